// A ByteSink behind libraries written in C, through which no exception may pass.
#pragma once

#include <cairo.h>

#include <exception>
#include <string_view>
#include <utility>

#include "files/byte_sink.h"

namespace partnerkit::cairo {

class SinkStream {
 public:
  explicit SinkStream(ByteSink sink) : sink_(std::move(sink)) {}

  // False once the sink has thrown.
  bool Write(std::string_view bytes) noexcept {
    if (failure_) return false;
    try {
      if (!closed_) sink_(bytes);
    } catch (...) {
      failure_ = std::current_exception();
    }
    return !failure_;
  }
  // What is still written goes nowhere.
  void Close() { closed_ = true; }
  void RaiseFailure() const {
    if (failure_) std::rethrow_exception(failure_);
  }

  static cairo_status_t WriteForCairo(void* stream, const unsigned char* bytes, unsigned length) {
    const bool written =
        static_cast<SinkStream*>(stream)->Write({reinterpret_cast<const char*>(bytes), std::size_t{length}});
    return written ? CAIRO_STATUS_SUCCESS : CAIRO_STATUS_WRITE_ERROR;
  }

 private:
  ByteSink sink_;
  bool closed_ = false;
  std::exception_ptr failure_;
};

}  // namespace partnerkit::cairo
