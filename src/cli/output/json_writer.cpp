#include "cli/output/json_writer.h"

#include <cmath>
#include <string>

#include "cli/output/text.h"

namespace partnerkit::cli {

namespace {

// Deeper levels stand on one line: a record, a row.
constexpr std::size_t kLevelsOverLines = 2;

// A control character below U+0100, by the last byte of its UTF-8, which is its number.
void AppendEscaped(std::string& json, char last) {
  constexpr std::string_view kHex = "0123456789abcdef";
  json += "\\u00";
  json += kHex[static_cast<unsigned char>(last) >> 4];
  json += kHex[static_cast<unsigned char>(last) & 15];
}

}  // namespace

JsonWriter::~JsonWriter() {
  while (!levels_.empty()) {
    if (named_) Null();
    End();
  }
}

void JsonWriter::Begin(char open) {
  Separate();
  out_ << open;
  levels_.push_back({open == '{' ? '}' : ']', true});
}

void JsonWriter::End() {
  const Level level = levels_.back();
  if (levels_.size() <= kLevelsOverLines && !level.empty) {
    levels_.pop_back();
    BreakLine();
  } else {
    levels_.pop_back();
  }
  out_ << level.close;
  if (levels_.empty()) out_ << '\n';
}

void JsonWriter::BreakLine() { out_ << '\n' << std::string(levels_.size() * 2, ' '); }

void JsonWriter::Separate() {
  if (named_) {
    named_ = false;
    return;
  }
  if (levels_.empty()) return;
  const bool first = levels_.back().empty;
  levels_.back().empty = false;
  if (!first) out_ << ',';
  if (levels_.size() <= kLevelsOverLines) {
    BreakLine();
  } else if (!first) {
    out_ << ' ';
  }
}

void JsonWriter::Name(std::string_view name) {
  Separate();
  Quote(name);
  out_ << ": ";
  named_ = true;
}

void JsonWriter::Literal(std::string_view json) {
  Separate();
  out_ << json;
}

void JsonWriter::Int(std::int64_t value) { Literal(std::to_string(value)); }

void JsonWriter::Number(double value) {
  if (std::isfinite(value)) {
    Literal(ShortestNumber(value));
  } else {
    Null();
  }
}

void JsonWriter::String(std::string_view bytes) {
  Separate();
  Quote(bytes);
}

void JsonWriter::Quote(std::string_view bytes) {
  std::string quoted = "\"";
  const std::string text = Utf8(bytes);
  for (std::size_t i = 0; i < text.size(); ++i) {
    switch (const char c = text[i]) {
      case '"':
        quoted += "\\\"";
        break;
      case '\\':
        quoted += "\\\\";
        break;
      case '\n':
        quoted += "\\n";
        break;
      case '\r':
        quoted += "\\r";
        break;
      case '\t':
        quoted += "\\t";
        break;
      default:
        if (const std::size_t length = ControlAt(text, i); length > 0) {
          i += length - 1;
          AppendEscaped(quoted, text[i]);
        } else {
          quoted += c;
        }
    }
  }
  out_ << quoted << '"';
}

void JsonWriter::Value(const Cell& cell) {
  struct Writer {
    JsonWriter& json;
    void operator()(std::monostate) const { json.Null(); }
    void operator()(bool value) const { json.Bool(value); }
    void operator()(double value) const { json.Number(value); }
    void operator()(const std::string& value) const { json.String(value); }
    void operator()(const DateTime& value) const { json.Date(value); }
  };
  std::visit(Writer{*this}, cell);
}

}  // namespace partnerkit::cli
