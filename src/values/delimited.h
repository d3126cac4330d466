// Splitting a comma-delimited line the partners' way.
#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

namespace partnerkit {

// Blanks cut from both ends. Blanks only: a tab is a character like any other in a partner's field.
std::string_view TrimBlanks(std::string_view text);

// The fields of one line, as views into it.
//
// A comma ends a field, inside double quotes too: the partners' translators quote whole fields and never put a comma in
// one on purpose. Quotes round a whole field are cut, quotes inside are kept. Columns beyond `columns` are ignored;
// those the line doesn't have are empty.
class DelimitedLine {
 public:
  explicit DelimitedLine(std::size_t columns = 0, bool quotesProtectCommas = false)
      : columns_(columns), quotesProtectCommas_(quotesProtectCommas) {}

  // Splits the first `upTo` columns of the line; the line must outlive the views.
  void Split(std::string_view line, std::size_t upTo);
  void Split(std::string_view line) { Split(line, columns_.size()); }

  // The field as read, blanks included. One that is left out, with nothing before its comma or behind the line's end,
  // has no data either.
  std::string_view operator[](std::size_t column) const {
    return column < split_ ? columns_[column] : std::string_view();
  }
  std::size_t Columns() const { return columns_.size(); }

 private:
  const char* CommasCountFrom(const char* start, const char* end) const;

  std::vector<std::string_view> columns_;
  bool quotesProtectCommas_;
  std::size_t split_ = 0;
};

}  // namespace partnerkit
