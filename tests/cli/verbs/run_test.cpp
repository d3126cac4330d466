#include <gmock/gmock.h>
#include <sys/file.h>

#include <fcntl.h>
#include <unistd.h>
#include <cerrno>

#include "cli/supplier.h"
#include "host/sql_session.h"

namespace partnerkit::testing {
namespace {

using nlohmann::json;
using ::testing::EndsWith;
using ::testing::HasSubstr;

class RunDocument : public Supplier {
 protected:
  // The sample file's orders, by number: the lines of the one named, with another purpose code and interchange number.
  std::string OrderAs(const std::string& number, const std::string& purpose, const std::string& interchange) {
    std::istringstream lines(Sample("orders.csv"));
    std::string chosen;
    for (std::string line; std::getline(lines, line);) {
      if (line.find("," + number + ",") == std::string::npos) continue;
      line.replace(0, 9, interchange);
      line.replace(line.find(",00,SA"), 3, "," + purpose);
      chosen += line + "\n";
    }
    return chosen;
  }
  std::string Orders() { return folder.Read("inbox/orders.csv"); }
  void Sql(const std::string& sql) { host::SqlHost::Open(folder / "partnerkit.db")->Session().Execute(sql); }
};

TEST_F(RunDocument, ShowsTheGridAndChangesNothing) {
  const json shown = Json({"rows", "1", "inbox/orders.csv"});
  EXPECT_EQ(shown, json::parse(R"({
    "columns": [["PO Number", 0, 2600], ["Date", 2, 1300], ["Trans Set", 0, 2000], ["Result", 0, 3000]],
    "rows": [["4500012345", "2006-03-06", "000000481/481/0001", ""],
             ["4500012346", "2006-03-06", "000000481/481/0002", ""],
             ["4500012351", "2006-03-07", "000000481/481/0003", ""],
             ["4500012352", "2006-03-07", "000000481/481/0004", ""]],
    "log": []})"));
  EXPECT_THAT(Run({"rows", "1", "inbox/orders.csv"}).out,
              EndsWith("  3  4500012352  2006-03-07  000000481/481/0004\n\n4 rows.\n"));
  EXPECT_EQ(Orders(), Sample("orders.csv"));
  EXPECT_FALSE(folder.Has("inbox/orders.tmp"));
}

TEST_F(RunDocument, ProcessesEveryRowAndKeepsTheFailedOrder) {
  const json done = Json({"--now", "2006-03-08T10:15:00", "process", "1", "inbox/orders.csv"}, 1);
  EXPECT_EQ(done["rows"].size(), 4U);
  EXPECT_EQ(done["results"], json::parse(R"([{"row": 0, "result": 1, "errorLog": [1]},
                                             {"row": 1, "result": 2, "errorLog": [2]},
                                             {"row": 2, "result": 0, "errorLog": [3, 4]},
                                             {"row": 3, "result": 3, "errorLog": [5]}])"));
  EXPECT_EQ(done["log"][2], json::parse(R"({"LogId": 3, "Source": "PartnerKit.clsMGB850csv", "Procedure": "Process",
      "ErrorNumber": -2147221502, "NativeError": 0,
      "Message": "...Cannot process PO 4500012351, product 9312345679126 cost price 11.25 does not agree with database cost 10.5"})"));
  EXPECT_EQ(Orders(), OrderAs("4500012351", "00", "000000481"));
  EXPECT_EQ(folder.Read("backup/po.csv"), OrderAs("4500012345", "00", "000000481") +
                                              OrderAs("4500012346", "00", "000000481") +
                                              OrderAs("4500012352", "00", "000000481"));
  const json orders = Json({"data", "dump", "Order"})["Order"];
  EXPECT_EQ(orders.size(), 3U);
  EXPECT_EQ(orders[0]["ImportDate"], "2006-03-08");
  EXPECT_EQ(orders[0]["Status"], 0);
  const json log = Json({"log", "--since", "3"})["log"];
  EXPECT_EQ(log.size(), 2U);
  EXPECT_EQ(log[0]["LogId"], 4);
  EXPECT_EQ(log[0]["LogDate"], "2006-03-08T10:15:00");
  EXPECT_THAT(Run({"log"}).out, HasSubstr(" 4  2006-03-08 10:15:00  clsMGB850csv  Process    PO 4500012351 import"));
}

TEST_F(RunDocument, ProcessesTheRowsNamedInTheirOrderAndTellsAPersonWhatBecameOfThem) {
  const Ran ran = Run({"process", "1", "inbox/orders.csv", "--row", "2", "--row", "1"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.err, "");
  EXPECT_EQ(ran.out,
            "Row  PO Number   Date        Trans Set           Result\n"
            "---  ----------  ----------  ------------------  ------------\n"
            "  2  4500012351  2006-03-07  000000481/481/0003  NOT DONE\n"
            "     rejection: ...Cannot process PO 4500012351, product 9312345679126 cost price 11.25 does not\n"
            "       agree with database cost 10.5\n"
            "     PO 4500012351 import incomplete.\n"
            "  1  4500012346  2006-03-06  000000481/481/0002  posted, id 1\n"
            "     PO 4500012346 import completed.\n"
            "\n4 rows, 1 posted, 1 not done.\n");
  EXPECT_EQ(Orders().find("4500012346"), std::string::npos);
}

TEST_F(RunDocument, TakesACancellationOrAChangeCarriedOutForSuccess) {
  EXPECT_EQ(Run({"process", "1", "inbox/orders.csv"}).status, 1);
  folder.Write("inbox/orders.csv", OrderAs("4500012345", "01", "000000482") + OrderAs("4500012346", "05", "000000482"));
  const json done = Json({"process", "1", "inbox/orders.csv"});
  EXPECT_EQ(done["results"], json::parse(R"([{"row": 0, "result": 0, "errorLog": [6]},
                                             {"row": 1, "result": 4, "errorLog": [7, 8]}])"));
  EXPECT_EQ(done["log"][0]["Message"], "... Warning Purchase Order Cancel Request 4500012345.");
  EXPECT_EQ(Json({"data", "dump", "Order"})["Order"].size(), 2U);
  EXPECT_EQ(Orders(), "");

  // One that is refused is turned away.
  folder.Write("inbox/orders.csv", OrderAs("4500012345", "01", "000000483"));
  const Ran refused = Run({"process", "1", "inbox/orders.csv"});
  EXPECT_EQ(refused.status, 1);
  EXPECT_THAT(refused.out, HasSubstr("Original PO 4500012345 doesn't exists."));
  folder.Write("inbox/orders.csv", OrderAs("4500012352", "01", "000000483"));
  EXPECT_THAT(Run({"process", "1", "inbox/orders.csv"}).out, HasSubstr("1 row, 1 cancelled."));
}

TEST_F(RunDocument, DeletesARowWithoutPostingIt) {
  const json done = Json({"delete", "1", "inbox/orders.csv", "--row", "1"});
  EXPECT_EQ(done["results"], json::parse(R"([{"row": 1, "result": true, "errorLog": [1]}])"));
  EXPECT_EQ(done["log"][0]["Message"], "Transaction deleted from file.");
  EXPECT_EQ(done["log"][0]["Procedure"], "Delete");
  EXPECT_EQ(Orders().find("4500012346"), std::string::npos);
  EXPECT_EQ(Orders().size(), Sample("orders.csv").size() - OrderAs("4500012346", "00", "000000481").size());
  EXPECT_EQ(Json({"data", "dump", "Order"})["Order"].size(), 0U);
}

TEST_F(RunDocument, TellsWhyAFileHasNoRows) {
  folder.Write("inbox/foreign.csv", "1,2,3,OTHER,OTHER,00\n");
  for (const std::string verb : {"rows", "process", "delete"}) {
    SCOPED_TRACE(verb);
    std::vector<std::string> command = {"--json", verb, "1", "inbox/foreign.csv"};
    if (verb != "rows") command.insert(command.end(), {"--row", "0"});
    const Ran ran = Run(command);
    EXPECT_EQ(ran.status, 1);
    EXPECT_EQ(ran.err, "partnerkit: inbox/foreign.csv: nothing to list: No orders found to match EDI addresses.\n");
    const json said = json::parse(ran.out);
    EXPECT_EQ(said["rows"], json::array());
    EXPECT_EQ(said.contains("results"), verb != "rows");
    EXPECT_EQ(said["log"].size(), 1U);
  }
}

TEST_F(RunDocument, TurnsAwayAFileThatAnotherProgramHolds) {
  const int held = open((folder / "inbox/orders.csv").c_str(), O_RDWR);
  ASSERT_EQ(flock(held, LOCK_EX), 0);
  const Ran ran = Run({"process", "1", "inbox/orders.csv"});
  close(held);
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.out, "error 70: Error opening file inbox/orders.csv\n");
  EXPECT_EQ(ran.err, "partnerkit: inbox/orders.csv: nothing to list: Error opening file inbox/orders.csv\n");
  EXPECT_EQ(Run({"rows", "1", "inbox/orders.csv"}).status, 0);
}

TEST_F(RunDocument, TellsThatARunCannotStart) {
  Load(R"({"Vendor": [{"VendorId": "ACME", "POBackupFile": "${workspace}/nowhere/po.csv"}]})");
  const Ran ran = Run({"--json", "process", "1", "inbox/orders.csv"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_THAT(ran.err, HasSubstr("inbox/orders.csv: the run cannot start: PO import cannot proceed. Backupfile /"));
  EXPECT_EQ(json::parse(ran.out)["log"][0]["Procedure"], "Init");
  EXPECT_EQ(json::parse(ran.out)["rows"], json::array());
}

// The note of what goes to the backup cannot be made where a folder bears its name.
TEST_F(RunDocument, TellsAFaultOnOneLineAndKeepsTheFile) {
  std::filesystem::create_directories(folder / "backup/po.csv.pending/in the way");
  const Ran ran = Run({"--json", "process", "1", "inbox/orders.csv", "--row", "0"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_THAT(ran.err, ::testing::StartsWith("partnerkit: TLE error - program error #75 ("));
  EXPECT_EQ(std::ranges::count(ran.err, '\n'), 1) << ran.err;
  EXPECT_EQ(json::parse(ran.out)["results"][0]["result"], 1);
  EXPECT_EQ(Orders(), Sample("orders.csv"));
  std::filesystem::remove_all(folder / "backup/po.csv.pending");
  const Ran again = Run({"process", "1", "inbox/orders.csv", "--row", "0"});
  EXPECT_EQ(again.status, 1);
  EXPECT_THAT(again.out, HasSubstr("000000481/481/0001  stored earlier\n"));
  EXPECT_THAT(again.out, HasSubstr("4 rows, 1 stored earlier.\n"));
  EXPECT_EQ(Orders().find("4500012345"), std::string::npos);
  EXPECT_THAT(folder.Read("backup/po.csv"), HasSubstr("4500012345"));
}

// The second order meets an error of the database that is no rule of it.
TEST_F(RunDocument, StopsBehindAFailingStoreAndSettlesWhatIsDone) {
  Sql("CREATE TRIGGER fault BEFORE INSERT ON tbOrderLine WHEN new.OrderId>1 "
      "BEGIN SELECT abs(-9223372036854775807-1); END");
  const Ran ran = Run({"--json", "process", "1", "inbox/orders.csv"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.err, "partnerkit: inbox/orders.csv: the store failed: integer overflow; 2 rows not tried\n");
  EXPECT_EQ(json::parse(ran.out)["results"], json::parse(R"([{"row": 0, "result": 1, "errorLog": [1]},
                                                            {"row": 1, "result": 0, "errorLog": [2]}])"));
  EXPECT_EQ(Orders(), Sample("orders.csv").substr(Sample("orders.csv").find("000000481,481,0002")));
  EXPECT_EQ(Json({"log"})["log"].size(), 2U);
  EXPECT_THAT(Run({"process", "1", "inbox/orders.csv"}).out, EndsWith("\n3 rows, 1 not done, 2 not tried.\n"));
  Sql("DROP TRIGGER fault");
  EXPECT_EQ(Json({"process", "1", "inbox/orders.csv"}, 1)["results"][0]["errorLog"], json::parse("[5, 6]"));
  EXPECT_EQ(Orders(), OrderAs("4500012351", "00", "000000481"));
}

// A record that doesn't get to the log is in the report, and the rows before it are as done as ever.
TEST_F(RunDocument, TellsWhichRecordsTheLogHasNotGot) {
  Sql("CREATE TRIGGER rule BEFORE INSERT ON tbLog WHEN new.Message LIKE '%4500012346%' BEGIN SELECT RAISE(ABORT,'no'); "
      "END");
  const Ran ran = Run({"--json", "process", "1", "inbox/orders.csv", "--row", "0", "--row", "1"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_EQ(ran.err, "partnerkit: 1 log record could not be stored\n");
  EXPECT_EQ(json::parse(ran.out)["log"][1]["Message"], "PO 4500012346 import completed.");
  EXPECT_EQ(Json({"log"})["log"].size(), 1U);
}

TEST_F(RunDocument, ShowsTextThatIsNotUtf8AsWindows1252) {
  std::string orders = OrderAs("4500012346", "00", "000000481");
  for (std::size_t at; (at = orders.find("4500012346")) != std::string::npos;) orders.replace(at, 10, "\x80\xE9-1\x01");
  folder.Write("inbox/orders.csv", orders);
  EXPECT_EQ(Json({"rows", "1", "inbox/orders.csv"})["rows"][0][0], "\u20ac\u00e9-1\u0001");
  EXPECT_THAT(Run({"rows", "1", "inbox/orders.csv"}).out, HasSubstr("  0  \u20ac\u00e9-1?  "));
}

TEST_F(RunDocument, FailsWhenItsOutputCannotBeWritten) {
  const std::string command =
      "'" PARTNERKIT_PROGRAM "' --workspace '" + folder / "" + "' docs > /dev/full 2> '" + folder / "said" + "'";
  EXPECT_EQ(WEXITSTATUS(std::system(command.c_str())), 1);
  EXPECT_EQ(folder.Read("said"), "partnerkit: standard output cannot be written\n");
}

TEST(Demo, ShowsTheMainJobStepByStep) {
  TempFolder folder;
  const Ran ran = RunPartnerkit(folder / "", {"demo", "try-it"});
  EXPECT_EQ(ran.status, 0);
  EXPECT_EQ(ran.err, "");
  for (const char* shown :
       {"$ partnerkit process 1 inbox/orders.csv\n", "4 rows, 3 posted, 1 not done.",
        " 3  4500012352  2006-03-07  2006-03-21         2       3     74  588.00\n",
        "  5 inbox/orders.csv\n 18 backup/po.csv\n 23 total\n", "\n$ partnerkit data load records/*.json\n",
        "K330871 REL# 2", "2 rows, 2 posted.\n", "5 rows, 3 posted, 1 cancelled, 1 not done.\n",
        "\nAK1*PO*771\nAK9*A*3*3*3\n", "   3  093123450000000036  16 x 9312347000201\n",
        "\nDrew the label of pack 1: label.png.\n",
        "\n1,SLH0048213,2500,90021,093123450000000036,TEA-60,19312347000208,16\n"}) {
    EXPECT_THAT(ran.out, HasSubstr(shown));
  }
  EXPECT_THAT(folder.Read("try-it/label.png"), ::testing::StartsWith("\x89PNG"));
  std::istringstream lines(ran.out);
  for (std::string line; std::getline(lines, line);) {
    EXPECT_TRUE(line.size() <= 100 || line.starts_with("ISA*")) << line;
  }
  EXPECT_EQ(RunPartnerkit(folder / "try-it", {"docs"}).status, 0);
  EXPECT_EQ(RunPartnerkit(folder / "", {"demo", "try-it"}).status, 2);
}

TEST(Demo, IsOneJsonDocument) {
  TempFolder folder;
  const json told = json::parse(RunPartnerkit(folder / "", {"--json", "demo", "try-it"}).out);
  EXPECT_EQ(told["workspace"], folder / "try-it");
  EXPECT_EQ(told["steps"][3]["command"], "partnerkit process 1 inbox/orders.csv");
  EXPECT_EQ(told["steps"][3]["status"], 1);
  EXPECT_EQ(told["steps"][3]["output"]["results"].size(), 4U);
}

}  // namespace
}  // namespace partnerkit::testing
