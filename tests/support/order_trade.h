// An importer's whole run over an order file, whatever its syntax, and what it stored.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "host/sql_session.h"
#include "support/faulty_files.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {

using Texts = std::vector<std::string>;

// What is told of the usual order.
inline const std::string kCompleted = "0 Process: PO 450001 import completed.";
inline const std::string kIncomplete = "0 Process: PO 450001 import incomplete.";
inline const std::string kExists = "R Process: Cannot process. PO 450001 already exists.";
inline const std::string kScrapped = "W Process: ... Warning incomplete/scrapped PO 450001.";
inline const std::string kWithErrors =
    "0 Process: PO 450001 import completed with errors. Data maintenance or POA required.";
inline std::string Refused(std::string_view why) {
  return "R Process: ...Cannot process PO 450001, " + std::string(why);
}
inline std::string InError(std::string_view why) { return "R Process: ...PO 450001 in error, " + std::string(why); }

inline std::string Replaced(std::string_view text, std::string_view what, std::string_view by) {
  std::string all;
  for (std::size_t at; (at = text.find(what)) != std::string_view::npos; text.remove_prefix(at + what.size())) {
    all.append(text.substr(0, at)).append(by);
  }
  return all.append(text);
}

// A member as text: quoted when it is text, absent when it is null, and left out when it is the number 0 or False.
inline std::string Shown(const Member& member, void* record) {
  const void* at = member.at(record);
  const auto quoted = [](std::string_view text) { return '"' + std::string(text) + '"'; };
  const auto number = [](double value) { return value == 0 ? std::string() : (std::ostringstream() << value).str(); };
  switch (member.kind) {
    case MemberKind::kString:
      return quoted(*static_cast<const std::string*>(at));
    case MemberKind::kText:
      return *static_cast<const Text*>(at) ? quoted(**static_cast<const Text*>(at)) : "";
    case MemberKind::kInt:
      return number(*static_cast<const std::int32_t*>(at));
    case MemberKind::kLong:
      return number(static_cast<double>(*static_cast<const std::int64_t*>(at)));
    case MemberKind::kBool:
      return *static_cast<const bool*>(at) ? "True" : "";
    case MemberKind::kDouble:
      return number(*static_cast<const double*>(at));
    case MemberKind::kNumber: {
      const auto& value = *static_cast<const std::optional<double>*>(at);
      return value ? quoted(number(*value)) : "";
    }
    case MemberKind::kDate: {
      const auto& date = *static_cast<const std::optional<DateTime>*>(at);
      return date ? date->Iso() : "";
    }
  }
  return {};
}

// A stored record with all its members: `OrderId=1 VendorId="ACME" ...`.
template <class R>
std::string Shown(R record) {
  std::string all;
  for (const Member& member : R::kType.members) {
    const std::string value = Shown(member, &record);
    if (!value.empty()) all += (all.empty() ? "" : " ") + std::string(member.name) + "=" + value;
  }
  return all;
}

// A record with some members set.
template <class R, class F>
R With(F set) {
  R record;
  set(record);
  return record;
}

// What a document definition asks to be checked.
enum Validate { kNothing = 0, kProduct = 1, kCost = 2, kRetail = 4, kAll = 7 };

inline void Set(EDIDoc& document, int validate) {
  document.ValidateProduct = (validate & kProduct) != 0;
  document.ValidateCost = (validate & kCost) != 0;
  document.ValidateRetail = (validate & kRetail) != 0;
}

// The rows of the grid, the first three cells of each with a blank between; the last one is empty.
inline Texts Rows(const RowTable& table) {
  const auto text = [](const Cell& cell) -> std::string {
    if (const auto* given = std::get_if<std::string>(&cell)) return *given;
    if (const auto* date = std::get_if<DateTime>(&cell)) return date->Iso();
    return std::holds_alternative<std::monostate>(cell) ? "empty" : "?";
  };
  Texts rows;
  for (std::size_t row = 0; row < table.Rows(); ++row) {
    EXPECT_EQ(table.Columns(), 4U);
    EXPECT_EQ(table.At(row, 3), Cell(std::string()));
    rows.push_back(text(table.At(row, 0)) + " " + text(table.At(row, 1)) + " " + text(table.At(row, 2)));
  }
  return rows;
}

// A supplier with one document definition (1) and an order file "in/orders.txt".
class OrderTrade : public TradingHost {
 public:
  OrderTrade(std::string_view importer, std::string_view partnerAddress, std::string_view companyAddress)
      : className(importer) {
    std::filesystem::create_directory(folder / "in");
    vendor.VendorId = "ACME";
    document.EDIDocId = 1;
    document.PartnerId = "MGB";
    document.VendorId = "ACME";
    document.CompanyEDIAddr = companyAddress;
    document.PartnerEDIAddr = partnerAddress;
    document.MapFolder = folder / "";
    Stored(With<Partner>([](Partner& partner) { partner.PartnerId = "MGB"; }));
    Stored(vendor);
    Stored(document);
    for (const char* number : {"0900", "0512", "0513", "0514"}) AddLocation(number);
  }

  void WriteOrders(std::string_view text) const { folder.Write(kFile, text); }
  std::string Orders() const { return folder.Read(kFile); }
  std::string OrdersPath() const { return folder / kFile; }

  void AddLocation(const std::string& number) {
    Sql("INSERT INTO tbPartnerLocn (VendorId, PartnerLocnNo) VALUES ('ACME', '" + number + "')");
  }
  // The product of the usual line, at its price, and one of another partner.
  void AddUsualProducts() {
    Sql("INSERT INTO tbProduct (ProductNo, PartnerId, InHouseProdNo, UOM, Symbology) "
        "VALUES ('93001', 'MGB', 'TRAIN', 'CT', 'EN'), ('93005', 'MYER', NULL, 'CT', 'EN')");
    Sql("INSERT INTO tbProductPrice (VendorId, ProductNo, SKU, Cost, Retail, TaxRate) "
        "VALUES ('ACME', '93001', '555001', 12.5, 29.95, '10')");
  }
  // A further document definition with the partner.
  void AddDocument(const std::string& partner, const std::string& code, const std::string& progId = "") {
    Sql("INSERT INTO tbEDIDoc (EDIDocId, VendorId, PartnerId, DocumentCode, ProgId) VALUES (3, 'ACME', '" + partner +
        "', '" + code + "', '" + progId + "')");
  }
  // An order of the usual number is in the store, with packing jobs made from it.
  void AddOrder(int jobs, const std::function<void(Order&)>& set) {
    const Order old = Stored(With<Order>([&](Order& order) {
      order.VendorId = "ACME";
      order.PartnerId = "MGB";
      order.PONo = "450001";
      order.TransactionCtl = "33";
      set(order);
    }));
    for (int job = 0; job < jobs; ++job) Stored(With<Job>([&](Job& made) { made.OrderId = old.OrderId; }));
  }
  // Every operation of that kind on the table fails, until "DROP TRIGGER refuse".
  void Refuse(const std::string& operation, const std::string& table) {
    Sql("CREATE TRIGGER refuse BEFORE " + operation + " ON " + table + " BEGIN SELECT RAISE(ABORT, 'refused'); END");
  }
  FaultyFiles& UseFaultyFiles() {
    ports.files = &faulty_;
    return faulty_;
  }
  void Sql(const std::string& statement) { system->Session().Execute(statement); }

  std::unique_ptr<Translator> Start() {
    EXPECT_TRUE(Update(system->Records(), document));
    EXPECT_TRUE(Update(system->Records(), vendor));
    std::unique_ptr<Translator> importer = Create(className);
    started_ = static_cast<std::int32_t>(LogLines().size());
    ColumnTable table;
    initialised = importer->Init(*system, 1, table);
    return importer;
  }
  // An importer that has the file open, with so many rows.
  std::unique_ptr<Translator> Loaded(std::string_view orders, std::int32_t rows = 1) {
    WriteOrders(orders);
    std::unique_ptr<Translator> importer = Start();
    RowTable table;
    EXPECT_EQ(importer->Load(OrdersPath(), table), rows);
    return importer;
  }
  // The rows that an importer lists of such a file, before it is cancelled.
  Texts Listed(std::string_view orders) {
    WriteOrders(orders);
    const auto importer = Start();
    RowTable table;
    const std::int32_t rows = importer->Load(OrdersPath(), table);
    EXPECT_EQ(static_cast<std::size_t>(rows), table.Rows());
    importer->Cancel();
    return Rows(table);
  }
  // What the log got since the last `Start`.
  Texts NewLog() { return LogLines(started_); }

  struct Run {
    std::int32_t rows = 0;
    std::vector<Outcome> outcomes;  // a row each
    bool term = false;
    Texts log;
  };
  // Init, Load, Process of every row, Term.
  Run Import() {
    Run run;
    const auto importer = Start();
    RowTable table;
    run.rows = importer->Load(OrdersPath(), table);
    for (std::int32_t row = 0; row < run.rows; ++row) run.outcomes.push_back(Process(*importer, row));
    run.term = importer->Term();
    run.log = NewLog();
    return run;
  }
  Run Import(std::string_view orders) {
    WriteOrders(orders);
    return Import();
  }

  // All records of a kind.
  template <class R>
  Texts Every() {
    Texts all;
    R record;
    system->Records().ForEach(R::kType, &record, [&] { all.push_back(Shown(record)); });
    return all;
  }
  std::vector<std::shared_ptr<Order>> StoredOrderRecords() {
    return All(Order::kByVendorAndPartner, With<Order>([](Order& probe) {
                 probe.VendorId = "ACME";
                 probe.PartnerId = "MGB";
               }));
  }
  // Every stored order, each with its lines, locations and location lines.
  Texts StoredRecords() {
    Texts all;
    for (const auto& order : StoredOrderRecords()) {
      all.push_back(Shown(*order));
      AppendOf<OrderLine>(order->OrderId, all);
      AppendOf<OrderLocn>(order->OrderId, all);
      AppendOf<OrderLocnLine>(order->OrderId, all);
    }
    return all;
  }
  // The number and status of each stored order: "450001/0".
  Texts StoredOrders() {
    Texts all;
    for (const auto& order : StoredOrderRecords()) all.push_back(order->PONo + "/" + std::to_string(order->Status));
    return all;
  }

  static constexpr std::string_view kFile = "in/orders.txt";

  std::string className;
  Vendor vendor;
  EDIDoc document;
  bool initialised = false;

 private:
  template <class R>
  void AppendOf(std::int32_t orderId, Texts& all) {
    const auto ofOrder = With<R>([&](R& probe) { probe.OrderId = orderId; });
    for (const auto& record : All(R::kByOrder, ofOrder)) all.push_back(Shown(*record));
  }

  std::int32_t started_ = 0;
  FaultyFiles faulty_{*ports.files};
};

}  // namespace partnerkit::testing
