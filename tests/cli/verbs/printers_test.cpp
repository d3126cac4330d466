#include <gmock/gmock.h>

#include <filesystem>

#include "cli/supplier.h"

namespace partnerkit::testing {
namespace {

class Printers : public Supplier {
 protected:
  void SetUp() override {
    Supplier::SetUp();
    std::filesystem::create_directory(folder / "dock");
    Put(R"({"Printer": [{"Name": "dock", "Kind": "file", "Target": "${workspace}/dock"},
                        {"Name": "gone", "Kind": "file", "Target": "${workspace}/gone"},
                        {"Name": "odd", "Kind": "lpt"}]})");
  }
};

TEST_F(Printers, AreListedWithTheirState) {
  const nlohmann::json none;
  std::vector<nlohmann::json> listed;
  const nlohmann::json told = Json({"printers"}, 1)["printers"];
  for (const auto& printer : told) {
    EXPECT_EQ(printer["reachable"], printer["trouble"].get<std::string>().empty());
    listed.push_back({printer["Name"], printer["Kind"], printer["Target"], printer["trouble"], printer["jobs"]});
  }
  const std::string gone = "Path not found: " + folder / "gone" + ": No such file or directory";
  EXPECT_EQ(listed, (std::vector<nlohmann::json>{
                        {"dock", "file", folder / "dock", "", 0},
                        {"gone", "file", folder / "gone", gone, 0},
                        {"odd", "lpt", none, "Printer error: odd: The printer's record has no Target", none},
                        {"file", "file", folder / "spool", "", 0}}));
  const Ran ran = Run({"printers", "dock", "odd"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.out.find("gone"), std::string::npos);
  EXPECT_THAT(ran.out, ::testing::ContainsRegex("dock +file +/.*dock +0  reachable\n"));
  EXPECT_THAT(ran.out, ::testing::ContainsRegex("odd +lpt +\\?  Printer error: odd: The printer's record"));
}

TEST_F(Printers, AreTriedWithAShortText) {
  const nlohmann::json tried = Json({"--now", "2006-03-08T10:15:00", "printers", "--test", "dock", "gone", "file"}, 1);
  EXPECT_EQ(tried["results"], nlohmann::json({{{"printer", "dock"}, {"result", true}},
                                              {{"printer", "gone"}, {"result", false}},
                                              {{"printer", "file"}, {"result", true}}}));
  EXPECT_EQ(tried["jobs"], nlohmann::json({"dock/0001.prn", "spool/0001.prn"}));
  EXPECT_EQ(folder.Read("dock/0001.prn"), "PartnerKit test\r\nPrinter dock\r\n2006-03-08T10:15:00\r\n\f");
  const Ran ran = Run({"printers", "--test", "dock", "odd"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.out, "Sent dock/0002.prn.\n");
  EXPECT_EQ(ran.err, "partnerkit: printer odd: Printer error: odd: The printer's record has no Target\n");
}

}  // namespace
}  // namespace partnerkit::testing
