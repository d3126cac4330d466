#include <regex>

#include "labels/label_trade.h"

namespace partnerkit::testing {
namespace {

// A run's only job, line by line: of a label its free lines, of a separator its first and its last line.
Strings Lines(const Strings& jobs) {
  if (jobs.size() != 1) return {std::to_string(jobs.size()) + " jobs"};
  static const std::regex kLine(
      R"re((\{F,9,.*C,580,150,0,3,2,2,B,L,0,3,|\|26,)"([^"]*)".*(\|27|B,L,0,3),"([^"]*)".*\r\n)re");
  Strings lines;
  for (std::sregex_iterator line(jobs[0].begin(), jobs[0].end(), kLine), none; line != none; ++line) {
    lines.push_back(line->str(1) == "|26," ? "" : "- ");
    lines.back().append(line->str(2)).append("/").append(line->str(4));
  }
  return lines;
}

struct BatchTest : ::testing::Test {
  // Three cartons for store 471, two for 464; a product each.
  BatchTest() {
    for (const auto& [packNo, store] :
         {std::pair("P-1", "471"), {"P-1", "471"}, {"P-2", "471"}, {"P-2", "464"}, {"P-3", "464"}}) {
      packs.push_back(trade.NewPack(packNo, store));
      const PSlipLine slipLine = trade.New<PSlipLine>([&](auto& r) {
        r.PSlipId = trade.slip.Id, r.APN = "9312347000300", r.StyleText = "only " + packs.back().PackNo;
      });
      trade.New<PackLine>(
          [&](auto& r) { r.PackId = packs.back().Id, r.PSlipLineId = slipLine.LineId, r.APN = "9312347000300"; });
    }
    for (const auto& item : {std::pair("P-1", "Tee"), {"P-2", "Jeans"}, {"P-2", "Shorts"}}) {
      trade.New<LabelJobItem>([&](auto& r) { r.PackNo = item.first, r.StyleText = item.second; });
    }
    trade.New<Product>([](auto& r) {
      r.ProductNo = "9312347000300", r.InHouseProdNo = "APRON-10", r.Description = "Kitchen apron, caf\u00e9 stripes";
    });
  }

  LabelTrade trade;
  std::vector<Pack> packs;
};

TEST_F(BatchTest, ByStoreSeparatorsLeadTheLabels) {
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}});
  label->SetUser2("mine");
  trade.yields = 0;
  EXPECT_TRUE(label->PrintAllLabels(packs, true));
  EXPECT_THAT(Lines(trade.Jobs()), ElementsAre("- 471/471", "PACK ID P-1/mine", "PACK ID P-1/mine", "PACK ID P-2/mine",
                                               "- 464/464", "PACK ID P-2/mine", "PACK ID P-3/mine"));
  EXPECT_EQ(trade.yields, 8);  // ahead of the job, and after each line
  EXPECT_TRUE(label->PrintLabel(packs[0], std::int16_t{7}));
  trade.Jobs();
  EXPECT_TRUE(label->PrintAllLabels(std::span(packs).first(2)));
  const Strings jobs = trade.Jobs();
  EXPECT_THAT(Lines(jobs), ElementsAre("PACK ID P-1/mine", "PACK ID P-1/mine"));
  EXPECT_THAT(jobs[0], StartsWith("dock PartnerKit.clsCMLSCM: {B,10,N,1|E,0,0,1,1,0,1|" + std::string(kBatchFields)));
}

TEST_F(BatchTest, ByStyleTheLastIsTheFirstAndSeparatorsFollow) {
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}, {"LabelUserField", "x"}});
  EXPECT_TRUE(label->PrintAllLabels(packs, true, true));
  // The second line of a separator is that of the pack which begins the next group.
  EXPECT_THAT(Lines(trade.Jobs()), ElementsAre("PACK ID P-3/x", "- /ONLY P-2", "PACK ID P-2/x", "PACK ID P-2/x",
                                               "- JEANS/ONLY P-1", "PACK ID P-1/x", "PACK ID P-1/x", "- TEE/TEE"));
  trade.New<PackLine>([&](auto& r) { r.PackId = packs[1].Id; });
  EXPECT_TRUE(label->PrintAllLabels(std::span(packs).subspan(1, 2), true, true));
  EXPECT_THAT(Lines(trade.Jobs()), ElementsAre("PACK ID P-2/x", "- JEANS/JEANS", "PACK ID P-1/x", "- TEE/TEE"));
  EXPECT_TRUE(label->PrintAllLabels(packs, false, true));
  EXPECT_THAT(Lines(trade.Jobs()),
              ElementsAre("PACK ID P-3/x", "PACK ID P-2/x", "PACK ID P-2/x", "PACK ID P-1/x", "PACK ID P-1/x"));
}

TEST_F(BatchTest, TheSettingSaysWhatTheSecondFreeLineShows) {
  const std::pair<std::string, std::string> table[] = {
      {"Item_Style/StockId", "ITEM ID APRON-10"},
      {"EAN/UPC", "ITEM ID 9312347000300"},
      {"PACKERID", "USER ID KIM"},
      {"jobid", "JOB ID " + std::to_string(trade.job.JobId)},
      {"DESCR", "ITEM ID Kitchen apron, caf\xE9 st"},
      {"DELIVERYREF", "REFER INV9"},
      {"PO 1234", "PO 1234"},
      {"", "held"},
  };
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}});
  for (const auto& [word, line] : table) {
    // Of the two settings the first, unless it is empty.
    for (const bool alone : {true, false}) {
      SCOPED_TRACE(word);
      trade.Set({{"LabelUserField", alone ? word : ""}, {"LabelUserFieldAlt", alone ? "" : word}});
      if (alone && !word.empty()) trade.Set({{"LabelUserFieldAlt", "FRAGILE"}});
      label->SetUser2("held");
      EXPECT_TRUE(label->PrintAllLabels(std::span(packs).first(1)));
      EXPECT_THAT(Lines(trade.Jobs()), ElementsAre("PACK ID P-1/" + line));
    }
  }
  // Of a pack with nothing in it and on no slip.
  Pack bare = trade.NewPack("P-9", "471");
  bare.PSlipId = 0, bare.InvoiceNo = {};
  for (const auto& [field, line] :
       {std::pair("APN", "ITEM ID "), {"USER", "USER ID "}, {"JOB", "JOB ID "}, {"DELIVERYREF", "REFER "}}) {
    trade.Set({{"LabelUserField", field}});
    EXPECT_TRUE(label->PrintAllLabels(std::span(&bare, 1)));
    EXPECT_THAT(Lines(trade.Jobs()), ElementsAre("PACK ID P-9/" + std::string(line)));
  }
}

TEST_F(BatchTest, ARunIsOneJobInEachLanguage) {
  const auto label = trade.Ready({{"PrinterLanguage", "ZPL"}});
  EXPECT_TRUE(label->PrintAllLabels(std::span(packs).first(2)));
  const Strings zpl = trade.Jobs();
  ASSERT_EQ(zpl.size(), 1U);
  EXPECT_THAT(zpl[0], StartsWith("dock PartnerKit.clsCMLSCM: ^XA"));
  EXPECT_THAT(zpl[0], EndsWith("^PQ1,0,0,N^MCN^XZ\r\n"));
  EXPECT_THAT(zpl[0], HasSubstr("^XZ\r\n^XA"));
  trade.Set({{"PrinterLanguage", "WinPCL"}, {"LabelUserField", "x"}});
  EXPECT_TRUE(label->PrintAllLabels(packs, true));
  const Strings drawn = trade.Jobs();
  ASSERT_EQ(drawn.size(), 1U);
  Strings told;
  std::istringstream lines(drawn[0]);
  for (std::string line; std::getline(lines, line);) {
    if (line.ends_with("page 400 x 600")) told.push_back("page");
    if (const std::size_t at = line.find("PACK ID"); at != line.npos) told.push_back(line.substr(at + 8));
  }
  EXPECT_THAT(told, ElementsAre("page", "P-1", "page", "P-1", "page", "P-2", "page", "P-2", "page", "P-3"));
  trade.Set({{"PrinterLanguage", "LBXII"}, {"ComDirect", "true"}, {"ComPort", "COM1"}});
  trade.spooler.opened = 0;
  EXPECT_TRUE(label->PrintAllLabels(packs));
  EXPECT_EQ(trade.spooler.opened, 1);
  EXPECT_THAT(trade.Jobs(), IsEmpty());
  ASSERT_EQ(trade.sent.size(), 1U);
  EXPECT_THAT(trade.sent[0], StartsWith("COM1 {B,10,N,1|"));
  EXPECT_THAT(trade.sent[0], EndsWith("|26,\"PACK ID P-3\"|27,\"x\"|28,\"\"|29,\"Geelong\"|}\r\n"));
  EXPECT_THAT(trade.reports, IsEmpty());
}

TEST_F(BatchTest, AnEmptyListOpensAndClosesThePrinter) {
  for (const std::string_view language : {"LBXII", "ZPL", "WinPCL"}) {
    const auto label = trade.Ready({{"PrinterLanguage", language}});
    trade.spooler.opened = 0;
    EXPECT_TRUE(label->PrintAllLabels({}, true, true));
    EXPECT_EQ(trade.spooler.opened, 1);
    EXPECT_THAT(trade.Jobs(), IsEmpty());
  }
  EXPECT_THAT(trade.LogLines(), IsEmpty());
}

TEST_F(BatchTest, AnErrorBehindTheFirstFreeLinesStopsNoRun) {
  int yields = -1;  // one of them at Init
  trade.ports.yield = [&] {
    if (++yields == 2) trade.Sql("DROP TABLE \"tbPackLine\"");
  };
  const auto label = trade.Ready({{"PrinterLanguage", "LBXII"}, {"LabelUserField", "STYLE"}});
  EXPECT_TRUE(label->PrintAllLabels(packs, true, true));
  EXPECT_THAT(Lines(trade.Jobs()),
              ElementsAre("PACK ID P-3/ITEM ID APRON-10", "- /", "PACK ID P-2/ITEM ID ", "PACK ID P-2/ITEM ID ",
                          "- JEANS/JEANS", "PACK ID P-1/ITEM ID ", "PACK ID P-1/ITEM ID ", "- TEE/TEE"));
  EXPECT_THAT(trade.reports, IsEmpty());
  // With the first free lines it does.
  EXPECT_FALSE(label->PrintAllLabels(packs));
  EXPECT_EQ(trade.reports.size(), 1U);
  EXPECT_THAT(trade.Jobs(), IsEmpty());
}

TEST_F(BatchTest, ALabelThatCannotBeDrawnIsLeftOutAndLogged) {
  const auto label = trade.Ready({{"PrinterLanguage", "WinPCL"}});
  trade.store.PartnerLocnNo = "475", trade.store.ShortName = "x|99,\"";
  trade.Stored(trade.store);
  packs[1].BuyStoreCode = "475";
  EXPECT_TRUE(label->PrintAllLabels(std::span(packs).first(3)));
  const Strings jobs = trade.Jobs();
  ASSERT_EQ(jobs.size(), 1U);
  EXPECT_THAT(trade.LogLines(), ElementsAre("W PrintAllLabels: Label of pack P-1 not printed."));
  EXPECT_EQ(trade.reports.size(), 1U);
  std::size_t pages = 0;
  for (std::size_t at = jobs[0].find("page 400"); at != jobs[0].npos; at = jobs[0].find("page 400", at + 1)) ++pages;
  EXPECT_EQ(pages, 2U);
}

}  // namespace
}  // namespace partnerkit::testing
