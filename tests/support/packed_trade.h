// A supplier whose cartons are packed: every record that a ship notice takes its values from, each member with a value
// of its own, and a whole run over them.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "support/order_trade.h"

namespace partnerkit::testing {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

inline constexpr const char* kMgb = "clsMGB856csv";
inline constexpr const char* kMyerDrop = "clsMYERDropShipDAcsv";
inline constexpr const char* kTargetNotice = "clsTarget856csv";
inline constexpr const char* kKmartNotice = "clsKMart856csv";
inline constexpr const char* kOfficeworksNotice = "clsOfficeworks856csv";
inline constexpr const char* kMgbbtNotice = "clsMGBBT856csv";
inline constexpr const char* kCmlAdvice = "clsCMLFLFDAcsv";
inline constexpr const char* kBulkAdvice = "clsTargetBulkDAcsv";

inline constexpr const char* kNoticeClasses[] = {kMgb,         kMyerDrop,          kTargetNotice, kMgbbtNotice,
                                                 kKmartNotice, kOfficeworksNotice, kCmlAdvice,    kBulkAdvice};

inline DateTime At(std::string_view iso) { return *DateTime::FromIso(iso); }

// The words of a text, by blanks.
inline Texts Words(const std::string& text) {
  std::istringstream words(text);
  return {std::istream_iterator<std::string>(words), std::istream_iterator<std::string>()};
}

// A file's lines; each has to end with CR LF.
inline Texts LinesOf(std::string_view text) {
  Texts lines;
  while (!text.empty()) {
    const std::size_t end = text.find("\r\n");
    if (end == std::string_view::npos) {
      lines.push_back("WITHOUT AN END: " + std::string(text));
      break;
    }
    lines.emplace_back(text.substr(0, end));
    text.remove_prefix(end + 2);
  }
  return lines;
}

// The rows of the compile screen, the cells of each with "|" between; one that is all empty is "-".
inline Texts NoticeRows(const RowTable& table) {
  Texts rows;
  for (std::size_t row = 0; row < table.Rows(); ++row) {
    std::string cells;
    for (std::size_t column = 0; column < table.Columns(); ++column) {
      const auto* text = std::get_if<std::string>(&table.At(row, column));
      cells += text != nullptr ? *text + "|" : "";
    }
    rows.push_back(cells.empty() ? "-" : cells);
  }
  return rows;
}

// One document definition (1) of ACME for MGB, whose output is "out/asn.csv" and whose map is "asn.map". Order 1 has
// one line and location with a slip; shipment 1 goes by carrier 1. Packs are added by the tests.
class PackedTrade : public TradingHost {
 public:
  // With these columns in its map; without any there is no map.
  explicit PackedTrade(std::string_view noticeClass, const std::string& columns = {}) : className(noticeClass) {
    std::filesystem::create_directory(folder / "out");
    AddMasters();
    AddShipment();
    AddOrder();
    AddSlip();
    document.EDIDocId = 1;
    document.PartnerId = "MGB";
    document.VendorId = "ACME";
    document.CompanyEDIAddr = "ACMETOYS";
    document.PartnerEDIAddr = "MGBSTORES";
    document.MapFolder = folder / "";
    document.MapFile = "asn.map";
    Stored(document);
    if (!columns.empty()) Map(columns);
  }

  // Statements with ";" between.
  void Sql(const std::string& statements) {
    std::istringstream each(statements);
    for (std::string statement; std::getline(each, statement, ';');) system->Session().Execute(statement);
  }
  void UseInventory(const std::string& name) {
    Sql("UPDATE tbPartner SET ASNExtension = 'TL2Compatible', InventoryFile = '" + folder / name + "'");
  }
  void Map(const std::string& columns) const {
    std::string text;
    for (const std::string& column : Words(columns)) text += column + "\r\n";
    folder.Write("asn.map", text);
  }

  using PackedLine = std::pair<std::string, double>;  // product and quantity
  std::int32_t AddPack(const std::function<void(Pack&)>& set = {},
                       const std::vector<PackedLine>& lines = {{"93001", 6}}) {
    Pack pack;
    pack.PSlipId = pack.OrderId = pack.ShipmentId = 1;
    pack.PackTypeId = "CARTON";
    pack.Status = 4;
    pack.VendorId = "ACME";
    pack.ShipToCode = "0900";
    pack.BuyStoreCode = "0512";
    pack.PartnerLocnId = 44;
    pack.InvoiceNo = "INV77";
    pack.PalletNo = "PAL5";
    pack.SSCC = "SSCC" + std::to_string(++packs_);
    pack.CartonCount = 2;
    pack.Weight = 7.25;
    if (set) set(pack);
    const std::int32_t id = Stored(pack).Id;
    for (const auto& [product, quantity] : lines) AddLine(id, product, quantity);
    return id;
  }
  // By a slip line of its own when the product is "93001".
  void AddLine(std::int32_t pack, const std::string& product, double quantity,
               const std::function<void(PackLine&)>& set = {}) {
    PackLine line;
    line.PackId = pack;
    line.PSlipLineId = product == "93001" ? 1 : 0;
    line.APN = product;
    line.GTIN = "193001";
    line.Quantity = quantity;
    line.BatchNo = "BATCH8";
    line.UseByDate = At("2006-05-06");
    line.BestBeforeDate = At("2006-04-05");
    line.ExpiryDate = At("2006-07-08");
    if (set) set(line);
    Stored(line);
  }
  std::int32_t AddShipment(const std::function<void(Shipment&)>& set = {}) {
    Shipment shipment;
    shipment.Status = 3;
    shipment.ConNoteNo = "CN5";
    shipment.BookingNo = "BK6";
    shipment.BillOfLadingNo = "BL7";
    shipment.CarrierId = 1;
    shipment.CarrierCode = "TOLL";
    shipment.DeliveryLocnCode = "0901";
    shipment.ScheduleDate = At("2006-03-09");
    shipment.DeliveryDate = At("2006-03-20");
    shipment.Weight = 123.456;
    shipment.Volume = 1.2345;
    if (set) set(shipment);
    return Stored(shipment).Id;
  }
  std::int32_t AddOrder(const std::function<void(Order&)>& set = {}) {
    Order order;
    order.VendorId = "ACME";
    order.PartnerId = "MGB";
    order.PONo = "45000" + std::to_string(++orders_);
    order.TypeCode = "SA";
    order.PODate = At("2006-03-01");
    order.CancelAfter = At("2006-03-24");
    order.Header2 = "V2";
    order.PartnerSupplierNo = "PS9";
    order.CompanyCode = "CC8";
    if (set) set(order);
    return Stored(order).OrderId;
  }
  // Nothing of the order is left to pack.
  void CompleteOrder() { Sql("UPDATE tbOrderLocnLine SET PackedQty = Quantity"); }

  // A class bound to the document and loaded with the output of that name.
  std::unique_ptr<Translator> Loaded(std::string_view output = "out/asn.csv") {
    EXPECT_TRUE(Update(system->Records(), document));
    auto translator = Create(className);
    ColumnTable columns;
    EXPECT_TRUE(translator->Init(*system, 1, columns));
    started_ = static_cast<std::int32_t>(LogLines().size());
    rows = translator->Load(folder / output, table);
    return translator;
  }
  Texts NewLog() { return LogLines(started_); }

  // Init, Load, Process of every row, Term.
  std::vector<Outcome> Run(std::string_view output = "out/asn.csv") {
    const auto translator = Loaded(output);
    std::vector<Outcome> outcomes;
    outcomes.reserve(static_cast<std::size_t>(rows));
    for (std::int32_t row = 0; row < rows; ++row) outcomes.push_back(Process(*translator, row));
    EXPECT_TRUE(translator->Term());
    return outcomes;
  }
  // The lines of the output, all its rows processed.
  Texts Compiled() {
    Run();
    return Output();
  }
  Texts Output(std::string_view name = "out/asn.csv") const { return LinesOf(folder.Read(name)); }
  // The names in the output folder, sorted; none without the folder.
  std::string Files() const {
    Texts names;
    std::error_code noFolder;
    for (const auto& entry : std::filesystem::directory_iterator(folder / "out", noFolder)) {
      names.push_back(entry.path().filename());
    }
    std::ranges::sort(names);
    std::string all;
    for (const std::string& name : names) all += (all.empty() ? "" : " ") + name;
    return all;
  }
  // "notice/status" of each pack, by id.
  std::string Stamps() {
    std::string all;
    Pack pack;
    system->Records().ForEach(Pack::kType, &pack, [&] {
      all += (all.empty() ? "" : " ") + std::to_string(pack.ASNId) + "/" + std::to_string(pack.Status);
    });
    return all;
  }

  std::string className;
  EDIDoc document;
  RowTable table;
  std::int32_t rows = 0;

 private:
  void AddMasters() {
    Sql("INSERT INTO tbPartner(PartnerId, Name, ABN, LastASNNo) VALUES('MGB', 'MGB Stores', '11 222', 1000);"
        "INSERT INTO tbVendor(VendorId) VALUES('ACME');"
        "INSERT INTO tbPartnerAddress(Name, ProcessProgID) VALUES('Toll', 'Toll.Papers');"
        "INSERT INTO tbPartnerLocn(VendorId, PartnerLocnNo, Name) VALUES('ACME', '0900', 'MGB Altona');"
        "INSERT INTO tbPackType(PackTypeId, ShipPackCode, PackageTypeCode, Length, Width, Height)"
        " VALUES('CARTON', 'CTN30', 'P02', 40.5, 30, 20);"
        "INSERT INTO tbProduct(ProductNo, PartnerId, InHouseProdNo, ProductSize)"
        " VALUES('93001', 'MGB', 'TRAIN', 'XL'), ('93002', 'MGB', 'BEAR', 'XL')");
  }
  void AddSlip() {
    Sql("INSERT INTO tbOrderLine(OrderId, LineNo, ProductNo, Cost) VALUES(1, '7', '93001', 12.5);"
        "INSERT INTO tbOrderLocn(OrderId, CustomerRef) VALUES(1, 'REF8');"
        "INSERT INTO tbOrderLocnLine(OrderId, LineId, LocnId, LineRef, Quantity) VALUES(1, 1, 1, 'LL31', 24);"
        "INSERT INTO tbJob(OrderId, PackerId) VALUES(1, 'PK4');"
        "INSERT INTO tbPSlip(JobId, OrderLocnId) VALUES(1, 1);"
        "INSERT INTO tbPSlipLine(PSlipId, OrderLocnLineId, APN, LineRef, OrderQty) VALUES(1, 1, '93001', 'SL32', 18)");
  }

  std::int32_t started_ = 0;
  int packs_ = 0, orders_ = 0;
};

}  // namespace partnerkit::testing
