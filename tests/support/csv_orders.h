// CSV order files by field name.
#pragma once

#include <algorithm>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "orders/csv/order_fields.h"
#include "support/order_trade.h"

namespace partnerkit::testing {

inline constexpr const char* kMgb = "clsMGB850csv";
inline constexpr const char* kMyer = "clsMYERDropShipPOcsv";
inline constexpr const char* kGhpl = "clsGHPL850csv";
inline constexpr const char* kTarget = "clsTarget850csv";
inline constexpr const char* kMgbbt = "clsMGBBT850csv";
inline constexpr const char* kKmart = "clsKMart850csv";
inline constexpr const char* kOfficeworks = "clsOfficeworks850csv";
inline constexpr const char* kCml = "clsCMLFLFPOcsv";
inline constexpr const char* kBulk = "clsTargetBulkPOcsv";
inline constexpr const char* kColes = "clsColesEIDCPOcsv";

inline constexpr const char* kAllClasses[] = {kMgb,   kMyer,        kGhpl, kTarget, kMgbbt,
                                              kKmart, kOfficeworks, kCml,  kBulk,   kColes};

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
inline Texts UsualColumns() {
  Texts columns = {""};
  columns.insert(columns.end(), orders::kOrderFieldNames.rbegin(), orders::kOrderFieldNames.rend());
  return columns;
}

inline std::string MapText(const Texts& columns) {
  std::string text;
  for (const std::string& column : columns) text.append(column).append("\r\n");
  return text;
}

// A supplier of CSV orders, with a map.
class CsvTrade : public OrderTrade {
 public:
  explicit CsvTrade(std::string_view importer, Texts mapColumns = UsualColumns())
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
  std::string Lines(const Texts& lines) const {
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

  Texts columns;
};

// --- The partners beside the first

// What lines carry beside the usual fields.
inline const std::string kTargetLine = "; CONTRACTNO=C55; HEADER1=PROMO; UNITSINNERPACK=6; PACKUOM=IN";
inline const std::string kPacks = "; POVERSIONNO=2; CARTONSOUTER=4; UNITSINNERPACK=6; PACKUOM=IN";
inline const std::string kGtin =
    "; POTYPECODE=220; INTDATE=20060302; RESPONSETYPECODE=29; DELIVERYPARTY=DC7; REQUIRED=20060315; TRADEDQUANTITY=48; "
    "DELDATE=20060320; PROMODATE=20060321; STATUS=1; INNEREAN=I44; INNERQTY=9; UNITSINNERPACK=6";
inline const std::string kColesLine =
    "; INTDATE=20060302; RESPONSETYPECODE=29; EQUIPMENT=E3; DELIVERYPARTY=DC7; REQUIRED=20060315; HEADER1=Coles DC; "
    "HEADER2=1 Dock Rd; HEADER3=Altona; HEADER4=VIC 3018; HEADER5=3018; DESTDOCK=D1; DELDOCK=D2; PALLETFOOTAGE=1.5; "
    "UNITPRICEINCGST=13.75; UNITPRICEEXGST=12.50; GSTRATE=10; CARTONSOUTER=12; PACKUOM=EA; UNITSINNERPACK=5; "
    "GSTAMOUNT=1.25; STATUS=1; INNEREAN=I44; INNERQTY=9; DETAIL4=X4; DETAIL5=X5";

inline std::string Extras(const std::string& className) {
  if (className == kTarget) return kTargetLine;
  if (className == kKmart || className == kOfficeworks) return kPacks;
  if (className == kCml || className == kBulk) return kGtin;
  return className == kColes ? kColesLine : "";
}

// The order's lines, what is changed before what the class carries.
inline std::string Lines(const CsvTrade& trade, const std::vector<std::string>& lines) {
  std::string all;
  for (const std::string& changed : lines) {
    const std::string extras = Extras(trade.className);
    all += trade.Line(!changed.empty() ? changed + extras : extras.substr(std::min<std::size_t>(extras.size(), 2)));
  }
  return all;
}

struct Siblings : CsvTrade {
  explicit Siblings(const std::string& importer) : CsvTrade(importer) {
    Sql("INSERT INTO tbPackType (ShipPackCode) VALUES ('PALLET')");
  }
  // Products and prices that the usual line agrees with, and others that it doesn't.
  void AddMasters() {
    AddUsualProducts();
    Sql("INSERT INTO tbPartner (PartnerId) VALUES ('MYER'), ('TOYS')");
    Sql("UPDATE tbPartner SET ABN = CASE PartnerId WHEN 'TOYS' THEN '99 000' ELSE '11 222' END");
    Sql("INSERT INTO tbProduct (ProductNo, PartnerId, UOM, Symbology) "
        "VALUES ('93002', 'MGB', 'CT', 'EN'), ('93006', 'TOYS', 'CT', 'EN')");
    Sql("INSERT INTO tbProductInner (ProductNo, InnerEAN, InnerQty) "
        "VALUES ('93001', '193001', 6), ('93005', '193005', 6), ('93006', '193006', 6)");
    Sql("INSERT INTO tbPrepack (ProductNo, PrepackQty) VALUES ('93001', 24)");
    Sql("INSERT INTO tbLabelJobItem (PackNo, ProductNo, PackQty) "
        "VALUES ('P100', '93001', 12), ('P200', '93001', 12), ('P200', '93002', 12)");
  }
};

}  // namespace partnerkit::testing
