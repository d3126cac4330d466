// What stands in each column of each partner's notice.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using Texts = std::vector<std::string>;

// Each class's columns and what they show of the usual pack.
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
    "QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32";

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
     "COST=12.5 LINEREF=SL32"},
    {kKmartNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=00 CONSIGNMENTNOTENO=CN5 SHIPMENTWEIGHT=123.46 SCHEDULEDATE=060309 DELIVERYDATE=060320 "
     "SHIPTOCODE=0900 SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=060301 ORDERSTATUSCODE=SS POVERSIONNO=V2 "
     "BUYSTORECODE=0512 INVOICENO=INV77 PACKERID=PK4 PALLETNO=PAL5 PALLETMARKTYPE= PALLETTYPECODE= "
     "CONTAINERNO=SSCC1 PACKMARKTYPE=GM PACKAGETYPECODE=CTN30 PACKWEIGHT=7.25 INHOUSEPRODNO=TRAIN APN=93001 "
     "QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32"},
    {kOfficeworksNotice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=060308 SHIPNOTETIME=1015 "
     "SHIPNOTETYPECODE=9 CONSIGNMENTNOTENO=CN5 SCHEDULEDATE=060309 DELIVERYDATE=20060320 DATESHIPPED=20060309 "
     "SHIPTOCODE=0900 SHIPMENTVOLUME=1.2345 ORDERNO=450001 ORDERDATE=20060301 PARTNERSUPPLIERNO=PS9 "
     "ORDERSTATUSCODE=165 POVERSIONNO=V2 BUYSTORECODE=0512 INVOICENO=INV77 PACKERID=PK4 PALLETNO=PAL5 "
     "PALLETMARKTYPE= PALLETTYPECODE= CONTAINERNO=SSCC1 PACKMARKTYPE=GM PACKTYPECODE=CTN30 PACKWEIGHT=7.25 "
     "INHOUSEPRODNO=TRAIN APN=93001 QUANTITYSHIPPED=6 COST=12.5 LINEREF=SL32"},
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
     "SUBSSCC19=SUB19 SUBSSCC20=SUB20"},
    {kCmlAdvice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=20060308 SHIPNOTETYPECODE=351 "
     "SHIPNOTEFUNCTIONCODE=9 SHIPNOTESTATUS=PR CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 INVOICENO=INV77 "
     "DELIVERYDATE=20060320 DATESHIPPED=20060309 SHIPTOCODE=0900 SHIPMENTWEIGHT=123.456 PARTNERSUPPLIERNO=PS9 "
     "SHIPMENTCOUNT=2 SHIPMENTPALLETCOUNT=1 ORDERNO=450001 ORDERDATE=20060301 ORDERSTATUSCODE=165 "
     "BUYSTORECODE=0512 DELREFERENCE=INV77 PALLETTYPECODE=09 CONTAINERNO=SSCC1 PACKAGETYPECODE=P02 WEIGHT=7.25 "
     "INHOUSEPRODNO=TRAIN GTIN=193001 TRADEDQUANTITY=6 BESTBEFORE=20060405 EXPIRATION=20060506 DETAIL1=BATCH8 "
     "SEQUENTIALLINENO=1 SYMBOLOGY= PACKERID=PK4 COST=12.5 DELLINEREF="},
    {kBulkAdvice,
     "SUPPLIERNO=ACMETOYS CUSTOMERCODE=MGBSTORES SHIPNOTENO=1001 SHIPNOTEDATE=20060308 SHIPNOTETYPECODE=00 "
     "SHIPNOTEFUNCTIONCODE= SHIPNOTESTATUS=PR CONSIGNMENTNOTENO=CN5 BOOKINGNO=BK6 INVOICENO=INV77 "
     "DELIVERYDATE=20060320 DATESHIPPED=20060309 SCHEDULEDATE=060309 SHIPTOCODE=0900 SHIPMENTWEIGHT=123.456 "
     "PARTNERSUPPLIERNO=PS9 SHIPMENTCOUNT=2 SHIPMENTPALLETCOUNT=1 ORDERNO=450001 ORDERDATE=20060301 "
     "ORDERSTATUSCODE=165 BUYSTORECODE=0512 DELREFERENCE=INV77 PALLETTYPECODE=09 CONTAINERNO=SSCC1 "
     "PACKAGETYPECODE=P02 WEIGHT=7.25 INHOUSEPRODNO=TRAIN GTIN=193001 TRADEDQUANTITY=6 BESTBEFORE=20060405 "
     "EXPIRATION=20060506 DETAIL1=BATCH8 SEQUENTIALLINENO=1 SYMBOLOGY= PACKERID=PK4 COST= DELLINEREF="},
};

struct Parts {
  Texts names, values;
};

Parts Split(const std::string& shown) {
  Parts parts;
  for (const std::string& each : Words(shown)) {
    parts.names.push_back(each.substr(0, each.find('=')));
    parts.values.push_back(each.substr(each.find('=') + 1));
  }
  return parts;
}

std::string Joined(const Texts& parts, const char* behind) {
  std::string all;
  for (const std::string& part : parts) all += part + behind;
  return all;
}

// A notice of the usual pack, a lead pack of twenty.
class Noticed {
 public:
  explicit Noticed(const char* className) : trade_(className) {
    trade_.system->BeginTrans();
    const std::int32_t lead = trade_.AddPack();
    for (int n = 1; n <= 20; ++n) {
      const auto sub = [&](Pack& pack) {
        pack.LeadPackId = lead;
        pack.SSCC = "SUB" + std::to_string(n);
      };
      trade_.AddPack(sub, {});
    }
    trade_.system->CommitTrans();
  }

  // Its line under a map of these columns.
  std::string Line(const Texts& columns) {
    trade_.Map(Joined(columns, " "));
    const Texts lines = trade_.Compiled();
    trade_.Unstamp();
    return lines.size() == 1 ? lines.front() : std::to_string(lines.size()) + " lines";
  }

 private:
  PackedTrade trade_;
};

TEST(CsvNoticeColumnsTest, ShowEachValueOfEachClassInTheMapsOrder) {
  for (const Columns& columns : kColumns) {
    SCOPED_TRACE(columns.className);
    Noticed noticed(columns.className);
    Parts parts = Split(columns.shown);
    EXPECT_EQ(noticed.Line(parts.names), Joined(parts.values, ","));
    std::ranges::reverse(parts.names);
    std::ranges::reverse(parts.values);
    EXPECT_EQ(noticed.Line(parts.names), Joined(parts.values, ","));
  }
}

TEST(CsvNoticeColumnsTest, LoseExactlyTheValueWhoseNameTheMapDoesNotHave) {
  for (const Columns& columns : kColumns) {
    SCOPED_TRACE(columns.className);
    Noticed noticed(columns.className);
    const Parts parts = Split(columns.shown);
    for (std::size_t column = 0; column < parts.names.size(); ++column) {
      Parts left = parts;
      left.names[column] += "X";
      left.values[column] = "";
      EXPECT_EQ(noticed.Line(left.names), Joined(left.values, ",")) << parts.names[column];
    }
  }
}

// Names that other classes know, and what isn't a name of any.
TEST(CsvNoticeColumnsTest, StayEmptyUnderNamesThatTheClassDoesNotKnow) {
  const std::string foreign[] = {
      "ORDERSTATUSCODEX DATESHIPPED BILLOFLADINGNO POVERSIONNO PALLETNO GTIN SUBSSCC1 shipnoteno",  // MGB
      "DATESHIPPED BILLOFLADINGNO POVERSIONNO PALLETNO GTIN SUBSSCC1",                              // Myer
      "SHIPNOTESTATUS COMPANYCODE PARTNERSUPPLIERNO SHIPMENTVOLUME ORDERDATE PACKAGETYPECODE ORDERPACKCODE POVERSIONNO",
      "BOOKINGNO SCHEDULEDATE COST PALLETNO SUBSSCC21 SUBSSCC0",
      "BOOKINGNO DATESHIPPED PACKTYPECODE PARTNERSUPPLIERNO DELREFERENCE SHIPPACKCODE PACKLENGTH SHIPNOTESTATUS",
      "BOOKINGNO SHIPMENTWEIGHT PACKAGETYPECODE DELREFERENCE SHIPPACKCODE PACKLENGTH SHIPNOTESTATUS",
      "SCHEDULEDATE SHIPNOTETIME APN QUANTITYSHIPPED LINEREF PACKWEIGHT PALLETNO COMPANYCODE",
      "SHIPNOTETIME APN QUANTITYSHIPPED LINEREF PACKWEIGHT PALLETNO COMPANYCODE",
  };
  for (std::size_t n = 0; n < std::size(kNoticeClasses); ++n) {
    SCOPED_TRACE(kNoticeClasses[n]);
    PackedTrade trade(kNoticeClasses[n]);
    trade.Map("CONTAINERNO " + foreign[n] + " CONTAINERNO");
    trade.AddPack();
    EXPECT_THAT(trade.Compiled(), ElementsAre("SSCC1" + std::string(Words(foreign[n]).size() + 1, ',') + "SSCC1,"));
  }
}

// One pack, a few columns: what the records make of them.
struct Value {
  const char* classes;
  const char* columns;
  std::function<void(PackedTrade&)> change;
  const char* line;
};

const char* const kAdvices = "clsCMLFLFDAcsv clsTargetBulkDAcsv";
const char* const kMeasured = "clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv clsTarget856csv";

std::function<void(PackedTrade&)> Do(const std::string& sql) {
  return [sql](PackedTrade& trade) { trade.Sql(sql); };
}
std::function<void(PackedTrade&)> PONo(const std::string& number) {
  return Do("UPDATE tbOrder SET PONo = '" + number + "'");
}

const Value kValues[] = {
    // Measures and weights.
    {kMeasured, "PACKWEIGHT PACKLENGTH PACKWIDTH PACKHEIGHT",
     Do("UPDATE tbPack SET Weight = NULL; UPDATE tbPackType SET Length = 0, Width = 0, Height = 0"), "1.0,1,1,1,"},
    {kMeasured, "PACKWEIGHT PACKLENGTH PACKWIDTH PACKHEIGHT SHIPPACKCODE",
     Do("UPDATE tbPack SET Weight = 0, PackTypeId = NULL"), "1.0,1,1,1,CTN25,"},
    {kMeasured, "PACKWEIGHT SHIPMENTWEIGHT", Do("UPDATE tbPack SET Weight = 0.5; UPDATE tbShipment SET Weight = 12000"),
     "0.5,12000.0,"},
    {kMeasured, "CONTAINERNO SHIPMENTWEIGHT", Do("UPDATE tbShipment SET Weight = NULL"), "SSCC1,,"},
    {kAdvices, "WEIGHT SHIPMENTWEIGHT", Do("UPDATE tbPack SET Weight = 0; UPDATE tbShipment SET Weight = 12000"),
     "1.0,12000,"},
    {kAdvices, "WEIGHT SHIPMENTWEIGHT", Do("UPDATE tbPack SET Weight = 2; UPDATE tbShipment SET Weight = NULL"),
     "2.0,,"},
    {kMgb, "CONTAINERNO SHIPMENTVOLUME", Do("UPDATE tbShipment SET Volume = NULL"), "SSCC1,,"},
    // Pack types.
    {"clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv", "SHIPPACKCODE PACKAGETYPECODE",
     Do("UPDATE tbPack SET PackTypeId = NULL"), "CTN25,P01,"},
    {"clsMGB856csv", "SHIPPACKCODE PACKAGETYPECODE CONTAINERNO", Do("UPDATE tbPack SET PackTypeId = 'NONE'"),
     ",,SSCC1,"},
    {kTargetNotice, "SHIPPACKCODE PACKTYPECODE", Do("UPDATE tbPack SET PackTypeId = NULL"), "CTN25,P01,"},
    {kKmartNotice, "PACKAGETYPECODE", Do("UPDATE tbPack SET PackTypeId = NULL"), "CTN25,"},
    {kOfficeworksNotice, "PACKTYPECODE", Do("UPDATE tbPack SET PackTypeId = NULL"), "CTN25,"},
    {kCmlAdvice, "PALLETTYPECODE", Do("UPDATE tbPack SET PackTypeId = 'RollCage'"), "CW,"},
    {kCmlAdvice, "PALLETTYPECODE", Do("UPDATE tbPack SET PackTypeId = NULL"), "09,"},
    {kBulkAdvice, "PALLETTYPECODE", Do("UPDATE tbPack SET PackTypeId = 'ROLLCAGE'"), "09,"},
    // Numbers of notices.
    {"clsKMart856csv clsOfficeworks856csv", "SHIPNOTENO", Do("UPDATE tbPartner SET LastASNNo = 6"), "07,"},
    {kTargetNotice, "SHIPNOTENO", Do("UPDATE tbPartner SET LastASNNo = 6"), "000000007,"},
    {"clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv clsCMLFLFDAcsv clsTargetBulkDAcsv", "SHIPNOTENO",
     Do("UPDATE tbPartner SET LastASNNo = 6"), "7,"},
    // Dates, at hours of a single digit too; a null one is empty.
    {"clsMGB856csv clsTarget856csv clsKMart856csv", "SHIPNOTEDATE SHIPNOTETIME SCHEDULEDATE DELIVERYDATE",
     [](PackedTrade& trade) {
       trade.clock = platform::FixedClock(At("2006-11-02T09:05:59"));
       trade.Sql("UPDATE tbShipment SET ScheduleDate = NULL, DeliveryDate = '2006-12-31T23:59:00'");
     },
     "061102,0905,,061231,"},
    {kOfficeworksNotice, "ORDERDATE DELIVERYDATE DATESHIPPED CONTAINERNO",
     Do("UPDATE tbShipment SET ScheduleDate = NULL, DeliveryDate = NULL; UPDATE tbOrder SET PODate = NULL"),
     ",,,SSCC1,"},
    {kAdvices, "BESTBEFORE EXPIRATION CONTAINERNO", Do("UPDATE tbPackLine SET BestBeforeDate = NULL, UseByDate = NULL"),
     ",,SSCC1,"},
    // Order numbers.
    {"clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv clsTarget856csv", "ORDERNO", PONo("45 REL# 2 DEL# 3 #4"),
     "45 REL# 2 DEL# 3 #4,"},
    {"clsKMart856csv clsOfficeworks856csv", "ORDERNO", PONo("45 REL# 2 REL# 3 DEL# 4"), "45,"},
    {"clsKMart856csv clsOfficeworks856csv", "ORDERNO", PONo("4 REL# 2"), "4,"},
    {"clsKMart856csv clsOfficeworks856csv", "ORDERNO", PONo(" REL# 2"), "REL# 2,"},
    {"clsKMart856csv clsOfficeworks856csv", "ORDERNO", PONo("45 REL#2"), "45 REL#2,"},
    {kKmartNotice, "ORDERNO", Do("UPDATE tbOrder SET PONo = '45 REL# 2', TypeCode = 'AP'"), "45 REL# 20900,"},
    {kKmartNotice, "ORDERNO", Do("UPDATE tbOrder SET PONo = '45 REL# 2', TypeCode = NULL"), "45,"},
    {kOfficeworksNotice, "ORDERNO", Do("UPDATE tbOrder SET PONo = '45 REL# 2', TypeCode = 'AP'"), "45,"},
    {kAdvices, "ORDERNO", PONo("12345 DEL# 678 #9"), "12345,"},
    {kAdvices, "ORDERNO", PONo("12345 #9 DEL# 678"), "12345,"},
    {kAdvices, "ORDERNO", PONo("12345 #9"), "12345,"},
    {kAdvices, "ORDERNO", PONo("45 REL# 2"), "45 REL# 2,"},
    // References of lines.
    {kMgb, "LINEREF", Do("UPDATE tbPSlipLine SET LineRef = ''"), "LL31,"},
    {kMgb, "LINEREF", Do("UPDATE tbPSlipLine SET LineRef = NULL"), "LL31,"},
    {kMgb, "CONTAINERNO LINEREF COST", Do("UPDATE tbPackLine SET PSlipLineId = 0"), "SSCC1,,0,"},
    // Products: of the line, and of the order line.
    {kMgb, "INHOUSEPRODNO APN", Do("UPDATE tbOrderLine SET ProductNo = '93002'"), "TRAIN,93001,"},
    {kAdvices, "INHOUSEPRODNO GTIN", Do("UPDATE tbOrderLine SET ProductNo = '93002'"), "BEAR,193001,"},
    {kAdvices, "CONTAINERNO INHOUSEPRODNO", Do("DELETE FROM tbProduct"), "SSCC1,,"},
    // The company's labels tell the kind of notice.
    {kCmlAdvice, "SHIPNOTETYPECODE", Do("UPDATE tbVendor SET LabelClass = 'PartnerKit.clsCMLFGPTL'"), "345,"},
    {kBulkAdvice, "SHIPNOTETYPECODE", Do("UPDATE tbVendor SET LabelClass = 'PartnerKit.clsCMLFGPTL'"), "00,"},
    // Texts stand as they are, blanks at their ends cut.
    {kMgb, "CONSIGNMENTNOTENO BUYSTORECODE", Do("UPDATE tbShipment SET ConNoteNo = '  CN,5 \"A\" '"),
     "CN,5 \"A\",0512,"},
    {kMgb, "INVOICENO DELREFERENCE BOOKINGNO COMPANYCODE PARTNERSUPPLIERNO PACKERID CONTAINERNO",
     Do("UPDATE tbPack SET InvoiceNo = NULL, PSlipId = 0; UPDATE tbShipment SET BookingNo = NULL;"
        "UPDATE tbOrder SET CompanyCode = NULL, PartnerSupplierNo = NULL"),
     ",,,,,,SSCC1,"},
    // A quantity with a fraction counts by the whole unit where lines are summed.
    {kMgb, "QUANTITYSHIPPED", Do("UPDATE tbPackLine SET Quantity = 2.5"), "2,"},
    {"clsMGBBT856csv", "QUANTITYSHIPPED", Do("UPDATE tbPackLine SET Quantity = 2.5"), "2.5,"},
};

TEST(CsvNoticeColumnsTest, ShowWhatTheRecordsHold) {
  for (const Value& value : kValues) {
    for (const std::string& className : Words(value.classes)) {
      SCOPED_TRACE(className + ": " + value.columns + " of " + value.line);
      PackedTrade trade(className);
      trade.Map(value.columns);
      trade.AddPack();
      value.change(trade);
      EXPECT_THAT(trade.Compiled(), ElementsAre(value.line));
    }
  }
}

bool Has(const std::string& text, char wanted) { return text.find(wanted) != std::string::npos; }

// Order and shipment complete, and packs of the shipment still to come: all three ways round.
TEST(CsvNoticeColumnsTest, TellTheStatusByOrderShipmentAndSlips) {
  struct Case {
    const char* classes;
    const char* column;
    // order, slip and shipment complete: none, o, s, h, os, oh, sh, osh
    const char* codes;
  };
  const Case cases[] = {
      {"clsMGB856csv clsMYERDropShipDAcsv clsMGBBT856csv clsCMLFLFDAcsv clsTargetBulkDAcsv", "SHIPNOTESTATUS",
       "PR PR PR PR CC PR PR CC"},
      {kTargetNotice, "ORDERSTATUSCODE", "SS SS SS CC SS CC CC CC"},
      {kKmartNotice, "ORDERSTATUSCODE", "SS SS SS PR SS CC PR CC"},
      {kOfficeworksNotice, "ORDERSTATUSCODE", "165 164 165 165 164 164 165 164"},
      {kAdvices, "ORDERSTATUSCODE", "165 165 165 164 165 164 164 164"},
  };
  const std::string complete[] = {"", "o", "s", "h", "os", "oh", "sh", "osh"};
  for (const Case& each : cases) {
    const Texts codes = Words(each.codes);
    for (const std::string& className : Words(each.classes)) {
      for (std::size_t n = 0; n < codes.size(); ++n) {
        SCOPED_TRACE(className + ", complete: " + complete[n]);
        PackedTrade trade(className);
        trade.Map(each.column);
        trade.AddPack();
        if (Has(complete[n], 'o')) trade.CompleteOrder();
        if (Has(complete[n], 's')) trade.CompleteSlip();
        if (Has(complete[n], 'h')) trade.CompleteShipment();
        EXPECT_THAT(trade.Compiled(), ElementsAre(codes[n] + ","));
      }
    }
  }
}

// A partner's invoice is one, whatever its packs say.
TEST(CsvNoticeColumnsTest, KeepTheFirstPacksInvoiceNumberWhereThePartnerWantsOne) {
  const std::pair<const char*, Texts> cases[] = {
      {kMgb, {"INV1,INV1,", "INV2,INV2,"}},          {kMyerDrop, {"INV1,INV1,", "INV2,INV2,"}},
      {kTargetNotice, {"INV1,INV1,", "INV2,INV2,"}}, {kMgbbtNotice, {"INV1,INV1,", "INV1,INV1,"}},
      {kKmartNotice, {"INV1,,", "INV1,,"}},          {kOfficeworksNotice, {"INV1,,", "INV2,,"}},
      {kCmlAdvice, {"INV1,INV1,", "INV1,INV2,"}},    {kBulkAdvice, {"INV1,INV1,", "INV1,INV2,"}},
  };
  for (const auto& [className, lines] : cases) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("INVOICENO DELREFERENCE");
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "INV1"; });
    trade.AddPack([](Pack& pack) { pack.InvoiceNo = "INV2"; });
    EXPECT_EQ(trade.Compiled(), lines);
  }
}

// What waits at the start of each row's call, sub packs not among them; lines are counted within a notice.
TEST(CsvNoticeColumnsTest, CountWhatStillWaits) {
  for (const std::string& className : Words(kAdvices)) {
    SCOPED_TRACE(className);
    PackedTrade trade(className);
    trade.Map("CONTAINERNO SHIPMENTCOUNT SHIPMENTPALLETCOUNT SEQUENTIALLINENO");
    const std::int32_t lead = trade.AddPack([](Pack& pack) { pack.CartonCount = 2.5; });
    trade.AddPack([](Pack& pack) { pack.CartonCount = 4; }, {{"93001", 1}, {"93001", 0}, {"93001", 2}});
    trade.AddPack([](Pack& pack) { pack.ShipToCode = "0901"; });
    trade.AddPack([&](Pack& pack) { pack.LeadPackId = lead; });
    EXPECT_THAT(trade.Compiled(), ElementsAre("SSCC1,8.5,3,1,", "SSCC2,8.5,3,2,", "SSCC2,8.5,3,3,", "SSCC3,2,1,1,"));
  }
}

}  // namespace
}  // namespace partnerkit::testing
