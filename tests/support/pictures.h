// Pictures that were drawn, read back, and what other programs say of a document.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace partnerkit::testing {

struct Picture {
  int width = 0, height = 0;
  std::vector<std::uint8_t> pixels;  // 0 is black

  int At(int x, int y) const {
    return pixels.at(static_cast<std::size_t>(y) * static_cast<std::size_t>(width) + static_cast<std::size_t>(x));
  }
  // A line of text a row: "#" for black, "." for white, "?" for what lies between.
  std::string Art() const;
};

// Fails the test where the bytes aren't a PNG of 8 bits of grey.
Picture ReadPng(std::string_view png);

// What the shell's command writes. It finds the document as the file `$document`.
std::string Told(const std::string& document, const std::string& command);

}  // namespace partnerkit::testing
