#include "spool/printer_spooler.h"

#include <filesystem>

#include "render/recording_device.h"
#include "spool/spool_test.h"

namespace partnerkit::spool {
namespace {

// A device that writes a document of what is drawn.
class ListingDevice : public partnerkit::testing::RecordingDevice {
 public:
  ListingDevice(ByteSink sink, const std::string& title) : sink_(std::move(sink)) { drawn.push_back(title); }
  double TwipsPerPixelX() const override { return 4.8; }
  double TwipsPerPixelY() const override { return 7.2; }
  void StartPage(int width, int height) override {
    drawn.push_back(std::to_string(width) + "x" + std::to_string(height));
  }
  void EndPage() override {
    for (const std::string& each : std::exchange(drawn, {})) sink_(each + "; ");
  }
  void EndDoc() override { sink_("end"); }

 private:
  ByteSink sink_;
};

class SpoolerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::filesystem::create_directory(folder / "spool");
    std::filesystem::create_directory(folder / "dock");
  }
  void Print(const std::string& printer, std::string_view bytes) {
    const auto job = spooler.OpenRaw(printer, "PartnerKit.clsCMLSCM");
    for (const char& byte : bytes) job->Write({&byte, 1});
    job->Close();
  }

  TempFolder folder, elsewhere;
  PrinterSpooler spooler{
      {{"dock", "file", "dock"},
       {"away", "file", elsewhere / ""},
       {"later", "file", "later"},
       {"bare", "tcp", std::nullopt},
       {"odd", "lpt", "1"}},
      folder / "",
      [](ByteSink pdf, const std::string& title) { return std::make_unique<ListingDevice>(std::move(pdf), title); },
      kShort};
};

TEST_F(SpoolerTest, ListsItsPrintersAt300DotsAnInch) {
  std::vector<std::string> names;
  for (const InstalledPrinter& printer : spooler.InstalledPrinters()) {
    names.push_back(printer.deviceName);
    EXPECT_EQ(printer.twipsPerPixelX, 4.8);
    EXPECT_EQ(printer.twipsPerPixelY, 4.8);
  }
  EXPECT_THAT(names, ElementsAre("dock", "away", "later", "bare", "odd", "file"));
  EXPECT_EQ(PrinterSpooler({{"file", "tcp", "warehouse"}}, folder / "").InstalledPrinters().size(), 1U);
}

TEST_F(SpoolerTest, RemembersWhatWasDelivered) {
  Print("file", "^XA1^XZ");
  Print("away", "^XA2^XZ");
  Print("dock", "");
  spooler.OpenRaw("dock", "abandoned")->Write("^XA3^XZ");
  Print("dock", "^XA4^XZ");
  EXPECT_THAT(spooler.Jobs(), ElementsAre("spool/0001.prn", elsewhere / "0001.prn", "dock/0001.prn"));
  EXPECT_EQ(folder.Read("spool/0001.prn"), "^XA1^XZ");
  EXPECT_EQ(elsewhere.Read("0001.prn"), "^XA2^XZ");
  EXPECT_EQ(folder.Read("dock/0001.prn"), "^XA4^XZ");
  EXPECT_EQ(spooler.JobCount("dock"), 0);
}

TEST_F(SpoolerTest, DeliversADrawingWhenItsDocumentEnds) {
  spooler.OpenDrawing("dock", "abandoned")->StartPage(1, 2);
  const auto device = spooler.OpenDrawing("dock", "PartnerKit.clsMYERSCM");
  EXPECT_EQ(device->TwipsPerPixelX(), 4.8);
  EXPECT_EQ(device->TwipsPerPixelY(), 7.2);
  device->StartPage(400, 600);
  device->Rectangle({5, 6, 7, 8}, 9);
  device->Text(10, 11, "Carton", {.name = "Arial"}, {});
  device->EndPage();
  EXPECT_FALSE(folder.Has("dock/0001.pdf"));
  device->EndDoc();
  EXPECT_EQ(folder.Read("dock/0001.pdf"),
            "PartnerKit.clsMYERSCM; 400x600; 5 6 7 8 pen 9; 10 11 0 0 400 0 Arial black on white: Carton; end");
  EXPECT_THAT(spooler.Jobs(), ElementsAre("dock/0001.pdf"));
}

TEST_F(SpoolerTest, AFailedJobMayBeClosedAgain) {
  const auto job = spooler.OpenRaw("later", "job");
  job->Write("^XA5^XZ");
  const auto drawing = spooler.OpenDrawing("later", "drawing");
  EXPECT_THAT(ErrorOf([&] { job->Close(); }), HasSubstr("76 Path not found: " + folder / "later"));
  EXPECT_THAT(ErrorOf([&] { drawing->EndDoc(); }), HasSubstr("76 "));
  EXPECT_THAT(spooler.Jobs(), ElementsAre());
  std::filesystem::create_directory(folder / "later");
  job->Close();
  drawing->EndDoc();
  EXPECT_THAT(spooler.Jobs(), ElementsAre("later/0001.prn", "later/0002.pdf"));
  EXPECT_EQ(folder.Read("later/0002.pdf"), "end");
  EXPECT_EQ(ErrorOf([&] { job->Write("more"); }), "52 Bad file name or number: job: The print job is closed");
  EXPECT_EQ(ErrorOf([&] { job->Close(); }), "52 Bad file name or number: job: The print job is closed");
}

TEST_F(SpoolerTest, SaysWhyAPrinterCannotBeOpened) {
  EXPECT_EQ(ErrorOf([&] { spooler.OpenRaw("Dock", "job"); }), "482 Printer error: Dock: There is no such printer");
  EXPECT_EQ(ErrorOf([&] { spooler.OpenDrawing("bare", "job"); }),
            "482 Printer error: bare: The printer's record has no Target");
  EXPECT_EQ(ErrorOf([&] { spooler.JobCount("odd"); }),
            "482 Printer error: odd: The printer's Kind \"lpt\" is not file, cups or tcp");
  EXPECT_EQ(ErrorOf([&] { PrinterSpooler({}, folder / "").OpenDrawing("file", "job"); }),
            "482 Printer error: file: Drawings are not printed here");
}

}  // namespace
}  // namespace partnerkit::spool
