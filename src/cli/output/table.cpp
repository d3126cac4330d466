#include "cli/output/table.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <utility>

#include "cli/output/text.h"

namespace partnerkit::cli {

namespace {

constexpr std::size_t kDefaultWidth = 100;
constexpr std::size_t kLeastWidth = 40;
constexpr std::size_t kLeastLastColumn = 20;
constexpr std::string_view kGap = "  ";
// Of any column but the last, which is broken into lines; one odd value must not push the others off the screen.
constexpr std::size_t kMostWidth = 60;
constexpr std::string_view kCut = "...";

// Byte position behind the first `columns` characters.
std::size_t Behind(std::string_view utf8, std::size_t columns) {
  std::size_t at = 0;
  for (; at < utf8.size(); ++at) {
    const bool starts = (static_cast<unsigned char>(utf8[at]) & 0xC0) != 0x80;
    if (starts && columns-- == 0) break;
  }
  return at;
}

std::string Shortened(std::string text) {
  if (Width(text) > kMostWidth) text.replace(Behind(text, kMostWidth - kCut.size()), std::string::npos, kCut);
  return text;
}

// Cuts the first line of at most `width` columns off `rest`, between words where there are any.
std::string_view TakeLine(std::string_view& rest, std::size_t width) {
  if (Width(rest) <= width) return std::exchange(rest, {});
  const std::size_t most = Behind(rest, width);
  const std::size_t blank = rest.rfind(' ', most);
  const std::size_t cut = blank == std::string_view::npos || blank == 0 ? most : blank;
  const std::string_view line = rest.substr(0, cut);
  rest.remove_prefix(cut);
  if (rest.starts_with(' ')) rest.remove_prefix(1);
  return line;
}

void Pad(std::string& line, std::string_view text, std::size_t width, bool right) {
  const std::string fill(width - std::min(width, Width(text)), ' ');
  line += right ? fill : "";
  line += text;
  line += right ? "" : fill;
}

void PrintLine(std::ostream& out, std::string_view line) {
  const std::size_t end = line.find_last_not_of(' ');
  out << line.substr(0, end == std::string_view::npos ? 0 : end + 1) << '\n';
}

}  // namespace

void PrintWrapped(std::ostream& out, std::string_view text, std::size_t indent, std::size_t width) {
  const std::size_t room = width > indent + kLeastLastColumn ? width - indent : kLeastLastColumn;
  bool first = true;
  do {
    if (!first) out << std::string(indent, ' ');
    out << TakeLine(text, room) << '\n';
    first = false;
  } while (!text.empty());
}

void PrintTable(std::ostream& out, const std::vector<TableColumn>& columns, std::size_t rows, const CellText& cell,
                std::size_t width, const NotesBelow& notes) {
  const std::size_t last = columns.size() - 1;
  std::vector<std::size_t> widths;
  widths.reserve(columns.size());
  for (const TableColumn& column : columns) widths.push_back(Width(column.caption));
  for (std::size_t row = 0; row < rows; ++row) {
    for (std::size_t i = 0; i < last; ++i) widths[i] = std::max(widths[i], Width(Shortened(cell(row, i))));
    widths[last] = std::max(widths[last], Width(cell(row, last)));
  }
  std::size_t before = 0;
  for (std::size_t i = 0; i < last; ++i) before += widths[i] + kGap.size();
  widths[last] = std::min(widths[last], std::max(kLeastLastColumn, width > before ? width - before : 0));

  const auto print = [&](const CellText& text, std::size_t row) {
    std::string line;
    for (std::size_t i = 0; i < last; ++i) {
      Pad(line, Shortened(text(row, i)), widths[i], columns[i].right);
      line += kGap;
    }
    const std::string lastText = text(row, last);
    std::string_view rest = lastText;
    Pad(line, TakeLine(rest, widths[last]), widths[last], columns[last].right);
    PrintLine(out, line);
    while (!rest.empty()) out << std::string(before, ' ') << TakeLine(rest, widths[last]) << '\n';
  };
  print([&](std::size_t, std::size_t i) { return columns[i].caption; }, 0);
  print([&](std::size_t, std::size_t i) { return std::string(widths[i], '-'); }, 0);
  for (std::size_t row = 0; row < rows; ++row) {
    print(cell, row);
    if (!notes) continue;
    const std::size_t indent = widths.front() + kGap.size();
    for (const std::string& note : notes(row)) {
      out << std::string(indent, ' ');
      PrintWrapped(out, note, indent + kGap.size(), width);
    }
  }
}

std::size_t OutputWidth() {
  std::size_t width = 0;
  if (const char* columns = std::getenv("COLUMNS")) {
    const std::string_view text = columns;
    std::from_chars(text.data(), text.data() + text.size(), width);
  }
  winsize window{};
  if (width == 0 && ioctl(STDOUT_FILENO, TIOCGWINSZ, &window) == 0) width = window.ws_col;
  return width == 0 ? kDefaultWidth : std::max(width, kLeastWidth);
}

std::string CellAsText(const Cell& cell) {
  struct Reader {
    std::string operator()(std::monostate) const { return {}; }
    std::string operator()(bool value) const { return value ? "yes" : "no"; }
    std::string operator()(double value) const { return ShortestNumber(value); }
    std::string operator()(const std::string& value) const { return OneLine(value); }
    std::string operator()(const DateTime& value) const { return value.Iso(); }
  };
  return std::visit(Reader{}, cell);
}

std::string Counted(std::size_t count, std::string_view one, std::string_view many) {
  return std::to_string(count) + ' ' + std::string(count == 1 ? one : many);
}

}  // namespace partnerkit::cli
