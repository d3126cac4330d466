// X12 files that aren't what they should be, and what the log says of them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/x12_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::SizeIs;

std::string Order(std::string_view number, std::string_view segments, std::string_view control = "0001") {
  return TransactionSet("BEG*00*SA*" + std::string(number) + "**060301~N1*ST**92*0900~" + std::string(segments),
                        control);
}

// The other order of each file is posted, whatever is wrong with the first, which stays with its reason on the log.
TEST(X12OddFilesTest, TellsWhyAnOrderIsRefused) {
  X12Trade mgb(kMgb);
  const std::string line = mgb.Line(), end = "CTT*1~";
  const std::string longNumber(200'000, '7');
  const struct {
    std::string what, first, told;
    bool numbered = true;
  } cases[] = {
      {"a store without a quantity", Order("450001", line + "SDQ*EA*92*0512~" + end),
       "segment SDQ*EA*92*0512 at byte {}: store 0512 has no quantity. It stays in the file."},
      {"a product in two lines", Order("450001", line + mgb.Line("93001", "2") + end),
       "segment PO1*2*24*CT*12.50*LE*EN*93001* at byte {}: product 93001 stands in two lines of the order. It stays in "
       "the file."},
      {"a quantity beyond all numbers", Order("450001", "PO1*1*1e400*CT*12.50*LE*EN*93001*~" + end),
       "segment PO1*1*1e400*CT*12.50*LE*EN*93001* at byte {}: PO102 \"1e400\" is beyond all numbers. It stays in the "
       "file."},
      {"no CTT", Order("450001", line),
       "segment SE*9*0001 at byte {}: the transaction ends here without its CTT. It stays in the file."},
      {"another transaction inside", "ST*850*0001~BEG*00*SA*450001**060301~" + line,
       "segment ST*850*0002 at byte {}: the transaction ends here without its CTT. It stays in the file."},
      {"an element that isn't there", Order("450001", "PO1*1*24*CT~" + end),
       "the segment PO1*1*24*CT at byte {} has no element 4. It stays in the file."},
      {"stores before any line", Order("450001", "SDQ*EA*92*0512*3~" + line + end),
       "segment SDQ*EA*92*0512*3 at byte {}: it stands before any line of the order. It stays in the file."},
      {"a number that can't be held", Order(longNumber, line + end),
       "segment BEG*00*SA*" + longNumber.substr(0, 50) + "... at byte {} is too long to be read. It stays in the file.",
       false},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    X12Trade trade(kMgb);
    const std::string orders = Interchange(Group(c.first + TransactionSet(trade.Body("450002"), "0002")));
    const auto run = trade.Import(orders);
    ASSERT_THAT(run.outcomes, SizeIs(2));
    ASSERT_THAT(run.outcomes[0].told, SizeIs(2));
    const std::string number = c.numbered ? "450001" : "";
    std::string told = run.outcomes[0].told[0];
    if (const std::size_t at = told.find(" at byte "); at != std::string::npos) {
      const std::size_t digits = at + 9;
      told.replace(digits, told.find_first_not_of("0123456789", digits) - digits, "{}");
    }
    EXPECT_EQ(told, "R Process: ...Cannot process PO " + number + ", " + c.told);
    EXPECT_EQ(run.outcomes[0].told[1], "0 Process: PO " + number + " import incomplete.");
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450002/0"));
    EXPECT_THAT(trade.Orders(), HasSubstr(trade.Settled(c.first)));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(X12OddFilesTest, WarnsOfNumbersThatArent) {
  X12Trade trade(kMgb);
  const auto run =
      trade.Import(trade.File("BEG*00*SA*450001**060301~N1*ST**92*0900~PO1*1*1O0*CT*1.2.3*LE*EN*93001*~"
                              "SDQ*EA*92*0512*-5*0513*x7~CTT*1~"));
  ASSERT_THAT(run.outcomes, SizeIs(1));
  EXPECT_GT(run.outcomes[0].result, 0);
  EXPECT_THAT(
      run.outcomes[0].told,
      ElementsAre("W Process: PO 450001, segment PO1*1*1O0*CT*1.2.3*LE*EN*93001* at byte 208: PO104 \"1.2.3\" is not "
                  "a number; it is read as 1.2.",
                  "W Process: PO 450001, segment PO1*1*1O0*CT*1.2.3*LE*EN*93001* at byte 208: PO102 \"1O0\" is not a "
                  "number; it is read as 1.",
                  "W Process: PO 450001, segment SDQ*EA*92*0512*-5*0513*x7 at byte 240: SDQ04 \"-5\" is a "
                  "negative quantity.",
                  "W Process: PO 450001, segment SDQ*EA*92*0512*-5*0513*x7 at byte 240: SDQ06 \"x7\" is not a "
                  "number; it is read as 0.",
                  kCompleted));
}

TEST(X12OddFilesTest, KeepsAStoredOrderWhoseReplacementFails) {
  for (const std::string& className : kAllClasses) {
    SCOPED_TRACE(className);
    X12Trade trade(className);
    trade.AddOrder(0, [](partnerkit::Order& order) { order.TransactionCtl = "32"; });
    const std::string body = trade.Body("450001", "0999", "07");
    const auto run = trade.Import(trade.Sent(trade.File(body)));
    ASSERT_THAT(run.outcomes, SizeIs(1));
    EXPECT_EQ(run.outcomes[0].told.front(), "W Process: ... Warning Duplicate PO 450001.");
    EXPECT_EQ(run.outcomes[0].told.back(), kIncomplete);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    EXPECT_EQ(trade.StoredOrderRecords().front()->TransactionCtl, "32");
    EXPECT_THAT(trade.Orders(), HasSubstr(trade.Settled(TransactionSet(body))));
    // Once its location is there it takes the place of the old one.
    trade.AddLocation("0999");
    EXPECT_GT(trade.Import().outcomes.at(0).result, 0);
    EXPECT_EQ(trade.StoredOrderRecords().front()->TransactionCtl, "0001");
  }
}

// As long as the order stays in the file, so does what cancels it: a run that comes to store the order cancels it, too.
TEST(X12OddFilesTest, LetsNoCancellationOvertakeItsOrder) {
  X12Trade trade(kKmart);
  const std::string failing = trade.Body("450001", "0999");
  const std::string cancel = "BCH*01*SA*450001***060302~CTT*0~";
  const std::string cancelsNothing = "R Process: Cannot process POC Cancellation - PO 450001";
  const std::string sets = TransactionSet(failing) + TransactionSet(cancel, "0002", "860");
  auto run = trade.Import(Interchange(Group(sets)));
  ASSERT_THAT(run.outcomes, SizeIs(2));
  EXPECT_THAT(run.outcomes[1].told, ElementsAre(cancelsNothing));
  EXPECT_EQ(trade.Orders(), trade.Settled(Interchange(Gs("77", "PO", "*FA DONE*") + sets + "GE*1*77~")));
  trade.AddLocation("0999");
  run = trade.Import();
  ASSERT_THAT(run.outcomes, SizeIs(2));
  EXPECT_GT(run.outcomes[0].result, 0);
  EXPECT_THAT(run.outcomes[1].told, ElementsAre("W Process: ... Warning Purchase Order Cancel Request 450001."));
  EXPECT_THAT(trade.StoredOrders(), IsEmpty());
  // One that waits is over once the order is sent anew behind it.
  trade.Import(Interchange(Group(TransactionSet(trade.Body("450001", "0888")) + TransactionSet(cancel, "0002", "860") +
                                 TransactionSet(trade.Body(), "0003"))));
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
  trade.Import();
  EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
  EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
  trade.Sql("DELETE FROM tbOrder");
  // With nothing before it, a cancellation of nothing leaves, as does one in front of its order.
  trade.Import(
      Interchange(Group(TransactionSet(cancel, "0002", "860") + TransactionSet(trade.Body("450001", "0888")))));
  EXPECT_THAT(trade.Orders(), ::testing::Not(HasSubstr("BCH")));
}

TEST(X12OddFilesTest, PostsNothingThatHasChangedSinceTheListing) {
  for (const std::string& className : kAllClasses) {
    SCOPED_TRACE(className);
    X12Trade trade(className);
    const auto importer = trade.Loaded(trade.Sent(trade.File(trade.Body())));
    const std::string changed = Replaced(trade.Orders(), "450001", "450009");
    std::fstream(trade.OrdersPath(), std::ios::in | std::ios::out | std::ios::binary) << changed;
    const auto outcome = trade.Process(*importer, 0);
    EXPECT_EQ(outcome.result, 0);
    ASSERT_THAT(outcome.told, SizeIs(2));
    EXPECT_THAT(outcome.told[0], HasSubstr("has changed since it was listed, and begins another order here. It stays"));
    EXPECT_TRUE(importer->Term());
    EXPECT_THAT(trade.Orders(), HasSubstr("450009"));
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
  }
}

TEST(X12OddFilesTest, ReadsFilesWithAByteOrderMarkOrCtrlZ) {
  const std::string mark = "\xEF\xBB\xBF", end = "\x1A";
  for (const std::string& className : kAllClasses) {
    SCOPED_TRACE(className);
    X12Trade trade(className);
    trade.document.AckFolder = Text();
    const std::string file = trade.File(trade.Body()), failing = trade.File(trade.Body("450002", "0999"));
    // Old systems append to a file behind its end.
    std::string both = mark;
    for (const std::string& sent : {file, failing}) both.append(trade.Sent(sent)).append(end);
    auto run = trade.Import(both);
    EXPECT_EQ(run.rows, 2);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0"));
    const std::string left = trade.Orders();
    EXPECT_TRUE(left.starts_with(mark + "ISA*")) << left;
    EXPECT_TRUE(left.ends_with("\r\n" + end)) << left;
    trade.AddLocation("0999");
    run = trade.Import();
    EXPECT_EQ(run.rows, 1);
    EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
  }
}

// A mailbox that writes slowly: whatever a run makes of the first part, the orders of the whole file come to the store.
TEST(X12OddFilesTest, WaitsForTheRestOfAnUpload) {
  for (const std::string& className : kAllClasses) {
    for (const bool posts : {false, true}) {
      X12Trade trade(className);
      trade.system->Commit(0);
      trade.Sql("PRAGMA synchronous=OFF");
      trade.document.AckFolder = Text();
      const std::string file =
          trade.Sent(Interchange(Group(TransactionSet(Replaced(trade.Body(), "CTT", "SDQ*EA*92*0512*12*0513*12~CTT")) +
                                       TransactionSet(trade.Body("450002"), "0002"))));
      const auto quantities = [&] {
        std::string all;
        for (const std::string& line : trade.Every<OrderLocnLine>()) all += line.substr(line.find("BuyingLocn")) + "\n";
        return all;
      };
      trade.Import(file);
      const std::string whole = quantities();
      EXPECT_THAT(whole, HasSubstr("Quantity=12 "));
      for (std::size_t cut = 1; cut < file.size(); cut += className == kKmart ? 1 : 5) {
        for (const char* table : {"Order", "OrderLine", "OrderLocn", "OrderLocnLine", "Log", "UnsettledOrder"}) {
          trade.Sql("DELETE FROM tb" + std::string(table));
        }
        std::filesystem::remove(trade.OrdersPath());
        trade.WriteOrders(file.substr(0, cut));
        if (posts) {
          trade.Import();
        } else {
          const auto importer = trade.Start();
          RowTable rows;
          importer->Load(trade.OrdersPath(), rows);
          importer->Cancel();
        }
        std::ofstream(trade.OrdersPath(), std::ios::app | std::ios::binary) << file.substr(cut);
        trade.Import();
        EXPECT_EQ(quantities(), whole) << className << " cut behind " << cut << ": " << file.substr(0, cut);
        if (::testing::Test::HasFailure()) return;
      }
    }
  }
}

// What left the file is in the archive, however often the file comes back under its name.
TEST(X12OddFilesTest, ArchivesNothingAway) {
  X12Trade trade(kMgb);
  std::filesystem::create_directory(trade.folder / "archive");
  const auto archived = [&](const std::string& name) { return trade.folder.Read("archive/orders.txt" + name); };
  const std::string both =
      Interchange(Group(TransactionSet(trade.Body()) + TransactionSet(trade.Body("450002", "0999"), "0002")));
  trade.Import(both);
  EXPECT_EQ(archived(""), both);
  const std::string left = trade.Orders();
  trade.Import();
  EXPECT_EQ(archived(""), left);
  EXPECT_EQ(archived(".1"), both);
  // The empty pair of the posted order is swept away by now, and the file stays as it is.
  const std::string swept = trade.Orders();
  trade.Import();
  trade.Import();
  EXPECT_EQ(archived(".2"), left);
  EXPECT_EQ(trade.Orders(), swept);
  // A file that has grown begins with all of the earlier copy.
  const std::string grown = swept + trade.File(trade.Body("450003"));
  trade.Import(grown);
  EXPECT_EQ(archived(""), grown);
  EXPECT_FALSE(trade.folder.Has("archive/orders.txt.3"));
  trade.Import(trade.File(trade.Body("450004")));
  EXPECT_EQ(archived(""), trade.File(trade.Body("450004")));
  EXPECT_EQ(archived(".3"), grown);
}

TEST(X12OddFilesTest, KnowsTheOrdersOfAnEarlierRun) {
  for (const std::string& className : kAllClasses) {
    SCOPED_TRACE(className);
    X12Trade trade(className);
    trade.document.AckFolder = Text();
    const std::string orders = trade.Sent(trade.File(trade.Body()));
    EXPECT_GT(trade.Process(*trade.Loaded(orders), 0).result, 0);
    EXPECT_THAT(trade.Every<UnsettledOrder>(), SizeIs(1));
    EXPECT_THAT(trade.Import().log, ElementsAre(kExists));
    EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
    EXPECT_THAT(trade.Every<UnsettledOrder>(), IsEmpty());
  }
}

}  // namespace
}  // namespace partnerkit::testing
