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
    EXPECT_EQ(Load(R"({"Printer": [{"Name": "dock", "Kind": "file", "Target": "${workspace}/dock"},
                                   {"Name": "gone", "Kind": "file", "Target": "${workspace}/gone"},
                                   {"Name": "odd", "Kind": "lpt"}]})")
                  .status,
              0);
  }
};

TEST_F(Printers, AreListedWithTheirState) {
  const std::string gone = "Path not found: " + folder / "gone" + ": No such file or directory";
  const nlohmann::json listed = {{{"Name", "dock"},
                                  {"Kind", "file"},
                                  {"Target", folder / "dock"},
                                  {"reachable", true},
                                  {"trouble", ""},
                                  {"jobs", 0}},
                                 {{"Name", "gone"},
                                  {"Kind", "file"},
                                  {"Target", folder / "gone"},
                                  {"reachable", false},
                                  {"trouble", gone},
                                  {"jobs", 0}},
                                 {{"Name", "odd"},
                                  {"Kind", "lpt"},
                                  {"Target", nullptr},
                                  {"reachable", false},
                                  {"trouble", "Printer error: odd: The printer's record has no Target"},
                                  {"jobs", nullptr}},
                                 {{"Name", "file"},
                                  {"Kind", "file"},
                                  {"Target", folder / "spool"},
                                  {"reachable", true},
                                  {"trouble", ""},
                                  {"jobs", 0}}};
  EXPECT_EQ(Json({"printers"}, 1)["printers"], listed);
  EXPECT_EQ(Json({"printers", "file", "dock"})["printers"], nlohmann::json({listed[3], listed[0]}));
  const Ran ran = Run({"printers", "dock", "odd"});
  EXPECT_EQ(ran.status, 1);
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
