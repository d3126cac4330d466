// Drawing devices that write documents: PDF, a grey PNG picture, SVG.
#pragma once

#include <memory>
#include <string>

#include "files/byte_sink.h"
#include "partnerkit/drawing.h"

namespace partnerkit::cairo {

struct PdfOptions {
  std::string title = {};
  int dotsPerInch = 300;
  // ISO 8601, "2006-03-06T10:15:00"; without it the document names no time, so that equal drawings are equal bytes.
  std::string created = {};
};

// The sinks get a document in pieces, the last of it at EndDoc; one without a page is nothing at all. What a sink
// throws comes out of the operation that called it, and the document is lost.
//
// Pages up to 200 inches either way, which is the most that a PDF can have; others raise error 5, as does a second page
// of a PNG or an SVG.
std::unique_ptr<DrawingDevice> MakePdfDevice(ByteSink sink, const PdfOptions& options = {});
std::unique_ptr<DrawingDevice> MakePngDevice(ByteSink sink, int dotsPerInch = 300);
std::unique_ptr<DrawingDevice> MakeSvgDevice(ByteSink sink, int dotsPerInch = 300);

}  // namespace partnerkit::cairo
