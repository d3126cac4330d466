// An order import under fuzzing: a small supplier in memory, whole runs over an order file, and what must hold of them
// for every input.
#pragma once

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "memory_files.h"
#include "memory_host.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/platform.h"
#include "platform/clocks.h"

namespace partnerkit::fuzz {

inline void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "does not hold: %s\n", what);
  std::abort();
}

inline constexpr std::string_view kMapFile =
    "INTCONTROLNO\nGRPCONTROLNO\nTRNCONTROLNO\nPARTNEREDIADDR\nCOMPANYEDIADDR\nPOPURPOSECODE\nPOTYPECODE\nPONUMBER\n"
    "PODATE\nSUPPLIERNO\nCUSTCAT\nDEPTNO\nNOTBEFORE\nCANCAFTER\nADDATE\nSTOREZONE\nBUYINGLOCPARTNERNO\n"
    "SHIPTOLOCPARTNERNO\nSEQUENTIALLINENO\nPRODUCTQUALIFIER\nINCOMINGPRODUCTNO\nUNITMEASURECODE\nUNITPRICECODE\n"
    "UNITPRICE\nORDERQUANTITY\nSKUPRODUCTKEYCODE\nRETAILUNITPRICE\nALLOCATEQUANTITY\nCUSTOMERREF\nCUSTOMERNO\nSTYLE\n"
    "COLOUR\nSIZE\nDESCRIPTION\nWEIGHT\nVOLUME\nBIN\nLINEREF\n";
inline constexpr std::size_t kNumberColumn = 7;

inline constexpr const char* kOrders = "inbox/orders.csv";
inline constexpr const char* kMap = "maps/orders.map";
inline constexpr const char* kBackup = "backup/po.csv";

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
  while (text.starts_with(' ')) text.remove_prefix(1);
  while (text.ends_with(' ')) text.remove_suffix(1);
  return text;
}

// One field of a line. Quotes are cut where a field has both; the last field of a line loses its last character to a
// quote in front.
inline std::string FieldOf(std::string_view line, std::size_t column) {
  line = line.substr(0, line.find_first_of("\r\n"));
  for (; column > 0; --column) {
    const std::size_t comma = line.find(',');
    if (comma == std::string_view::npos) return {};
    line.remove_prefix(comma + 1);
  }
  const std::size_t comma = line.find(',');
  std::string_view field = line.substr(0, comma);
  if (field.starts_with('"') && (comma == std::string_view::npos || field.ends_with('"'))) {
    field = field.size() < 2 ? std::string_view() : field.substr(1, field.size() - 2);
  }
  return std::string(Trimmed(field));
}

class OrderRun {
 public:
  // `checks`: products, prices and locations are checked, and a fault leaves its procedure; without, it is passed over.
  OrderRun(std::string_view map, std::string_view orders, bool checks) {
    files_.Put(kMap, std::string(map));
    files_.Put(kOrders, std::string(orders));
    files_.Put(kBackup, "an order of last week\r\n");
    ports_ = platform::DefaultPorts();
    ports_.files = &files_;
    ports_.clock = &clock_;
    ports_.errorOutlets.dialog = [checks](const ErrorReport&, const std::string&) {
      return checks ? Button::kAbort : Button::kIgnore;
    };
    Stock(checks);
  }

  // A whole run over every row. `numberColumn` is where the file has its order numbers. False when there are no rows.
  bool ProcessAll(std::size_t numberColumn) {
    const std::string before = files_.Bytes(kOrders);
    const std::string backup = files_.Bytes(kBackup);
    RowTable rows;
    const std::unique_ptr<Translator> importer = Loaded(rows);
    if (!importer) return false;
    std::set<std::string> posted, done;
    for (std::size_t row = 0; row < rows.Rows(); ++row) {
      ErrorList log;
      const std::int32_t id = importer->Process(static_cast<std::int32_t>(row), log);
      const std::string number = std::get<std::string>(rows.At(row, 0));
      const std::vector<LogRecord> told = Told(log);
      const bool cancelled = id == 0 && AnySays(told, "Cancel Request");
      const bool replaced = AnySays(told, "Duplicate PO") || AnySays(told, "Change Request");
      if (cancelled || replaced) stored_.erase(number);
      // The order is stored no longer: all lines of the number stay, unless the new one is posted.
      if (replaced) {
        posted.erase(number);
        done.erase(number);
      }
      if (id > 0) {
        stored_[number] = id;
        posted.insert(number);
      }
      if (id > 0 || cancelled || (!told.empty() && TurnsAway(told.back()))) done.insert(number);
    }
    Check(importer->Term(), "Term gives True");
    CheckFile(before, backup, numberColumn, posted, done);
    CheckStore();
    CheckTidy();
    return true;
  }

  // Takes one row's transaction out. What goes is one run of lines.
  void DeleteRow(bool last) {
    const std::string before = files_.Bytes(kOrders);
    RowTable rows;
    const std::unique_ptr<Translator> importer = Loaded(rows);
    if (!importer) return;
    ErrorList log;
    Check(importer->Delete(last ? static_cast<std::int32_t>(rows.Rows()) - 1 : 0, log), "Delete gives True");
    importer->Cancel();
    const std::string& after = files_.Bytes(kOrders);
    Check(after.size() < before.size(), "Delete takes something out");
    const auto front =
        static_cast<std::size_t>(std::mismatch(after.begin(), after.end(), before.begin()).first - after.begin());
    const auto back =
        static_cast<std::size_t>(std::mismatch(after.rbegin(), after.rend(), before.rbegin()).first - after.rbegin());
    Check(front + back >= after.size(), "Delete takes one run of bytes out");
    const std::vector<std::string_view> old = LinesOf(before), left = LinesOf(after);
    Check(std::all_of(left.begin(), left.end(),
                      [&](std::string_view line) { return std::find(old.begin(), old.end(), line) != old.end(); }),
          "Delete leaves whole lines");
    CheckTidy();
  }

 private:
  static constexpr std::int32_t kWarned = static_cast<std::int32_t>(0x80040001);
  static constexpr std::int32_t kRejected = static_cast<std::int32_t>(0x80040002);

  static std::string ClassUnderTest() {
    const char* named = std::getenv("PARTNERKIT_FUZZ_CLASS");
    return named == nullptr ? "PartnerKit.clsMGB850csv" : named;
  }

  template <class R>
  void Keep(R record) {
    Check(Add(host_.Records(), record), "the supplier's records are stored");
  }

  void Stock(bool checks) {
    Partner partner;
    partner.PartnerId = "MGB";
    Keep(partner);
    Vendor vendor;
    vendor.VendorId = "ACME";
    vendor.POBackupFile = kBackup;
    Keep(vendor);
    EDIDoc document;
    document.EDIDocId = 1;
    document.ProgId = ClassUnderTest();
    document.PartnerId = "MGB";
    document.VendorId = "ACME";
    document.PartnerEDIAddr = "MGBEDI";
    document.CompanyEDIAddr = "ACMEEDI";
    document.MapFolder = "maps/";
    document.MapFile = "orders.map";
    document.ValidateProduct = document.ValidateCost = document.ValidateRetail = checks;
    Keep(document);
    for (const char* number : {"0052", "0117", "0900"}) {
      PartnerLocn location;
      location.VendorId = "ACME";
      location.PartnerLocnNo = number;
      Keep(location);
    }
    for (const char* number : {"9312345678907", "9312345679010"}) {
      Product product;
      product.ProductNo = number;
      product.PartnerId = "MGB";
      product.UOM = "EA";
      product.Symbology = "EN";
      Keep(product);
      ProductPrice price;
      price.VendorId = "ACME";
      price.ProductNo = number;
      price.Cost = 10.5;
      price.Retail = 19.95;
      price.SKU = "2004510";
      Keep(price);
    }
  }

  // An importer that has listed the file; nothing when there was nothing to list, and the file is then as it was.
  std::unique_ptr<Translator> Loaded(RowTable& rows) {
    const std::string before = files_.Bytes(kOrders);
    std::unique_ptr<Translator> importer = CreateTranslator(ClassUnderTest(), ports_);
    Check(importer != nullptr, "the class is known");
    ColumnTable columns;
    Check(importer->Init(host_, 1, columns), "Init gives True");
    const std::int32_t count = importer->Load(kOrders, rows);
    if (count > 0) {
      Check(rows.Rows() == static_cast<std::size_t>(count), "Load gives the number of rows");
      return importer;
    }
    importer->Cancel();
    Check(files_.Bytes(kOrders) == before, "a file without rows stays as it was");
    CheckTidy();
    return nullptr;
  }

  std::vector<LogRecord> Told(const ErrorList& list) {
    std::vector<LogRecord> told;
    for (const std::int32_t id : list.value_or(std::vector<std::int32_t>())) {
      told.emplace_back().LogId = id;
      Check(Load(host_.Records(), told.back()), "the log has what the error list names");
    }
    return told;
  }

  // A failed check is a rejection too, but begins with "...".
  static bool TurnsAway(const LogRecord& log) {
    return log.ErrorNumber == kRejected && Str(log.Message).starts_with("Cannot process");
  }

  static bool AnySays(const std::vector<LogRecord>& told, std::string_view words) {
    return std::any_of(told.begin(), told.end(), [&](const LogRecord& log) {
      return log.ErrorNumber == kWarned && Str(log.Message).find(words) != std::string_view::npos;
    });
  }

  // All transactions of one number leave together: one that failed goes with another of its number that was dealt with.
  void CheckFile(const std::string& before, const std::string& backup, std::size_t column,
                 const std::set<std::string>& posted, const std::set<std::string>& done) {
    std::string kept, moved = backup;
    for (const std::string_view line : LinesOf(before)) {
      const std::string number = FieldOf(line, column);
      if (posted.contains(number)) {
        moved += line;
        if (!line.ends_with('\n') && !line.ends_with('\r')) moved += "\r\n";
      } else if (!done.contains(number)) {
        kept += line;
      }
    }
    Check(files_.Bytes(kOrders) == kept, "the file keeps every line not dealt with, and no other");
    Check(files_.Bytes(kBackup) == moved, "the backup holds every posted line, and no other");
  }

  void CheckStore() {
    std::map<std::string, std::int32_t> found;
    host_.Records().ForEach<Order>([&](const Order& order) {
      Check(found.emplace(order.PONo, order.OrderId).second, "an order is stored once");
      Check(order.Status == 0, "a stored order is complete");
      OrderLocnLine probe;
      probe.OrderId = order.OrderId;
      Check(partnerkit::Count(host_.Records(), OrderLocnLine::kByOrder, probe) > 0, "a stored order has lines");
    });
    Check(found == stored_, "the store holds what was posted, and no other order");
  }

  void CheckTidy() {
    Check(!files_.AnyHeld(), "no file stays held");
    Check(files_.Count() == 3, "no file is left over or lost");
  }

  MemoryFiles files_;
  MemoryHost host_;
  platform::FixedClock clock_{*DateTime::FromYmdHms(2006, 3, 8, 10, 15, 0)};
  Ports ports_;
  std::map<std::string, std::int32_t> stored_;
};

}  // namespace partnerkit::fuzz
