#include <gmock/gmock.h>
#include <sys/stat.h>

#include <iterator>

#include "cli/supplier.h"

namespace partnerkit::testing {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

using Usage = Supplier;

TEST_F(Usage, RefusesWhatCannotRun) {
  Load(R"({"EDIDoc": [{"EDIDocId": 2, "ProgId": "PartnerKit.clsNobody850csv"}]})");
  folder.Write("plain.txt", "no JSON");
  const std::pair<std::vector<std::string>, std::string> table[] = {
      {{}, "a verb is wanted"},
      {{"frobnicate"}, "no such verb: frobnicate"},
      {{"rows", "1", "inbox/orders.csv", "--fast"}, "--fast"},
      {{"rows", "1x", "inbox/orders.csv"}, "document 1x: not the id of a document definition"},
      {{"rows", "70000", "inbox/orders.csv"}, "document 70000: not the id of a document definition"},
      {{"process", "9", "inbox/orders.csv"}, "document 9: no such document definition in /"},
      {{"process", "2", "inbox/orders.csv"}, "document 2: class \"PartnerKit.clsNobody850csv\" is not known"},
      {{"process", "1", "inbox/orders.csv", "--row", "0", "--row", "-1"}, "--row -1: inbox/orders.csv has rows 0 to 3"},
      {{"delete", "1", "inbox/orders.csv", "--row", "4"}, "--row 4: inbox/orders.csv has rows 0 to 3"},
      {{"rows", "", "inbox/orders.csv"}, "document \"\": not the id of a document definition"},
      {{"process", "1", "inbox/orders.csv", "--row", ""}, "--row: wants a whole number, not \"\""},
      {{"process", "1", "inbox/orders.csv", "--row", "0", "--row", "0x1"}, "--row: wants a whole number, not \"0x1\""},
      {{"process", "1", "inbox/orders.csv", "--row", "012"}, "--row 12: inbox/orders.csv has rows 0 to 3"},
      {{"delete", "1", "inbox/orders.csv", "--row", ""}, "--row: wants a whole number, not \"\""},
      {{"log", "--since", ""}, "--since: wants a whole number, not \"\""},
      {{"print", "clsCMLSCM", "--pack", "1", ""}, "--pack: wants a whole number, not \"\""},
      {{"print", "clsCMLSCM", "--pack", "1", "--qty", ""}, "--qty: wants a whole number, not \"\""},
      {{"print", "clsCMLSCM", "--pack", "99999999999"}, "--pack"},
      {{"preview", "clsCMLSCM", "--pack", "1 ", "--out", "x.png"}, "--pack: wants a whole number, not \"1 \""},
      {{"--now", "yesterday", "docs"}, "--now yesterday: wants a time such as 2006-03-08T10:15:00"},
      {{"--workspace", "elsewhere", "docs"}, "elsewhere: no such workspace folder"},
      {{"--workspace", "maps", "docs"}, "maps: not a workspace, it holds no partnerkit.db"},
      {{"--database", "maps", "docs"}, "maps"},
      {{"new", "."}, "is a workspace already"},
      {{"new", "plain.txt/deeper"}, "plain.txt"},
      {{"demo", "maps"}, "maps: the demo wants a new or an empty folder"},
      {{"data", "frobnicate"}, "no such verb: data frobnicate"},
      {{"--frobnicate"}, "no such option: --frobnicate"},
      {{"data", "load", "nowhere.json"}, "nowhere.json: cannot be read: No such file or directory"},
      {{"data", "load", "maps"}, "maps: is a folder"},
      {{"data", "load", "records.json", "plain.txt"}, "plain.txt: line 1, column 2: "},
      {{"data", "dump", "Product", "Nonsense"}, "Nonsense: no such kind of record"},
      {{"printers", "file", "label"}, "printer label: no such printer in /"},
      {{"printers", "--test"}, "--test: the name of a printer is wanted"},
      {{"printers", "--test", "file", "label"}, "printer label: no such printer in /"},
  };
  for (const auto& [arguments, says] : table) ExpectRefused(arguments, says);
}

TEST_F(Usage, RefusesADatabaseThatIsNone) {
  folder.Write("partnerkit.db", std::string(4096, 'x'));
  ExpectRefused({"docs"}, "partnerkit.db: file is not a database");
  EXPECT_EQ(folder.Read("partnerkit.db"), std::string(4096, 'x'));
  folder.Write("partnerkit.db", "");
  for (const char* command : {"docs", "data dump", "process 1 inbox/orders.csv", "print clsCMLSCM --pack 1", "log"}) {
    std::istringstream words{std::string(command)};
    ExpectRefused({std::istream_iterator<std::string>(words), {}},
                  "partnerkit.db: is empty, and was a database: bring it back from a backup, or remove it");
  }
  ExpectRefused({"new", "."}, "is a workspace already");
  EXPECT_EQ(folder.Read("partnerkit.db"), "");
}

TEST_F(Usage, FindsTheWorkspaceByOptionThenEnvironmentThenFolder) {
  TempFolder elsewhere;
  EXPECT_EQ(RunPartnerkit(elsewhere / "", {"docs"}).status, 2);
  EXPECT_THAT(RunPartnerkit(elsewhere / "", {"docs"}, folder / "").out, HasSubstr("clsMGB850csv"));
  EXPECT_THAT(RunPartnerkit(elsewhere / "", {"--workspace", folder / "", "docs"}, "/nowhere").out,
              HasSubstr("clsMGB850csv"));
}

TEST_F(Usage, KeepsAnotherStoreApart) {
  EXPECT_EQ(Run({"--database", "sqlite3://" + (folder / "other.db"), "data", "load", "records.json"}).status, 0);
  EXPECT_EQ(Run({"--database", folder / "other.db", "process", "1", "inbox/orders.csv", "--row", "0"}).status, 0);
  EXPECT_EQ(Json({"data", "dump", "Order"})["Order"].size(), 0U);
  EXPECT_EQ(Json({"--database", folder / "other.db", "data", "dump", "Order"})["Order"].size(), 1U);
}

TEST_F(Usage, LeavesNothingWhereAWorkspaceCannotBeMade) {
  const Ran ran = Run({"--database", "postgresql://nowhere/db", "new", "a/b"});
  EXPECT_EQ(ran.status, 2);
  EXPECT_FALSE(folder.Has("a"));
}

TEST_F(Usage, AWorkspaceIsNoneOfOthersBusiness) {
  const mode_t before = umask(0022);
  EXPECT_EQ(Run({"new", "our/mine"}).status, 0);
  EXPECT_EQ(Run({"--database", "our/mine/more.db", "docs"}).status, 0);
  umask(before);
  const std::pair<const char*, int> table[] = {{"our", 0755},
                                               {"our/mine", 0750},
                                               {"our/mine/spool", 0750},
                                               {"our/mine/partnerkit.db", 0640},
                                               {"our/mine/more.db", 0640}};
  for (const auto& [name, rights] : table)
    EXPECT_EQ(static_cast<int>(std::filesystem::status(folder / name).permissions()), rights) << name;
}

TEST_F(Usage, EveryVerbHasAnExample) {
  for (std::vector<std::string> verb : std::vector<std::vector<std::string>>{{}, {"process"}, {"data", "load"}}) {
    verb.push_back("--help");
    const Ran ran = Run(verb);
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.out, HasSubstr("Example:\n  partnerkit ")) << verb.front();
  }
  EXPECT_THAT(Run({"--version"}).out, StartsWith("partnerkit "));
}

TEST_F(Usage, ListsClassesAndDocuments) {
  const nlohmann::json first = Json({"classes"})["classes"][0];
  EXPECT_EQ(first["ProgId"], "PartnerKit.clsMGB850csv");
  EXPECT_EQ(first["Direction"], "in");
  EXPECT_THAT(Run({"classes"}).out,
              ::testing::ContainsRegex("PartnerKit.clsMGB850csv +Purchase order .850. +in +CSV\n"));
  EXPECT_EQ(Json({"docs"})["docs"][0]["MapFolder"], folder / "maps/");
  EXPECT_THAT(Run({"docs"}).out, HasSubstr("product, cost, retail"));
}

}  // namespace
}  // namespace partnerkit::testing
