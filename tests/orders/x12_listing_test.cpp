#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/x12_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::string_literals;

// A beginning segment and no more.
std::string Set(std::string_view number, std::string_view control) {
  return TransactionSet("BEG*00*SA*" + std::string(number) + "**060301~", control);
}

TEST(X12ListingTest, ListsAndAcknowledgesAlikeInEveryFormOfAFile) {
  const std::string one = Set("450001", "0001"), two = Set("450002", "0002"), headless = "ST*850*0003~REF*DP~SE~";
  const std::string row = "450001 2006-03-01 000000481/77/0001", second = "450002 2006-03-01 000000481/77/0002";
  const std::string ack = "FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*1*1*1";
  const std::string ackOfTwo = "FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*2*2*2";
  const struct {
    std::string what, orders;
    Texts rows, acks;
  } cases[] = {
      // clang-format off
      {"two orders", Interchange(Group(one + two)), {row, second}, {ackOfTwo}},
      {"groups and interchanges",
       Interchange(Group(one) + Group(two, "78")) + Interchange(Group(one, "79"), "000000482"),
       {row, "450002 2006-03-01 000000481/78/0002", "450001 2006-03-01 000000482/79/0001"},
       {ack, "FA_PO_78_0603081015.TXT AK1*PO*78 AK9*A*1*1*1", "FA_PO_79_0603081015.TXT AK1*PO*79 AK9*A*1*1*1"}},
      {"a reference twice in a minute", Interchange(Group(one) + Group("")), {row}, {ack + " AK1*PO*77 AK9*A*0*0*0"}},
      {"a transaction that doesn't begin", Interchange(Group(headless + one)), {row}, {ackOfTwo}},
      {"one that begins twice", Interchange(Group(TransactionSet("BEG*00*SA*450001**060301~BEG*00*SA*9**060301~"))),
       {row}, {ack}},
      {"one without end", Interchange(Group("ST*850*0001~BEG*00*SA*450001**060301~" + two)), {row, second}, {ackOfTwo}},
      {"other sets", Interchange(Group(TransactionSet("BIG*1~BEG*00*SA*9**060301~", "0004", "810") + one)), {row},
       {ack}},
      {"other groups", Interchange(Group(one, "76", "IN") + Group(one) + Group(two, "78", "SH")), {row}, {ack}},
      {"others' interchanges",
       Interchange(Group(one, "70"), "1", "OTHERS") + Interchange(Group(one)) +
           Isa("2", kPartnerAddress, "ACMETOYS04568") + Group(one, "71") + Interchange(Group(one, "72"), "3", "MGB"),
       {row}, {ack}},
      {"the first of two cut short", Isa() + Gs() + one + Isa("000000481") + Gs("78") + two,
       {row, "450002 2006-03-01 000000481/78/0002"}, {ack, "FA_PO_78_0603081015.TXT AK1*PO*78 AK9*A*1*1*1"}},
      {"groups acknowledged before", Interchange(Group(one, "77", "PO", "*FA DONE*") + Group("", "78")),
       {row}, {"FA_PO_78_0603081015.TXT AK1*PO*78 AK9*A*0*0*0"}},
      {"rubbish", "ISA" + std::string(40'000, '*') + "~ISA*" + std::string(40'000, 'x') + "~ISA~" +
       Interchange(Group(one + "REF" + std::string(40'000, '*') + "~")), {row}, {ack}},
      {"outside", "NTE*1~GS*PO~" + one + Interchange(Group(one)) + "BEG~", {row}, {ack}},
      {"dates", Interchange(Group(TransactionSet("BEG*00*SA*1**990301~") + TransactionSet("BEG*00*SA*2**0603~") +
                                  TransactionSet("BEG*00*SA*3**060231*~"))),
       {"1 1999-03-01 000000481/77/0001", "2 empty 000000481/77/0001", "3 empty 000000481/77/0001"},
       {"FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*3*3*3"}},
      // clang-format on
  };
  for (const std::string& className : kAllClasses) {
    X12Trade trade(className);
    for (const auto& c : cases) {
      for (const std::string end : {"~", "~\r\n", "\r\n", "\n", "\r\n\r\n  \r\n"}) {
        if (className == kGhpl && end.starts_with("~")) continue;
        SCOPED_TRACE(c.what + " for " + className + " with " + ::testing::PrintToString(end));
        trade.ClearAcks();
        EXPECT_EQ(trade.Listed(Replaced(c.orders, "~", end)), c.rows);
        EXPECT_EQ(trade.Acks(), c.acks);
        EXPECT_THAT(trade.NewLog(), IsEmpty());
        EXPECT_THAT(trade.reports, IsEmpty());
      }
    }
  }
}

TEST(X12ListingTest, ReadsEachPartnersOwnFiles) {
  const std::string row = "450001 2006-03-01 000000481/77/0001";
  const std::string usual = Interchange(Group(Set("450001", "0001")));
  const std::string changes = TransactionSet("BCH*05*RL*450002*R9*C1*060302~", "0005", "860");
  const std::string release = TransactionSet("BEG*00*RL*450003* R7 *060303~", "0006");
  const struct {
    std::string className, orders, partnerAddress;
    Texts rows;
  } cases[] = {
      // clang-format off
      {kMgb,    Replaced(usual, "~", "'"), "", {row}},
      {kTarget, Replaced(usual, "450001", "45'001"), "", {"45'001 2006-03-01 000000481/77/0001"}},
      {kGhpl,   Replaced(Replaced(usual, "450001", "45'00'01"), "~", "'\r\n"), "", {row}},
      {kGhpl,   Replaced(Replaced(usual, "*0001", "*0001*LONGER"), "~", "\r\n"), "",
       {"450001 2006-03-01 000000481/77/0001*LONG"}},
      {kKmart,  Replaced(usual, "~", "'\r\n"), "", {row}},
      {kKmart,  Replaced(usual, "~", "''\r\n"), "", {"450001 2006-03-01 000000481/77/0001'"}},
      {kKmart,  Interchange(Group(changes + release, "78", "PC")), "",
       {"450002 REL# R9 2006-03-02 000000481/78/0005", "450003 REL# R7 2006-03-03 000000481/78/0006"}},
      {kMgb,    Interchange(Group(changes + release) + Group(release, "78", "PC")), "",
       {"450003 2006-03-03 000000481/77/0006"}},
      // Addresses without their blanks, or thirteen characters.
      {kMgb,    Interchange(Group(Set("450001", "0001")), "000000481", "MGB"), "MGB", {row}},
      {kTarget, usual, "MGBSTORES012", {}},
      {kKmart,  Interchange(Group(Set("450001", "0001")), "000000481", "MGB"), "MGB", {}},
      {kKmart,  Interchange(Group(Set("450001", "0001")), "000000481", "MGB"), "MGB          ", {row}},
      {kKmart,  Interchange(Group(Set("450001", "0001")), "000000481", "MGBSTORES01234"), "MGBSTORES0123", {row}},
      {kGhpl,   Replaced(Interchange(Group(Set("450001", "0001")), "000000481", "MGB"), "~", "\n"), "MGB", {}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.className + " " + c.orders);
    X12Trade trade(c.className);
    if (!c.partnerAddress.empty()) trade.document.PartnerEDIAddr = c.partnerAddress;
    EXPECT_EQ(trade.Listed(c.orders), c.rows);
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(X12ListingTest, TellsWhyNothingWasListed) {
  const struct {
    std::string what;
    std::function<void(X12Trade&)> arrange;
    std::string log;
    bool archived;
  } cases[] = {
      // clang-format off
      {"no file", [](X12Trade& t) { std::filesystem::remove(t.OrdersPath()); },
       "53 SetOrderList: File {} does not exist.", false},
      {"empty", [](X12Trade& t) { t.WriteOrders(""); }, "0 SetOrderList: File {} is empty.", false},
      {"no order of ours", [](X12Trade& t) { t.document.CompanyEDIAddr = "ACMETOYS"; },
       "0 Load: No orders found to match EDI addresses.", true},
      {"no place for acknowledgements", [](X12Trade& t) { t.document.AckFolder = t.folder / "gone/"; },
       "76 Open FA File: Cannot open FA file {folder}gone/FA_PO_77_0603081015.TXT", true},
      // clang-format on
  };
  for (const auto& c : cases) {
    for (const std::string& className : kAllClasses) {
      for (const bool cancels : {false, true}) {
        SCOPED_TRACE(c.what + " for " + className);
        X12Trade trade(className);
        trade.WriteOrders(trade.Sent(trade.File(trade.Body())));
        c.arrange(trade);
        const std::string before = trade.Orders();
        const auto importer = trade.Start();
        RowTable table(7, 1);
        EXPECT_EQ(importer->Load(trade.OrdersPath(), table), 0);
        EXPECT_EQ(table.Rows(), 7U);
        EXPECT_THAT(trade.NewLog(),
                    ElementsAre(Replaced(Replaced(c.log, "{}", trade.OrdersPath()), "{folder}", trade.folder / "")));
        EXPECT_THAT(trade.reports, IsEmpty());
        EXPECT_EQ(trade.folder.Has("archive/orders.txt"), c.archived && className != kGhpl);
        if (cancels) importer->Cancel();
        else importer->Term();
        EXPECT_EQ(trade.Orders(), before);
        EXPECT_THAT(trade.Acks(), IsEmpty());
      }
    }
  }
}

// A word that went out stays good, though a later one of the same file could not be given.
TEST(X12ListingTest, ListsNothingWhenAGroupCannotBeAcknowledged) {
  for (const std::string& className : kAllClasses) {
    X12Trade trade(className);
    FaultyFiles& files = trade.UseFaultyFiles();
    const std::string orders = trade.Sent(Interchange(Group(Set("450001", "0001")) + Group(Set("450002", "1"), "78")));
    files.Fail("OpenDraft", "FA_PO_78_0603081015.TXT", 75);
    const auto importer = trade.Loaded(orders, 0);
    EXPECT_THAT(trade.Acks(), ElementsAre("FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*1*1*1"));
    EXPECT_EQ(trade.Process(*importer, 0).result, 0);
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), orders);
    EXPECT_EQ(trade.Import().rows, 2);
  }
}

TEST(X12ListingTest, ArchivesTheFileAsItCame) {
  for (const std::string& className : kAllClasses) {
    X12Trade trade(className);
    for (const char* number : {"450001", "450002"}) {
      const std::string orders = trade.Sent(trade.File(trade.Body(number)));
      trade.Import(orders);
      EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
      EXPECT_EQ(trade.folder.Read("archive/orders.txt"), className == kGhpl ? "" : orders);
    }
    std::filesystem::remove_all(trade.folder / "archive");
    trade.folder.Write("archive", "no folder");
    Texts told;
    trade.ports.tell = [&](Told, const std::string& sentence) { told.push_back(sentence); };
    EXPECT_EQ(trade.Import(trade.Sent(trade.File(trade.Body("450003")))).rows, 1);
    EXPECT_THAT(trade.NewLog(), ElementsAre("0 Process: PO 450003 import completed."));
    EXPECT_THAT(trade.reports, IsEmpty());
    if (className == kGhpl) {
      EXPECT_THAT(told, IsEmpty());
    } else {
      EXPECT_THAT(told, ElementsAre(::testing::HasSubstr(" is not archived: ")));
    }
  }
}

TEST(X12ListingTest, AsksTheErrorTrailAboutWhatItCannotRead) {
  const std::string failed = "TLE error - program error #57 (It failed: orders.txt)";
  const struct {
    std::string what, body;
    Button answer;
    std::int32_t rows;
    Texts reports;
  } cases[] = {
      // clang-format off
      {"element", "BEG*00*SA~", Button::kAbort, 1, {}},
      {"file", "BEG*00*SA*450001**060301~", Button::kIgnore, 0, {failed}},
      {"file", "BEG*00*SA*450001**060301~", Button::kRetry, 1, {failed}},
      {"long", "REF*" + std::string(2'000'000, 'x') + "~BEG*00*SA*450001**060301~", Button::kAbort, 1, {}},
      {"long", "BEG*" + std::string(2'000'000, 'x') + "~", Button::kAbort, 1, {}},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    X12Trade trade(kMgb);
    FaultyFiles& files = trade.UseFaultyFiles();
    trade.answer = c.answer;
    const std::string orders = Interchange(Group(TransactionSet(c.body)));
    trade.WriteOrders(orders);
    const auto importer = trade.Start();
    if (c.what == "file") files.Fail("Read", "orders.txt", 57);
    RowTable table;
    EXPECT_EQ(importer->Load(trade.OrdersPath(), table), c.rows);
    for (std::string& report : trade.reports) report.resize(report.find(" occured"));
    EXPECT_EQ(trade.reports, c.reports);
    EXPECT_THAT(trade.NewLog(), IsEmpty());
    if (c.rows == 0) importer->Cancel();
    EXPECT_EQ(trade.Orders(), orders);
  }
}

}  // namespace
}  // namespace partnerkit::testing
