// X12 order files, and their four importers. Texts have "~" behind each segment; a trade gives them its own form.
#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

#include "support/order_trade.h"

namespace partnerkit::testing {

inline constexpr const char* kMgb = "clsMGB850ansix12";
inline constexpr const char* kTarget = "clsTarget850ansix12";
inline constexpr const char* kGhpl = "clsGHPL850ansix12";
inline constexpr const char* kKmart = "clsKMart850ansix12";

inline const Texts kAllClasses = {kMgb, kTarget, kGhpl, kKmart};

inline constexpr std::string_view kPartnerAddress = "MGBSTORES0123", kCompanyAddress = "ACMETOYS04567";

inline std::string Isa(std::string_view control = "000000481", std::string_view sender = kPartnerAddress,
                       std::string_view receiver = kCompanyAddress) {
  const auto padded = [](std::string_view address) { return std::string(address).append(15 - address.size(), ' '); };
  return "ISA*00*          *00*          *ZZ*" + padded(sender) + "*ZZ*" + padded(receiver) + "*060308*1015*U*00200*" +
         std::string(control) + "*0*P*>~";
}
inline std::string Gs(std::string_view control = "77", std::string_view kind = "PO", std::string_view mark = {}) {
  return "GS*" + std::string(kind) + "*MGBSTORES*ACMETOYS*060308*1015*" + std::string(control) + "*X*003040" +
         std::string(mark) + "~";
}
inline std::string Interchange(std::string_view groups, std::string_view control = "000000481",
                               std::string_view sender = kPartnerAddress) {
  return Isa(control, sender) + std::string(groups) + "IEA*1*" + std::string(control) + "~";
}
inline std::string Group(std::string_view sets, std::string_view control = "77", std::string_view kind = "PO",
                         std::string_view mark = {}) {
  return Gs(control, kind, mark) + std::string(sets) + "GE*1*" + std::string(control) + "~";
}
inline std::string TransactionSet(std::string_view segments, std::string_view control = "0001",
                                  std::string_view set = "850") {
  return "ST*" + std::string(set) + "*" + std::string(control) + "~" + std::string(segments) + "SE*9*" +
         std::string(control) + "~";
}

// A supplier of X12 orders who acknowledges them into "ack".
struct X12Trade : OrderTrade {
  explicit X12Trade(std::string_view importer) : OrderTrade(importer, kPartnerAddress, kCompanyAddress) {
    std::filesystem::create_directory(folder / "ack");
    document.AckFolder = folder / "ack/";
  }

  // As the partner sends it: on one line, or as lines without "~".
  std::string Sent(std::string_view text) const {
    return className == kGhpl ? Replaced(text, "~", "\r\n") : std::string(text);
  }
  // As a rewrite leaves it.
  std::string Settled(std::string_view text) const {
    return Replaced(text, "~", className == kGhpl ? "\r\n" : "~\r\n");
  }

  // Where the class reads the product number as an inner element, something must follow it.
  std::string ProductElement(std::string_view number) const {
    return std::string(number) + (className == kMgb || className == kTarget ? "*" : "");
  }
  std::string Line(std::string_view product = "93001", std::string_view lineNo = "1") const {
    return "PO1*" + std::string(lineNo) + "*24*CT*12.50*LE*EN*" + ProductElement(product) + "~";
  }
  // The segments of an order of one line; location 0999 makes it fail.
  std::string Body(std::string_view number = "450001", std::string_view location = "0900",
                   std::string_view purpose = "00") const {
    return "BEG*" + std::string(purpose) + "*SA*" + std::string(number) + "**060301~N1*ST**92*" +
           std::string(location) + "~" + Line() + "CTT*1~";
  }
  // A file of one order.
  std::string File(std::string_view body) const { return Interchange(Group(TransactionSet(body))); }

  void ClearAcks() const {
    std::filesystem::remove_all(folder / "ack");
    std::filesystem::create_directory(folder / "ack");
  }
  // The acknowledgements, by name: "FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*1*1*1".
  Texts Acks() const {
    Texts acks;
    for (const auto& entry : std::filesystem::directory_iterator(folder / "ack")) {
      acks.push_back(entry.path().filename());
      std::ifstream file(entry.path());
      for (std::string line; std::getline(file, line);) {
        if (line.starts_with("AK")) acks.back() += " " + line.substr(0, line.size() - 1);
      }
    }
    std::ranges::sort(acks);
    return acks;
  }
};

}  // namespace partnerkit::testing
