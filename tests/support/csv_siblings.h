// The partners' CSV order importers beside the first: what their orders carry, and the records these are checked with.
#pragma once

#include <algorithm>
#include <string>
#include <vector>

#include "support/csv_orders.h"

namespace partnerkit::testing {

inline constexpr const char* kMyer = "clsMYERDropShipPOcsv";
inline constexpr const char* kGhpl = "clsGHPL850csv";
inline constexpr const char* kTarget = "clsTarget850csv";
inline constexpr const char* kMgbbt = "clsMGBBT850csv";
inline constexpr const char* kKmart = "clsKMart850csv";
inline constexpr const char* kOfficeworks = "clsOfficeworks850csv";
inline constexpr const char* kCml = "clsCMLFLFPOcsv";
inline constexpr const char* kBulk = "clsTargetBulkPOcsv";
inline constexpr const char* kColes = "clsColesEIDCPOcsv";

inline constexpr const char* kAllClasses[] = {kMyer, kGhpl, kTarget, kMgbbt, kKmart, kOfficeworks, kCml, kBulk, kColes};

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
    Stored(With<PackType>([](PackType& pallet) { pallet.ShipPackCode = "PALLET"; }));
  }
  void AddPartner(const std::string& id, const std::string& ABN) {
    Stored(With<Partner>([&](Partner& partner) {
      partner.PartnerId = id;
      partner.ABN = ABN;
    }));
  }
  void AddProduct(const std::string& number, const std::string& partner, const Text& inHouse = {}) {
    Stored(With<Product>([&](Product& product) {
      product.ProductNo = number;
      product.PartnerId = partner;
      product.InHouseProdNo = inHouse;
      product.UOM = "CT";
      product.Symbology = "EN";
    }));
  }
  void AddInner(const std::string& product, const std::string& EAN, double quantity) {
    Stored(With<ProductInner>([&](ProductInner& inner) {
      inner.ProductNo = product;
      inner.InnerEAN = EAN;
      inner.InnerQty = quantity;
    }));
  }
  void AddPrepackJob(const std::string& number, const std::vector<std::string>& products, double quantity) {
    Stored(With<LabelJob>([&](LabelJob& job) { job.PackNo = number; }));
    for (const std::string& product : products) {
      Stored(With<LabelJobItem>([&](LabelJobItem& item) {
        item.PackNo = number;
        item.ProductNo = product;
        item.PackQty = quantity;
      }));
    }
  }
  // Products and prices that the usual line agrees with, and others that it doesn't.
  void AddMasters() {
    Sql("UPDATE tbPartner SET ABN = '11 222'");
    AddPartner("MYER", "11 222");
    AddPartner("TOYS", "99 000");
    AddProduct("93001", "MGB", "TRAIN");
    AddProduct("93002", "MGB");
    AddProduct("93005", "MYER");
    AddProduct("93006", "TOYS");
    Stored(With<ProductPrice>([](ProductPrice& price) {
      price.VendorId = "ACME";
      price.ProductNo = "93001";
      price.SKU = "555001";
      price.Cost = 12.5;
      price.Retail = 29.95;
      price.TaxRate = "10";
    }));
    AddInner("93001", "193001", 6);
    AddInner("93005", "193005", 6);
    AddInner("93006", "193006", 6);
    Stored(With<Prepack>([](Prepack& prepack) {
      prepack.ProductNo = "93001";
      prepack.PrepackQty = 24;
    }));
    AddPrepackJob("P100", {"93001"}, 12);
    AddPrepackJob("P200", {"93001", "93002"}, 12);
  }
  template <class R>
  std::vector<std::string> Every() {
    std::vector<std::string> all;
    R record;
    system->Records().ForEach(R::kType, &record, [&] { all.push_back(Shown(record)); });
    return all;
  }
};

}  // namespace partnerkit::testing
