#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/x12_orders.h"
#include "values/numbers.h"

namespace partnerkit::testing {
namespace {

using ::testing::IsEmpty;
using ::testing::SizeIs;

const std::string kBegin = "BEG*00*SA*450001**060301~";

TEST(X12PostingTest, StoresEveryMemberOfAnOrder) {
  const std::string order = R"(OrderId=1 VendorId="ACME" PartnerId="MGB" )";
  const std::string control = R"( InterchangeCtl="000000481" GroupCtl="77" TransactionCtl="0001")";
  const std::string lines =
      R"(ProductNo="93001" SKU="555001" Quantity=24 UOM="CT" PriceCode="LE" Cost=12.5 RetailPrice=29.95)";
  const std::string bare = R"(ProductNo="93001" Quantity=24 UOM="CT" PriceCode="LE" Cost=12.5)";
  const std::string atStore = R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0512" )";
  const struct {
    std::string className, body;
    Texts records;
    std::string set = "850";
  } cases[] = {
      // clang-format off
      {kMgb, kBegin + "REF*DP*0042*X~DTM*001*060324~DTM*037*060310~DTM*015*060401~N1*ST*Acme*92*0900~"
       "PO1*7*24*CT*12.50*LE*EN*93001*SK*555001~CTP**RTL*29.95~PO4*3*6*IN~SDQ*EA*92*0512*18*0513*6~"
       "PO1*8*5.5*EA*3.25*WE*UP*93002*SK1*5550022*X~CTT*2~",
       {order + R"(PONo="450001" PurposeCode="00" TypeCode="SA" PODate=2006-03-01 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-10 CancelAfter=2006-03-24 DeptNo="0042" Header1="0104")" + control +
        R"( SourceFile="{file}" FilePos=168 Note="Advertised date 01/04/2006")",
        "LineId=1 OrderId=1 LineNo=\"7\" " + lines,
        R"(LineId=2 OrderId=1 LineNo="8" ProductNo="93002" SKU="5550022" Quantity=5.5 UOM="EA" PriceCode="WE" )" +
        std::string("Cost=3.25"),
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900")",
        R"(LocnId=2 OrderId=1 VendorId="ACME" BuyingLocn="0513" ShipToLocn="0900")",
        R"(LocnId=3 OrderId=1 VendorId="ACME" BuyingLocn="0900" ShipToLocn="0900")",
        atStore + "Quantity=18 AllocateQty=18",
        R"(Id=2 OrderId=1 LineId=1 LocnId=2 ProductNo="93001" BuyingLocn="0513" Quantity=6 AllocateQty=6)",
        R"(Id=3 OrderId=1 LineId=2 LocnId=3 ProductNo="93002" BuyingLocn="0900" Quantity=5.5 AllocateQty=5.5)"}},
      {kTarget, "BEG*07*RL*450002**060302~REF*DP*0042~PKG*X*68*VI*PROMO* LABEL 2~PKG*F*68*VI*NONE*TICKET~"
       "DTM*063*060324~DTM*064*060310~N1*ST*Acme*92*DTS~"
       "PO1*7*24*CT*12.50*LE*EN*93001*CB*555001~CTP**RTL*29.95~PO4*3*6*IN~SDQ*EA*92*0512*18~CTT*1~",
       {order + R"(PONo="450002" PurposeCode="07" TypeCode="RL" PODate=2006-03-02 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-10 CancelAfter=2006-03-24 Header1="PROMO" Header2="LABEL 2" Header3="TICKET")" +
        control + " FilePos=168",
        "LineId=1 OrderId=1 LineNo=\"1\" " + lines + R"( PackUOM="IN" PackSize="6")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0512")",
        atStore + "Quantity=18 AllocateQty=18"}},
      {kGhpl, kBegin + "N9*ZZ*1*2*060320~DTM*064*060310~N1*ST*Acme*92*0900~"
       "PO1*7*24*CT*12.50*LE*EN*93001                         *SK*555001~CTP**RTL*29.95~PO4*3*6*IN~"
       "SDQ*EA*92*0512*18~CTT*1~",
       {order + R"(PONo="450001" PurposeCode="00" TypeCode="SA" PODate=2006-03-01 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-10 CancelAfter=2006-03-20)" + control + " FilePos=171",
        R"(LineId=1 OrderId=1 LineNo="1" ProductNo="93001" SKU="555001" Quantity=24 UOM="CT" PriceCode="LE" )"
        R"(Cost=12.5 PackSize="6")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900")",
        atStore + "Quantity=18 AllocateQty=18"}},
      {kKmart, "BEG*00*RL*450001*R7*060301~REF*IA*77001 ~REF*DP*0042~PKG*F*68*VI*AD 0401*GIFTS~DTM*063*060324~"
       "DTM*064*060310~N1*ST*Acme*92*0900~PO1*7*24*CT*12.50*LE*EN*93001~PO4*3*6*IN*9~SDQ*EA*92*0512*18~CTT*1~",
       {order + R"(PONo="450001 REL# R7" PurposeCode="00" TypeCode="RL" PODate=2006-03-01 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-10 CancelAfter=2006-03-24 DeptNo="0042" Header1="0401" Header2="R7" Header4="GIFTS" )"
        R"(SupplierNo="77001")" + control + " FilePos=168",
        "LineId=1 OrderId=1 LineNo=\"7\" " + bare + R"( PackUOM="IN" PackSize="6" PackCount="3")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0512" ShipToLocn="0900")",
        atStore + "Quantity=18 AllocateQty=18"}},
      {kKmart, "BCH*05*SA*450002* R9 *C1*060302~N1*ST*Acme*92*0900~POC*8*AI*24*0*CT*12.50*LE*EN*93001~PO4*3**EA~CTT*1~",
       {order + R"(PONo="450002" PurposeCode="05" TypeCode="SA" PODate=2006-03-02 ImportDate=2006-03-08 )"
        R"(NotBefore=2006-03-08 CancelAfter=2006-03-08 Header2="R9")" + control + " FilePos=168",
        "LineId=1 OrderId=1 LineNo=\"8\" " + bare + R"( PackUOM="EA" PackCount="3")",
        R"(LocnId=1 OrderId=1 VendorId="ACME" BuyingLocn="0900" ShipToLocn="0900")",
        R"(Id=1 OrderId=1 LineId=1 LocnId=1 ProductNo="93001" BuyingLocn="0900" Quantity=24 AllocateQty=24)"}, "860"},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.set);
    X12Trade trade(c.className);
    const auto run = trade.Import(trade.Sent(Interchange(Group(TransactionSet(c.body, "0001", c.set)))));
    ASSERT_EQ(run.rows, 1);
    EXPECT_EQ(run.outcomes[0].result, 1);
    Texts records = c.records;
    records[0] = Replaced(records[0], "{file}", trade.OrdersPath());
    EXPECT_EQ(trade.StoredRecords(), records);
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

// What the header's segments set; the number, dates and control numbers around it are those of the usual order.
TEST(X12PostingTest, ReadsTheHeadersSegments) {
  const struct {
    std::string className, segments, header;
  } cases[] = {
      // clang-format off
      {kMgb,    "REF*DP*00421~", R"( DeptNo="0042")"},
      {kMgb,    "REF*IA* 7~REF~N9*ZZ*1*2*060320~PKG*X*68*VI*A*B~DTM*063*060324~SSS*1~", R"( DeptNo="7")"},
      {kMgb,    "DTM*001*0603~DTM*037*060231~DTM*015*060132~", R"( Header1="3201")"},
      {kMgb,    "DTM*001*060324*~DTM*001~", ""},
      {kTarget, "REF*DP*42~N9*ZZ*1*2*060320~DTM*001*060324~PKG*S*68*VI*A*B~DTM*064*060310~", " NotBefore=2006-03-10"},
      {kGhpl,   "REF*DP*42~N9*ZZ*1*060320~PKG*X*68*VI*A*B~DTM*063*060324~", " CancelAfter=2006-03-24"},
      {kGhpl,   "DTM*063*060324~N9*ZZ*1**060320*X~", " NotBefore=2006-03-20 CancelAfter=2006-03-20"},
      {kKmart,  "REF*IA* ~REF*XX*7~PKG*F*68*VI* ~N9*ZZ*1*2*060320~", " NotBefore=2006-03-08 CancelAfter=2006-03-08"},
      {kKmart,  "PKG*F*68*VI*GIFTS ~PKG*F*68~DTM*063*060324~",
       R"( NotBefore=2006-03-08 CancelAfter=2006-03-24 Header1="GIFTS")"},
      {kKmart,  "PKG*F*68*VI*AD1*X~DTM*064*060310~",
       R"( NotBefore=2006-03-10 CancelAfter=2006-03-08 Header1="AD1" Header4="X")"},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.segments);
    X12Trade trade(c.className);
    trade.Import(trade.Sent(trade.File(kBegin + c.segments + trade.Line() + "CTT*1~")));
    const Texts records = trade.StoredRecords();
    ASSERT_THAT(records, SizeIs(4));
    const std::size_t from = records[0].find("ImportDate=2006-03-08") + 21;
    EXPECT_EQ(records[0].substr(from, records[0].find(" InterchangeCtl") - from), c.header);
    EXPECT_THAT(records[0], ::testing::Not(::testing::HasSubstr("Note")));
  }
}

// Where quantities go: "ship-to>buying location product quantity".
Texts Given(X12Trade& trade) {
  Texts given;
  const auto first = With<OrderLocn>([](OrderLocn& probe) { probe.OrderId = 1; });
  const auto locations = trade.All(OrderLocn::kByOrder, first);
  for (const auto& line : trade.All(OrderLocnLine::kByOrder, With<OrderLocnLine>([](auto& l) { l.OrderId = 1; }))) {
    const auto at = std::ranges::find(locations, line->LocnId, [](const auto& location) { return location->LocnId; });
    EXPECT_EQ((*at)->BuyingLocn, line->BuyingLocn);
    given.push_back((*at)->ShipToLocn + ">" + line->BuyingLocn + " " + line->ProductNo + " " +
                    NumberText(line->Quantity));
  }
  return given;
}

TEST(X12PostingTest, GivesEachLineToItsStores) {
  const std::string noShipTo = Refused("ship to location 0888 does not exist.");
  const std::string noBuying = Refused("buying location 0888 does not exist.");
  const std::string noStore = Refused("store location 0888 does not exist.");
  const std::string store = "SDQ*EA*92*0512*18~", n1 = "N1*ST*X*92*0900~", direct = "N1*ST*X*92*DTS~";
  std::string ten = "SDQ*EA*92";
  for (int n = 0; n < 11; ++n) ten += "*S" + std::to_string(n) + "*" + std::to_string(n + 1);
  const Texts toEach = {"0512>0512 93001 18"}, toDirect = {"DTS>0512 93001 18"}, toAll = {">0512 93001 18"};
  const struct {
    Texts classes;
    std::string n1;
    Texts lines;  // what follows each PO1
    Texts log, given;
  } cases[] = {
      // clang-format off
      {kAllClasses, n1, {"", store}, {}, {"0900>0900 93001 24", "0900>0512 93002 18"}},
      {kAllClasses, n1, {store + "SDQ*EA*92*0513*6.5*0514*0~", ""}, {},
       {"0900>0512 93001 18", "0900>0513 93001 6.5", "0900>0514 93001 0", "0900>0900 93002 24"}},
      {kAllClasses, "", {""}, {}, {"> 93001 24"}},
      {{kMgb, kGhpl, kKmart}, "", {store, "SDQ*EA*92*0513*6~"}, {}, {"0512>0512 93001 18", "0513>0513 93002 6"}},
      {{kTarget}, "", {store}, {}, toAll},
      {{kTarget}, direct, {store}, {}, toEach},
      {{kTarget}, direct, {""}, {}, {"DTS>DTS 93001 24"}},
      {{kMgb, kGhpl, kKmart}, direct, {store}, {Refused("ship to location DTS does not exist.")}, {}},
      {kAllClasses, "N1*ST*X*92*0999~N1*BY*X*92*0900~", {store}, {Refused("ship to location 0999 does not exist.")},
       {}},
      {{kMgb, kTarget, kGhpl}, n1, {"SDQ*EA*92*0888*1*0888*1~"},
       {noBuying, "0 Process: Duplicate lines found for store 0888 EAN 93001"}, {}},
      {{kMgb, kTarget, kGhpl}, n1, {"SDQ*EA*92*0888*1*0512*1~", "SDQ*EA*92*0888*1~"}, {noBuying, noBuying}, {}},
      {{kKmart}, n1, {"SDQ*EA*92*0888*1~"}, {noStore}, {}},
      {{kMgb, kGhpl}, "", {"SDQ*EA*92*0888*1~"}, {noShipTo}, {}},
      {{kKmart}, "", {"SDQ*EA*92*0888*1~"}, {noShipTo, noStore}, {}},
      {kAllClasses, n1, {"SDQ*EA*92*0900*1~", "SDQ*EA*92*0900*1*0900*2~"},
       {"0 Process: Duplicate lines found for store 0900 EAN 93002"}, {}},
      {{kMgb, kGhpl, kKmart}, "", {ten + "~"}, {},
       {"S0>S0 93001 1", "S1>S1 93001 2", "S2>S2 93001 3", "S3>S3 93001 4", "S4>S4 93001 5", "S5>S5 93001 6",
        "S6>S6 93001 7", "S7>S7 93001 8", "S8>S8 93001 9", "S9>S9 93001 10"}},
      // clang-format on
  };
  for (const auto& c : cases) {
    for (const std::string& className : c.classes) {
      SCOPED_TRACE(className + " " + c.n1 + ::testing::PrintToString(c.lines));
      X12Trade trade(className);
      for (int n = 0; n < 10; ++n) trade.AddLocation("S" + std::to_string(n));
      std::string body = kBegin + c.n1;
      for (const std::string& behind : c.lines) body += trade.Line(&behind == &c.lines[0] ? "93001" : "93002") + behind;
      const auto run = trade.Import(trade.Sent(trade.File(body + "CTT*1~")));
      Texts log = c.log;
      if (log.empty()) log.push_back(kCompleted);
      else if (!log.back().starts_with("0 ")) log.push_back(kIncomplete);
      EXPECT_EQ(run.log, log);
      EXPECT_EQ(run.outcomes.at(0).told, log);
      EXPECT_EQ(run.outcomes.at(0).result, c.log.empty() ? 1 : 0);
      EXPECT_EQ(trade.folder.Has(X12Trade::kFile), !c.log.empty());
      EXPECT_EQ(Given(trade), c.given);
    }
  }
}

// Tells what it is called for.
struct Recorder : OrderExport {
  Recorder(Texts& calls, bool agrees) : told(calls), answer(agrees) {}
  void Init(const EDIDoc& document, System&, const Partner& partner, const Vendor& vendor) override {
    told.push_back("Init " + std::to_string(document.EDIDocId) + " " + partner.PartnerId + " " + vendor.VendorId);
  }
  bool Process(const Order& order, std::vector<std::int32_t>& logIds) override {
    told.push_back("Process " + order.PONo + "/" + std::to_string(order.OrderId) + "/" + std::to_string(order.Status));
    logIds.push_back(1);
    return answer;
  }
  void Term() override { told.push_back("Term"); }

  Texts& told;
  bool answer;
};

TEST(X12PostingTest, HandsAPostedOrderOn) {
  const Texts calls = {"Create Acme.Out", "Init 3 MGB ACME", "Process 450001/1/0", "Term"};
  const std::string failed = "0 Process: PO 450001 error exporting file.";
  const struct {
    std::string className, options, progId, partner;
    bool agrees;
    Texts calls, told;
  } cases[] = {
      // clang-format off
      {kMgb,    "#%X XOLE=\"Acme.Out\" Y", "Acme.Out", "MGB", true,  calls, {kCompleted, kCompleted}},
      {kTarget, "XOLE=\"Acme.Out\"",       "Acme.Out", "MGB", false, calls, {kCompleted, failed, kCompleted}},
      {kGhpl,   "XOLE=\"Acme.Out\"",       "Acme.Out", "MGB", true,  {},    {kCompleted}},
      {kKmart,  "XOLE=\"Acme.Out\"",       "Acme.Out", "MGB", true,  {},    {kCompleted}},
      {kMgb,    "XOLE=\"Acme.Out",         "Acme.Out", "MGB", true,  {},    {kCompleted}},
      {kMgb,    "XOLE=\"Acme.Out\"",       "Acme.In",  "MGB", true,  {},    {kCompleted}},
      {kMgb,    "XOLE=\"Acme.Out\"",       "Acme.Out", "KMT", true,  {},    {kCompleted}},
      {kMgb,    "XOLE=\"Acme.None\"",      "Acme.None", "MGB", true, {"Create Acme.None"}, {kCompleted}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.options + " " + c.progId + " " + c.partner);
    X12Trade trade(c.className);
    Texts told;
    trade.ports.components.orderExport = [&](std::string_view progId) -> std::unique_ptr<OrderExport> {
      told.push_back("Create " + std::string(progId));
      return progId == "Acme.Out" ? std::make_unique<Recorder>(told, c.agrees) : nullptr;
    };
    trade.document.Options = c.options;
    trade.AddDocument(c.partner, "", c.progId);
    trade.Stored(With<Log>([](Log& log) { log.Procedure = "Process", log.Message = "PO 450001 import completed."; }));
    const auto run = trade.Import(trade.Sent(trade.File(trade.Body())));
    EXPECT_EQ(told, c.calls);
    EXPECT_EQ(run.outcomes.at(0).told, c.told);
    EXPECT_EQ(run.outcomes.at(0).result, 1);
  }
}

}  // namespace
}  // namespace partnerkit::testing
