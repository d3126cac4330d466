#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

// --- What is stored

const std::string kOurs = R"(OrderId=1 VendorId="ACME" PartnerId="MGB" )";
const std::string kOrder = kOurs + R"(PONo="450001" PurposeCode="00" TypeCode="SA" PODate=2006-03-01 )";
const std::string kDates = "ImportDate=2006-03-08 NotBefore=2006-03-10 CancelAfter=2006-03-24 ";
const std::string kControls = R"(InterchangeCtl="1001" GroupCtl="202" TransactionCtl="33" FilePos=4)";
const std::string kLine = R"(LineId=1 OrderId=1 LineNo="7" ProductNo="93001" )";
const std::string kPriced = R"(UOM="CT" PriceCode="LE" Cost=12.5)";
const std::string kUsualLine = kLine + R"(SKU="555001" Quantity=24 )" + kPriced + " RetailPrice=29.95";
const std::string kCustomer = R"(CustomerRef="REF8" CustomerNo="CUST9")";
const std::string kLocn = R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900" )" + kCustomer;
const std::string kLocn2 = R"(LocnId=2 OrderId=1 VendorId="ACME" BuyingLocn="0513" ShipToLocn="0900" )" + kCustomer;
const std::string kAtLocn = R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512" )";
const std::string kLocnLine = kAtLocn + R"(LineRef="31" Quantity=24 AllocateQty=18)";

TEST(CsvSiblingsTest, StoresEveryMemberOfAnOrder) {
  const std::string second = "SEQUENTIALLINENO=9; INCOMINGPRODUCTNO=93002",
                    gift = "; HEADER1=Gift; HEADER2=Ann; HEADER4=Lee";
  const std::string customer =
      kOurs + R"(PONo="450001" PurposeCode="00" TypeCode="CO" PODate=2006-03-01 )" + kDates +
      R"(DeptNo="042" Header1="0401" Header2="Gift" Header3="NSW" SupplierNo="77001" CustomerRef="REF8" )"
      R"(CustCat="GIFTS" CustomerName="Ann  Lee" )" +
      kControls;
  const std::string gtinLine = kLine + R"(ProductQualifier="EN" GTIN="93001" Quantity=48 )" + kPriced;
  const std::string gtinLocnLine = kAtLocn + R"(GTIN="93001" LineRef="31" Quantity=48 AllocateQty=18)";
  const std::string gtinHeader =
      kDates + R"(Header2="DC7" SupplierNo="77001" CustomerRef="REF8" )" + kControls + " ResponseStatus=4";
  const std::string noControls = "INTCONTROLNO=; GRPCONTROLNO=; ";
  const std::string atShipTo = R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0900" ShipToLocn="0900" )" + kCustomer;
  const std::string colesPrices =
      R"(UOM="CT" PriceCode="LE" Cost=13.75 CostExGST="12.5" GSTRate="10" GSTAmount="1.25")";
  const struct {
    std::string className;
    Texts lines, records;
  } cases[] = {
      // clang-format off
      {kMgb, {""},
       {kOrder + kDates + R"(DeptNo="042" Header1="0401" SupplierNo="77001" CustomerRef="REF8" CustCat="GIFTS" )" +
        kControls,
        kUsualLine, kLocn, kLocnLine}},
      // Without any values.
      {kMgb,
       {"POPURPOSECODE=; POTYPECODE=; PODATE=; NOTBEFORE=20040231; CANCAFTER=2 May; ADDATE=; DEPTNO= ; CUSTOMERREF=; "
        "SUPPLIERNO=\"\"; CUSTCAT=; CUSTOMERNO=; SEQUENTIALLINENO=; UNITMEASURECODE=; UNITPRICECODE=; "
        "UNITPRICE=call us; ORDERQUANTITY=; SKUPRODUCTKEYCODE=; RETAILUNITPRICE=; ALLOCATEQUANTITY=; LINEREF=; "
        "INTCONTROLNO=; GRPCONTROLNO="},
       {kOurs + R"(PONo="450001" PurposeCode="" TypeCode="" ImportDate=2006-03-08 InterchangeCtl="" GroupCtl="" )"
        R"(TransactionCtl="33" FilePos=4)",
        R"(LineId=1 OrderId=1 LineNo="" ProductNo="93001" SKU="" UOM="" PriceCode="")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900")",
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512")"}},
      // A product at several locations is one line with the first one's price; DTS ships to the store itself; an empty
      // allocation is the whole quantity, "0" nothing.
      {kMgb,
       {"ADDATE=soon",
        "SEQUENTIALLINENO=8; BUYINGLOCPARTNERNO=0513; ORDERQUANTITY=6.5 CT; UNITPRICE=1; ALLOCATEQUANTITY=; LINEREF=32",
        "SEQUENTIALLINENO=9; BUYINGLOCPARTNERNO=0514; SHIPTOLOCPARTNERNO=DTS; INCOMINGPRODUCTNO=93002; "
        "ORDERQUANTITY=99999999999; ALLOCATEQUANTITY=0",
        "SEQUENTIALLINENO=10; INCOMINGPRODUCTNO=93002; SHIPTOLOCPARTNERNO=0513; CUSTOMERREF=LATER; ORDERQUANTITY=1"},
       {kOrder + kDates + R"(DeptNo="042" SupplierNo="77001" CustomerRef="REF8" CustCat="GIFTS" )" + kControls,
        kLine + R"(SKU="555001" Quantity=30.5 )" + kPriced + " RetailPrice=29.95",
        R"(LineId=2 OrderId=1 LineNo="9" ProductNo="93002" SKU="555001" Quantity=1e+11 )" + kPriced +
        " RetailPrice=29.95",
        kLocn, kLocn2,
        R"(LocnId=3 OrderId=1 VendorId="ACME" BuyingLocn="0514" ShipToLocn="0514" )" + kCustomer,
        kLocnLine,
        R"(Id=2 OrderId=1 LineId=1 LocnId=2 ProductNo="93001" BuyingLocn="0513" LineRef="32" Quantity=6.5 )" +
        std::string("AllocateQty=6.5"),
        R"(Id=3 OrderId=1 LineId=2 LocnId=3 ProductNo="93002" BuyingLocn="0514" LineRef="31" Quantity=1e+11)",
        R"(Id=4 OrderId=1 LineId=2 LocnId=1 ProductNo="93002" BuyingLocn="0512" LineRef="31" Quantity=1 )" +
        std::string("AllocateQty=18")}},
      {kMyer, {""},
       {kOrder + kDates + R"(DeptNo="042" SupplierNo="77001" CustomerRef="REF8" CustCat="GIFTS" )" + kControls,
        kUsualLine, kLocn, kLocnLine}},
      // Products are counted, whatever the file numbers them.
      {kGhpl, {"SEQUENTIALLINENO=6", second, "SEQUENTIALLINENO=5; BUYINGLOCPARTNERNO=0513; ORDERQUANTITY=2"},
       {kOrder + kDates + R"(DeptNo="042" CustomerRef="REF8" )" + kControls,
        R"(LineId=1 OrderId=1 LineNo="1" ProductNo="93001" SKU="555001" Quantity=26 )" + kPriced + " RetailPrice=29.95",
        R"(LineId=2 OrderId=1 LineNo="2" ProductNo="93002" SKU="555001" Quantity=24 )" + kPriced + " RetailPrice=29.95",
        kLocn, kLocn2, kLocnLine,
        R"(Id=2 OrderId=1 LineId=2 LocnId=1 ProductNo="93002" BuyingLocn="0512" LineRef="31" Quantity=24 )" +
        std::string("AllocateQty=18"),
        R"(Id=3 OrderId=1 LineId=1 LocnId=2 ProductNo="93001" BuyingLocn="0513" LineRef="31" Quantity=2 )" +
        std::string("AllocateQty=18")}},
      {kTarget, {""},
       {kOrder + kDates + R"(Header1="20060401" Header2="NSW" Header3="PROMO" CustomerRef="REF8" )" + kControls,
        kUsualLine + R"( PackUOM="IN" PackSize="6")", kLocn, kLocnLine}},
      {kTarget, {"ADDATE=; STOREZONE=; HEADER1=; UNITSINNERPACK=; BUYINGLOCPARTNERNO="},
       {kOrder + kDates + R"(CustomerRef="REF8" )" + kControls, kUsualLine, atShipTo,
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0900" LineRef="31" Quantity=24 )"
        "AllocateQty=18"}},
      {kMgbbt, {"STOREZONE=" + gift},
       {kOrder + kDates + R"(DeptNo="042" Header1="0401" SupplierNo="77001" CustomerRef="REF8" CustCat="GIFTS" )" +
        kControls,
        kUsualLine, kLocn, kLocnLine}},
      {kMgbbt, {gift.substr(2)}, {customer, kUsualLine, kLocn, kLocnLine}},
      // A customer's repeated line adds up; an empty allocation is its whole quantity.
      {kMgbbt, {gift.substr(2), "SEQUENTIALLINENO=8; ORDERQUANTITY=6; ALLOCATEQUANTITY=",
       "SEQUENTIALLINENO=9; ORDERQUANTITY=0; ALLOCATEQUANTITY=2"},
       {customer, kLine + R"(SKU="555001" Quantity=30 )" + kPriced + " RetailPrice=29.95", kLocn,
        kAtLocn + R"(LineRef="31" Quantity=30 AllocateQty=26)"}},
      // Lines without a sequence or a product are text.
      {kKmart, {"", "SEQUENTIALLINENO=0; INCOMINGPRODUCTNO=93002", "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=",
       "SEQUENTIALLINENO=; INCOMINGPRODUCTNO=93003"},
       {kOrder + kDates +
        R"(DeptNo="042" Header1="0401" Header2="2" Header4="NSW" SupplierNo="77001" CustomerRef="REF8" )" + kControls,
        kLine + "Quantity=24 " + kPriced + R"( PackUOM="IN" PackSize="6" PackCount="4")", kLocn, kLocnLine}},
      {kKmart, {"ADDATE=060401; POVERSIONNO=; DEPTNO=; SUPPLIERNO=; STOREZONE=; POTYPECODE=RL"},
       {kOurs + R"(PONo="450001 REL# " PurposeCode="00" TypeCode="RL" PODate=2006-03-01 )" + kDates +
        R"(DeptNo="" Header1="060401" Header4="" SupplierNo="" CustomerRef="REF8" )" + kControls,
        kLine + "Quantity=24 " + kPriced + R"( PackUOM="IN" PackSize="6" PackCount="4")", kLocn, kLocnLine}},
      {kOfficeworks, {""},
       {kOrder + kDates + R"(Header1="0401" Header2="77001" SupplierNo="77001" CustomerRef="REF8" )" + kControls,
        kLine + R"(Quantity=24 Cost=12.5 PackSize="6" PackCount="4")", kLocn, kLocnLine}},
      {kOfficeworks, {"CANCAFTER=; ADDATE=; SUPPLIERNO=; UNITSINNERPACK=0; CARTONSOUTER="},
       {kOrder + R"(ImportDate=2006-03-08 NotBefore=2006-03-10 CancelAfter=2006-03-10 Header1="" Header2="" )"
        R"(SupplierNo="" CustomerRef="REF8" )" + kControls,
        kLine + R"(Quantity=24 Cost=12.5 PackSize="1" PackCount="1")", kLocn, kLocnLine}},
      {kCml, {"UNITMEASURECODE=EA"},
       {kOurs + R"(PONo="450001 #0900" PurposeCode="00" TypeCode="220" PODate=2006-03-01 )" + gtinHeader,
        kLine + R"(ProductQualifier="EN" GTIN="93001" Quantity=48 UOM="EA" PriceCode="LE" Cost=12.5 )"
        "DeliveryDate=2006-03-20", kLocn, gtinLocnLine}},
      // Nothing traded, and what a change neither accepts nor alters, isn't ordered. Straight to the ship-to: one date.
      {kCml, {noControls + "PONUMBER=450001000; POTYPECODE=231; STATUS=5; BUYINGLOCPARTNERNO=0900; "
       "UNITMEASURECODE=; DELDATE=; ALLOCATEQUANTITY=",
       noControls + "PONUMBER=450001000; POTYPECODE=231; STATUS=4; BUYINGLOCPARTNERNO=0513; INCOMINGPRODUCTNO=93002",
       noControls + "PONUMBER=450001000; POTYPECODE=231; STATUS=3; TRADEDQUANTITY=0; INCOMINGPRODUCTNO=93003"},
       {kOurs + R"(PONo="450001000" PurposeCode="00" TypeCode="231" PODate=2006-03-01 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-15 CancelAfter=2006-03-15 POADate=2006-03-01 Header2="DC7" SupplierNo="77001" )"
        R"(CustomerRef="REF8" TransactionCtl="33" FilePos=4 ResponseStatus=4)",
        gtinLine, atShipTo,
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0900" GTIN="93001" LineRef="31" )"
        R"(Quantity=48 AllocateQty=48)"}},
      {kBulk, {"UNITMEASURECODE=EA", "POTYPECODE=SA; INCOMINGPRODUCTNO=93002"},
       {kOurs + R"(PONo="450001" PurposeCode="00" TypeCode="220" PODate=2006-03-01 )" + gtinHeader,
        gtinLine + R"( PackSize="6")", kLocn, gtinLocnLine}},
      {kBulk, {noControls + "NOTBEFORE=; CANCAFTER=; DELIVERYPARTY=; UNITSINNERPACK="},
       {kOurs + R"(PONo="450001" PurposeCode="00" TypeCode="220" PODate=2006-03-01 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-08 CancelAfter=2006-03-08 Header2="" SupplierNo="77001" CustomerRef="REF8" )"
        R"(TransactionCtl="33" FilePos=4 ResponseStatus=4)",
        gtinLine, kLocn, gtinLocnLine}},
      {kColes, {""},
       {kOrder + kDates +
        R"(SupplierNo="77001" CustomerRef="REF8" InterchangeCtl="1001" TransactionCtl="33" FilePos=4)",
        kLine + R"(ProductQualifier="EN" SKU="555001" Quantity=24 )" + colesPrices +
        R"( PackUOM="EA" PackCount="12")", kLocn, kLocnLine}},
      {kColes, {noControls + "PACKUOM=CT; ORDERQUANTITY=3; ALLOCATEQUANTITY=",
       noControls + "SEQUENTIALLINENO=8; INCOMINGPRODUCTNO=93002; PACKUOM=; CARTONSOUTER=; GSTRATE=; GSTAMOUNT=; "
       "UNITPRICEEXGST=; UNITMEASURECODE=; PRODUCTQUALIFIER=; SKUPRODUCTKEYCODE="},
       {kOrder + kDates + R"(SupplierNo="77001" CustomerRef="REF8" TransactionCtl="33" FilePos=4)",
        kLine + R"(ProductQualifier="EN" SKU="555001" Quantity=36 )" + colesPrices +
        R"( PackUOM="CT" PackCount="12")",
        R"(LineId=2 OrderId=1 LineNo="8" ProductNo="93002" Quantity=24 PriceCode="LE" Cost=13.75)", kLocn,
        kAtLocn + R"(LineRef="31" Quantity=36 AllocateQty=36)",
        R"(Id=2 OrderId=1 LineId=2 LocnId=1 ProductNo="93002" BuyingLocn="0512" LineRef="31" Quantity=24 )" +
        std::string("AllocateQty=18")}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.lines.front());
    Siblings trade(c.className);
    const auto run = trade.Import("x\r\n" + Lines(trade, c.lines));
    ASSERT_EQ(run.rows, 1);
    EXPECT_EQ(run.outcomes[0].result, 1);
    EXPECT_EQ(trade.StoredRecords(), c.records);
    EXPECT_EQ(trade.Orders(), "x\r\n");
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvSiblingsTest, TargetsBulkVendorOrdersByGtin) {
  Siblings trade(kTarget);
  trade.Stored(With<Vendor>([](Vendor& vendor) { vendor.VendorId = "TARGETBULK"; }));
  trade.document.VendorId = "TARGETBULK";
  trade.Sql("UPDATE tbPartnerLocn SET VendorId = 'TARGETBULK'");
  EXPECT_THAT(trade.Import(Lines(trade, {""})).log, ElementsAre("0 Process: PO 450001 import completed."));
  EXPECT_THAT(trade.Every<OrderLine>(), ElementsAre(kLine + R"(GTIN="93001" SKU="555001" Quantity=24 )" + kPriced +
                                                    R"( RetailPrice=29.95 PackUOM="IN" PackSize="6")"));
  EXPECT_THAT(trade.Every<OrderLocnLine>(),
              ElementsAre(kAtLocn + R"(GTIN="93001" LineRef="31" Quantity=24 AllocateQty=18)"));
}

// --- What is checked

// Keeps a line from making its product.
const std::string kNoStyle = "STYLE=; COLOUR=; SIZE=";

TEST(CsvSiblingsTest, TellsEveryFaultOfAnOrder) {
  const auto product = [](const std::string& number) { return "INCOMINGPRODUCTNO=" + number; };
  const std::string differs = "UNITMEASURECODE=EA; PRODUCTQUALIFIER=UP; RETAILUNITPRICE=1; SKUPRODUCTKEYCODE=x";
  const std::string unit = "product 93001 UOM EA does not agree with database UOM CT";
  const std::string symbology = "barcode 93001 symbology UP does not agree with database symbology EN";
  const std::string cost = "product 93001 cost price 12.51 does not agree with database cost 12.5";
  const std::string retail = "product 93001 retail price 1 does not agree with database retail 29.95";
  const std::string sku = "product 93001 SKU x does not agree with database SKU 555001";
  const std::string warned = "R Process: ...Warning PO 450001, " + symbology;
  const std::string none = "product 93009 does not exist.", others = "product 93005 does not exist for vendor MGB";
  const std::string othersGtin = "GTIN 193006 does not exist for vendor MGB";
  const std::string noPrice = "pricing details for product 93009 does not exist.";
  const std::string noCost = "product 93009 cost price 12.50 does not agree with database cost 0";
  const std::string carton = "; PACKUOM=CT; CARTONSOUTER=";
  const std::string noShipTo = Refused("ship to location 0999 does not exist.");
  const std::string noStore = Refused("ship to location DTS does not exist.");
  const std::string noBuying = Refused("buying location 0888 does not exist.");
  const std::string toStore = "SHIPTOLOCPARTNERNO=DTS", noPlace = "SHIPTOLOCPARTNERNO=0999";
  const std::string elsewhere = "BUYINGLOCPARTNERNO=0888", received = "SHIPTOLOCPARTNERNO=; BUYINGLOCPARTNERNO=";
  const struct {
    std::string className;
    int validate;
    Texts lines;
    Texts faults;
    std::string productNo = "93001";  // of the stored line
    bool warns = false;               // the order is posted all the same
  } cases[] = {
      // clang-format off
      {kMgb, kAll, {""}, {}},
      {kMgb, kAll, {"UNITPRICE=012.5 ; RETAILUNITPRICE=29.950"}, {}},
      {kMgb, kCost | kRetail, {product("93009")}, {}, "93009"},
      {kMgb, kAll, {product("93009")},
       {Refused(none), Refused(noPrice), Refused(noCost),
        Refused("product 93009 retail price 29.95 does not agree with database retail 0"),
        Refused("product 93009 SKU 555001 does not agree with database SKU ")}},
      {kMgb, kProduct, {product("93005")}, {Refused(others)}},
      {kMgb, kProduct, {"UNITMEASURECODE=EA; PRODUCTQUALIFIER=UP"}, {Refused(unit)}},
      {kMgb, kProduct, {"PRODUCTQUALIFIER=UP"}, {Refused(symbology)}},
      {kMgb, kProduct | kCost, {"UNITPRICE=12.51; RETAILUNITPRICE=1"}, {Refused(cost)}},
      {kMgb, kProduct | kRetail, {"UNITPRICE=1; RETAILUNITPRICE=$29; SKUPRODUCTKEYCODE=x"},
       {Refused("product 93001 retail price $29 does not agree with database retail 29.95"), Refused(sku),
        "W Process: PO 450001, line 1: RETAILUNITPRICE \"$29\" is not a number; it is read as 0."}},
      // One message for each product, and for a location each time that it changes.
      {kMgb, kProduct, {product("93009"), product("93009") + "; BUYINGLOCPARTNERNO=0513"}, {Refused(none)}},
      {kMgb, kNothing, {elsewhere, elsewhere + "; " + product("93002"), noPlace, elsewhere + "; " + noPlace + "; " +
       product("93003")}, {noBuying, noShipTo, noBuying}},
      {kMgb, kNothing, {noPlace + "; " + elsewhere}, {noShipTo, noBuying}},
      {kMgb, kNothing, {toStore + "; BUYINGLOCPARTNERNO=0999"}, {noShipTo}},
      {kMgb, kNothing, {received}, {Refused("ship to location  does not exist.")}},

      {kMyer, kAll, {differs}, {Refused(unit), Refused(retail), Refused(sku)}},
      {kMyer, kNothing, {toStore}, {}},

      {kGhpl, kAll, {differs}, {}},
      {kGhpl, kAll, {"UNITPRICE=12.51"}, {Refused(cost)}},
      {kGhpl, kNothing, {toStore}, {noStore}},

      {kTarget, kAll, {differs}, {Refused(unit), Refused(retail), Refused(sku)}},
      {kTarget, kProduct, {product("93005")}, {}, "93005"},
      {kTarget, kProduct, {product("93006")}, {Refused("product 93006 does not exist for vendor MGB")}},
      {kTarget, kNothing, {toStore}, {noStore}},

      {kMgbbt, kAll, {differs}, {}},
      {kMgbbt, kAll, {"UNITPRICE=12.51"}, {Refused(cost)}},
      {kMgbbt, kNothing, {toStore}, {noStore}},

      {kKmart, kAll, {differs}, {warned}, "93001", true},
      {kKmart, kAll, {product("93009")}, {InError(none), InError(noPrice), InError(noCost)}},
      {kKmart, kProduct, {product("93005")}, {InError(others)}},
      {kKmart, kNothing, {toStore}, {noStore}},
      // Without a ship-to the goods go through where the buying location receives.
      {kKmart, kNothing, {received + "0512"}, {}},
      {kKmart, kNothing, {received + "0513"}, {noShipTo}},
      {kKmart, kNothing, {received + "0514"}, {Refused("ship to location 0514 does not exist.")}},
      {kKmart, kNothing, {received + "0888"}, {Refused("ship to location 0888 does not exist.")}},

      {kOfficeworks, kAll, {differs}, {warned}, "93001", true},
      {kOfficeworks, kAll, {product("93009")}, {Refused(none), Refused(noPrice), Refused(noCost)}},
      {kOfficeworks, kProduct, {"UNITSINNERPACK=5"},
       {Refused("93001 inner for 5 does not exist."), Refused("93001 outer for 4 does not exist.")}},
      {kOfficeworks, kProduct, {"UNITSINNERPACK=5; CARTONSOUTER=1"}, {Refused("93001 inner for 5 does not exist.")}},
      {kOfficeworks, kProduct, {"UNITSINNERPACK=24; CARTONSOUTER=0"}, {}},
      {kOfficeworks, kProduct, {"UNITSINNERPACK=; CARTONSOUTER=6"}, {}},
      {kOfficeworks, kProduct, {"UNITSINNERPACK=5; " + product("93002")}, {}, "93002"},
      {kOfficeworks, kNothing, {toStore}, {noStore}},
      {kOfficeworks, kNothing, {elsewhere}, {noBuying}},

      {kBulk, kAll, {product("193001") + "; " + differs}, {}},
      {kBulk, kAll, {product("193001") + "; UNITPRICE=12.51"}, {Refused(cost)}},
      {kBulk, kProduct, {product("193005")}, {}, "93005"},
      {kBulk, kProduct, {product("193006")}, {Refused(othersGtin)}},
      {kBulk, kProduct, {product("193009")}, {Refused("GTIN 193009 does not exist.")}},
      {kBulk, kProduct, {product("193001") + "; UNITSINNERPACK=5"},
       {Refused("GTIN 193001 inner pack quantity 6 does not match order 5")}},
      {kBulk, kProduct, {product("193001") + "; UNITSINNERPACK="}, {}},
      {kBulk, kNothing, {elsewhere}, {}},

      // As Target's bulk orders, but for the inner's quantity.
      {kCml, kProduct, {product("193005") + "; UNITSINNERPACK=7"}, {}, "93005"},
      {kCml, kProduct, {product("193006")}, {Refused(othersGtin)}},

      {kColes, kAll, {differs}, {Refused(unit)}},
      {kColes, kProduct, {"PRODUCTQUALIFIER=UP"}, {Refused(symbology)}},
      {kColes, kProduct, {product("93006")}, {}, "93006"},
      {kColes, kAll, {product("P100") + carton + "12"}, {}},
      {kColes, kProduct, {product("P100") + carton + "11"}, {Refused("GTIN P100 does not exist.")}},
      {kColes, kProduct, {product("P200") + carton + "12"}, {Refused("GTIN P200 does not exist.")}},
      {kColes, kAll, {product("193001") + carton + "6"}, {}},
      {kColes, kProduct, {product("193001") + carton + "7"},
       {Refused("GTIN 193001 does not exist with inner quantity 7")}},
      {kColes, kProduct, {product("193005") + carton + "6"}, {}, "93005"},
      {kColes, kProduct, {product("193006") + carton + "6"}, {Refused(othersGtin)}},
      {kColes, kProduct | kCost, {"UNITPRICEEXGST=12; UNITPRICEINCGST=13; GSTRATE=9"},
       {Refused("product 93001 GST Inc price 12 does not agree with database gross 12.5"),
        Refused("product 93001 GST Ex price 13 does not agree with database net 13.75"),
        Refused("product 93001 GST rate 9 does not agree with database rate 10")}},
      {kColes, kProduct | kCost, {"GSTRATE="}, {}},
      {kColes, kNothing, {toStore + "; " + elsewhere}, {}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.lines.front());
    Siblings trade(c.className);
    trade.AddMasters();
    trade.Sql("UPDATE tbPartnerLocn SET DeliverToCode = '0900' WHERE PartnerLocnNo = '0512'");
    trade.Sql("UPDATE tbPartnerLocn SET DeliverToCode = '0999' WHERE PartnerLocnNo = '0513'");
    Set(trade.document, c.validate);
    Texts given = c.lines;
    for (std::string& line : given) line += (line.empty() ? "" : "; ") + kNoStyle;
    const std::string order = Lines(trade, given);
    const auto run = trade.Import(order);
    ASSERT_EQ(run.rows, 1);
    const bool posted = c.faults.empty() || c.warns;
    Texts told = c.faults;
    told.push_back(posted ? kCompleted : kIncomplete);
    // CML's short numbers go by their ship-to.
    for (std::string& text : told) {
      if (c.className == kCml) text = Replaced(text, "PO 450001", "PO 450001 #0900");
    }
    EXPECT_EQ(run.outcomes[0].told, told);
    EXPECT_EQ(run.outcomes[0].result, posted ? 1 : 0);
    EXPECT_EQ(trade.Orders(), posted ? "" : order);
    EXPECT_TRUE(run.term);
    const auto lines = trade.Every<OrderLine>();
    ASSERT_EQ(lines.size(), posted ? 1U : 0U);
    if (posted) {
      EXPECT_THAT(lines[0], HasSubstr("ProductNo=\"" + c.productNo + "\""));
    }
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(CsvSiblingsTest, ChecksMerchandiseAsMgbDoes) {
  Siblings trade(kMgbbt);
  trade.AddMasters();
  Set(trade.document, kAll);
  const auto run = trade.Import(trade.Line("STOREZONE=; UNITMEASURECODE=EA; RETAILUNITPRICE=1; " + kNoStyle));
  EXPECT_THAT(run.log, ElementsAre("R MerchPOProcess: ...Cannot process PO 450001, product 93001 UOM EA does not agree "
                                   "with database UOM CT",
                                   "R MerchPOProcess: ...Cannot process PO 450001, product 93001 retail price 1 does "
                                   "not agree with database retail 29.95",
                                   "0 MerchPOProcess: PO 450001 import incomplete."));
}

TEST(CsvSiblingsTest, CmlOrdersOnPallets) {
  Siblings trade(kCml);
  trade.Sql("UPDATE tbPackType SET ShipPackCode = 'CARTON'");
  const std::string order = Lines(trade, {""});
  EXPECT_THAT(trade.Import(order).log,
              ElementsAre("W Process: ... Cannot process order 450001 #0900, PALLET Package Type not found."));
  EXPECT_THAT(trade.StoredOrders(), IsEmpty());
  EXPECT_EQ(trade.Orders(), order);
}

// Where orders are acknowledged, a Kmart order is stored with its faults, for the acknowledgement to tell of them.
TEST(CsvSiblingsTest, KmartStoresAnOrderWithErrorsThatIsAnswered) {
  const struct {
    std::string code, partner, line;
    bool stores;
  } cases[] = {
      {"855", "MGB", "", true},     {"ORDRSP", "MGB", "", true},
      {"poa", "MGB", "", true},     {"So", "MGB", "", true},
      {"ordrsp", "MGB", "", false}, {"850", "MGB", "", false},
      {"855", "MYER", "", false},   {"855", "MGB", "; BUYINGLOCPARTNERNO=0888", false},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.code + " of " + c.partner + c.line);
    Siblings trade(kKmart);
    trade.UseBackup();
    Set(trade.document, kProduct);
    trade.AddDocument(c.partner, c.code);
    const std::string order = Lines(trade, {"INCOMINGPRODUCTNO=93009" + c.line + "; " + kNoStyle});
    const auto run = trade.Import(order);
    Texts log = {InError("product 93009 does not exist.")};
    if (!c.line.empty()) log.push_back(Refused("buying location 0888 does not exist."));
    log.push_back(c.stores ? kWithErrors : kIncomplete);
    EXPECT_EQ(run.log, log);
    EXPECT_EQ(run.outcomes.at(0).told, log);
    EXPECT_EQ(run.outcomes.at(0).result, 0);
    EXPECT_EQ(trade.StoredOrders(), c.stores ? Texts{"450001/9"} : Texts());
    EXPECT_EQ(trade.StoredRecords().size(), c.stores ? 4U : 0U);
    EXPECT_EQ(trade.Orders(), c.stores ? "" : order);
    EXPECT_EQ(trade.Backup(), c.stores ? order : "");
  }
}

TEST(CsvSiblingsTest, ColesWritesTheShipTosAddress) {
  Siblings trade(kColes);
  trade.vendor.Name = "Acme Toys";
  trade.Sql("DELETE FROM tbPartnerLocn WHERE PartnerLocnNo <> '0900'");
  trade.Sql("UPDATE tbPartnerLocn SET Name = 'Old', ContactNo = 'C1'");
  trade.Import(
      Lines(trade, {"",
                    "SHIPTOLOCPARTNERNO=0777; BUYINGLOCPARTNERNO=0513; HEADER1=Coles Store; HEADER2=; HEADER3=Kew; "
                    "HEADER4=NT; HEADER5=0800"}));
  EXPECT_THAT(trade.Every<PartnerLocn>(),
              UnorderedElementsAre(
                  R"(VendorId="ACME" PartnerLocnNo="0900" Name="Coles DC" ShortName="Acme Toys" Address1="1 Dock Rd" )"
                  R"(Suburb="Altona" State="VIC" Postcode="3018" ContactNo="C1")",
                  R"(VendorId="ACME" PartnerLocnNo="0777" Name="Coles Store" ShortName="Acme Toys" Address1="" )"
                  R"(Suburb="Kew" State="NT" Postcode="0800")"));
}

}  // namespace
}  // namespace partnerkit::testing
