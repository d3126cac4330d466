// CSV order files by field name, and an importer's whole run over one of them.
#pragma once

#include <algorithm>
#include <map>
#include <numeric>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "host/sql_session.h"
#include "orders/csv/order_fields.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {

// Fields and their values: "PONUMBER=450001; BIN=B12". A value's own blanks count, but for the one behind a ";".
inline std::map<std::string, std::string> Fields(std::string_view text) {
  std::map<std::string, std::string> fields;
  while (!text.empty()) {
    const std::string_view field = text.substr(0, text.find(';'));
    text.remove_prefix(std::min(text.size(), field.size() + 2));
    const std::size_t equals = field.find('=');
    fields.emplace(field.substr(0, equals), field.substr(equals + 1));
  }
  return fields;
}

// Every field with a value of its own.
inline constexpr std::string_view kUsualFields =
    "INTCONTROLNO=1001; GRPCONTROLNO=202; TRNCONTROLNO=33; PARTNEREDIADDR=MGBSTORES; COMPANYEDIADDR=ACMETOYS; "
    "POPURPOSECODE=00; POTYPECODE=SA; PONUMBER=450001; PODATE=20060301; SUPPLIERNO=77001; CUSTCAT=GIFTS; DEPTNO=042; "
    "NOTBEFORE=060310; CANCAFTER=2006/3/24; ADDATE=20060401; STOREZONE=NSW; BUYINGLOCPARTNERNO=0512; "
    "SHIPTOLOCPARTNERNO=0900; SEQUENTIALLINENO=7; PRODUCTQUALIFIER=EN; INCOMINGPRODUCTNO=93001; UNITMEASURECODE=CT; "
    "UNITPRICECODE=LE; UNITPRICE=12.50; ORDERQUANTITY=24; SKUPRODUCTKEYCODE=555001; RETAILUNITPRICE=29.95; "
    "ALLOCATEQUANTITY=18; CUSTOMERREF=REF8; CUSTOMERNO=CUST9; STYLE=TRAIN; COLOUR=RED; SIZE=XL; "
    "DESCRIPTION=Wooden train; WEIGHT=0.75; VOLUME=0.003; BIN=B12; LINEREF=31";

// The columns of the usual map file: an unused one in front, then every field, the last first.
inline std::vector<std::string> UsualColumns() {
  std::vector<std::string> columns = {""};
  columns.insert(columns.end(), orders::kOrderFieldNames.rbegin(), orders::kOrderFieldNames.rend());
  return columns;
}

inline std::string MapText(const std::vector<std::string>& columns) {
  return std::accumulate(columns.begin(), columns.end(), std::string(),
                         [](std::string text, const std::string& column) { return text + column + "\r\n"; });
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

// A supplier with one document definition (1), its map, and an order file "in/orders.txt".
class CsvTrade : public TradingHost {
 public:
  explicit CsvTrade(std::string_view importer, std::vector<std::string> mapColumns = UsualColumns())
      : className(importer), columns(std::move(mapColumns)) {
    std::filesystem::create_directory(folder / "in");
    folder.Write("orders.map", MapText(columns));
    vendor.VendorId = "ACME";
    document.EDIDocId = 1;
    document.PartnerId = "MGB";
    document.VendorId = "ACME";
    document.CompanyEDIAddr = "ACMETOYS";
    document.PartnerEDIAddr = "MGBSTORES";
    document.MapFolder = folder / "";
    document.MapFile = "orders.map";
    Stored(With<Partner>([](Partner& partner) { partner.PartnerId = "MGB"; }));
    Stored(vendor);
    Stored(document);
    for (const char* number : {"0900", "0512", "0513", "0514"}) AddLocation(number);
  }

  // A line of the order file: the usual fields but for those given.
  std::string Line(std::string_view changed = {}) const {
    auto fields = Fields(changed);
    fields.merge(Fields(kUsualFields));
    std::string line;
    for (const std::string& column : columns) {
      if (&column != &columns.front()) line += ',';
      line += fields[column];
      fields.erase(column);
    }
    for (const auto& [name, value] : fields) ADD_FAILURE() << name << " is no column";
    return line + "\r\n";
  }
  std::string Lines(const std::vector<std::string>& lines) const {
    std::string all;
    for (const std::string& changed : lines) all += Line(changed);
    return all;
  }

  void WriteOrders(std::string_view text) const { folder.Write(kFile, text); }
  std::string Orders() const { return folder.Read(kFile); }
  std::string OrdersPath() const { return folder / kFile; }
  std::string Backup() const { return folder.Read("backup.txt"); }

  void AddLocation(const std::string& number) {
    Stored(With<PartnerLocn>([&](PartnerLocn& location) {
      location.VendorId = "ACME";
      location.PartnerLocnNo = number;
    }));
  }
  void Sql(const std::string& statement) { system->Session().Execute(statement); }
  void UseBackup() { vendor.POBackupFile = folder / "backup.txt"; }
  void UseProductFile(std::string_view text) {
    vendor.ProductImportFile = folder / "products.csv";
    folder.Write("products.csv", text);
  }

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
  // What the log got since the last `Start`.
  std::vector<std::string> NewLog() { return LogLines(started_); }

  // One call of `Process`: its result, and what its error list names.
  struct Outcome {
    std::int32_t result = 0;
    std::vector<std::string> told;
  };
  Outcome Process(Translator& importer, std::int32_t row) {
    ErrorList ids;
    Outcome outcome;
    outcome.result = importer.Process(row, ids);
    for (const std::int32_t id : ids.value_or(std::vector<std::int32_t>())) {
      outcome.told.push_back(LogLines(id - 1).front());
    }
    return outcome;
  }

  struct Run {
    std::int32_t rows = 0;
    std::vector<Outcome> outcomes;  // a row each
    bool term = false;
    std::vector<std::string> log;
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

  std::vector<std::shared_ptr<Order>> StoredOrderRecords() {
    return All(Order::kByVendorAndPartner, With<Order>([](Order& probe) {
                 probe.VendorId = "ACME";
                 probe.PartnerId = "MGB";
               }));
  }
  // Every stored order, each with its lines, locations and location lines.
  std::vector<std::string> StoredRecords() {
    std::vector<std::string> all;
    for (const auto& order : StoredOrderRecords()) {
      all.push_back(Shown(*order));
      AppendOf<OrderLine>(order->OrderId, all);
      AppendOf<OrderLocn>(order->OrderId, all);
      AppendOf<OrderLocnLine>(order->OrderId, all);
    }
    return all;
  }
  // The number and status of each stored order: "450001/0".
  std::vector<std::string> StoredOrders() {
    std::vector<std::string> all;
    for (const auto& order : StoredOrderRecords()) all.push_back(order->PONo + "/" + std::to_string(order->Status));
    return all;
  }

  static constexpr std::string_view kFile = "in/orders.txt";

  std::string className;
  std::vector<std::string> columns;
  Vendor vendor;
  EDIDoc document;
  bool initialised = false;

 private:
  template <class R>
  void AppendOf(std::int32_t orderId, std::vector<std::string>& all) {
    const auto ofOrder = With<R>([&](R& probe) { probe.OrderId = orderId; });
    for (const auto& record : All(R::kByOrder, ofOrder)) all.push_back(Shown(*record));
  }

  std::int32_t started_ = 0;
};

}  // namespace partnerkit::testing
