#include "labels/label_fields.h"

#include "labels/carton_label.h"
#include "labels/label_trade.h"
#include "partnerkit/catalogue.h"

namespace partnerkit::labels {
namespace {

using testing::LabelTrade;
using V = LabelValues;

LabelValues Filled(LabelTrade& trade, LabelValues values = {}) {
  const auto label = CreateLabelClass("PartnerKit.clsCMLSCM", trade.ports);
  EXPECT_TRUE(label->Init(trade.labelHost, ""));
  FillValues(dynamic_cast<CartonLabel&>(*label), trade.pack, {}, values);
  return values;
}

TEST(LabelFieldsTest, EveryValueHasItsSourceAndItsLength) {
  LabelTrade trade;
  trade.vendor.Name = "Acme Apparel Holdings", trade.vendor.Suburb = "Brunswick East Village";
  trade.vendor.State = "VICT";
  trade.linehaul.Name = "Southern Linehaul";
  trade.shipment.ConNoteNo = "SLH0048213000009", trade.shipment.BillOfLadingNo = "BL7710000001";
  trade.hub.ShortName = "  Altona North ", trade.hub.Address1 = "250 Dohertys Road West";
  trade.hub.Suburb = "Laverton North Estate", trade.hub.Postcode = "30261";
  trade.store.ShortName = " Ballarat Centre", trade.store.Name = "Ballarat Central Plaza";
  trade.store.Address1 = "8 Sturt Street, corner Lydiard", trade.store.Suburb = "Ballarat and Surrounds";
  trade.store.Postcode = "33501", trade.store.CountryCode = "0361";
  trade.order.PONo = "4500012345-EXTRA-LONG-NUMBER", trade.order.Header2 = "Homewares and linen";
  RecordStore& records = trade.system->Records();
  EXPECT_TRUE(Update(records, trade.vendor) && Update(records, trade.linehaul) && Update(records, trade.shipment) &&
              Update(records, trade.hub) && Update(records, trade.store) && Update(records, trade.order));
  LabelValues given;
  given.User1 = std::string(29, 'u') + "12", given.User2 = "two", given.StoreZoneDept = "zone 7";
  given.ComponentItem = "2", given.FormatNo = "10", given.Qty = "3";
  const LabelValues values = Filled(trade, given);
  const V& v = values;
  std::string all;
  for (const std::string& value :
       {v.FromName,      v.FromSuburb, v.FromState, v.CarrierName, v.ConNoteNo,     v.BillOfLadingNo,
        v.ToName,        v.ToAddress,  v.ToSuburb,  v.ToPostcode,  v.ToLocnNo,      v.ForName,
        v.ForLocnName,   v.ForAddress, v.ForSuburb, v.ForPostcode, v.ForLocnNo,     v.FinalLocnNo,
        v.CountryCode,   v.SSCCText,   v.POText,    v.ADFlag,      v.ADDate,        v.DeptText,
        v.DeptCapitals,  v.PalletText, v.User1,     v.User2,       v.StoreZoneDept, v.StoreZoneCapitals,
        v.ComponentItem, v.FormatNo,   v.Qty}) {
    all += value + '|';
  }
  EXPECT_EQ(all,
            "Acme Apparel Ho|Brunswick East |VIC|Southern Lineha|SLH004821300000|BL771000000|"
            "Altona Nor|250 Dohertys Road We|Laverton North |3026|2510|"
            "Ballarat Cen|Ballarat Central Pla|8 Sturt Street, corner|Ballarat and Surro|3350|0471|0471|036|"
            "093123450000009015|PO 4500012345-EXTRA-LONG-|AD|1203|Homewares and l|HOMEWARES AND L||"
            "uuuuuuuuuuuuuuuuuuuuuuuuuuuuu1|two|zone 7|ZONE 7|2|10|3|");
  EXPECT_TRUE(trade.reports.empty());
}

struct Rule {
  const char* name;
  std::function<void(LabelTrade& trade)> change;
  std::vector<std::pair<std::string LabelValues::*, std::string>> expected;
};

// clang-format off
const Rule kRules[] = {
    {"no shipment", [](auto& t) { t.pack.ShipmentId = 0; }, {{&V::ConNoteNo, ""}, {&V::BillOfLadingNo, ""}}},
    {"the pack's own carrier", [](auto& t) { t.pack.PartnerLocnId = 5; }, {{&V::CarrierName, "Couriers"}}},
    {"its own, and none", [](auto& t) { t.pack.PartnerLocnId = 5, t.pack.CarrierId = 0; }, {{&V::CarrierName, ""}}},
    {"received where it goes", [](auto& t) { t.shipTo.DeliverToCode = "  "; },
     {{&V::ToName, "Geelong W"}, {&V::ToAddress, "95 Shannon Ave"}, {&V::ToPostcode, "3218"}, {&V::ToLocnNo, "0464"}}},
    {"a centre by its name", [](auto& t) { t.hub.Name = " dc ", t.hub.ShortName = "Altona North"; },
     {{&V::ToName, "Altona  DC"}}},
    {"no such locations", [](auto& t) { t.pack.ShipToCode = "77", t.pack.BuyStoreCode = "88"; },
     {{&V::CarrierName, ""}, {&V::ToName, ""}, {&V::ToSuburb, ""}, {&V::ToLocnNo, "0077"}, {&V::ForName, ""},
      {&V::ForLocnNo, "0088"}, {&V::FinalLocnNo, "0088"}, {&V::CountryCode, ""}}},
    {"ends at the centre", [](auto& t) { t.pack.BuyStoreCode = "DC"; },
     {{&V::FinalLocnNo, "2510"}, {&V::ForLocnNo, "DC"}}},
    {"a customer's", [](auto& t) { t.order.TypeCode = "CO", t.order.Header3 = "  Ms. H. Longname-Smithers-Bee II "; },
     {{&V::ForName, "Ms. H. Longname-Smithers-Bee I"}, {&V::ForLocnName, ""}, {&V::ForAddress, ""}, {&V::ForSuburb, ""},
      {&V::ForPostcode, ""}, {&V::ForLocnNo, ""}, {&V::FinalLocnNo, "0471"}, {&V::CountryCode, "036"}}},
    {"a release", [](auto& t) { t.order.PONo = "12345 REL# 2"; }, {{&V::POText, "PO 12345"}}},
    {"no order", [](auto& t) { t.pack.OrderId = 0; },
     {{&V::POText, "PO "}, {&V::ADDate, ""}, {&V::DeptText, ""}, {&V::ForName, "Ballarat"}}},
    {"advertised in words", [](auto& t) { t.order.Header1 = "12AB5"; }, {{&V::ADFlag, ""}, {&V::ADDate, "12AB"}}},
    {"three digits", [](auto& t) { t.order.Header1 = "123"; }, {{&V::ADFlag, ""}, {&V::ADDate, "123"}}},
    {"one character", [](auto& t) { t.order.Header1 = "\u00e9"; }, {{&V::ADFlag, ""}, {&V::ADDate, ""}}},
    {"the department's number", [](auto& t) { t.order.Header2 = "", t.order.DeptNo = "45 and the whole of it"; },
     {{&V::DeptText, "45 and the whole of it"}, {&V::DeptCapitals, "45 AND THE WHOLE OF IT"}}},
    {"accents", [](auto& t) { t.order.Header2 = "Caf\u00e9 \u0153uvre \u00f7 \u00ff"; },
     {{&V::DeptText, "Caf\xE9 \x9Cuvre \xF7 \xFF"}, {&V::DeptCapitals, "CAF\xC9 \x8CUVRE \xF7 \x9F"}}},
    {"a pallet", [](auto& t) { t.pack.PackTypeId = "pallet"; }, {{&V::PalletText, "PALLET"}}},
    {"no type", [](auto& t) { t.pack.SSCC = t.pack.PackTypeId = {}; }, {{&V::SSCCText, ""}, {&V::PalletText, ""}}},
    {"a short code", [](auto& t) { t.pack.SSCC = "9015"; }, {{&V::SSCCText, "9015"}}},
    {"more bytes than characters", [](auto& t) { t.hub.ShortName = "Z\u00fcrich S\u00fcd-Ost"; },
     {{&V::ToName, "Z\xFCrich S\xFC\x64"}}},
};
// clang-format on

TEST(LabelFieldsTest, ACartonSaysWhatTheRulesHaveItSay) {
  for (const Rule& rule : kRules) {
    SCOPED_TRACE(rule.name);
    LabelTrade trade;
    rule.change(trade);
    RecordStore& records = trade.system->Records();
    EXPECT_TRUE(Update(records, trade.vendor) && Update(records, trade.shipTo) && Update(records, trade.hub) &&
                Update(records, trade.order));
    const LabelValues values = Filled(trade);
    for (const auto& [value, expected] : rule.expected) EXPECT_EQ(values.*value, expected);
    EXPECT_TRUE(trade.reports.empty());
  }
}

TEST(LabelFieldsTest, NothingOfAnEarlierCartonStays) {
  LabelTrade trade;
  const LabelValues ordinary = Filled(trade);
  EXPECT_EQ(ordinary.ForAddress, "8 Sturt St");
  trade.order.TypeCode = "CO";
  EXPECT_TRUE(Update(trade.system->Records(), trade.order));
  const LabelValues customers = Filled(trade, ordinary);
  EXPECT_EQ(customers.ForName, "Ms. Customer");
  EXPECT_EQ(customers.ForAddress + customers.ForLocnName + customers.ForLocnNo, "");
  // What could not be read is empty, and so is what would have been filled behind it.
  trade.Sql("DROP TABLE \"tbShipment\"");
  const LabelValues broken = Filled(trade, ordinary);
  EXPECT_EQ(broken.CarrierName, "Linehaul");
  EXPECT_EQ(broken.ConNoteNo + broken.ToName + broken.ForName + broken.SSCCText + broken.POText, "");
  EXPECT_EQ(broken.FormatNo, ordinary.FormatNo);
  ASSERT_EQ(trade.reports.size(), 1U);
  EXPECT_THAT(trade.reports[0], testing::HasSubstr("occured in module cCMLSCM, Sub FillValues, line"));
}

}  // namespace
}  // namespace partnerkit::labels
