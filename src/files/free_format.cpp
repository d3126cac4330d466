#include "files/free_format.h"

#include "values/delimited.h"

namespace partnerkit {

namespace {

// Cuts the first item, with the comma behind it, off the text.
std::string TakeItem(std::string_view& text, bool& more) {
  while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
  std::string_view quoted;
  const bool isQuoted = !text.empty() && text.front() == '"';
  if (isQuoted) {
    const std::size_t close = text.find('"', 1);
    quoted = text.substr(1, close == std::string_view::npos ? close : close - 1);
    text.remove_prefix(close == std::string_view::npos ? text.size() : close + 1);
  }
  const std::size_t comma = text.find(',');
  const std::string_view plain = TrimBlanks(text.substr(0, comma));
  more = comma != std::string_view::npos;
  text = more ? text.substr(comma + 1) : std::string_view();
  return std::string(isQuoted ? quoted : plain);
}

}  // namespace

bool FreeFormatReader::Read(std::vector<std::string>& items) {
  Line line;
  do {
    if (!lines_.Read(line)) return false;
    ++lineNo_;
  } while (TrimBlanks(line.text).empty());
  items.clear();
  std::string_view text = line.text;
  for (bool more = true; more;) items.push_back(TakeItem(text, more));
  if (items.size() != columns_) {
    // The same line is met again when it is read again.
    lines_.Seek(line.position);
    --lineNo_;
    throw RunTimeError(run_time::kTypeMismatch, "File " + path_ + ", line " + std::to_string(lineNo_ + 1) + " has " +
                                                    std::to_string(items.size()) + " columns instead of " +
                                                    std::to_string(columns_));
  }
  return true;
}

}  // namespace partnerkit
