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

// A picture at 100 dots an inch, so that sizes in hundredths are pixels.
inline Picture Drawn(int width, int height, const Draw& draw, int dotsPerInch = 100) {
  std::string png;
  const auto device = MakePngDevice(Into(png), dotsPerInch);
  device->StartPage(width, height);
  draw(*device);
  device->EndPage();
  device->EndDoc();
  return testing::ReadPng(png);
}

inline std::string DrawnPdf(const Draw& draw, const PdfOptions& options = {}) {
  std::string pdf;
  const auto device = MakePdfDevice(Into(pdf), options);
  draw(*device);
  device->EndDoc();
  return pdf;
}

}  // namespace partnerkit::cairo
