#include <gmock/gmock.h>

#include "cli/supplier.h"

namespace partnerkit::testing {
namespace {

namespace fs = std::filesystem;

// The sample supplier's workspace in a folder that goes places.
class Moved : public Supplier {
 protected:
  void SetUp() override {
    EXPECT_EQ(Run({"new", "first"}).status, 0);
    folder.Write("first/maps/mgb850.map", Sample("mgb850.map"));
    folder.Write("first/inbox/orders.csv", Sample("orders.csv"));
    folder.Write("more.json", R"({"Printer": [{"Name": "dock", "Kind": "file", "Target": "${workspace}/outbox"}],
                                  "System": {"ComPort": "${workspace}/port"}})");
    const std::string samples = PARTNERKIT_SOURCE_DIR "/samples/mgb850/records.json";
    const std::string cartons = PARTNERKIT_SOURCE_DIR "/tests/data/cartons.json";
    EXPECT_EQ(Run({"--workspace", "first", "data", "load", samples, cartons, "more.json"}).status, 0);
  }
  // Imports a row of the workspace's order file. Gives how many lines its backup file has then.
  std::ptrdiff_t LinesAfter(const std::string& workspace, const std::string& row) {
    const Ran ran =
        Run({"--workspace", workspace, "process", "1", folder / workspace + "/inbox/orders.csv", "--row", row});
    EXPECT_EQ(ran.status, 0) << ran.err << ran.out;
    return std::ranges::count(folder.Read(workspace + "/backup/po.csv"), '\n');
  }
  std::string Dump(const std::string& workspace) { return Run({"--workspace", workspace, "data", "dump"}).out; }
};

TEST_F(Moved, AWorkspaceGoesOnWhereItHasGone) {
  const std::ptrdiff_t first = LinesAfter("first", "0");
  fs::rename(folder / "first", folder / "second");
  const std::ptrdiff_t second = LinesAfter("second", "0");
  EXPECT_GT(second, first);
  EXPECT_EQ(Run({"--workspace", "second", "print", "clsCMLSCM", "--pack", "901", "--language", "ZPL"}).out,
            "Pack  Result\n----  -------\n 901  printed\n\n1 job: outbox/0001.prn.\n");
  const std::string dumped = Dump("second");
  EXPECT_EQ(dumped.find(folder / "first"), std::string::npos);
  const auto all = nlohmann::json::parse(dumped);
  EXPECT_EQ(all["EDIDoc"][0]["MapFolder"], folder / "second/maps/");
  EXPECT_EQ(all["System"]["ComPort"], folder / "second/port");
  EXPECT_FALSE(folder.Has("first"));

  fs::copy(folder / "second", folder / "copy", fs::copy_options::recursive);
  EXPECT_GT(LinesAfter("copy", "1"), second);
  EXPECT_EQ(Dump("second"), dumped);
  EXPECT_EQ(std::ranges::count(folder.Read("second/backup/po.csv"), '\n'), second);
  // Another folder's store, named as one, still means what lies beside it.
  EXPECT_EQ(Run({"--workspace", "copy", "--database", folder / "second/partnerkit.db", "data", "dump"}).out, dumped);
}

}  // namespace
}  // namespace partnerkit::testing
