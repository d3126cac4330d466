// What stands in each column of each partner's notice.
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

// Each class's columns and what they show of the usual pack, and behind them some names that only other classes know.
struct Columns {
  const char* className;
  std::string shown;  // "NAME=value NAME= ..."
};

const std::string kMgbColumns =
    "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
    "SHIPNOTETYPECODE=00 SHIPNOTESTATUS=PR COMPANYCODE=CC8 PARTNERSUPPLIERNO=PS9 CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 "
    "SCHEDULEDATE=060309 DELIVERYDATE=060320 SHIPTOCODE=0900 SHIPPACKCODE=CTN30 SHIPMENTWEIGHT=123.46 "
    "SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=060301 PACKERID=PK4 ORDERSTATUSCODE= BUYSTORECODE=0512 "
    "DELREFERENCE=INV77 ORDERPACKCODE= INVOICENO=INV77 CONTAINERNO=SSCC1 PACKAGETYPECODE=P02 PACKWEIGHT=7.25 "
    "PACKLENGTH=40.5 PACKWIDTH=30 PACKHEIGHT=20 INHOUSEPRODNO=TRAIN APN=93001 INNERSPERPACK= UNITSPERPACK= "
    "QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32 CONTAINERNO=SSCC1 shipnoteno= DATESHIPPED= BILLOFLADINGNO= POVERSIONNO= "
    "PALLETNO= GTIN= SUBSSCC1=";

const Columns kColumns[] = {
    {kMgb, kMgbColumns},
    {kMyerDrop, kMgbColumns},
    {kTargetNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=000001001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=00 BILLOFLADINGNO=BL7 SHIPMENTWEIGHT=123.46 CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 "
     "SCHEDULEDATE=060309 DELIVERYDATE=060320 DATESHIPPED=060309 SHIPTOCODE=0900 SHIPPACKCODE=CTN30 ORDERNO=450001 "
     "ORDERSTATUSCODE=SS BUYSTORECODE=0512 DELREFERENCE=INV77 INVOICENO=INV77 PACKERID=PK4 PALLETNO=PAL5 "
     "PALLETMARKTYPE= PALLETTYPECODE= CONTAINERNO=SSCC1 PACKMARKTYPE=GM PACKTYPECODE=P02 INNERSPERPACK= "
     "PACKLENGTH=40.5 PACKWIDTH=30 PACKHEIGHT=20 PACKWEIGHT=7.25 INHOUSEPRODNO=TRAIN APN=93001 QUANTITYSHIPPED=6 "
     "COST=12.5 LINEREF=SL32 SHIPNOTESTATUS= COMPANYCODE= PARTNERSUPPLIERNO= SHIPMENTVOLUME= ORDERDATE= "
     "PACKAGETYPECODE= ORDERPACKCODE= POVERSIONNO="},
    {kKmartNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=00 CONSIGNMENTNOTENO=CN5 SHIPMENTWEIGHT=123.46 SCHEDULEDATE=060309 DELIVERYDATE=060320 "
     "SHIPTOCODE=0900 SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=060301 ORDERSTATUSCODE=SS POVERSIONNO=V2 "
     "BUYSTORECODE=0512 INVOICENO=INV77 PACKERID=PK4 PALLETNO=PAL5 PALLETMARKTYPE= PALLETTYPECODE= "
     "CONTAINERNO=SSCC1 PACKMARKTYPE=GM PACKAGETYPECODE=CTN30 PACKWEIGHT=7.25 INHOUSEPRODNO=TRAIN APN=93001 "
     "QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32 BOOKINGNO= DATESHIPPED= PACKTYPECODE= PARTNERSUPPLIERNO= "
     "DELREFERENCE= SHIPPACKCODE= PACKLENGTH= SHIPNOTESTATUS="},
    {kOfficeworksNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=9 CONSIGNMENTNOTENO=CN5 SCHEDULEDATE=060309 DELIVERYDATE=20060320 DATESHIPPED=20060309 "
     "SHIPTOCODE=0900 SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=20060301 PARTNERSUPPLIERNO=PS9 "
     "ORDERSTATUSCODE=165 POVERSIONNO=V2 BUYSTORECODE=0512 INVOICENO=INV77 PACKERID=PK4 PALLETNO=PAL5 "
     "PALLETMARKTYPE= PALLETTYPECODE= CONTAINERNO=SSCC1 PACKMARKTYPE=GM PACKTYPECODE=CTN30 PACKWEIGHT=7.25 "
     "INHOUSEPRODNO=TRAIN APN=93001 QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32 BOOKINGNO= SHIPMENTWEIGHT= "
     "PACKAGETYPECODE= DELREFERENCE= SHIPPACKCODE= PACKLENGTH= SHIPNOTESTATUS="},
    {kMgbbtNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=00 SHIPNOTESTATUS=PR COMPANYCODE=CC8 PARTNERSUPPLIERNO=PS9 CONSIGNMENTNOTENO=CN5 "
     "DATESHIPPED=060309 DELIVERYDATE=060320 SHIPTOCODE=0900 SHIPPACKCODE=CTN30 SHIPMENTWEIGHT=123.46 "
     "SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=060301 PACKERID=PK4 ORDERSTATUSCODE= BUYSTORECODE=0512 "
     "DELREFERENCE=INV77 ORDERPACKCODE= INVOICENO=INV77 CONTAINERNO=SSCC1 PACKAGETYPECODE=P02 PACKWEIGHT=7.25 "
     "PACKLENGTH=40.5 PACKWIDTH=30 PACKHEIGHT=20 INHOUSEPRODNO=TRAIN APN=93001 INNERSPERPACK= UNITSPERPACK= "
     "QUANTITYSHIPPED=6 LINEREF=SL32 SUBSSCC1=SUB1 SUBSSCC2=SUB2 SUBSSCC3=SUB3 SUBSSCC4=SUB4 SUBSSCC5=SUB5 "
     "SUBSSCC6=SUB6 SUBSSCC7=SUB7 SUBSSCC8=SUB8 SUBSSCC9=SUB9 SUBSSCC10=SUB10 SUBSSCC11=SUB11 SUBSSCC12=SUB12 "
     "SUBSSCC13=SUB13 SUBSSCC14=SUB14 SUBSSCC15=SUB15 SUBSSCC16=SUB16 SUBSSCC17=SUB17 SUBSSCC18=SUB18 "
     "SUBSSCC19=SUB19 SUBSSCC20=SUB20 SUBSSCC21= SUBSSCC0= BOOKINGNO= SCHEDULEDATE= COST= PALLETNO="},
    {kCmlAdvice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=20060308 SHIPNOTETYPECODE=351 "
     "SHIPNOTEFUNCTIONCODE=9 SHIPNOTESTATUS=PR CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 INVOICENO=INV77 "
     "DELIVERYDATE=20060320 DATESHIPPED=20060309 SHIPTOCODE=0900 SHIPMENTWEIGHT=123.456 PARTNERSUPPLIERNO=PS9 "
     "SHIPMENTCOUNT=2 SHIPMENTPALLETCOUNT=1 ORDERNO=450001 ORDERDATE=20060301 ORDERSTATUSCODE=165 "
     "BUYSTORECODE=0512 DELREFERENCE=INV77 PALLETTYPECODE=09 CONTAINERNO=SSCC1 PACKAGETYPECODE=P02 WEIGHT=7.25 "
     "INHOUSEPRODNO=TRAIN GTIN=193001 TRADEDQUANTITY=6 BESTBEFORE=20060405 EXPIRATION=20060506 DETAIL1=BATCH8 "
     "SEQUENTIALLINENO=1 SYMBOLOGY= PACKERID=PK4 COST=12.5 DELLINEREF= SCHEDULEDATE= SHIPNOTETIME= APN= "
     "QUANTITYSHIPPED= LINEREF= PACKWEIGHT= PALLETNO= COMPANYCODE="},
    {kBulkAdvice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=20060308 SHIPNOTETYPECODE=00 "
     "SHIPNOTEFUNCTIONCODE= SHIPNOTESTATUS=PR CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 INVOICENO=INV77 "
     "DELIVERYDATE=20060320 DATESHIPPED=20060309 SCHEDULEDATE=060309 SHIPTOCODE=0900 SHIPMENTWEIGHT=123.456 "
     "PARTNERSUPPLIERNO=PS9 SHIPMENTCOUNT=2 SHIPMENTPALLETCOUNT=1 ORDERNO=450001 ORDERDATE=20060301 "
     "ORDERSTATUSCODE=165 BUYSTORECODE=0512 DELREFERENCE=INV77 PALLETTYPECODE=09 CONTAINERNO=SSCC1 "
     "PACKAGETYPECODE=P02 WEIGHT=7.25 INHOUSEPRODNO=TRAIN GTIN=193001 TRADEDQUANTITY=6 BESTBEFORE=20060405 "
     "EXPIRATION=20060506 DETAIL1=BATCH8 SEQUENTIALLINENO=1 SYMBOLOGY= PACKERID=PK4 COST= DELLINEREF= SHIPNOTETIME= "
     "APN= QUANTITYSHIPPED= LINEREF= PACKWEIGHT= PALLETNO= COMPANYCODE="},
};

TEST(CsvNoticeColumnsTest, ShowEachValueOfEachClassInTheMapsOrder) {
  for (const Columns& columns : kColumns) {
    Texts shown = Words(columns.shown);
    for (const bool reversed : {false, true}) {
      SCOPED_TRACE(std::string(columns.className) + (reversed ? ", reversed" : ""));
      if (reversed) std::ranges::reverse(shown);
      std::string map, line;
      for (const std::string& each : shown) {
        map += each.substr(0, each.find('=')) + " ";
        line += each.substr(each.find('=') + 1) + ",";
      }
      PackedTrade trade(columns.className, map);
      const std::int32_t lead = trade.AddPack();
      for (int n = 1; n <= 20; ++n) {
        trade.AddPack([&](Pack& sub) { sub.LeadPackId = lead, sub.SSCC = "SUB" + std::to_string(n); }, {});
      }
      EXPECT_THAT(trade.Compiled(), ElementsAre(line));
    }
  }
}

// One pack, a few columns: what the records make of them.
struct Value {
  const char* classes;
  const char* columns;
  std::string change;  // of the store
  const char* line;
};

std::string PONo(const std::string& number) { return "UPDATE tbOrder SET PONo = '" + number + "'"; }

const Value kValues[] = {
    // Measures, weights and pack types.
    {kMgb, "PACKWEIGHT PACKLENGTH PACKWIDTH PACKHEIGHT",
     "UPDATE tbPack SET Weight = NULL; UPDATE tbPackType SET Length = 0, Width = 0, Height = 0", "1.0,1,1,1,"},
    {kMgb, "PACKWEIGHT PACKLENGTH PACKWIDTH PACKHEIGHT SHIPPACKCODE PACKAGETYPECODE",
     "UPDATE tbPack SET Weight = 0, PackTypeId = NULL", "1.0,1,1,1,CTN25,P01,"},
    {kMgb, "SHIPPACKCODE PACKAGETYPECODE CONTAINERNO", "UPDATE tbPack SET PackTypeId = 'NONE'", ",,SSCC1,"},
    {kMgb, "PACKWEIGHT SHIPMENTWEIGHT", "UPDATE tbPack SET Weight = 0.5; UPDATE tbShipment SET Weight = 12000",
     "0.5,12000.0,"},
    {kMgb, "CONTAINERNO SHIPMENTWEIGHT SHIPMENTVOLUME", "UPDATE tbShipment SET Weight = NULL, Volume = NULL",
     "SSCC1,,,"},
    {kCmlAdvice, "WEIGHT SHIPMENTWEIGHT", "UPDATE tbPack SET Weight = 0; UPDATE tbShipment SET Weight = 12000",
     "1.0,12000,"},
    {kCmlAdvice, "WEIGHT SHIPMENTWEIGHT", "UPDATE tbShipment SET Weight = NULL", "7.25,,"},
    {kCmlAdvice, "PALLETTYPECODE", "UPDATE tbPack SET PackTypeId = 'RollCage'", "CW,"},
    {kBulkAdvice, "PALLETTYPECODE", "UPDATE tbPack SET PackTypeId = 'ROLLCAGE'", "09,"},
    // Numbers of notices.
    {"clsKMart856csv clsOfficeworks856csv", "SHIPNOTENO", "UPDATE tbPartner SET LastASNNo = 6", "07,"},
    {kTargetNotice, "SHIPNOTENO", "UPDATE tbPartner SET LastASNNo = 6", "000000007,"},
    {kMgb, "SHIPNOTENO", "UPDATE tbPartner SET LastASNNo = 6", "7,"},
    // Dates; a null one is empty.
    {kMgb, "SHIPNOTEDATE SHIPNOTETIME SCHEDULEDATE DELIVERYDATE",
     "UPDATE tbShipment SET ScheduleDate = NULL, DeliveryDate = '2006-12-31T23:59:00'", "061102,0905,,061231,"},
    {kOfficeworksNotice, "ORDERDATE DELIVERYDATE DATESHIPPED CONTAINERNO",
     "UPDATE tbShipment SET ScheduleDate = NULL, DeliveryDate = NULL; UPDATE tbOrder SET PODate = NULL", ",,,SSCC1,"},
    {kBulkAdvice, "BESTBEFORE EXPIRATION CONTAINERNO", "UPDATE tbPackLine SET BestBeforeDate = NULL, UseByDate = NULL",
     ",,SSCC1,"},
    // Order numbers.
    {kMgb, "ORDERNO", PONo("45 REL# 2 DEL# 3 #4"), "45 REL# 2 DEL# 3 #4,"},
    {"clsKMart856csv clsOfficeworks856csv", "ORDERNO", PONo("45 REL# 2 REL# 3 DEL# 4"), "45,"},
    {kOfficeworksNotice, "ORDERNO", PONo(" REL# 2"), "REL# 2,"},
    {kOfficeworksNotice, "ORDERNO", PONo("45 REL#2"), "45 REL#2,"},
    {kOfficeworksNotice, "ORDERNO", "UPDATE tbOrder SET PONo = '45 REL# 2', TypeCode = 'AP'", "45,"},
    {kKmartNotice, "ORDERNO", "UPDATE tbOrder SET PONo = '45 REL# 2', TypeCode = 'AP'", "45 REL# 20900,"},
    {kCmlAdvice, "ORDERNO", PONo("12345 DEL# 678"), "12345,"},
    {kCmlAdvice, "ORDERNO", PONo("12345 #9 DEL# 678"), "12345,"},
    {kCmlAdvice, "ORDERNO", PONo("45 REL# 2"), "45 REL# 2,"},
    // References of lines.
    {kMgb, "LINEREF", "UPDATE tbPSlipLine SET LineRef = NULL", "LL31,"},
    {kMgb, "CONTAINERNO LINEREF COST", "UPDATE tbPackLine SET PSlipLineId = 0", "SSCC1,,0,"},
    // Products: of the line, and of the order line.
    {kMgb, "INHOUSEPRODNO APN", "UPDATE tbOrderLine SET ProductNo = '93002'", "TRAIN,93001,"},
    {kCmlAdvice, "INHOUSEPRODNO GTIN", "UPDATE tbOrderLine SET ProductNo = '93002'", "BEAR,193001,"},
    {kCmlAdvice, "CONTAINERNO INHOUSEPRODNO", "DELETE FROM tbProduct", "SSCC1,,"},
    // The company's labels tell the kind of notice.
    {kCmlAdvice, "SHIPNOTETYPECODE", "UPDATE tbVendor SET LabelClass = 'PartnerKit.clsCMLFGPTL'", "345,"},
    {kBulkAdvice, "SHIPNOTETYPECODE", "UPDATE tbVendor SET LabelClass = 'PartnerKit.clsCMLFGPTL'", "00,"},
    // Texts stand as they are, blanks at their ends cut.
    {kMgb, "CONSIGNMENTNOTENO BUYSTORECODE", "UPDATE tbShipment SET ConNoteNo = '  CN,5 \"A\" '", "CN,5 \"A\",0512,"},
    // Nothing in them breaks a line.
    {kMgb, "CONSIGNMENTNOTENO BUYSTORECODE",
     "UPDATE tbShipment SET ConNoteNo = char(13, 10) || 'CN' || char(10) || '5' || char(0, 13) || 'A' || char(10, 32)",
     "CN 5  A,0512,"},
    {kMgb, "INVOICENO DELREFERENCE BOOKINGNO COMPANYCODE PARTNERSUPPLIERNO PACKERID CONTAINERNO",
     "UPDATE tbPack SET InvoiceNo = NULL, PSlipId = 0; UPDATE tbShipment SET BookingNo = NULL;"
     "UPDATE tbOrder SET CompanyCode = NULL, PartnerSupplierNo = NULL",
     ",,,,,,SSCC1,"},
    // A quantity with a fraction counts by the whole unit where lines are summed.
    {kMgb, "QUANTITYSHIPPED", "UPDATE tbPackLine SET Quantity = 2.5", "2,"},
    {kMgbbtNotice, "QUANTITYSHIPPED", "UPDATE tbPackLine SET Quantity = 2.5", "2.5,"},
};

TEST(CsvNoticeColumnsTest, ShowWhatTheRecordsHold) {
  for (const Value& value : kValues) {
    for (const std::string& className : Words(value.classes)) {
      SCOPED_TRACE(className + ": " + value.columns + " of " + value.line);
      PackedTrade trade(className, value.columns);
      trade.clock = platform::FixedClock(At("2006-11-02T09:05:59"));
      trade.AddPack();
      trade.Sql(value.change);
      EXPECT_THAT(trade.Compiled(), ElementsAre(value.line));
    }
  }
}

// Order and shipment complete, and packs of the shipment still to come: all three ways round.
TEST(CsvNoticeColumnsTest, TellTheStatusByOrderShipmentAndSlips) {
  struct Case {
    const char* classes;
    const char* column;
    const char* codes;  // order, slip and shipment complete: none, o, s, h, os, oh, sh, osh
  };
  const Case cases[] = {
      {"clsMGB856csv clsCMLFLFDAcsv", "SHIPNOTESTATUS", "PR PR PR PR CC PR PR CC"},
      {kTargetNotice, "ORDERSTATUSCODE", "SS SS SS CC SS CC CC CC"},
      {kKmartNotice, "ORDERSTATUSCODE", "SS SS SS PR SS CC PR CC"},
      {kOfficeworksNotice, "ORDERSTATUSCODE", "165 164 165 165 164 164 165 164"},
      {kCmlAdvice, "ORDERSTATUSCODE", "165 165 165 164 165 164 164 164"},
  };
  const std::string complete[] = {"", "o", "s", "h", "os", "oh", "sh", "osh"};
  for (const Case& each : cases) {
    const Texts codes = Words(each.codes);
    for (const std::string& className : Words(each.classes)) {
      for (std::size_t n = 0; n < codes.size(); ++n) {
        SCOPED_TRACE(className + ", complete: " + complete[n]);
        PackedTrade trade(className, each.column);
        trade.AddPack();
        for (const char what : complete[n]) {
          if (what == 'o') trade.CompleteOrder();
          if (what == 's') trade.Sql("UPDATE tbPSlipLine SET PackedQty = OrderQty");
          if (what == 'h') trade.Sql("UPDATE tbShipment SET Complete = 1");
        }
        EXPECT_THAT(trade.Compiled(), ElementsAre(codes[n] + ","));
      }
    }
  }
}

// A partner's invoice is one, whatever its packs say.
TEST(CsvNoticeColumnsTest, KeepTheFirstPacksInvoiceNumberWhereThePartnerWantsOne) {
  const std::pair<const char*, Texts> cases[] = {
      {kMgb, {"INV1,INV1,", "INV2,INV2,"}},       {kMgbbtNotice, {"INV1,INV1,", "INV1,INV1,"}},
      {kKmartNotice, {"INV1,,", "INV1,,"}},       {kOfficeworksNotice, {"INV1,,", "INV2,,"}},
      {kCmlAdvice, {"INV1,INV1,", "INV1,INV2,"}},
  };
  for (const auto& [className, lines] : cases) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "INVOICENO DELREFERENCE");
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "INV1"; });
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "INV2"; });
    EXPECT_EQ(trade.Compiled(), lines);
  }
}

// What waits at the start of each row's call, sub packs not among them; lines are written one by one, and counted
// within a notice.
TEST(CsvNoticeColumnsTest, CountWhatStillWaits) {
  for (const char* className : {kCmlAdvice, kBulkAdvice}) {
    SCOPED_TRACE(className);
    PackedTrade trade(className, "CONTAINERNO SHIPMENTCOUNT SHIPMENTPALLETCOUNT SEQUENTIALLINENO TRADEDQUANTITY");
    const std::int32_t lead = trade.AddPack([](Pack& pack) { pack.CartonCount = 2.5; });
    trade.AddPack([](Pack& pack) { pack.CartonCount = 4; },
                  {{"93001", 1}, {"93001", 0}, {"93001", 2.5}, {"93001", -1}});
    trade.AddPack([](Pack& pack) { pack.ShipToCode = "0901"; });
    trade.AddPack([&](Pack& pack) { pack.LeadPackId = lead; });
    EXPECT_THAT(trade.Compiled(),
                ElementsAre("SSCC1,8.5,3,1,6,", "SSCC2,8.5,3,2,1,", "SSCC2,8.5,3,3,2.5,", "SSCC3,2,1,1,6,"));
  }
}

}  // namespace
}  // namespace partnerkit::testing
