// Owners of Cairo's objects, and its failures as run-time errors.
#pragma once

#include <cairo.h>

#include <memory>
#include <string>

namespace partnerkit::cairo {

template <auto release>
struct Release {
  template <class T>
  void operator()(T* object) const {
    release(object);
  }
};

using Surface = std::unique_ptr<cairo_surface_t, Release<cairo_surface_destroy>>;
using Context = std::unique_ptr<cairo_t, Release<cairo_destroy>>;
using FontFace = std::unique_ptr<cairo_font_face_t, Release<cairo_font_face_destroy>>;
using ScaledFont = std::unique_ptr<cairo_scaled_font_t, Release<cairo_scaled_font_destroy>>;
using FontOptions = std::unique_ptr<cairo_font_options_t, Release<cairo_font_options_destroy>>;

// Raises error 57, or 7 where memory is short, unless the status is a success. `what` was being made.
void Check(cairo_status_t status, const std::string& what);

// Raises error 5, which is drawing outside of a page, and anything else that the caller could have known.
[[noreturn]] void RaiseInvalidCall(const std::string& cause = {});

}  // namespace partnerkit::cairo
