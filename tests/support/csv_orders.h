// CSV order files by field name.
#pragma once

#include <algorithm>
#include <map>
#include <numeric>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "orders/csv/order_fields.h"
#include "support/order_trade.h"

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

// A supplier of CSV orders, with a map.
class CsvTrade : public OrderTrade {
 public:
  explicit CsvTrade(std::string_view importer, std::vector<std::string> mapColumns = UsualColumns())
      : OrderTrade(importer, "MGBSTORES", "ACMETOYS"), columns(std::move(mapColumns)) {
    folder.Write("orders.map", MapText(columns));
    document.MapFile = "orders.map";
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

  std::string Backup() const { return folder.Read("backup.txt"); }
  void UseBackup() { vendor.POBackupFile = folder / "backup.txt"; }
  void UseProductFile(std::string_view text) {
    vendor.ProductImportFile = folder / "products.csv";
    folder.Write("products.csv", text);
  }

  std::vector<std::string> columns;
};

}  // namespace partnerkit::testing
