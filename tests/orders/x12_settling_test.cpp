#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <regex>

#include "support/x12_orders.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;

// What isn't ours and stays byte for byte: "{F}" an interchange, "{G}" a group within ours, "{O}" outside of them all.
std::string WithOthers(std::string text) {
  text = Replaced(text, "{F}",
                  "ISA*00*          *00*          *ZZ*OTHERS         *ZZ*ACMETOYS04567  *060308*1015*U*00200*5*0*P*>\n"
                  "GS*PO*A*B\n\nST*850*1~~ \nBEG*00*SA*9**060301'\nSE*2*1\r\nGE*1*5\nIEA*1*5\n");
  text = Replaced(text, "{G}", "GS*IN*A*B\nST*810*1~\n \nBIG*1*'2'\nSE*2*1\nGE*1*5\n");
  return Replaced(text, "{O}", "NTE*from the mailbox\n\nGE~\n");
}

const std::string kPair = TransactionSet("");

struct Settling : X12Trade {
  using X12Trade::X12Trade;
  std::string Good(std::string_view control = "0001") const { return TransactionSet(Body(), control); }
  std::string Failing(std::string_view control = "0002") const {
    return TransactionSet(Body("450002", "0999"), control);
  }
  // In the file's form, with the others.
  std::string Came(std::string_view text) const { return WithOthers(Sent(text)); }
  std::string Left(std::string_view text) const { return WithOthers(Settled(text)); }
};

std::string Marked(std::string_view sets, std::string_view control = "77") {
  return Group(sets, control, "PO", "*FA DONE*");
}

TEST(X12SettlingTest, WritesTheFileAsItIs) {
  Settling trade(kMgb);
  trade.Import(trade.File(trade.Body()) + trade.File(trade.Body("450002", "0999")));
  EXPECT_EQ(trade.Orders(),
            "ISA*00*          *00*          *ZZ*MGBSTORES0123  *ZZ*ACMETOYS04567  "
            "*060308*1015*U*00200*000000481*0*P*>~\r\n"
            "GS*PO*MGBSTORES*ACMETOYS*060308*1015*77*X*003040*FA DONE*~\r\nST*850*0001~\r\nSE*9*0001~\r\nGE*1*77~\r\n"
            "IEA*1*000000481~\r\n"
            "ISA*00*          *00*          *ZZ*MGBSTORES0123  *ZZ*ACMETOYS04567  "
            "*060308*1015*U*00200*000000481*0*P*>~\r\n"
            "GS*PO*MGBSTORES*ACMETOYS*060308*1015*77*X*003040*FA DONE*~\r\nST*850*0001~\r\n"
            "BEG*00*SA*450002**060301~\r\nN1*ST**92*0999~\r\nPO1*1*24*CT*12.50*LE*EN*93001*~\r\nCTT*1~\r\n"
            "SE*9*0001~\r\nGE*1*77~\r\nIEA*1*000000481~\r\n");
}

TEST(X12SettlingTest, LeavesInTheFileWhatIsNotDealtWith) {
  for (const std::string& className : kAllClasses) {
    Settling trade(className);
    const std::string good = trade.Good(), failing = trade.Failing();
    const std::string headless = TransactionSet("REF*DP*7~", "0003");
    const std::string longSegment = TransactionSet("BEG*00*SA*1**060301~SSS*" + std::string(1'500'000, 'x') + "~");
    const struct {
      std::string what, orders;
      std::int32_t rows;
      std::string left, leftByNext;
    } cases[] = {
        // clang-format off
        {"all", Interchange(Group(failing)), 1, Interchange(Marked(failing)), Interchange(Marked(failing))},
        {"one", Interchange(Group(good + failing)), 2, Interchange(Marked(kPair + failing)),
         Interchange(Marked(failing))},
        {"empty pairs", Interchange(Group(kPair + failing + "ST*850*0004~SE*1~", "77")), 1,
         Interchange(Marked(failing)), Interchange(Marked(failing))},
        {"a group", Interchange(Group(good) + Group("", "76") + Group(failing, "78")), 2,
         Interchange(Marked(kPair) + Marked(failing, "78")), Interchange(Marked(failing, "78"))},
        {"an interchange", Interchange(Group(good)) + Interchange(Group(failing), "2"), 2,
         Interchange(Marked(kPair)) + Interchange(Marked(failing), "2"), Interchange(Marked(failing), "2")},
        {"others' interchanges", "{F}" + Interchange(Group(good)) + "{F}{F}", 1,
         "{F}" + Interchange(Marked(kPair)) + "{F}{F}", "{F}{F}{F}"},
        {"other groups", Interchange("{G}" + Group(good) + "{G}"), 1, Interchange("{G}" + Marked(kPair) + "{G}"),
         Interchange("{G}{G}")},
        {"outside", "{O}" + Interchange(Group(good)) + "{O}", 1, "{O}" + Interchange(Marked(kPair)) + "{O}", "{O}{O}"},
        {"a transaction that isn't listed", Interchange(Group(good + headless)), 1,
         Interchange(Marked(kPair + headless)), Interchange(Marked(headless))},
        {"cut short", Isa() + Gs() + good + Isa("2") + Gs("78").append(failing), 2,
         Isa() + Gs("77", "PO", "*FA DONE*") + kPair + Isa("2") + Gs("78", "PO", "*FA DONE*").append(failing),
         Isa("2") + Gs("78", "PO", "*FA DONE*") + failing},
        {"a long segment", Interchange(Group(longSegment)), 1, Interchange(Marked(longSegment)),
         Interchange(Marked(longSegment))},
        // clang-format on
    };
    for (const auto& c : cases) {
      SCOPED_TRACE(c.what + " for " + className);
      trade.Sql("DELETE FROM tbOrder");
      const auto run = trade.Import(trade.Came(c.orders));
      EXPECT_EQ(run.rows, c.rows);
      EXPECT_TRUE(run.term);
      EXPECT_TRUE(trade.Orders() == trade.Left(c.left)) << trade.Orders().substr(0, 3000);
      trade.ClearAcks();
      EXPECT_TRUE(trade.Import().term);
      // The line end behind the last segment is a bare one, for those who keep them.
      const bool addsBare = (className == kTarget || className == kKmart) && c.leftByNext.ends_with('~');
      EXPECT_TRUE(trade.Orders() == trade.Left(c.leftByNext + (addsBare ? "~" : ""))) << trade.Orders().substr(0, 3000);
      EXPECT_THAT(trade.Acks(), IsEmpty());
      EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
      EXPECT_THAT(trade.reports, IsEmpty());
    }
  }
}

// Two of the partners have always found the rest of a finished file beside it.
TEST(X12SettlingTest, TakesAFinishedFileAway) {
  for (const std::string& className : kAllClasses) {
    SCOPED_TRACE(className);
    Settling trade(className);
    trade.document.Options = "#%DELETEONEMPTY";
    const std::string orders = trade.Came(Interchange(Group(trade.Good() + trade.Failing())));
    EXPECT_THAT(trade.Import(orders).outcomes, SizeIs(2));
    trade.AddLocation("0999");
    EXPECT_THAT(trade.Import().log, ElementsAre("0 Process: PO 450002 import completed."));
    EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
    EXPECT_EQ(trade.folder.Has("in/orders.tmp"), className == kTarget || className == kGhpl);
    EXPECT_EQ(trade.folder.Read("in/orders.tmp"),
              trade.folder.Has("in/orders.tmp") ? trade.Settled(Interchange(Marked(TransactionSet("", "0002")))) : "");
    EXPECT_THAT(trade.Acks(), ElementsAre("FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*2*2*2"));
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0", "450002/0"));
    // The same file sent again is turned away.
    EXPECT_THAT(trade.Import(orders).log, ElementsAre(kExists, "R Process: Cannot process. PO 450002 already exists."));
    EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
    EXPECT_THAT(trade.reports, IsEmpty());
  }
}

TEST(X12SettlingTest, KeepsBareTerminatorsForSomePartners) {
  const std::string orders = Isa() + "~" + Gs() + "~ST*850*0001~~BEG*00*SA*1**060301~~SE~*FA DONE*~GE~IEA~";
  const struct {
    std::string className, left;
  } cases[] = {
      {kMgb, Isa() + Gs("77", "PO", "*FA DONE*") + "ST*850*0001~BEG*00*SA*1**060301~SE~GE~IEA~"},
      {kTarget, Isa() + "~" + Gs("77", "PO", "*FA DONE*") + "~ST*850*0001~~BEG*00*SA*1**060301~~SE~*FA DONE*~GE~IEA~"},
      {kKmart, Isa() + "~" + Gs("77", "PO", "*FA DONE*") + "~ST*850*0001~~BEG*00*SA*1**060301~~SE~*FA DONE*~GE~IEA~"},
  };
  for (const auto& c : cases) {
    X12Trade trade(c.className);
    EXPECT_TRUE(trade.Loaded(orders)->Term());
    EXPECT_EQ(trade.Orders(), trade.Settled(c.left)) << c.className;
  }
}

TEST(X12SettlingTest, KeepsEveryTransactionWhenCancelled) {
  for (const std::string& className : kAllClasses) {
    Settling trade(className);
    const std::string orders = trade.Came("{F}" + Interchange(Group(trade.Failing() + trade.Good())));
    const std::string marked = trade.Left("{F}" + Interchange(Marked(trade.Failing() + trade.Good())));
    trade.Loaded(orders, 2)->Cancel();
    EXPECT_EQ(trade.Orders(), className == kGhpl ? orders : marked);
    trade.Loaded(trade.Orders(), 2)->Cancel();
    EXPECT_THAT(trade.Acks(), ElementsAre("FA_PO_77_0603081015.TXT AK1*PO*77 AK9*A*2*2*2" +
                                          std::string(className == kGhpl ? " AK1*PO*77 AK9*A*2*2*2" : "")));
    trade.document.PartnerEDIAddr = "MYER";
    trade.Loaded(orders, 0)->Cancel();
    EXPECT_EQ(trade.Orders(), orders);
  }
}

TEST(X12SettlingTest, DeletesOneTransactionOnly) {
  for (const std::string& className : kAllClasses) {
    Settling trade(className);
    const std::string good = trade.Good(), failing = trade.Failing(), third = trade.Good("0003");
    const auto file = [&](const std::string& first, const std::string& second, const std::string& last) {
      return "{O}" + Interchange(Group(first + second) + "{G}") + "{F}" + Interchange(Group(last, "78"), "2") + "{F}";
    };
    const std::string orders = trade.Came(file(good, failing, third));
    const std::string left[] = {file(kPair, failing, third), file(good, TransactionSet("", "0002"), third),
                                file(good, failing, TransactionSet("", "0003"))};
    for (std::int32_t row = 0; row < 3; ++row) {
      const auto importer = trade.Loaded(orders, 3);
      ErrorList list;
      EXPECT_TRUE(importer->Delete(row, list));
      EXPECT_THAT(trade.NewLog(), ElementsAre("0 Delete: Transaction deleted from file."));
      EXPECT_THAT(*list, ElementsAre(importer->Log().LogId));
      EXPECT_EQ(trade.Orders(), trade.Left(left[row])) << className << " row " << row;
      EXPECT_FALSE(trade.folder.Has("in/orders.tmp"));
    }
    EXPECT_THAT(trade.StoredOrders(), IsEmpty());
    trade.Loaded(trade.Orders(), 2)->Term();
    EXPECT_EQ(trade.Orders(), trade.Left("{O}" + Interchange(Marked(good + failing) + "{G}") + "{F}{F}"));
  }
}

// A disk or a share that fails while the file is settled. The next run ends with every order stored once.
TEST(X12SettlingTest, LosesNothingWhenSettlingFails) {
  const struct {
    std::string operation, file;
    Button answer;
    bool allPosted, term;
    std::size_t reports;
    bool keepsAll, keepsTemporary;
  } cases[] = {
      // clang-format off
      {"Rename",     "orders.txt", Button::kAbort,  false, true,  0, true,  true},
      {"Delete",     "orders.txt", Button::kAbort,  true,  true,  0, true,  true},
      {"Write",      "orders.txt", Button::kIgnore, false, false, 1, true,  false},
      {"Write",      "orders.txt", Button::kRetry,  false, true,  1, false, false},
      {"Sync",       "orders.txt", Button::kAbort,  true,  false, 1, true,  false},
      {"Read",       "orders.txt", Button::kAbort,  false, false, 1, true,  false},
      {"Read",       "orders.txt", Button::kIgnore, true,  false, 1, true,  false},
      {"Read",       "orders.txt", Button::kRetry,  false, true,  1, false, false},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.operation + " " + c.file);
    Settling trade(kMgb);
    FaultyFiles& files = trade.UseFaultyFiles();
    trade.answer = c.answer;
    const std::string orders = Interchange(Group(trade.Good() + trade.Failing()));
    if (c.allPosted) trade.AddLocation("0999");
    {
      const auto importer = trade.Loaded(orders, 2);
      for (const std::int32_t row : {0, 1}) trade.Process(*importer, row);
      files.Fail(c.operation, c.file, 57);
      EXPECT_EQ(importer->Term(), c.term);
      EXPECT_THAT(trade.reports, SizeIs(c.reports));
    }
    EXPECT_EQ(trade.Orders() == orders, c.keepsAll);
    EXPECT_EQ(trade.folder.Has("in/orders.tmp"), c.keepsTemporary);
    if (!c.allPosted) trade.AddLocation("0999");
    EXPECT_TRUE(trade.Import().term);
    EXPECT_THAT(trade.StoredOrders(), ElementsAre("450001/0", "450002/0"));
    EXPECT_FALSE(trade.folder.Has(X12Trade::kFile));
  }
}

TEST(X12SettlingTest, KeepsWhatAMailboxAddedMeanwhile) {
  for (const std::string& className : kAllClasses) {
    Settling trade(className);
    const auto importer = trade.Loaded(trade.Sent(Interchange(Group(trade.Good()))));
    trade.Process(*importer, 0);
    const std::string added = trade.Sent(Interchange(Group(trade.Failing("0001")), "2"));
    std::ofstream(trade.OrdersPath(), std::ios::app) << added;
    EXPECT_TRUE(importer->Term());
    EXPECT_EQ(trade.Orders(), trade.Settled(Interchange(Marked(kPair))) + added);
  }
}

// Importing a file that is still being written, and then the whole of it behind what that left.
TEST(X12SettlingTest, PostsOnceWhateverTheFilesEnd) {
  for (const std::string& className : kAllClasses) {
    Settling trade(className);
    trade.system->Commit(0);
    trade.Sql("PRAGMA synchronous=OFF");
    trade.answer = Button::kIgnore;
    trade.document.AckFolder = Text();
    const std::string file =
        trade.Sent(Interchange(Group(trade.Good() + TransactionSet(trade.Body("450003"), "0003"))) +
                   Interchange(Group(TransactionSet(trade.Body("450004") + trade.Line("93002"), "0004"), "78"), "2"));
    // Without ids and positions, which differ from run to run.
    const auto stored = [&] {
      Texts records = trade.StoredRecords();
      for (std::string& record : records) record = std::regex_replace(record, std::regex("\\w*(Id|FilePos)=\\d+"), "");
      return records;
    };
    const auto clear = [&] {
      std::filesystem::remove(trade.OrdersPath());
      for (const char* table : {"Order", "OrderLine", "OrderLocn", "OrderLocnLine", "Log"}) {
        trade.Sql("DELETE FROM tb" + std::string(table));
      }
    };
    trade.Import(file);
    const Texts whole = stored();
    EXPECT_THAT(whole, SizeIs(12));
    const std::size_t step = className == kMgb ? 1 : 7;
    for (std::size_t length = 1; length < file.size(); length += step) {
      clear();
      trade.Import(file.substr(0, length));
      std::ofstream(trade.OrdersPath(), std::ios::app) << "\r\n" << file;
      EXPECT_TRUE(trade.Import().term);
      EXPECT_EQ(stored(), whole) << className << " cut behind " << length;
      if (::testing::Test::HasFailure()) return;
    }
  }
}

}  // namespace
}  // namespace partnerkit::testing
