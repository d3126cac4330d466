// The files of a notice: whole or as they were, whatever fails, and taken up again after a killed run.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/faulty_files.h"
#include "support/other_program.h"
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

// One pack, an inventory file and an output that was there before.
struct FiledTrade : PackedTrade {
  FiledTrade() : PackedTrade(kMgb), faulty(*ports.files) {
    ports.files = &faulty;
    Map("CONTAINERNO SHIPNOTENO");
    Sql("UPDATE tbPartner SET ASNExtension = 'TL2Compatible', InventoryFile = '" + folder / "out/stock" + "'");
    folder.Write("out/asn.csv", "EARLIER\r\n");
    AddPack();
  }
  std::string Path(std::string text) const {
    const std::size_t at = text.find("FOLDER");
    return at == std::string::npos ? text : text.replace(at, 6, folder / "");
  }

  FaultyFiles faulty;
};

struct Fault {
  const char* what;
  const char* name;
  int passed;
  const char* told;
};

const Fault kFaults[] = {
    {"OpenOutput", "stock.pending", 0, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"OpenOutput", "stock.pending", 1, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"Write", "stock.pending", 0, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"OpenOutput", "out/stock", 0, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"OpenOutput", "asn.csv.pending", 0, "61 Open ASN File: Cannot open file FOLDERout/asn.csv"},
    {"OpenOutput", "asn.csv", 0, "61 Open ASN File: Cannot open file FOLDERout/asn.csv"},
    {"Write", "stock.pending", 1, "61 Process: Cannot write ASN 1001: It failed: stock.pending"},
    {"Sync", "stock.pending", 0, "61 Process: Cannot write ASN 1001: It failed: stock.pending"},
    {"Write", "asn.csv.pending", 0, "61 Process: Cannot write ASN 1001: It failed: asn.csv.pending"},
    {"Sync", "asn.csv.pending", 0, "61 Process: Cannot write ASN 1001: It failed: asn.csv.pending"},
    {"Write", "out/stock", 0, "61 Process: Cannot write ASN 1001: It failed: out/stock"},
    {"Sync", "out/stock", 0, "61 Process: Cannot write ASN 1001: It failed: out/stock"},
    {"Write", "asn.csv", 0, "61 Process: Cannot write ASN 1001: It failed: asn.csv"},
    {"Sync", "asn.csv", 0, "61 Process: Cannot write ASN 1001: It failed: asn.csv"},
};

TEST(NoticeFilesTest, AreAsTheyWereWhenTheDiskIsFullAtAnyOperation) {
  for (const Fault& fault : kFaults) {
    SCOPED_TRACE(std::string(fault.what) + " of " + fault.name + " after " + std::to_string(fault.passed));
    FiledTrade trade;
    const auto translator = trade.Loaded();
    trade.faulty.Fail(fault.what, fault.name, run_time::kDiskFull, 1, fault.passed);
    const auto outcome = trade.Process(*translator);
    EXPECT_EQ(outcome.result, 0);
    ASSERT_FALSE(outcome.told.empty());
    EXPECT_EQ(outcome.told.back(), trade.Path(fault.told));
    EXPECT_THAT(trade.reports, IsEmpty());
    EXPECT_EQ(trade.Stamps(), "0/4");
    EXPECT_THAT(trade.Output(), ElementsAre("EARLIER"));
    // A note that could not be opened anew is another program's, for all that is known.
    EXPECT_EQ(trade.Files(),
              fault.what == std::string("OpenOutput") && fault.passed == 1 ? "asn.csv stock.pending" : "asn.csv");
    EXPECT_EQ(trade.Process(*translator).result, 1);
    EXPECT_EQ(trade.Files(), "asn.csv stock");
    EXPECT_EQ(trade.Output().size(), 2U);
    EXPECT_EQ(trade.Output("out/stock").size(), 1U);
  }
}

// Not even the way back is open: the note stays, and the next run goes it.
TEST(NoticeFilesTest, AreCutBackByTheNextRunWhenTheyCannotBeAtOnce) {
  FiledTrade trade;
  const auto translator = trade.Loaded();
  trade.Sql("UPDATE tbPack SET Status = 8");
  trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError);
  EXPECT_EQ(trade.Process(*translator).result, 0);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1001,"));
  EXPECT_EQ(trade.Files(), "asn.csv asn.csv.pending");
  translator->Term();
  trade.Sql("UPDATE tbPack SET Status = 4");
  EXPECT_EQ(trade.Run().front().result, 1);
  EXPECT_THAT(trade.NewLog(), Contains(trade.Path("W Load: Notice 1001 of an interrupted run was never stored and is "
                                                  "taken out of FOLDERout/asn.csv")));
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1002,"));
  EXPECT_EQ(trade.Files(), "asn.csv stock");
}

TEST(NoticeFilesTest, StayWithTheNoticeWhoseNoteCannotBeDeleted) {
  FiledTrade trade;
  trade.faulty.Fail("Delete", "asn.csv.pending", run_time::kPermissionDenied);
  EXPECT_EQ(trade.Run().front().result, 1);
  EXPECT_EQ(trade.Files(), "asn.csv asn.csv.pending stock");
  EXPECT_THAT(trade.reports, IsEmpty());
  trade.Loaded();
  EXPECT_EQ(trade.Files(), "asn.csv stock");
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1001,"));
}

// --- After a killed run

struct Killed {
  const char* what;
  std::string note;  // beside the output
  std::string file;  // the output; "-" for none
  std::string sql;
  std::string left;  // of it
  bool told;
};

const std::string kGrown = "partnerkit notice 1\nFOLDERout/asn.csv\ngrown\n1001\n1\n1\n9\n13\nend\n";
const std::string kNew = "partnerkit notice 1\nFOLDERout/asn.csv\nnew\n1001\n1\n1\n0\n13\nend\n";
const std::string kEarlier = "EARLIER\r\n", kNotice = "SSCC1,1001,\r\n";
const std::string kStored = "INSERT INTO tbASN(PartnerId, ASNNo, ShipmentId, OrderId) VALUES('MGB', '1001', 1, 1)";

const Killed kKilled[] = {
    {"before the file grew", kGrown, kEarlier, "", kEarlier, false},
    {"in the midst of it", kGrown, kEarlier + "SSCC1", "", kEarlier, true},
    {"behind it", kGrown, kEarlier + kNotice, "", kEarlier, true},
    {"behind the storing", kGrown, kEarlier + kNotice, kStored, kEarlier + kNotice, false},
    {"behind the storing, for another partner", kGrown, kEarlier + kNotice,
     "INSERT INTO tbASN(PartnerId, ASNNo, ShipmentId, OrderId) VALUES('TOYS', '1001', 1, 1)", kEarlier + kNotice,
     false},
    {"with its number used elsewhere", kGrown, kEarlier + kNotice,
     "INSERT INTO tbASN(PartnerId, ASNNo, ShipmentId, OrderId) VALUES('MGB', '1001', 1, 2), ('MGB', '1002', 1, 1)",
     kEarlier, true},
    {"and the file has grown since", kGrown, kEarlier + kNotice + "more", "", kEarlier + kNotice + "more", false},
    {"and the file is shorter than it was", kGrown, "EARL", "", "EARL", false},
    {"and the file is gone", kGrown, "-", "", "-", false},
    {"with a new file", kNew, "", "", "-", false},
    {"with a new file begun", kNew, "SSCC1", "", "-", true},
    {"with a new file not begun", kNew.substr(0, kNew.find("1001")), "", "", "-", false},
    {"with a new file that somebody filled", kNew.substr(0, kNew.find("1001")), "theirs", "", "theirs", false},
};

TEST(NoticeFilesTest, AreTakenUpAfterAKilledRun) {
  for (const Killed& killed : kKilled) {
    SCOPED_TRACE(killed.what);
    FiledTrade trade;
    trade.folder.Write("out/asn.csv.pending", trade.Path(killed.note));
    trade.folder.Write("out/asn.csv", killed.file);
    if (killed.file == "-") std::filesystem::remove(trade.folder / "out/asn.csv");
    trade.Sql(killed.sql);
    trade.Loaded();
    EXPECT_EQ(trade.folder.Has("out/asn.csv") ? trade.folder.Read("out/asn.csv") : "-", killed.left);
    EXPECT_FALSE(trade.folder.Has("out/asn.csv.pending"));
    const Texts told = {
        trade.Path("W Load: Notice 1001 of an interrupted run was never stored and is taken out of "
                   "FOLDERout/asn.csv")};
    EXPECT_EQ(trade.NewLog(), killed.told ? told : Texts{});
  }
}

// A note is on the disk before anything else is.
TEST(NoticeFilesTest, AreLeftAloneByANoteThatIsTorn) {
  for (const std::string& note : {kGrown, kNew}) {
    for (std::size_t length = 0; length + 4 < note.size(); ++length) {
      SCOPED_TRACE(note.substr(0, length));
      FiledTrade trade;
      const std::string whole = trade.Path(note);
      trade.folder.Write("out/asn.csv.pending", whole.substr(0, std::min(length, whole.size() - 4)));
      trade.folder.Write("out/asn.csv", kEarlier + kNotice);
      trade.Loaded();
      EXPECT_EQ(trade.folder.Read("out/asn.csv"), kEarlier + kNotice);
      EXPECT_EQ(trade.Files(), "asn.csv");
      EXPECT_THAT(trade.NewLog(), IsEmpty());
    }
  }
}

TEST(NoticeFilesTest, AreTakenUpByARowToo) {
  FiledTrade trade;
  const auto translator = trade.Loaded();
  trade.folder.Write("out/asn.csv.pending", trade.Path(kGrown));
  trade.folder.Write("out/asn.csv", kEarlier + kNotice);
  trade.Sql("UPDATE tbPartner SET LastASNNo = 1001");
  const auto outcome = trade.Process(*translator);
  EXPECT_THAT(outcome.told.front(), trade.Path("W Process: Notice 1001 of an interrupted run was never stored and is "
                                               "taken out of FOLDERout/asn.csv"));
  EXPECT_EQ(outcome.result, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1002,"));
  EXPECT_EQ(trade.Files(), "asn.csv stock");
}

TEST(NoticeFilesTest, KeepTheNoteWhileTheyCannotBeTakenUp) {
  FiledTrade trade;
  trade.answer = Button::kIgnore;
  trade.folder.Write("out/asn.csv.pending", trade.Path(kGrown));
  trade.folder.Write("out/asn.csv", kEarlier + kNotice);
  trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError);
  trade.Loaded();
  EXPECT_EQ(trade.reports.size(), 1U);
  EXPECT_EQ(trade.Files(), "asn.csv asn.csv.pending");
  EXPECT_EQ(trade.Run().front().result, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1001,"));
  EXPECT_EQ(trade.Files(), "asn.csv stock");
}

// --- Other programs

TEST(NoticeFilesTest, TurnARowAwayWhileAnotherProgramHoldsThem) {
  struct Case {
    const char* held;
    const char* told;
  };
  const Case cases[] = {
      {"out/asn.csv", "70 Open ASN File: Cannot open file FOLDERout/asn.csv"},
      {"out/asn.csv.pending", "70 Open ASN File: Cannot open file FOLDERout/asn.csv"},
      {"out/stock", "70 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
      {"out/stock.pending", "70 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
  };
  for (const Case& each : cases) {
    SCOPED_TRACE(each.held);
    FiledTrade trade;
    if (!trade.folder.Has(each.held)) trade.folder.Write(each.held, "");
    const auto translator = [&] {
      const OtherProgram other(trade.folder / each.held);
      auto loaded = trade.Loaded();
      const auto outcome = trade.Process(*loaded);
      EXPECT_EQ(outcome.result, 0);
      EXPECT_THAT(outcome.told, ElementsAre(trade.Path(each.told)));
      return loaded;
    }();
    EXPECT_EQ(trade.folder.Read("out/asn.csv"), kEarlier);
    EXPECT_EQ(trade.Process(*translator).result, 1);
    EXPECT_EQ(trade.Files(), "asn.csv stock");
  }
}

TEST(NoticeFilesTest, AreCutBackWithTheRunThatIsGivenUp) {
  FiledTrade trade;
  std::filesystem::remove(trade.folder / "out/asn.csv");
  trade.Sql("UPDATE tbPackLine SET Quantity = 40000");
  EXPECT_EQ(trade.Run().front().result, 0);
  EXPECT_EQ(trade.Files(), "");
}

}  // namespace
}  // namespace partnerkit::testing
