// The segments of an X12 order file as a person reads them: what is whose.
#pragma once

#include <algorithm>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "subject.h"

namespace partnerkit::fuzz {

struct PlainSegment {
  std::string text;       // without what ends it and apostrophes at its end
  std::size_t begin = 0;  // in the file, behind line ends
};

class X12Segments {
 public:
  explicit X12Segments(std::string_view bytes) {
    const std::string_view ends = Ends();
    for (std::size_t at = 0; at < bytes.size();) {
      at = std::min(bytes.find_first_not_of("\r\n", at), bytes.size());
      const std::size_t end = std::min(bytes.find_first_of(ends, at), bytes.size());
      PlainSegment segment{std::string(bytes.substr(at, end - at)), at};
      if (IsOfLines()) std::erase(segment.text, '\'');
      while (segment.text.ends_with('\'')) segment.text.pop_back();
      if (segment.text.find_first_not_of(' ') != std::string::npos) segments_.push_back(std::move(segment));
      at = end + 1;
    }
    length_ = bytes.size();
  }

  const std::vector<PlainSegment>& All() const { return segments_; }

  // The bytes from each ISA that has nothing of the partner's address up to the next one that may be his.
  std::vector<std::string_view> Foreign(std::string_view bytes) const {
    std::vector<std::string_view> ranges;
    std::size_t from = std::string::npos;
    const auto end = [&](std::size_t at) {
      if (from != std::string::npos) ranges.push_back(bytes.substr(from, at - from));
      from = std::string::npos;
    };
    for (const PlainSegment& segment : segments_) {
      if (!segment.text.starts_with("ISA")) continue;
      if (MayBeOurs(segment.text)) {
        end(segment.begin);
      } else if (from == std::string::npos) {
        from = segment.begin;
      }
    }
    end(length_);
    return ranges;
  }

  // The segments of each transaction, up to its SE, by its control numbers as a row shows them; only of those that no
  // other has.
  std::map<std::string, std::vector<std::string>> Transactions() const {
    std::map<std::string, std::vector<std::string>> transactions;
    std::map<std::string, int> count;
    std::string interchange, group;
    std::vector<std::string>* open = nullptr;
    for (const auto& [text, begin] : segments_) {
      if (text.starts_with("ISA") || text.starts_with("GS*")) {
        (text[0] == 'I' ? interchange : group) = Element(text, text[0] == 'I' ? 13 : 6);
        open = nullptr;
      } else if (text.starts_with("ST")) {
        const std::string key = std::string(interchange)
                                    .append("/")
                                    .append(group)
                                    .append("/")
                                    .append(text.size() > 7 ? std::string_view(text).substr(7) : std::string_view());
        ++count[key];
        open = &transactions[key];
      } else if (text.starts_with("SE*") || text.starts_with("GE") || text.starts_with("IEA")) {
        open = nullptr;
      } else if (open != nullptr) {
        open->push_back(text);
      }
    }
    std::erase_if(transactions, [&](const auto& entry) { return count[entry.first] > 1; });
    return transactions;
  }

  // Whether every segment stands where it belongs, and each group's header keeps its number with a mark at its end.
  // Trailers may be missing at the end of an interchange. What stands elsewhere goes with the order before it.
  bool IsOrderly() const {
    std::string open;  // the first letters of the envelopes that are open
    bool foreign = false;
    for (const auto& [text, begin] : segments_) {
      if (text.starts_with("ISA")) {
        foreign = !MayBeOurs(text);
        open = "I";
      } else if (!foreign &&
                 !(text.starts_with("GS") ? IsWholeGroup(text) && Opens(open, "I", "G") : Fits(text, open))) {
        return false;
      }
    }
    return true;
  }

  static std::string WithoutMark(std::string text) {
    constexpr std::string_view kMark = "*FA DONE*";
    const std::size_t at = text.starts_with("GS") ? text.find(kMark) : std::string::npos;
    if (at != std::string::npos) text.erase(at, kMark.size());
    while (text.ends_with('\'')) text.pop_back();
    return text;
  }

 private:
  static bool Opens(std::string& open, std::string_view within, std::string_view envelope) {
    const bool fits = open == within;
    open += envelope;
    return fits;
  }
  static bool Closes(std::string& open, std::string_view envelopes) {
    const bool fits = open == envelopes;
    if (fits) open.pop_back();
    return fits;
  }
  static bool Fits(std::string_view text, std::string& open) {
    if (text.starts_with("ST")) return text.starts_with("ST*") && Opens(open, "IG", "S");
    if (text.starts_with("SE")) return text.starts_with("SE*") && Closes(open, "IGS");
    if (text.starts_with("GE")) return text.starts_with("GE*") && Closes(open, "IG");
    if (text.starts_with("IEA")) return Closes(open, "I");
    return open == "IGS" || open.empty();
  }
  static bool IsWholeGroup(std::string_view gs) {
    return gs.starts_with("GS*") && std::ranges::count(gs.substr(0, gs.find('~')), '*') > 6;
  }

  static bool IsOfLines() { return TheSubject().Is("whole-lines"); }
  static std::string_view Ends() {
    if (IsOfLines()) return "\r\n";
    return TheSubject().Is("apostrophe-ends") ? "\r\n~'" : "\r\n~";
  }
  static bool MayBeOurs(const std::string& isa) {
    return isa.find(Str(TheSubject().document.PartnerEDIAddr)) != std::string::npos;
  }
  static std::string Element(std::string_view text, int n) {
    for (; n > 0; --n) {
      const std::size_t star = text.find('*');
      if (star == std::string_view::npos) return {};
      text.remove_prefix(star + 1);
    }
    return std::string(text.substr(0, text.find('*')));
  }

  std::vector<PlainSegment> segments_;
  std::size_t length_ = 0;
};

}  // namespace partnerkit::fuzz
