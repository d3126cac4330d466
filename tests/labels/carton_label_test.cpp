#include "labels/label_trade.h"

namespace partnerkit::testing {
namespace {

// Of each job or text sent, where it went and how it begins.
Strings Heads(const Strings& texts) {
  Strings heads;
  for (std::string text : texts) {
    if (const std::size_t title = text.find("PartnerKit.clsCMLSCM: "); title != text.npos) text.erase(title, 22);
    heads.push_back(text.substr(0, text.find(' ') + 6));
  }
  return heads;
}

struct Road {
  std::string_view language, direct, port;
  bool inHand;              // the caller says that it has the printer
  Strings atInit, atPrint;  // jobs and texts sent
  int opened = 1;           // jobs at PrintLabel
  Strings log = {};
  std::string report = "";  // without one the label counts as printed
};

// clang-format off
const Road kRoads[] = {
    {"LBXII",  "",     "",     false, {"dock {F,10"}, {"dock {B,10"}},
    {"LBXII",  "",     "COM1", false, {"dock {F,10"}, {"dock {B,10"}},
    {"LBXII",  "true", "COM1", false, {"COM1 {F,10"}, {"COM1 {B,10"}, 0},
    {"LBXII",  "1",    "",     false, {"dock {F,10"}, {" {B,10"}},
    {"LBXII",  "1",    "",     true,  {"dock {F,10"}, {" {B,10"}, 0},
    {"LBXII",  "",     "",     true,  {"dock {F,10"}, {}, 0, {},
     "(No print job is open on dock) occured in module cCMLSCM, Function WriteLabel,"},
    {"ZPL",    "",     "",     false, {},             {"dock ^XA^M"}},
    {"ZPL",    "1",    "COM1", false, {},             {"COM1 ^XA^M"}, 0},
    {"WinPCL", "",     "",     false, {},             {"dock page "}},
    {"WinPCL", "1",    "COM1", false, {},             {"dock page "}},
    {"WinPCL", "",     "",     true,  {},             {}, 0, {},
     "(No print job is open) occured in module cCMLSCM, Sub PrintWinPCL,"},
    {"lbxii",  "",     "",     false, {"dock {F,10"}, {}, 1, {"0 WriteLabel: lbxii unknown."}},
};
// clang-format on

TEST(CartonLabelTest, ALabelGoesTheRoadOfItsPrintersLanguage) {
  for (const Road& road : kRoads) {
    LabelTrade trade;
    trade.Set({{"PrinterLanguage", road.language}, {"ComDirect", road.direct}, {"ComPort", road.port}});
    SCOPED_TRACE(::testing::Message() << road.language << ' ' << road.direct << ' ' << road.port << ' ' << road.inHand);
    const auto label = trade.Created();
    EXPECT_TRUE(label->Init(trade.labelHost, "dock"));
    const auto went = [&] {
      Strings all = trade.Jobs();
      for (std::string& text : std::exchange(trade.sent, {})) all.push_back(std::move(text));
      return Heads(all);
    };
    EXPECT_EQ(went(), road.atInit);
    trade.spooler.opened = 0;
    EXPECT_EQ(label->PrintLabel(trade.pack, {}, road.inHand), road.report.empty());
    EXPECT_EQ(went(), road.atPrint);
    EXPECT_EQ(trade.spooler.opened, road.opened);
    EXPECT_EQ(trade.LogLines(), road.log);
    trade.reports.resize(1);
    EXPECT_THAT(trade.reports[0], HasSubstr(road.report));
    EXPECT_EQ(trade.reports[0].empty(), road.report.empty());
  }
}

TEST(CartonLabelTest, ABatchHasTheQuantityAndTheFreeLinesAndFollowsNoFormat) {
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}, {"BatchControl", "4"}});
  label->SetUser1(std::string(40, 'u'));
  label->SetUser2("Caf\u00e9 " + std::string(30, 'w'));
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  EXPECT_TRUE(label->PrintLabel(trade.pack, std::int16_t{3}));
  const std::string sscc = R"(24,"~20100093123450000009015"|25,"(00)093123450000009015"|)";
  const std::string foot = "26,\"" + std::string(30, 'u') + "\"|27,\"Caf\xE9 " + std::string(25, 'w') +
                           "\"|28,\"\"|29,\"Ballarat Central\"|}";
  const std::string fields = std::string(kBatchFields);
  EXPECT_THAT(trade.Jobs(), ElementsAre("dock PartnerKit.clsCMLSCM: {B,10,N,1|E,4,0,1,1,0,1|" + fields + sscc + foot,
                                        "dock PartnerKit.clsCMLSCM: {B,10,N,3|E,4,0,1,1,0,1|" + fields + sscc + foot));
  // A component's label, first of one whose host has told nothing yet.
  label->SetComponentPrint(true);
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  EXPECT_THAT(trade.Jobs().at(0), HasSubstr(fields + R"(22,"0 OF 0"|23,""|26,)"));
  label->SetComponentItem(2), label->SetComponentCount(5), label->SetComponentStyle(std::string(40, 's'));
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  EXPECT_THAT(trade.Jobs().at(0), HasSubstr(fields + "22,\"2 OF 5\"|23,\"" + std::string(40, 's') + "\"|26,"));
  const std::string component = "|T,22,50,V,20,100,0,3,2,2,B,L,0,0,0|T,23,50,V,70,50,0,3,1,1,B,L,0,0,0|T,26,";
  EXPECT_THAT(label->PrintLBXII(), HasSubstr(component));
  label->SetComponentPrint(false);
  EXPECT_THAT(label->PrintLBXII(), HasSubstr("|T,21,50,V,382,100,0,3,1,1,B,L,0,0,0|B,24,"));
}

TEST(CartonLabelTest, InitSetsTheHostsFlagsAndNeedsNoPrinter) {
  LabelTrade trade;
  trade.Set({{"PrinterLanguage", "LBXII"}});
  const auto label = trade.Created();
  label->PrintSCMatClose = label->OLESubPackComponent = label->Prepack = label->ValidateClose = true;
  label->PrePackComplete = true, label->PrePackStyle = "TEE";
  EXPECT_TRUE(label->Init(trade.labelHost));
  EXPECT_EQ(trade.spooler.opened, 0);
  EXPECT_TRUE(label->PrintSCMatOpen);
  EXPECT_FALSE(label->PrintSCMatClose || label->OLESubPackComponent || label->Prepack || label->ValidateClose);
  EXPECT_TRUE(label->PrePackComplete && label->PrePackStyle == "TEE");
  EXPECT_EQ(label->PDTFieldLength(), "7,6,10,22,20,13,20,13,20,20,10,6,6,1,16,6");
}

TEST(CartonLabelTest, EveryOperationFailsWithAPrinterThatFails) {
  const auto shut = [](LabelTrade& t) { t.spooler.shut = true; };
  const auto broken = [](LabelTrade& t) { t.spooler.broken = true; };
  const auto none = [](LabelTrade& t) { t.ports.spooler = nullptr; };
  const Strings notOpened = {"482 OpenPtr: Error 482Unable to open printer dock"};
  const Strings notPrinted = {"57 ClosePtr: Error 57Unable to print on dock: Out of paper"};
  const struct Trouble {
    std::string language;
    std::function<void(LabelTrade& trade)> cause;
    Strings log;  // of each operation
  } table[] = {
      {"LBXII", shut, notOpened}, {"WinPCL", shut, notOpened},   {"LBXII", none, notOpened},
      {"WinPCL", none, {}},       {"LBXII", broken, notPrinted}, {"WinPCL", broken, notPrinted},
  };
  for (const Trouble& trouble : table) {
    SCOPED_TRACE(trouble.language);
    LabelTrade trade;
    trade.Set({{"PrinterLanguage", trouble.language}});
    trouble.cause(trade);
    const auto label = trade.Created();
    const bool sendsAtInit = trouble.language == "LBXII";
    EXPECT_EQ(label->Init(trade.labelHost, "dock"), !sendsAtInit);
    const Pack packs[] = {trade.pack};
    const std::string format = label->PrintLBXII();
    EXPECT_FALSE(label->PrintLabel(trade.pack));
    EXPECT_FALSE(label->PrintAllLabels(packs));
    EXPECT_FALSE(label->PrintFile(format, "batch"));
    EXPECT_FALSE(label->Separator("dock", "STORE 12"));
    Strings expected;
    for (int operation = sendsAtInit ? 0 : 1; operation < 5; ++operation) {
      expected.insert(expected.end(), trouble.log.begin(), trouble.log.end());
    }
    EXPECT_EQ(trade.LogLines(), expected);
    EXPECT_THAT(trade.reports, IsEmpty());
    EXPECT_THAT(trade.Jobs(), IsEmpty());
  }
}

TEST(CartonLabelTest, APortThatFailsIsAnErrorOfItsProcedure) {
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}, {"ComDirect", "1"}, {"ComPort", "COM1"}});
  trade.portGone = true;
  EXPECT_FALSE(label->PrintLabel(trade.pack));
  EXPECT_FALSE(trade.Created()->Init(trade.labelHost, "dock"));
  ASSERT_EQ(trade.reports.size(), 2U);
  EXPECT_THAT(trade.reports[0], HasSubstr("cCMLSCM, Function WriteLabel,"));
  EXPECT_THAT(trade.reports[1], HasSubstr("cCMLSCM, Function Init,"));
}

TEST(CartonLabelTest, WaitsWhileTheQueueIsFull) {
  for (const auto& [platform, asked] : {std::pair("1", 3), {"2", 0}}) {
    LabelTrade trade;
    const auto label = trade.Ready({{"PrinterLanguage", "ZPL"}, {"PlatformId", platform}});
    trade.spooler.queues = {999, 999, 998, 999};
    EXPECT_TRUE(label->PrintLabel(trade.pack));
    EXPECT_EQ(trade.spooler.asked, asked);
    EXPECT_EQ(trade.yields, std::max(asked, 1));
    EXPECT_EQ(trade.Jobs().size(), 1U);
  }
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "ZPL"}});
  trade.spooler.queues = {7, 5000};
  EXPECT_EQ(label->SpooledJobCount(""), 0);
  EXPECT_EQ(trade.spooler.asked, 0);
  EXPECT_EQ(label->SpooledJobCount("dock"), 7);
  EXPECT_EQ(label->SpooledJobCount("dock"), 999);
  trade.spooler.mute = true;
  EXPECT_EQ(label->SpooledJobCount("dock"), 0);
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  EXPECT_THAT(trade.reports, IsEmpty());
}

TEST(CartonLabelTest, ASeparatorGoesToTheSpoolerAndItsPrinterStays) {
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}, {"ComDirect", "1"}, {"ComPort", "COM1"}});
  EXPECT_TRUE(label->Separator("office", "store 12"));
  const std::string text = label->RatioSeparator("store 12");
  EXPECT_THAT(text, HasSubstr(R"(C,580,150,0,3,2,2,B,L,0,3,"STORE 12"|)"));
  EXPECT_THAT(trade.Jobs(), ElementsAre("office PartnerKit.clsCMLSCM: " + text));
  EXPECT_THAT(trade.sent, IsEmpty());
  trade.Set({{"ComDirect", "0"}});
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  EXPECT_THAT(Heads(trade.Jobs()), ElementsAre("office {B,10"));
  for (const std::string_view language : {"ZPL", "WinPCL"}) {
    trade.Set({{"PrinterLanguage", language}});
    trade.spooler.opened = 0;
    EXPECT_EQ(label->RatioSeparator("store 12"), "");
    EXPECT_TRUE(label->Separator("dock", "store 12"));
    EXPECT_EQ(trade.spooler.opened, 1);
    EXPECT_THAT(trade.Jobs(), IsEmpty());
  }
}

TEST(CartonLabelTest, AFileIsAFormatAndABatch) {
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}});
  EXPECT_TRUE(label->PrintFile("{format}", "{batch}"));
  EXPECT_THAT(trade.Jobs(), ElementsAre("dock PartnerKit.clsCMLSCM: {format}{batch}"));
  trade.Set({{"PrinterLanguage", "ZPL"}});
  EXPECT_TRUE(label->PrintFile("{format}", "{batch}"));
  EXPECT_THAT(trade.Jobs(), ElementsAre("dock PartnerKit.clsCMLSCM: {format}"));
  EXPECT_THAT(trade.LogLines(), ElementsAre("0 WriteLabel: ZPL unknown."));
  // On an ordinary printer the format is drawn with the values of the carton that was printed last.
  trade.Set({{"PrinterLanguage", "WinPCL"}});
  EXPECT_TRUE(label->PrintLabel(trade.pack));
  std::string format = label->PrintLBXII();
  format.replace(format.find("\"FROM:\""), 7, "\"FROM US\"");
  trade.Jobs();
  EXPECT_TRUE(label->PrintFile(format, "{batch}"));
  const Strings drawn = trade.Jobs();
  ASSERT_EQ(drawn.size(), 1U);
  EXPECT_THAT(drawn[0], HasSubstr(": FROM US\n"));
  EXPECT_THAT(drawn[0], HasSubstr(": PO 4500012345\n"));
  EXPECT_FALSE(label->PrintFile("{format}", ""));
  EXPECT_THAT(trade.Jobs(), IsEmpty());
  ASSERT_EQ(trade.reports.size(), 1U);
  EXPECT_THAT(trade.reports[0], HasSubstr("Sub PrintWinPCL"));
}

TEST(CartonLabelTest, ADrawnLabelStandsByTheResolutionInItsPrintersEntry) {
  LabelTrade trade;
  const auto label = trade.Ready({{"PrinterLanguage", "WinPCL"}}, "office");
  label->SetUser1("a|b");
  EXPECT_TRUE(label->PrintLabel(trade.pack, std::int16_t{3}));
  const Strings jobs = trade.Jobs();
  ASSERT_EQ(jobs.size(), 1U);
  // At 7.2 twips: 12 mm are 93.3 pixels, 108 mm 840, which 7.201 would make 839.9.
  EXPECT_THAT(jobs[0], HasSubstr("\n93 840 31 15 400 0 ARIAL black on white: (421)0363026(90)0471\n"));
  // A bar cuts its field short and the rest of the label is still drawn.
  EXPECT_THAT(jobs[0], HasSubstr(": a\n"));
  EXPECT_THAT(jobs[0], HasSubstr(": Ballarat Central\n"));
  // A label that cannot be read is none, and nothing of it is delivered.
  label->SetUser1("a|99,\"b");
  EXPECT_FALSE(label->PrintLabel(trade.pack));
  EXPECT_THAT(trade.Jobs(), IsEmpty());
  ASSERT_EQ(trade.reports.size(), 1U);
  EXPECT_THAT(trade.reports[0], HasSubstr("error #91 (The label's format has no field 99) occured in module cCMLSCM, "
                                          "Sub PrintWinPCL"));
  label->PrintWinPCL();
  EXPECT_EQ(trade.reports.size(), 2U);
}

}  // namespace
}  // namespace partnerkit::testing
