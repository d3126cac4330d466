// The files of a notice: whole or as they were, whatever fails, and taken up again after a killed run.
#include "support/faulty_files.h"
#include "support/other_program.h"
#include "support/packed_trade.h"

namespace partnerkit::testing {
namespace {

using ::testing::Contains;

constexpr const char* kTakenOut =
    "W Load: Notice 1001 of an interrupted run was never stored and is taken out of FOLDERout/asn.csv";

// One pack, an inventory file and an output that was there before.
struct FiledTrade : PackedTrade {
  FiledTrade() : PackedTrade(kMgb, "CONTAINERNO SHIPNOTENO"), faulty(*ports.files) {
    ports.files = &faulty;
    UseInventory("out/stock");
    folder.Write("out/asn.csv", "EARLIER\r\n");
    AddPack();
  }
  // What the store says of notices in the making.
  int Pending() {
    int pending = 0;
    PendingNotice notice;
    system->Records().ForEach(PendingNotice::kType, &notice, [&] { ++pending; });
    return pending;
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
    {"Length", "out/stock", 0, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"OpenDraft", "out/stock", 0, "61 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
    {"OpenOutput", "asn.csv", 0, "61 Open ASN File: Cannot open file FOLDERout/asn.csv"},
    {"OpenInput", "asn.csv", 0, "61 Open ASN File: Cannot open file FOLDERout/asn.csv"},
    {"Write", "out/stock", 0, "61 Process: Cannot write ASN 1001: It failed: out/stock"},
    {"Sync", "out/stock", 0, "61 Process: Cannot write ASN 1001: It failed: out/stock"},
    {"Rename", "out/stock", 0, "61 Process: Cannot write ASN 1001: It failed: out/stock"},
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
    EXPECT_EQ(trade.Files(), "asn.csv");
    EXPECT_EQ(trade.Pending(), 0);
    EXPECT_EQ(trade.Process(*translator).result, 1);
    EXPECT_EQ(trade.Files(), "asn.csv stock");
    EXPECT_EQ(trade.Output().size(), 2U);
    EXPECT_EQ(trade.Output("out/stock").size(), 1U);
  }
}

// Not even the way back is open: the next run goes it.
TEST(NoticeFilesTest, AreCutBackByTheNextRunWhenTheyCannotBeAtOnce) {
  FiledTrade trade;
  const auto translator = trade.Loaded();
  trade.Sql("UPDATE tbPack SET Status = 8");
  trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError);
  EXPECT_EQ(trade.Process(*translator).result, 0);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1001,"));
  EXPECT_EQ(trade.Files(), "asn.csv");
  translator->Term();
  trade.Sql("UPDATE tbPack SET Status = 4");
  EXPECT_EQ(trade.Run().front().result, 1);
  EXPECT_THAT(trade.NewLog(), Contains(trade.Path(kTakenOut)));
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1002,"));
  EXPECT_EQ(trade.Pending(), 0);
}

// --- After a killed run

enum Told { kNothing, kOut, kSeen };

struct Killed {
  const char* what;
  const char* growth;  // NewFile, LengthBefore, LengthAdded
  std::string file;    // the output; "-" for none
  std::string left;    // of it
  Told told;
  bool draft = false;  // there is one still
};

constexpr const char* kGrown = "0, 9, 13";
constexpr const char* kMade = "1, 0, 13";
const std::string kEarlier = "EARLIER\r\n", kNotice = "SSCC1,1001,\r\n";

const Killed kKilled[] = {
    {"before the file grew", kGrown, kEarlier, kEarlier, kNothing},
    {"in the midst of it", kGrown, kEarlier + "SSCC1", kEarlier, kOut},
    {"behind it", kGrown, kEarlier + kNotice, kEarlier, kOut},
    {"and the file has grown since", kGrown, kEarlier + kNotice + "more", kEarlier + kNotice + "more", kSeen},
    {"and the file is shorter than it was", kGrown, "EARL", "EARL", kSeen},
    {"and the file is gone", kGrown, "-", "-", kSeen},
    {"with a file that was there empty", "0, 0, 13", "", "", kNothing},
    {"with a new file", kMade, kNotice, "-", kOut},
    {"with a new file that somebody emptied", kMade, "", "", kSeen},
    {"with a new file that somebody filled", kMade, kNotice + "theirs", kNotice + "theirs", kSeen},
    {"with a new file that is gone", kMade, "-", "-", kSeen},
    // Before the draft had its name: what has it is another program's, of whatever length.
    {"with a draft", kMade, "-", "-", kNothing, true},
    {"with a draft, and somebody made the file", kMade, kNotice, kNotice, kNothing, true},
};

constexpr const char* kDraftOfOutput = "out/.asn.csv.partnerkit-1";

struct KilledTrade : FiledTrade {
  KilledTrade(const std::string& growth, const std::string& file, const std::string& partner = "MGB") {
    Note(partner, "out/asn.csv", growth);
    if (growth == kMade) Note(partner, kDraftOfOutput, "1, -1, 0");
    folder.Write("out/asn.csv", file);
    if (file == "-") std::filesystem::remove(folder / "out/asn.csv");
  }
  void Note(const std::string& partner, const std::string& name, const std::string& growth) {
    Sql("INSERT INTO tbPendingNotice(VendorId, PartnerId, ASNNo, FileName, NewFile, LengthBefore, LengthAdded) "
        "VALUES('ACME', '" +
        partner + "', '1001', '" + folder / name + "', " + growth + ")");
  }
};

TEST(NoticeFilesTest, AreTakenUpAfterAKilledRun) {
  for (const Killed& killed : kKilled) {
    SCOPED_TRACE(killed.what);
    KilledTrade trade(killed.growth, killed.file);
    if (killed.draft) trade.folder.Write(kDraftOfOutput, "SSCC1,10");
    trade.Loaded();
    EXPECT_FALSE(trade.folder.Has(kDraftOfOutput));
    EXPECT_EQ(trade.folder.Has("out/asn.csv") ? trade.folder.Read("out/asn.csv") : "-", killed.left);
    EXPECT_EQ(trade.Pending(), 0);
    const Texts told[] = {
        {},
        {trade.Path(kTakenOut)},
        {trade.Path("W Load: Notice 1001 of an interrupted run was never stored, and "
                    "FOLDERout/asn.csv has changed since: look whether the partner got that notice")}};
    EXPECT_EQ(trade.NewLog(), told[killed.told]);
  }
}

// A workspace may be entered from any folder.
TEST(NoticeFilesTest, AreFoundAgainFromAnotherFolder) {
  FiledTrade trade;
  const auto relative = std::filesystem::relative(trade.folder / "out/asn.csv").string();
  const auto before = std::filesystem::current_path();
  const auto translator = trade.Loaded();
  RowTable rows;
  ASSERT_EQ(translator->Load(relative, rows), 1);
  trade.Sql("UPDATE tbPack SET Status = 8");
  trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError);
  EXPECT_EQ(trade.Process(*translator).result, 0);
  std::filesystem::current_path("/");
  trade.Loaded();
  std::filesystem::current_path(before);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER"));
}

// Before anything was noted: its number comes again, and with it the name.
TEST(NoticeFilesTest, LeaveNoDraftBehindARunKilledAtOnce) {
  FiledTrade trade;
  trade.folder.Write("out/.asn1001.csv.partnerkit-1", "");
  trade.folder.Write("out/.stock.partnerkit-1", "");
  EXPECT_EQ(trade.Run("out/asn*.csv").front().result, 1);
  EXPECT_EQ(trade.Files(), "asn.csv asn1001.csv stock");
  // And another program made the files then.
  trade.folder.Write(kDraftOfOutput, "");
  trade.folder.Write("out/.stock.partnerkit-1", "");
  trade.folder.Write("out/.stock.partnerkit-2", "");
  trade.Loaded();
  EXPECT_EQ(trade.Files(), "asn.csv asn1001.csv stock");
}

TEST(NoticeFilesTest, KeepTheDraftsThatAnotherPartnersNoticeIsNotedWith) {
  KilledTrade trade(kMade, "-", "TOYS");
  trade.folder.Write(kDraftOfOutput, kNotice);
  trade.Loaded();
  EXPECT_TRUE(trade.folder.Has(kDraftOfOutput));
}

// Another partner's notice, of a document that writes to the same file.
TEST(NoticeFilesTest, AreTakenUpByARowToo) {
  KilledTrade trade(kGrown, kEarlier + kNotice, "TOYS");
  trade.Sql("UPDATE tbPartner SET LastASNNo = 1001");
  const auto translator = trade.Loaded();
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1001,"));
  const auto outcome = trade.Process(*translator);
  EXPECT_EQ(outcome.told.front(), trade.Path("W Process: Notice 1001 of an interrupted run was never stored and is "
                                             "taken out of FOLDERout/asn.csv"));
  EXPECT_EQ(outcome.result, 1);
  EXPECT_THAT(trade.Output(), ElementsAre("EARLIER", "SSCC1,1002,"));
  EXPECT_EQ(trade.Pending(), 0);
}

// A new draft takes the place of the one that was left, which told that the file never had its name.
TEST(NoticeFilesTest, AreTakenUpBeforeTheirDraftIsCleared) {
  KilledTrade trade(kMade, "-", "TOYS");
  trade.folder.Write(kDraftOfOutput, kNotice);
  const auto outcome = trade.Run().front();
  EXPECT_THAT(outcome.told, ElementsAre(HasSubstr("Pack SSCC1 added"), HasSubstr("compile completed")));
  EXPECT_EQ(trade.Files() + " " + std::to_string(trade.Pending()), "asn.csv stock 0");
}

TEST(NoticeFilesTest, TurnRowsAwayWhileTheyCannotBeTakenUp) {
  KilledTrade trade(kGrown, kEarlier + kNotice);
  trade.answer = Button::kIgnore;
  trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError, 2);
  const auto translator = trade.Loaded();
  EXPECT_EQ(trade.reports.size(), 1U);
  EXPECT_EQ(trade.Process(*translator).told, Texts{trade.Path("70 Open ASN File: Cannot open file FOLDERout/asn.csv")});
  EXPECT_EQ(trade.Stamps(), "0/4");
  EXPECT_EQ(trade.Pending(), 1);
  EXPECT_EQ(trade.Process(*translator).result, 1);
  EXPECT_EQ(trade.Output().size(), 2U);
  EXPECT_EQ(trade.Pending(), 0);
}

// --- Other programs

TEST(NoticeFilesTest, TurnARowAwayWhileAnotherProgramHoldsThem) {
  struct Case {
    const char* held;
    const char* told;
  };
  const Case cases[] = {
      {"out/asn.csv", "70 Open ASN File: Cannot open file FOLDERout/asn.csv"},
      {"out/stock", "70 Open Inventory File: Cannot open inventory file FOLDERout/stock"},
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

// It may be at work on that very notice.
TEST(NoticeFilesTest, AreNotTakenUpWhileAnotherProgramHoldsThem) {
  for (const char* held : {"out/asn.csv", kDraftOfOutput}) {
    SCOPED_TRACE(held);
    KilledTrade trade(kMade, "-");
    trade.folder.Write(held, kNotice);
    {
      const OtherProgram other(trade.folder / held);
      trade.Loaded();
      EXPECT_TRUE(trade.folder.Has(held));
      EXPECT_EQ(trade.Pending(), 2);
      EXPECT_THAT(trade.NewLog(), IsEmpty());
    }
    trade.Loaded();
    EXPECT_EQ(trade.Files() + std::to_string(trade.Pending()), "0");
  }
}

// What happens at the moment in which a new file gets its name.
struct NamingFiles : FaultyFiles {
  using FaultyFiles::FaultyFiles;
  bool RenameNew(const std::string& from, const std::string& to) override {
    atNaming(from, to);
    return FaultyFiles::RenameNew(from, to);
  }

  std::function<void(const std::string&, const std::string&)> atNaming;
};

TEST(NoticeFilesTest, GetTheirNamesWhenTheyAreWhole) {
  FiledTrade trade;
  NamingFiles files(trade.faulty);
  trade.ports.files = &files;
  Texts named;
  files.atNaming = [&](const std::string& from, const std::string& to) {
    named.push_back(to.substr(to.rfind('/') + 1) + " " + std::to_string(std::filesystem::file_size(from)) +
                    (std::filesystem::exists(to) ? " too late" : ""));
  };
  EXPECT_EQ(trade.Run("out/asn*.csv").front().result, 1);
  EXPECT_THAT(named, ElementsAre("stock 150", "asn1001.csv 13"));
  EXPECT_THAT(trade.Output("out/asn1001.csv"), ElementsAre("SSCC1,1001,"));
  EXPECT_EQ(trade.Pending(), 0);
}

TEST(NoticeFilesTest, NeverTakeTheNameOfAFileThatAnotherProgramMade) {
  FiledTrade trade;
  NamingFiles files(trade.faulty);
  trade.ports.files = &files;
  files.atNaming = [&](const std::string&, const std::string& to) {
    if (to.ends_with(".csv")) trade.folder.Write("out/asn1001.csv", "theirs");
  };
  const auto outcome = trade.Run("out/asn*.csv").front();
  EXPECT_EQ(outcome.told.back(),
            trade.Path("58 Process: Cannot write ASN 1001: There is something of that name by now: "
                       "FOLDERout/asn1001.csv"));
  EXPECT_EQ(trade.folder.Read("out/asn1001.csv"), "theirs");
  EXPECT_EQ(trade.Files(), "asn.csv asn1001.csv");
  EXPECT_EQ(trade.Stamps() + " " + std::to_string(trade.Pending()), "0/4 0");
}

// Some file systems rename by a second link. Killed between the two, or failing there, both names are one file's.
TEST(NoticeFilesTest, AreTakenUpWithBothTheirNames) {
  FiledTrade trade;
  std::filesystem::remove(trade.folder / "out/asn.csv");
  NamingFiles files(trade.faulty);
  trade.ports.files = &files;
  files.atNaming = [](const std::string& from, const std::string& to) {
    if (!to.ends_with(".csv")) return;
    std::filesystem::create_hard_link(from, to);
    throw RunTimeError(run_time::kPathAccess, "The old name stays");
  };
  EXPECT_EQ(trade.Run().front().result, 0);
  EXPECT_EQ(trade.Files(), ".asn.csv.partnerkit-1 asn.csv");
  trade.Loaded();
  EXPECT_EQ(trade.Files() + std::to_string(trade.Pending()), "0");
  EXPECT_THAT(trade.NewLog(), Contains(trade.Path(kTakenOut)));
}

// --- Links

TEST(NoticeFilesTest, FollowNoLinkUnderANameThatWasMadeUp) {
  const std::pair<const char*, const char*> cases[] = {
      {"victim", "75 Open ASN File: Cannot open file FOLDERout/asn1001.csv"},
      {"nowhere", "58 Process: Cannot write ASN 1001: There is something of that name by now: FOLDERout/asn1001.csv"},
  };
  for (const auto& [target, told] : cases) {
    SCOPED_TRACE(target);
    FiledTrade trade;
    trade.folder.Write("victim", kEarlier);
    std::filesystem::create_symlink(trade.folder / target, trade.folder / "out/asn1001.csv");
    EXPECT_EQ(trade.Run("out/asn*.csv").front().told.back(), trade.Path(told));
    EXPECT_EQ(trade.folder.Read("victim"), kEarlier);
    EXPECT_FALSE(trade.folder.Has("nowhere"));
    EXPECT_EQ(trade.Files(), "asn.csv asn1001.csv");
    EXPECT_EQ(trade.Run("out/asn*.csv").front().result, 1);
    EXPECT_THAT(trade.Output("out/asn1002.csv"), ElementsAre("SSCC1,1002,"));
  }
}

TEST(NoticeFilesTest, AreNotTakenUpThroughALinkPlantedSince) {
  for (const char* growth : {kGrown, kMade}) {
    SCOPED_TRACE(growth);
    KilledTrade trade(growth, "-");
    const std::string content = growth == kMade ? kNotice : kEarlier + kNotice;
    trade.folder.Write("victim", content);
    std::filesystem::create_symlink(trade.folder / "victim", trade.folder / "out/asn.csv");
    trade.Loaded();
    EXPECT_EQ(trade.folder.Read("victim"), content);
    EXPECT_THAT(trade.NewLog(), ElementsAre(HasSubstr("asn.csv has changed since")));
  }
}

// The user's own, and where it led to when the notice was written is where it is taken out again.
TEST(NoticeFilesTest, GoWhereTheUsersLinkLeads) {
  FiledTrade trade;
  trade.folder.Write("first", kEarlier);
  trade.folder.Write("second", kEarlier);
  std::filesystem::remove(trade.folder / "out/asn.csv");
  std::filesystem::create_symlink(trade.folder / "first", trade.folder / "out/asn.csv");
  const auto translator = trade.Loaded();
  trade.Sql("UPDATE tbPack SET Status = 8");
  trade.faulty.Fail("Truncate", "first", run_time::kDeviceError);
  EXPECT_EQ(trade.Process(*translator).result, 0);
  EXPECT_EQ(trade.folder.Read("first"), kEarlier + kNotice);
  std::filesystem::remove(trade.folder / "out/asn.csv");
  std::filesystem::create_symlink(trade.folder / "second", trade.folder / "out/asn.csv");
  trade.Sql("UPDATE tbPack SET Status = 4");
  EXPECT_EQ(trade.Run().front().result, 1);
  EXPECT_EQ(trade.folder.Read("first"), kEarlier);
  EXPECT_THAT(LinesOf(trade.folder.Read("second")), ElementsAre("EARLIER", "SSCC1,1002,"));
}

// --- Files whose last line has no end

TEST(NoticeFilesTest, StartANoticeOnALineOfItsOwn) {
  struct Case {
    const char* before;
    const char* after;  // one notice without lines, and two with
  };
  const Case cases[] = {
      {"EARLIER", "EARLIER\r\nSSCC2,1002,\r\nSSCC3,1003,\r\n"},
      {"EARLIER\n", "EARLIER\nSSCC2,1002,\r\nSSCC3,1003,\r\n"},
      {"EARLIER\r", "EARLIER\rSSCC2,1002,\r\nSSCC3,1003,\r\n"},
      {"", "SSCC2,1002,\r\nSSCC3,1003,\r\n"},
  };
  for (const Case& each : cases) {
    SCOPED_TRACE(each.before);
    FiledTrade trade;
    trade.Sql("DELETE FROM tbPackLine");
    for (const int order : {2, 3}) {
      trade.AddOrder();
      trade.AddPack([&](Pack& pack) { pack.OrderId = order; });
    }
    trade.folder.Write("out/asn.csv", each.before);
    const auto translator = trade.Loaded();
    EXPECT_EQ(trade.Process(*translator, 0).result, 1);
    EXPECT_EQ(trade.folder.Read("out/asn.csv"), each.before);
    trade.Process(*translator, 1);
    trade.Process(*translator, 2);
    EXPECT_EQ(trade.folder.Read("out/asn.csv"), each.after);
  }
}

// At once, and by the next run when that fails.
TEST(NoticeFilesTest, LoseTheLineEndWithTheNotice) {
  for (const int failures : {0, 1}) {
    FiledTrade trade;
    trade.folder.Write("out/asn.csv", "EARLIER");
    const auto translator = trade.Loaded();
    trade.Sql("UPDATE tbPack SET Status = 8");
    trade.faulty.Fail("Truncate", "asn.csv", run_time::kDeviceError, failures);
    EXPECT_EQ(trade.Process(*translator).result, 0);
    EXPECT_EQ(trade.folder.Read("out/asn.csv"), failures == 0 ? "EARLIER" : "EARLIER\r\n" + kNotice);
    trade.Loaded();
    EXPECT_EQ(trade.folder.Read("out/asn.csv"), "EARLIER");
  }
}

TEST(NoticeFilesTest, AreCutBackWithTheRunThatIsGivenUp) {
  FiledTrade trade;
  std::filesystem::remove(trade.folder / "out/asn.csv");
  trade.Sql("UPDATE tbPackLine SET Quantity = 40000");
  EXPECT_EQ(trade.Run().front().result, 0);
  EXPECT_EQ(trade.Files() + std::to_string(trade.Pending()), "0");
}

}  // namespace
}  // namespace partnerkit::testing
