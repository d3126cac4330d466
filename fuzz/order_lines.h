// The lines of an order file as a person reads them, with the map beside: what order each belongs to.
#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

#include "subject.h"

namespace partnerkit::fuzz {

// The lines of a file, each with its end: LF, CR LF or CR.
inline std::vector<std::string_view> LinesOf(std::string_view bytes) {
  std::vector<std::string_view> lines;
  while (!bytes.empty()) {
    std::size_t end = bytes.find_first_of("\r\n");
    end = end == std::string_view::npos ? bytes.size() : end + (bytes.substr(end, 2) == "\r\n" ? 2 : 1);
    lines.push_back(bytes.substr(0, end));
    bytes.remove_prefix(end);
  }
  return lines;
}

inline std::string_view Trimmed(std::string_view text) {
  text = text.substr(0, text.find_first_of("\r\n"));
  while (text.starts_with(' ')) text.remove_prefix(1);
  while (text.ends_with(' ')) text.remove_suffix(1);
  return text;
}

inline bool IsBlank(std::string_view line) { return Trimmed(line).empty(); }

// Whether segments of an interchange stand between the lines.
inline bool HasEnvelope(std::string_view bytes) {
  constexpr std::string_view kTags[] = {"ISA", "GS*", "ST*", "IEA", "GE*", "SE*", "UNB", "UNH", "UNT", "UNZ"};
  return std::ranges::any_of(LinesOf(bytes),
                             [&](std::string_view line) { return std::ranges::count(kTags, line.substr(0, 3)) > 0; });
}

class OrderLines {
 public:
  explicit OrderLines(std::string_view map) {
    for (const std::string_view line : LinesOf(map)) columns_.emplace_back(Trimmed(line));
  }

  // What a listed order settles under.
  std::string Key(const std::string& number, std::string controls) const {
    std::erase(controls, '/');
    return TheSubject().Is("by-controls") ? number + '\0' + controls : number;
  }
  // What the line's order settles under.
  std::string Key(std::string_view line) const {
    return Key(Number(line), Field(line, "INTCONTROLNO") + Field(line, "GRPCONTROLNO") + Field(line, "TRNCONTROLNO"));
  }
  // Controls with a slash cannot be told from those of another line.
  bool AnyAmbiguous(const std::vector<std::string_view>& lines) const {
    return std::ranges::any_of(lines, [&](std::string_view line) {
      return std::ranges::any_of(
          kControls, [&](std::string_view name) { return Field(line, name).find('/') != std::string::npos; });
    });
  }

  bool IsOurs(std::string_view line) const {
    const EDIDoc& document = TheSubject().document;
    return Field(line, "PARTNEREDIADDR") == Str(document.PartnerEDIAddr) &&
           Field(line, "COMPANYEDIADDR") == Str(document.CompanyEDIAddr);
  }
  // A line that names another sender or receiver.
  bool IsOfOthers(std::string_view line) const {
    return !IsOurs(line) && !(Field(line, "PARTNEREDIADDR").empty() && Field(line, "COMPANYEDIADDR").empty());
  }

 private:
  static constexpr std::string_view kControls[] = {"INTCONTROLNO", "GRPCONTROLNO", "TRNCONTROLNO"};

  std::string Number(std::string_view line) const {
    const Subject& subject = TheSubject();
    std::string number = Field(line, "PONUMBER");
    if (subject.Is("short-numbers") && number.size() <= 8) return number + " #" + Field(line, "SHIPTOLOCPARTNERNO");
    if (subject.Is("releases") && Field(line, "POTYPECODE") == "RL")
      return number + " REL# " + Field(line, "POVERSIONNO");
    return number;
  }

  // One field of a line. Quotes are cut where a field has both; the last field of a line loses its last character to a
  // quote in front.
  std::string Field(std::string_view line, std::string_view name) const {
    line = line.substr(0, line.find_first_of("\r\n"));
    const auto comma = [&] {
      const bool quoted = TheSubject().Is("quoted-commas") && line.starts_with('"');
      const std::size_t close = quoted ? line.find('"', 1) : std::string_view::npos;
      return line.find(',', close == std::string_view::npos ? 0 : close);
    };
    auto column = std::ranges::find(columns_, name) - columns_.begin();
    for (; column > 0; --column) {
      if (comma() == std::string_view::npos) return {};
      line.remove_prefix(comma() + 1);
    }
    const std::size_t end = comma();
    std::string_view field = line.substr(0, end);
    if (field.starts_with('"') && (end == std::string_view::npos || field.ends_with('"'))) {
      field = field.size() < 2 ? std::string_view() : field.substr(1, field.size() - 2);
    }
    return std::string(Trimmed(field));
  }

  std::vector<std::string> columns_;
};

}  // namespace partnerkit::fuzz
