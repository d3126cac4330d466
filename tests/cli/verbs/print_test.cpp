#include <gmock/gmock.h>
#include <sys/wait.h>

#include "cli/supplier.h"
#include "support/pictures.h"

namespace partnerkit::testing {
namespace {

using nlohmann::json;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::StartsWith;

constexpr const char* kClass = "PartnerKit.clsCMLSCM";

class PrintLabels : public Supplier {
 protected:
  void SetUp() override {
    EXPECT_EQ(Run({"new", "."}).status, 0);
    EXPECT_EQ(Run({"data", "load", PARTNERKIT_SOURCE_DIR "/tests/data/cartons.json"}).status, 0);
  }
  std::string Workspace() { return std::filesystem::path(folder / "").parent_path(); }
  std::string Job(int number) { return folder.Read("spool/000" + std::to_string(number) + ".prn"); }
};

TEST_F(PrintLabels, APackAtATimeAsAJobEach) {
  EXPECT_EQ(Json({"print", kClass, "--pack", "901", "903", "--qty", "2"}),
            json::parse(R"({"results": [{"pack": 901, "result": true}, {"pack": 903, "result": true}],
                            "jobs": ["spool/0001.prn", "spool/0002.prn", "spool/0003.prn"], "log": []})"));
  EXPECT_THAT(Job(1), StartsWith("{F,10,A,R,E,600,400,\"CMLDC\"|"));
  EXPECT_EQ(Job(2),
            R"({B,10,N,2|E,1,0,1,1,0,1|1,"Acme Apparel"|2,"Brunswick"|3,"VIC"|4,"Southern Lineha"|5,"SLH0048213"|)"
            R"(6,"Altona DC"|7,"250 Dohertys Road"|8,"Laverton North 3026"|9,"2510"|10,"Geelong West"|)"
            R"(11,"95 Shannon Avenue"|12,"Geelong West"|13,"3218"|14,"0464"|15,"~2014210363026~201900464"|)"
            R"(16,"(421)0363026(90)0464"|17,"(00)093123450000009015"|18,"PO 73014455"|19,"AD"|20,"1203"|)"
            R"(21,"HOMEWARES"|24,"~20100093123450000009015"|25,"(00)093123450000009015"|26,""|27,""|28,""|)"
            R"(29,"Geelong West"|})");
  EXPECT_THAT(Job(3), HasSubstr("|28,\"PALLET\"|"));
  const Ran ran = Run({"print", "clsCMLSCM", "--pack", "902", "--language", "ZPL"});
  EXPECT_EQ(ran.status, 0);
  EXPECT_THAT(ran.out, MatchesRegex("Pack +Result\n-+ +-+\n +902 +printed\n\n1 job: spool/0004.prn.\n"));
  EXPECT_THAT(Job(4), EndsWith("^FV>;>800093123450000009022^FS^PQ1,0,0,N^MCN^XZ"));
}

TEST_F(PrintLabels, AllPacksAsOneJob) {
  EXPECT_EQ(Json({"print-all", kClass, "--pack", "901", "902", "903", "--separators"}),
            json::parse(R"({"results": [{"result": true}], "jobs": ["spool/0001.prn", "spool/0002.prn"], "log": []})"));
  const std::string labels = Job(2);
  EXPECT_EQ(std::ranges::count(labels, '\n'), 5);
  EXPECT_LT(labels.find("\"0464\"|}"), labels.find("26,\"PACK ID P-901\"|27,\"ITEM ID APRON-10\"|"));
  EXPECT_EQ(Json({"print-all", kClass, "--pack", "901", "903", "--style-sort"})["jobs"][1], "spool/0004.prn");
  EXPECT_LT(Job(4).find("P-903"), Job(4).find("P-901"));
  // A run that lacks a carton is not begun.
  const Ran ran = Run({"print-all", kClass, "--pack", "901", "77"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_THAT(ran.out, MatchesRegex(" *Pack +Result\n-+ +-+\nall 2 +NOT PRINTED\n\n0 jobs.\n"));
  EXPECT_EQ(ran.err, "partnerkit: pack 77: no such pack in " + Workspace() + "\n");
}

TEST_F(PrintLabels, DrawnLabelsArePagesOfADocument) {
  EXPECT_EQ(Json({"print-all", kClass, "--pack", "901", "902", "903", "--language", "WinPCL"})["jobs"],
            json({"spool/0001.pdf"}));
  const std::string pdf = folder.Read("spool/0001.pdf");
  const std::string told = Told(pdf, "pdfinfo -l 9 \"$document\"");
  EXPECT_THAT(told, HasSubstr("Title:           PartnerKit.clsCMLSCM\n"));
  EXPECT_THAT(told, HasSubstr("Page    3 size:  288 x 432 pts\n"));
  EXPECT_THAT(told, ::testing::Not(HasSubstr("Page    4")));
}

TEST_F(PrintLabels, APreviewCanBeScanned) {
  EXPECT_EQ(Json({"preview", kClass, "--pack", "901", "--out", "label.png"}),
            json::parse(R"({"results": [{"pack": 901, "result": true}], "files": ["label.png"], "log": []})"));
  EXPECT_EQ(Told(folder.Read("label.png"), "zbarimg --nodbus --quiet --raw \"$document\" 2>/dev/null | sort"),
            "00093123450000009015\n4210363026\x1d"
            "900464\n");
  EXPECT_EQ(Run({"preview", kClass, "--pack", "903", "--out", "label.pdf"}).out,
            "Drew the label of pack 903: label.pdf.\n");
  EXPECT_THAT(Told(folder.Read("label.pdf"), "pdftotext -layout \"$document\" -"), HasSubstr("PO 73014455"));
  EXPECT_EQ(Run({"preview", kClass, "--pack", "901", "--out", "label.svg"}).status, 0);
  EXPECT_THAT(folder.Read("label.svg"), HasSubstr("<svg "));
  const auto expectFailed = [&](const std::string& pack, const std::string& out, int status, const std::string& said) {
    const Ran ran = Run({"preview", kClass, "--pack", pack, "--out", out});
    EXPECT_EQ(ran.status, status);
    EXPECT_EQ(ran.err, "partnerkit: " + said + "\n");
  };
  expectFailed("901", "label.gif", 2, "--out label.gif: wants a name that ends in .png, .pdf or .svg");
  expectFailed("77", "none.png", 1, "pack 77: no such pack in " + Workspace());
  expectFailed("901", "no/none.png", 1, "Path not found: no/none.png: No such file or directory");
  EXPECT_FALSE(folder.Has("none.png") || folder.Has("none.png"));
}

TEST_F(PrintLabels, WhatCannotBePrintedIsTold) {
  EXPECT_EQ(Json({"print", kClass, "--pack", "77", "901"}, 1)["results"],
            json::parse(R"([{"pack": 77, "result": false}, {"pack": 901, "result": true}])"));
  const auto expectTold = [&](const std::vector<std::string>& options, bool result, const std::string& message) {
    std::vector<std::string> command = {"print", kClass, "--pack", "901"};
    command.insert(command.end(), options.begin(), options.end());
    SCOPED_TRACE(json(command).dump());
    const json told = Json(command, 1);
    EXPECT_EQ(told["results"], json({{{"pack", 901}, {"result", result}}}));
    ASSERT_EQ(told["log"].size(), 1U);
    EXPECT_EQ(told["log"][0]["Message"], message);
  };
  std::filesystem::remove_all(folder / "spool");
  for (const char* language : {"LBXII", "WinPCL"}) {
    expectTold({"--language", language}, false,
               "Error 76Unable to print on file: Path not found: " + folder / "spool" + ": No such file or directory");
  }
  for (const Ran& ran : {Run({"print", kClass, "--pack", "901"}), Run({"log"})})
    EXPECT_THAT(ran.out, HasSubstr("error 76: Unable to print on file: Path"));
  Put(R"({"System": {"PrinterLanguage": "EPL"}})");
  std::filesystem::create_directory(folder / "spool");
  expectTold({}, true, "EPL unknown.");
}

TEST_F(PrintLabels, ACommandThatCannotRunIsRefused) {
  Put(R"({"System": {"PrinterLanguage": ""}})");
  const auto expectRefused = [&](const std::vector<std::string>& command, const std::string& said) {
    const Ran ran = Run(command);
    EXPECT_EQ(ran.status, 2);
    EXPECT_EQ(ran.err, "partnerkit: " + said + "\n");
  };
  expectRefused({"print-all", "clsMGB850csv", "--pack", "901"},
                "class \"clsMGB850csv\" is not known, or no label class");
  expectRefused(
      {"print", kClass, "--pack", "901"},
      R"(no printer language: load the setting, such as {"System": {"PrinterLanguage": "ZPL"}}, or give --language)");
  expectRefused({"print", kClass, "--pack", "901", "--language", "EPL"},
                "--language EPL: PartnerKit.clsCMLSCM prints LBXII, ZPL, WinPCL only");
  for (const char* verb : {"print", "print-all"}) {
    for (const char* language : {"ZPL", "WinPCL"}) {
      expectRefused({verb, kClass, "--pack", "901", "--printer", "attic", "--language", language},
                    "printer attic: no such printer in " + Workspace());
    }
  }
  EXPECT_TRUE(std::filesystem::is_empty(folder / "spool"));
  Put(R"({"Printer": [{"Name": "dock", "Kind": "file", "Target": "spool"}]})");
  const std::vector<std::string> zpl = {"print", kClass, "--pack", "901", "--language", "ZPL"};
  EXPECT_EQ(Run(zpl).status, 0);
  Put(R"({"Printer": [{"Name": "office", "Kind": "file", "Target": "spool"}]})");
  expectRefused(zpl, "the workspace has 2 printers: name one with --printer");
}

TEST_F(PrintLabels, AFullDiskLeavesNoHalfJob) {
  // Room for the database and no more.
  std::string packs;
  for (int n = 0; n < 2'500; ++n) packs += " 901";
  const std::string command = "cd '" + folder / "" +
                              "' && trap '' XFSZ && ulimit -f 2000 && '" PARTNERKIT_PROGRAM
                              "' --json print-all clsCMLSCM --pack" +
                              packs + " > told";
  EXPECT_EQ(WEXITSTATUS(std::system(command.c_str())), 1);
  const json told = json::parse(folder.Read("told"));
  EXPECT_EQ(told["results"], json::parse(R"([{"result": false}])"));
  EXPECT_EQ(told["jobs"], json({"spool/0001.prn"}));  // the format
  ASSERT_EQ(told["log"].size(), 1U);
  EXPECT_THAT(told["log"][0]["Message"], StartsWith("Error 61Unable to print on file: Disk full: "));
  const std::filesystem::directory_iterator files(folder / "spool");
  EXPECT_EQ(std::distance(begin(files), end(files)), 1);
}

TEST_F(PrintLabels, DirectLabelsGoToThePort) {
  folder.Write("port", "");
  Put(R"({"System": {"ComDirect": true, "ComPort": ")" + folder / "port" + "\"}}");
  const std::string job = "port:" + folder / "port";
  EXPECT_EQ(Json({"print", kClass, "--pack", "901", "902"})["jobs"], json({job, job, job}));
  const std::string sent = folder.Read("port");
  EXPECT_THAT(sent, StartsWith("{F,10,"));
  EXPECT_THAT(sent, EndsWith("|29,\"Geelong West\"|}"));
  std::filesystem::remove(folder / "port");
  const Ran ran = Run({"print", kClass, "--pack", "901"});
  EXPECT_EQ(ran.status, 1);
  EXPECT_THAT(ran.err, HasSubstr("error #53 (File not found: " + folder / "port" + ": No such file or directory)"));
  EXPECT_THAT(ran.out, HasSubstr("NOT PRINTED"));
}

}  // namespace
}  // namespace partnerkit::testing
