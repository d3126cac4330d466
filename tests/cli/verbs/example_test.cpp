#include <gmock/gmock.h>

#include <regex>

#include "cli/supplier.h"
#include "partnerkit/catalogue.h"

namespace partnerkit::testing {
namespace {

using nlohmann::json;
using ::testing::HasSubstr;

class Example : public Supplier {
 protected:
  void SetUp() override { EXPECT_EQ(Run({"new", "."}).status, 0); }
  // The words of each command that the output proposes.
  static std::vector<std::vector<std::string>> CommandsIn(const std::string& out) {
    std::vector<std::vector<std::string>> commands;
    std::istringstream lines(out);
    for (std::string line; std::getline(lines, line);) {
      if (!line.starts_with("  partnerkit ")) continue;
      std::istringstream words(line.substr(13, line.find('#') - 13));
      std::vector<std::string>& command = commands.emplace_back();
      for (std::string word; words >> word;) {
        std::erase(word, '\'');
        command.push_back(word);
      }
    }
    return commands;
  }
  // The command carried something out: an order posted, a notice compiled, a label printed.
  void ExpectCarriedOut(std::vector<std::string> command) {
    SCOPED_TRACE(json(command).dump());
    command.insert(command.begin(), "--json");
    const json told = json::parse(Run(command).out, nullptr, false);
    ASSERT_TRUE(told.contains("results")) << told;
    EXPECT_TRUE(std::ranges::any_of(told["results"], [](const json& each) {
      return each["result"] != 0 && each["result"] != false;
    })) << told;
  }
};

TEST_F(Example, OfEveryClassLoadsAndWorks) {
  for (const PublicClass& row : Catalogue()) {
    SCOPED_TRACE(row.progId);
    const std::string name(row.progId.substr(row.progId.find('.') + 1));
    const std::string within = name + "/";
    EXPECT_EQ(Run({"new", name}).status, 0);
    const Ran made = Run({"data", "example", name, "--out", name});
    EXPECT_EQ(made.status, 0) << made.err;
    EXPECT_EQ(Run({"data", "example", std::string(row.progId)}).out, folder.Read(within + name + ".json"));
    auto commands = CommandsIn(made.out);
    ASSERT_EQ(commands.size(), 3U);
    for (auto& command : commands) {
      for (std::string& word : command) {
        if (word.ends_with(".json") || word.find('/') != std::string::npos) word.insert(0, within);
      }
      command.insert(command.begin(), {"--workspace", name});
    }
    EXPECT_EQ(Run(commands[0]).status, 0) << Run(commands[0]).err;
    EXPECT_EQ(Run(commands[1]).status, 0) << Run(commands[1]).err;
    ExpectCarriedOut(commands[2]);
  }
}

TEST_F(Example, IsTakenUpFromWhereNewLeavesOffAndInTheReadme) {
  const std::string readme = Sample("README.md", "..");
  const std::size_t use = readme.find("```sh", readme.find("## Using it"));
  const std::string typed = readme.substr(use, readme.find("```\n", use) - use);
  const auto run = [&](const std::string& text, std::string within) {
    for (const auto& command : CommandsIn(text)) {
      SCOPED_TRACE(json(command).dump());
      const Ran ran = RunPartnerkit(within, command);
      EXPECT_EQ(ran.err, "");
      // One of the sample's orders is to fail its checks.
      EXPECT_EQ(ran.status, command.front() == "process" && command[1] == "1" ? 1 : 0);
      if (command.front() == "new") within = folder / "typed/acme";
    }
  };
  run(Run({"new", "acme"}).out, folder / "acme");
  EXPECT_THAT(Run({"--workspace", "acme", "log"}).out, HasSubstr("PO 4500012345 import completed."));
  std::filesystem::create_directory(folder / "typed");
  run(std::regex_replace(typed, std::regex("(^|\n)partnerkit "), "$1  partnerkit "), folder / "typed");
  EXPECT_TRUE(folder.Has("typed/acme/label.png") && folder.Has("typed/acme/spool/0003.prn"));
  EXPECT_THAT(folder.Read("typed/acme/outbox/asn1.csv"),
              HasSubstr(",0052,4500900101,260302,,0052,093123450009001010,P01,TEE-100,9312345678907,12,KIM,\r\n"));
}

TEST_F(Example, ReplacesNoFile) {
  folder.Write("inbox/orders.csv", Sample("orders.csv"));
  folder.Write("maps/mgb850.map", "MINE");
  ExpectRefused({"data", "example", "clsMGB850csv", "--out", "."}, "maps/mgb850.map: is there already");
  EXPECT_FALSE(folder.Has("clsMGB850csv.json"));
  ExpectRefused({"data", "example", "clsNobody"}, "class \"clsNobody\" is not known");
  EXPECT_EQ(Json({"data", "example", "clsCMLSCM", "--out", "."})["files"],
            json({"clsCMLSCM.json", "maps/cmlflf.map", "maps/cmlflfda.map"}));
  EXPECT_EQ(Run({"data", "example", "clsCMLFLFDAcsv", "--out", "."}).status, 0);
}

}  // namespace
}  // namespace partnerkit::testing
