// The two encodings that people's texts come in: UTF-8, and Windows-1252, which partners' files and label printers
// have.
#pragma once

#include <string>
#include <string_view>

namespace partnerkit {

// The five bytes that Windows-1252 leaves free keep their number, which makes them control characters.
char16_t FromWindows1252(char byte);

void AppendUtf8(std::string& text, char16_t character);

// UTF-8 as it stands; anything else is read as Windows-1252.
std::string Utf8(std::string_view text);

// A byte for each character. What is not UTF-8 stands as it is; characters that Windows-1252 doesn't have become "?".
std::string Windows1252(std::string_view text);

// The capitals of a Windows-1252 text, accented letters included.
std::string Windows1252Capitals(std::string_view bytes);

}  // namespace partnerkit
