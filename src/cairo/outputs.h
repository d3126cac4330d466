// The kinds of document.
#pragma once

#include <memory>

#include "cairo/devices.h"
#include "cairo/output.h"

namespace partnerkit::cairo {

std::unique_ptr<Output> MakePdfOutput(ByteSink sink, const PdfOptions& options);
std::unique_ptr<Output> MakePngOutput(ByteSink sink, int dotsPerInch);
std::unique_ptr<Output> MakeSvgOutput(ByteSink sink, int dotsPerInch);

}  // namespace partnerkit::cairo
