#include "support/pictures.h"

#include <gtest/gtest.h>
#include <png.h>

#include <array>
#include <cstdio>
#include <memory>

#include "support/trading_fixture.h"

namespace partnerkit::testing {

std::string Picture::Art() const {
  std::string art;
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) art += At(x, y) == 0 ? '#' : At(x, y) == 255 ? '.' : '?';
    art += '\n';
  }
  return art;
}

Picture ReadPng(std::string_view png) {
  constexpr std::size_t kDepthAndColour = 24;  // in the header
  png_image image{};
  image.version = PNG_IMAGE_VERSION;
  if (png_image_begin_read_from_memory(&image, png.data(), png.size()) == 0) {
    ADD_FAILURE() << image.message;
    return {};
  }
  EXPECT_EQ(png.substr(kDepthAndColour, 2), std::string_view("\x08\x00", 2));
  image.format = PNG_FORMAT_GRAY;
  Picture picture{static_cast<int>(image.width), static_cast<int>(image.height), {}};
  picture.pixels.resize(PNG_IMAGE_SIZE(image));
  EXPECT_NE(png_image_finish_read(&image, nullptr, picture.pixels.data(), 0, nullptr), 0) << image.message;
  return picture;
}

std::string Told(const std::string& document, const std::string& command) {
  const TempFolder folder;
  folder.Write("document", document);
  const std::string line = "document='" + folder / "document" + "'; " + command;
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> pipe(popen(line.c_str(), "r"), pclose);
  std::string told;
  std::array<char, 4096> block{};
  while (const std::size_t length = std::fread(block.data(), 1, block.size(), pipe.get())) {
    told.append(block.data(), length);
  }
  return told;
}

}  // namespace partnerkit::testing
