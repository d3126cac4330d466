#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/x12_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

const std::string kNoCancellation = "R Process: Cannot process POC Cancellation - PO 450001";

// An order of that purpose and type, with its dates.
std::string Order850(const X12Trade& trade, const std::string& purpose, const std::string& type = "SA") {
  return Replaced(trade.Body("450001", "0900", purpose), "*SA*450001**060301~",
                  "*" + type + "*450001**060301~DTM*063*060324~DTM*064*060310~");
}

// The stored order: none, the same transaction, or another.
enum Comes { kAlone, kAgain, kAsNew };

TEST(X12RulesTest, SettlesAnOrderByItsRules) {
  const std::string duplicate = "W Process: ... Warning Duplicate PO 450001.";
  const std::string cancelled = "W Process: ... Warning Purchase Order CANCEL Request 450001 processed.";
  const std::string notCancelled = "W Process: ... Warning Purchase Order CANCEL Request FAILED 450001.";
  const std::string change = "W Process: ... Warning Purchase Order Change Request 450001.";
  const std::string changeFailed = "W Process: ... Warning Purchase Order Change Request FAILED450001.";
  const std::string changeBegun =
      "W Process: ... Cannot process Purchase Order Change Request 450001 processing begun.";
  const std::string cancel = "W Process: ... Warning Purchase Order Cancel Request 450001.";
  const std::string cancelFailed = "W Process: ... Warning Purchase Order Cancel Request FAILED450001.";
  const std::string cancelBegun =
      "W Process: ... Cannot process Purchase Order Cancel Request 450001 processing begun.";
  const std::string noOriginal = "R Process: Cannot process. Original PO 450001 doesn't exist.";
  const std::string blanket = "R Process: Warning. Blanket Order, PO 450001";
  const std::string blanketDash = "R Process: Warning Blanket Order - PO 450001";
  const Texts mgb = {kMgb}, kmart = {kKmart}, target = {kTarget};
  const std::string noDelete = "DELETE", noUpdate = "UPDATE";
  const struct {
    Texts classes;
    std::string purpose, type;
    Comes comes;
    int jobs, status;
    std::string about;  // the stored order: its type, or "1" for its change flag
    Texts told;
    bool leaves;
    std::string stored;  // the group number of what is stored afterwards
    std::int32_t result = 0;
    std::string refused = {};
  } cases[] = {
      // clang-format off
      {kAllClasses, "00", "SA", kAgain, 0, 0, "",   {kExists},                true,  "77"},
      {kAllClasses, "00", "SA", kAgain, 0, 9, "",   {kScrapped, kCompleted},  true,  "77", 2},
      {kAllClasses, "07", "SA", kAsNew, 0, 0, "",   {duplicate, kCompleted},  true,  "77", 2},
      {kAllClasses, "07", "SA", kAsNew, 0, 9, "",   {duplicate, kCompleted},  true,  "77", 2},
      {kAllClasses, "07", "SA", kAsNew, 0, 0, "",   {duplicate},              false, "7", 0, noDelete},
      {kAllClasses, "07", "SA", kAsNew, 1, 0, "",   {kExists},                true,  "7"},
      {kAllClasses, "00", "SA", kAsNew, 1, 9, "",   {kScrapped, kCompleted},  true,  "77", 2},
      {kAllClasses, "00", "SA", kAsNew, 0, 9, "",   {kScrapped},              false, "7", 0, noDelete},
      {kAllClasses, "00", "SA", kAsNew, 0, 1, "",   {kExists},                true,  "7"},
      {{kTarget, kGhpl}, "00", "RL", kAsNew, 0, 0, "SA", {kExists},                true,  "7"},
      {mgb,         "05", "SA", kAsNew, 0, 0, "",   {kExists},                true,  "7"},
      {mgb,         "01", "SA", kAsNew, 1, 0, "",   {cancelled},              true,  ""},
      {mgb,         "01", "SA", kAsNew, 0, 9, "",   {cancelled},              true,  ""},
      {mgb,         "01", "SA", kAsNew, 0, 0, "",   {cancelled, notCancelled}, true, "7", 0, noDelete},
      {mgb,         "00", "RL", kAsNew, 0, 0, "BL", {kExists},                true,  "7"},
      {target,      "00", "RL", kAsNew, 0, 0, "BL", {duplicate, kCompleted},  true,  "77", 2},
      {target,      "00", "RL", kAsNew, 1, 0, "BL", {kExists},                true,  "7"},
      {{kTarget, kGhpl}, "01", "SA", kAsNew, 0, 0, "", {kExists},             true,  "7"},
      {kmart,       "05", "SA", kAsNew, 0, 0, "",   {change, kCompleted},     true,  "77", 2},
      {kmart,       "05", "SA", kAsNew, 0, 0, "",   {change},                 false, "7", 0, noDelete},
      {kmart,       "05", "SA", kAsNew, 1, 0, "",   {changeBegun},            false, "7"},
      {kmart,       "05", "SA", kAsNew, 1, 0, "1",  {change},                 true,  "7 2006-03-10 2006-03-24", 1},
      {kmart,       "05", "SA", kAsNew, 1, 0, "1",  {changeFailed},           true,  "7", 0, noUpdate},
      {kmart,       "05", "SA", kAsNew, 1, 9, "1",  {kScrapped, kCompleted},  true,  "77", 2},
      {kmart,       "01", "SA", kAsNew, 0, 0, "",   {cancel},                 false, "", 1},
      {kmart,       "01", "SA", kAsNew, 0, 0, "",   {cancelFailed},           true,  "7", 0, noDelete},
      {kmart,       "01", "SA", kAsNew, 1, 0, "",   {cancelBegun},            true,  "7"},
      {kmart,       "01", "SA", kAsNew, 0, 9, "",   {kScrapped, kNoCancellation}, true, ""},

      {kAllClasses, "05", "SA", kAlone, 0, 0, "",   {kCompleted},             true,  "77", 1},
      {kAllClasses, "07", "SA", kAlone, 0, 0, "",   {kCompleted},             true,  "77", 1},
      {{kTarget, kGhpl}, "01", "SA", kAlone, 0, 0, "", {kCompleted},          true,  "77", 1},
      {mgb,         "01", "SA", kAlone, 0, 0, "",   {noOriginal},             false, ""},
      {kmart,       "01", "SA", kAlone, 0, 0, "",   {kNoCancellation},        true,  ""},
      {target,      "00", "BL", kAlone, 0, 0, "",   {blanket, kCompleted},    true,  "77", 1},
      {kmart,       "00", "BK", kAlone, 0, 0, "",   {blanketDash, kCompleted}, true, "77", 1},
      {kmart,       "01", "BK", kAlone, 0, 0, "",   {blanketDash, kNoCancellation}, true, ""},
      {{kMgb, kGhpl, kKmart}, "00", "BL", kAlone, 0, 0, "", {kCompleted},     true,  "77", 1},
      {{kMgb, kGhpl, kTarget}, "00", "BK", kAlone, 0, 0, "", {kCompleted},    true,  "77", 1},
      // clang-format on
  };
  for (const auto& c : cases) {
    for (const std::string& className : c.classes) {
      SCOPED_TRACE(className + " " + c.purpose + " " + c.type + (c.comes == kAgain ? " again" : "") +
                   (c.comes == kAlone ? " alone" : "") + " jobs " + std::to_string(c.jobs) + " status " +
                   std::to_string(c.status) + " " + c.about + c.refused);
      X12Trade trade(className);
      const auto old = [&](Order& order) {
        order.InterchangeCtl = "000000481";
        order.GroupCtl = c.comes == kAgain ? "77" : "7";
        order.TransactionCtl = c.comes == kAgain ? "0001" : "70001";
        order.Status = c.status;
        (c.about == "1" ? order.ChangeFlag : order.TypeCode) = c.about;
      };
      if (c.comes != kAlone) trade.AddOrder(c.jobs, old);
      if (!c.refused.empty()) {
        trade.Sql("CREATE TRIGGER no BEFORE " + c.refused + " ON tbOrder BEGIN SELECT RAISE(IGNORE); END");
      }
      const std::string body = Order850(trade, c.purpose, c.type);
      const auto run = trade.Import(trade.Sent(trade.File(body)));
      ASSERT_EQ(run.rows, 1);
      EXPECT_EQ(run.outcomes[0].told, c.told);
      EXPECT_EQ(run.log, c.told);
      EXPECT_EQ(run.outcomes[0].result, c.result);
      EXPECT_EQ(trade.Orders(),
                c.leaves ? "" : trade.Settled(Interchange(Group(TransactionSet(body), "77", "PO", "*FA DONE*"))));
      const auto stored = trade.StoredOrderRecords();
      ASSERT_THAT(stored, SizeIs(c.stored.empty() ? 0 : 1));
      if (stored.empty()) continue;
      EXPECT_EQ(stored[0]->GroupCtl, c.stored.substr(0, c.stored.find(' ')));
      if (c.stored.size() > 2) {
        EXPECT_EQ("7 " + stored[0]->NotBefore->Iso() + " " + stored[0]->CancelAfter->Iso(), c.stored);
      }
    }
  }
}

struct Checked : X12Trade {
  Checked(const std::string& importer, int validate) : X12Trade(importer) {
    Set(document, validate);
    AddUsualProducts();
    Sql("INSERT INTO tbProduct (ProductNo, PartnerId, UOM, Symbology) VALUES ('93001234567890', 'MGB', 'CT', 'EN')");
  }
};

TEST(X12RulesTest, TellsEveryFaultOfALineAndKeepsTheOrder) {
  const Texts usual = {kMgb, kTarget, kGhpl}, retail = {kMgb, kTarget}, none = {kGhpl, kKmart}, kmart = {kKmart};
  const std::string missing = "product 93009 does not exist.",
                    noPrice = "pricing details for product 93009 does not exist.";
  const std::string noCost = "product 93009 cost price 12.50 does not agree with database cost 0";
  const std::string cost = "product 93001 cost price 12.51 does not agree with database cost 12.5";
  const std::string UOM = "product 93001 UOM EA does not agree with database UOM CT";
  const std::string price = "product 93001 retail price 29.90 does not agree with database retail 29.95";
  const struct {
    Texts classes;
    int validate;
    std::string what, by;  // in the line and its retail price
    Texts faults;
  } cases[] = {
      // clang-format off
      {kAllClasses, kAll, "12.50", "012.5", {}},
      {kAllClasses, kCost | kRetail, "93001", "93009", {}},
      {{kGhpl}, kAll, "93001", "93009", {Refused(missing), Refused(noPrice), Refused(noCost)}},
      {kmart, kAll, "93001", "93009", {InError(missing), InError(noPrice), InError(noCost)}},
      {retail, kAll, "93001", "93009", {Refused(missing), Refused(noPrice), Refused(noCost),
       Refused("product 93009 retail price 29.95 does not agree with database retail 0")}},
      {usual, kProduct, "93001", "93005", {Refused("product 93005 does not exist for vendor MGB")}},
      {usual, kAll, "CT*12.50*LE*EN", "EA*12.51*LE*UP", {Refused(UOM), Refused(cost)}},
      {kmart, kAll, "CT*12.50*LE*EN", "EA*12.51*LE*UP", {InError(UOM), InError(cost)}},
      {usual, kProduct, "EN*", "UP*",
       {Refused("barcode 93001 symbology UP does not agree with database symbology EN")}},
      {kmart, kProduct, "EN*", "UP*",
       {InError("product 93001 qualifier UP does not agree with database symbology EN")}},
      {{kGhpl}, kProduct, "EN*93001", "UP*93001234567890", {}},
      {retail, kAll, "29.95", "29.90", {Refused(price)}},
      {retail, kProduct | kRetail, "29.95", "29.90", {}},
      {retail, kProduct | kCost, "29.95", "29.90", {}},
      {none, kAll, "29.95", "29.90", {}},
      // clang-format on
  };
  for (const auto& c : cases) {
    for (const std::string& className : c.classes) {
      SCOPED_TRACE(className + " " + std::to_string(c.validate) + " " + c.what + " by " + c.by);
      Checked trade(className, c.validate);
      const std::string line = Replaced(trade.Line() + "CTP**RTL*29.95~", c.what, c.by);
      const auto run = trade.Import(trade.Sent(trade.File("BEG*00*SA*450001**060301~" + line + "CTT*1~")));
      Texts told = c.faults;
      told.push_back(c.faults.empty() ? kCompleted : kIncomplete);
      EXPECT_EQ(run.outcomes.at(0).told, told);
      EXPECT_THAT(trade.StoredOrders(), SizeIs(c.faults.empty() ? 1 : 0));
      EXPECT_EQ(trade.folder.Has(X12Trade::kFile), !c.faults.empty());
    }
  }
}

// Where orders are acknowledged, a Kmart order is stored with its faults, for the acknowledgement to tell of them.
TEST(X12RulesTest, KmartStoresAnOrderWithErrorsThatIsAnswered) {
  const std::string missing = InError("product 93009 does not exist.");
  const std::string noPrice = InError("pricing details for product 93009 does not exist.");
  const std::string noCost = InError("product 93009 cost price 12.50 does not agree with database cost 0");
  const std::string PO1 = "PO1*1*24*CT*12.50*LE*EN*93009~", POC = "POC*1*AI*24*0*CT*12.50*LE*EN*93009~";
  const struct {
    std::string code, line;
    int validate;
    Texts told;
  } cases[] = {
      {"855", PO1, kAll, {missing, noPrice, noCost, kWithErrors}},
      {" ordrsp ", POC, kProduct, {missing, kWithErrors}},
      {"POA", POC, kAll, {missing, noPrice, noCost, kIncomplete}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.code + c.line);
    Checked trade(kKmart, c.validate);
    trade.AddDocument("MGB", c.code);
    const std::string file = trade.File("BEG*00*SA*450001**060301~" + c.line + "CTT*1~");
    const auto run = trade.Import(file);
    EXPECT_EQ(run.outcomes.at(0).told, c.told);
    EXPECT_EQ(run.outcomes.at(0).result, 0);
    const bool stores = c.told.back() == kWithErrors;
    EXPECT_EQ(trade.StoredOrders(), stores ? Texts{"450001/9"} : Texts());
    EXPECT_EQ(trade.folder.Has(X12Trade::kFile), !stores);
    if (!stores) continue;
    EXPECT_THAT(trade.Import(file).log, ElementsAre(kExists));
    EXPECT_EQ(trade.StoredOrders(), Texts{"450001/9"});
  }
}

TEST(X12RulesTest, TellsWhereTheStoreRefusedHalfWay) {
  X12Trade trade(kMgb);
  trade.Refuse("INSERT", "tbOrderLocnLine");
  EXPECT_THAT(trade.Import(trade.File(trade.Body())).log,
              ElementsAre("40002 Process: Error while inserting tbOrderLocnLine for PO 450001 line sequence 1 location "
                          "0900"));
  EXPECT_EQ(trade.StoredOrders(), Texts{"450001/9"});
  EXPECT_TRUE(trade.folder.Has(X12Trade::kFile));
}

// An order that was cut short never takes the end of another document for its own.
TEST(X12RulesTest, PostsNothingWithoutItsTotals) {
  for (const std::string& className : kAllClasses) {
    X12Trade trade(className);
    const std::string cut = Replaced(trade.Body(), "CTT*1~", "");
    const std::string other = "BAK*00~" + trade.Line("93002") + "CTT*1~";
    for (const std::string& file :
         {trade.File(cut), Interchange(Group(TransactionSet(cut) + TransactionSet(other, "0002", "855"))),
          Interchange(Group("ST*850*0001~" + cut + TransactionSet(other, "0002", "855"))),
          Isa() + Gs() + "ST*850*0001~" + cut + Interchange(Group(other), "1", "OTHERS"),
          Isa() + Gs() + "ST*850*0001~" + cut, Interchange(Group("ST*850*0001~" + cut + "BEG*00~CTT*1~"))}) {
      const auto run = trade.Import(trade.Sent(file));
      EXPECT_THAT(run.log, ElementsAre(::testing::HasSubstr("the transaction ends here without its CTT"), kIncomplete))
          << className << file;
      EXPECT_THAT(trade.StoredOrders(), IsEmpty());
      EXPECT_TRUE(trade.folder.Has(X12Trade::kFile));
    }
  }
}

TEST(X12RulesTest, StopsAtWhatItCannotTake) {
  const std::string many(30'000, '*'), overflow(40'000, '*');
  const struct {
    std::string className, segments, told;
  } cases[] = {
      {kMgb, "PO1*2*5*CT*1*LE*EN*93001*~", ": product 93001 stands in two lines of the order"},
      {kKmart, "PO1*2*5*CT*1*LE*EN*93001~", ": product 93001 stands in two lines of the order"},
      {kGhpl, "PO1*2*5~", "the segment PO1*2*5 at byte"},
      {kMgb, "N1*ST*Acme*92~", "has no element 4"},
      {kKmart, "PKG" + overflow + "~", "is too long to be read"},
      {kMgb, "SDQ*EA*92*" + std::string(33'000, 'x') + "*1*0512*1~", "is too long to be read"},
      {kTarget, "REF*" + std::string(2'000'000, 'x') + "~PKG*" + std::string(2'000'000, 'x') + "~",
       "is too long to be read"},
      {kMgb, "REF" + many + "~PKG" + many + "~SSS" + overflow + "~N1****0900" + many + "~", "ship to location 0900"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.segments.substr(0, 40));
    X12Trade trade(c.className);
    const std::string body = Replaced(trade.Body(), "CTT", c.segments + "CTT");
    const auto run = trade.Import(trade.Sent(trade.File(body)));
    EXPECT_EQ(run.outcomes.at(0).result, 0);
    EXPECT_THAT(run.log, ElementsAre(::testing::AllOf(::testing::StartsWith("R Process: ...Cannot process PO 450001, "),
                                                      ::testing::HasSubstr(c.told)),
                                     kIncomplete));
    EXPECT_THAT(trade.reports, IsEmpty());
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
    EXPECT_TRUE(trade.Orders() == trade.Settled(Interchange(Group(TransactionSet(body), "77", "PO", "*FA DONE*"))));
  }
}

}  // namespace
}  // namespace partnerkit::testing
