// One drawing, made by a function, as a document or a picture.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>

#include "cairo/devices.h"
#include "support/error_of.h"
#include "support/pictures.h"

namespace partnerkit::cairo {

using partnerkit::testing::ErrorOf;
using partnerkit::testing::Picture;
using ::testing::HasSubstr;

using Draw = std::function<void(DrawingDevice& device)>;

// Collects a document in `text`.
inline ByteSink Into(std::string& text) {
  return [&text](std::string_view bytes) { text.append(bytes); };
}

// Each kind of document.
struct Named {
  const char* name;
  std::unique_ptr<DrawingDevice> (*make)(ByteSink sink);
};

inline const Named kDevices[] = {{"PDF", [](ByteSink sink) { return MakePdfDevice(std::move(sink)); }},
                                 {"PNG", [](ByteSink sink) { return MakePngDevice(std::move(sink)); }},
                                 {"SVG", [](ByteSink sink) { return MakeSvgDevice(std::move(sink)); }}};

// A picture at 100 dots an inch, so that sizes in hundredths are pixels.
inline std::string DrawnPng(int width, int height, const Draw& draw, int dotsPerInch = 100) {
  std::string png;
  const auto device = MakePngDevice(Into(png), dotsPerInch);
  device->StartPage(width, height);
  draw(*device);
  device->EndPage();
  device->EndDoc();
  return png;
}
inline Picture Drawn(int width, int height, const Draw& draw, int dotsPerInch = 100) {
  return testing::ReadPng(DrawnPng(width, height, draw, dotsPerInch));
}

inline std::string DrawnPdf(const Draw& draw, const PdfOptions& options = {}) {
  std::string pdf;
  const auto device = MakePdfDevice(Into(pdf), options);
  draw(*device);
  device->EndDoc();
  return pdf;
}

}  // namespace partnerkit::cairo
