// What a drawing is written as: the part of a device in which the kinds of document differ.
#pragma once

#include <string>

#include "cairo/handles.h"
#include "cairo/sink_stream.h"
#include "partnerkit/drawing.h"

namespace partnerkit::cairo {

struct PageSize {
  double width, height;  // in points
  int across, down;      // in pixels
};

class Output {
 public:
  explicit Output(ByteSink sink) : stream_(std::move(sink)) {}
  // A surface let go half way writes its end.
  virtual ~Output() { stream_.Close(); }
  Output(const Output&) = delete;
  Output& operator=(const Output&) = delete;

  // How large a pixel is in the surface's own units.
  virtual double UnitsPerPixel() const = 0;
  // What is left out at each edge of a filled rectangle, in pixels.
  virtual double Inset() const { return 0; }
  // A white page.
  virtual void StartPage(const PageSize& size) = 0;
  virtual void EndPage(cairo_t* page) { cairo_show_page(page); }
  virtual void EndDoc() { cairo_surface_finish(surface_.get()); }
  virtual void Use(cairo_t* page, Ink ink) const {
    const double level = ink == Ink::kWhite ? 1 : 0;
    cairo_set_source_rgb(page, level, level, level);
  }

  cairo_surface_t* PageSurface() const { return surface_.get(); }
  // Raises what the sink threw or what Cairo met with.
  void CheckAll(cairo_status_t status) const {
    stream_.RaiseFailure();
    Check(status, "drawing");
    if (surface_) Check(cairo_surface_status(surface_.get()), "drawing");
  }

 protected:
  SinkStream stream_;
  Surface surface_;
};

}  // namespace partnerkit::cairo
