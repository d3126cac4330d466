#include "orders/functional_ack.h"

#include "support/order_trade.h"

namespace partnerkit::orders {
namespace {

using partnerkit::testing::Replaced;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::UnorderedElementsAre;

// A partner who gave numbers before, and a folder for acknowledgements.
struct Acknowledging : partnerkit::testing::TradingHost {
  Acknowledging() {
    std::filesystem::create_directory(folder / "ack");
    partner.PartnerId = "KMT";
    partner.Translator = "B2BE";
    partner.LastInterchangeNo = 470;
    partner.LastGroupNo = 57;
    Stored(partner);
    document.EDIDocId = 1;
    document.PartnerId = "KMT";
    document.CompanyEDIAddr = "ACMETOYS";
    document.PartnerEDIAddr = "KMARTSTORES01";
    document.AckFolder = folder / "ack/";
    ports.files = &files;
  }

  bool Write(std::string_view className, std::string_view acknowledged, std::string_view prefix,
             std::string_view reference, int transactions) {
    const auto reader = Create("clsKMart850ansix12");
    if (!Update(system->Records(), document)) Stored(document);
    ColumnTable columns;
    reader->Init(*system, 1, columns);
    return WriteFunctionalAck(dynamic_cast<TranslatorBase&>(*reader), *X12EnvelopeOf(className, "997"), acknowledged,
                              prefix, reference, transactions);
  }
  bool Write(std::string_view reference = "4711") { return Write("clsKMart850ansix12", "PO", "FA_PO_", reference, 3); }

  std::vector<std::string> Written() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder / "ack"))
      names.push_back(entry.path().filename());
    return names;
  }
  // The counters: the numbers given last.
  std::string Numbers() {
    EXPECT_TRUE(Load(system->Records(), partner));
    return std::to_string(partner.LastInterchangeNo) + "/" + std::to_string(partner.LastGroupNo);
  }

  partnerkit::testing::FaultyFiles files{*ports.files};
  Partner partner;
  EDIDoc document;
};

const std::string kFirst =
    "ISA*00*          *00*          *ZZ*ACMETOYS       *ZZ*KMARTSTORES01  *060308*1015*U*00204*000000471*0*P*>\r\n"
    "GS*FA*ACMETOYS*KMARTSTORES0*060308*1015*58*X*003020\r\n"
    "ST*997*0001\r\n"
    "AK1*PO*4711\r\n"
    "AK9*A*3*3*3\r\n"
    "SE*4*0001\r\n"
    "GE*1*58\r\n"
    "IEA*1*000000471\r\n";

TEST(FunctionalAck, IsAWholeInterchangeBehindAnotherOfTheSameMinute) {
  Acknowledging trade;
  EXPECT_TRUE(trade.Write());
  EXPECT_TRUE(trade.Write("clsMGB850ansix12", "PO", "FA_RA_", "4712", 1));
  EXPECT_THAT(trade.Written(), UnorderedElementsAre("FA_PO_4711_0603081015.TXT", "FA_RA_4712_0603081015.TXT"));
  EXPECT_EQ(trade.folder.Read("ack/FA_PO_4711_0603081015.TXT"), kFirst);
  EXPECT_TRUE(trade.Write("clsKMart850ansix12", "RA", "FA_PO_", "4711", 0));
  std::string second = Replaced(Replaced(kFirst, "000000471", "000000473"), "*58", "*60");
  second = Replaced(Replaced(second, "AK1*PO", "AK1*RA"), "*3*3*3", "*0*0*0");
  EXPECT_EQ(trade.folder.Read("ack/FA_PO_4711_0603081015.TXT"), kFirst + second);
  EXPECT_THAT(trade.LogLines(), IsEmpty());
}

TEST(FunctionalAck, DrawsNoNumbersWithoutAFile) {
  Acknowledging trade;
  for (const Text& none : {Text(), Text("")}) {
    trade.document.AckFolder = none;
    EXPECT_TRUE(trade.Write());
    EXPECT_THAT(trade.LogLines(), IsEmpty());
  }
  trade.document.AckFolder = trade.folder / "gone/";
  EXPECT_FALSE(trade.Write());
  EXPECT_THAT(trade.LogLines(), ElementsAre("76 Open FA File: Cannot open FA file " + trade.folder / "gone/" +
                                            "FA_PO_4711_0603081015.TXT"));
  EXPECT_EQ(trade.Numbers(), "470/57");
  EXPECT_THAT(trade.reports, IsEmpty());
}

TEST(FunctionalAck, StaysInItsFolderWhateverTheReference) {
  Acknowledging trade;
  EXPECT_TRUE(trade.Write("../..\\47/11"));
  EXPECT_THAT(trade.Written(), ElementsAre("FA_PO_.._.._47_11_0603081015.TXT"));
  EXPECT_THAT(trade.folder.Read("ack/FA_PO_.._.._47_11_0603081015.TXT"),
              ::testing::HasSubstr("AK1*PO*../..\\47/11\r\n"));
  EXPECT_TRUE(trade.Write(std::string(5000, '9')));
  EXPECT_TRUE(trade.folder.Has("ack/FA_PO_" + std::string(100, '9') + "_0603081015.TXT"));
}

TEST(FunctionalAck, IsWrittenWholeOrNotAtAll) {
  for (const std::string what : {"Write", "Sync", "Rename"}) {
    for (const Button answer : {Button::kAbort, Button::kIgnore}) {
      SCOPED_TRACE(what);
      Acknowledging trade;
      trade.answer = answer;
      trade.files.Fail(what, ".TXT", run_time::kDiskFull, 2, 1);
      EXPECT_TRUE(trade.Write());
      EXPECT_FALSE(trade.Write());
      EXPECT_FALSE(trade.Write("4712"));
      EXPECT_THAT(trade.Written(), ElementsAre("FA_PO_4711_0603081015.TXT"));
      EXPECT_EQ(trade.folder.Read("ack/FA_PO_4711_0603081015.TXT"), kFirst);
      EXPECT_EQ(trade.reports.size(), 2U);
      EXPECT_EQ(trade.Numbers(), "473/60");
    }
  }
}

TEST(FunctionalAck, IsWrittenOnceWhenTheUserTriesAgain) {
  Acknowledging trade;
  trade.answer = Button::kRetry;
  trade.files.Fail("Sync", ".TXT", run_time::kDiskFull);
  EXPECT_TRUE(trade.Write());
  EXPECT_EQ(trade.folder.Read("ack/FA_PO_4711_0603081015.TXT"), kFirst);
}

TEST(FunctionalAck, FailsWithoutNumbersOfItsOwn) {
  Acknowledging trade;
  trade.answer = Button::kIgnore;
  trade.document.PartnerId = "XYZ";
  EXPECT_FALSE(trade.Write());
  EXPECT_THAT(trade.Written(), IsEmpty());
  EXPECT_EQ(trade.reports.size(), 1U);
}

}  // namespace
}  // namespace partnerkit::orders
