#include <stdexcept>

#include "cairo/drawn.h"

namespace partnerkit::cairo {
namespace {

using ::testing::IsEmpty;
using ::testing::MatchesRegex;
using ::testing::Not;
using ::testing::StartsWith;

const Font kFont{.height = 40, .name = "ARIAL"};

void DrawPage(DrawingDevice& device, int width, int height, std::string_view text) {
  device.StartPage(width, height);
  device.Rectangle({10, 10, 20, 20}, 3);
  device.Text(30, 10, text, kFont, {});
  device.EndPage();
}

TEST(CairoDocumentTest, APdfHasItsPagesTextsAndTitle) {
  const std::string pdf = DrawnPdf(
      [](DrawingDevice& device) {
        EXPECT_EQ(device.TwipsPerPixelX(), 4.8);
        EXPECT_EQ(device.TwipsPerPixelY(), 4.8);
        DrawPage(device, 413, 583, "Caf\xE9 12\x80");
        DrawPage(device, 600, 400, "Carton 2 \x96 end");
      },
      {.title = "Labels for Caf\xE9"});
  EXPECT_EQ(testing::Told(pdf, "pdftotext -enc UTF-8 \"$document\" -"), "Café 12€\n\n\fCarton 2 – end\n\n\f");
  const std::string told = testing::Told(pdf, "pdfinfo -enc UTF-8 -l 9 \"$document\"");
  EXPECT_THAT(told, HasSubstr("Title:           Labels for Café\n"));
  EXPECT_THAT(told, HasSubstr("Page    1 size:  297.36 x 419.76 pts\n"));
  EXPECT_THAT(told, HasSubstr("Page    2 size:  432 x 288 pts\n"));
  EXPECT_THAT(told, Not(HasSubstr("Page    3")));
  EXPECT_THAT(told, Not(HasSubstr("CreationDate")));
  EXPECT_THAT(testing::Told(pdf, "pdffonts \"$document\""), HasSubstr("LiberationSans"));
}

TEST(CairoDocumentTest, APdfHasTheTimeThatItIsGiven) {
  const Draw draw = [](DrawingDevice& device) { DrawPage(device, 100, 100, "A"); };
  EXPECT_THAT(testing::Told(DrawnPdf(draw, {.created = "2006-03-06T10:15:00Z"}), "pdfinfo -isodates \"$document\""),
              HasSubstr("CreationDate:    2006-03-06T10:15:00"));
  EXPECT_EQ(DrawnPdf(draw), DrawnPdf(draw));
}

TEST(CairoDocumentTest, PicturesAreAsLargeAsThePageAndHaveOne) {
  const Picture picture = Drawn(
      413, 583, [](DrawingDevice& device) { EXPECT_EQ(device.TwipsPerPixelX(), 1440.0 / 203); }, 203);
  EXPECT_EQ(picture.width, 838);
  EXPECT_EQ(picture.height, 1183);
  std::string svg;
  const auto device = MakeSvgDevice(Into(svg), 100);
  DrawPage(*device, 200, 100, "A");
  device->EndDoc();
  EXPECT_THAT(svg, HasSubstr("viewBox=\"0 0 144 72\""));
  for (const auto& [name, make] : {kDevices[1], kDevices[2]}) {
    std::string document;
    const auto onePage = make(Into(document));
    DrawPage(*onePage, 100, 100, "A");
    EXPECT_THAT(ErrorOf([&] { onePage->StartPage(100, 100); }), MatchesRegex("5 Inv.*: An? (PNG|SVG) has one page"));
    onePage->EndDoc();
    EXPECT_THAT(document, Not(IsEmpty()));
  }
}

TEST(CairoDocumentTest, NothingIsDrawnOutsideOfAPage) {
  constexpr const char* kInvalid = "5 Invalid procedure call or argument";
  for (const Named& kind : kDevices) {
    const std::string name = kind.name;
    std::string document;
    const auto device = kind.make(Into(document));
    const auto drawing = [&] {
      EXPECT_EQ(ErrorOf([&] { device->Rectangle({1, 1, 2, 2}, 1); }), kInvalid) << name;
      EXPECT_EQ(ErrorOf([&] { device->Text(1, 1, "", kFont, {}); }), kInvalid) << name;
      EXPECT_EQ(ErrorOf([&] { device->EndPage(); }), kInvalid) << name;
    };
    drawing();
    EXPECT_EQ(ErrorOf([&] { device->StartPage(0, 100); }),
              "5 Invalid procedure call or argument: A page of 0 x 100 hundredths of an inch");
    EXPECT_THAT(ErrorOf([&] { device->StartPage(100, 20001); }), StartsWith(kInvalid));
    drawing();
    device->StartPage(100, 100);
    EXPECT_EQ(ErrorOf([&] { device->StartPage(100, 100); }), kInvalid) << name;
    EXPECT_EQ(ErrorOf([&] { device->EndDoc(); }), kInvalid) << name;
    device->EndPage();
    drawing();
    device->EndDoc();
    EXPECT_EQ(ErrorOf([&] { device->EndDoc(); }), kInvalid) << name;
    EXPECT_EQ(ErrorOf([&] { device->StartPage(100, 100); }), kInvalid) << name;
  }
  EXPECT_EQ(ErrorOf([] { MakePngDevice({}, 0); }), "5 Invalid procedure call or argument: 0 dots per inch");
}

TEST(CairoDocumentTest, ADocumentLetGoOrWithoutAPageIsNotDelivered) {
  for (const auto& [name, make] : kDevices) {
    std::string document;
    make(Into(document))->EndDoc();
    EXPECT_EQ(document, "") << name;
    auto device = make(Into(document));
    DrawPage(*device, 100, 100, "A");
    const std::size_t before = document.size();
    device.reset();
    EXPECT_EQ(document.size(), before) << name;
    device = make(Into(document));
    device->StartPage(100, 100);
    device->Rectangle({1, 1, 2, 2}, 1);
    const std::size_t withinPage = document.size();
    device.reset();
    EXPECT_EQ(document.size(), withinPage) << name;
  }
}

TEST(CairoDocumentTest, WhatASinkThrowsComesOut) {
  for (const Named& kind : kDevices) {
    for (const int calls : {0, 1, 2, 3}) {
      int left = calls;
      const auto device = kind.make([&](std::string_view) {
        if (left-- == 0) throw std::length_error("full");
      });
      EXPECT_THROW(
          {
            DrawPage(*device, 100, 100, "A");
            device->EndDoc();
          },
          std::length_error)
          << kind.name << ' ' << calls;
      EXPECT_EQ(left, -1) << kind.name << ' ' << calls;
    }
  }
}

TEST(CairoDocumentTest, ATooLargePictureIsTold) {
  std::string png;
  const auto device = MakePngDevice(Into(png), 9600);
  EXPECT_EQ(ErrorOf([&] { device->StartPage(413, 583); }),
            "57 Device I/O error: drawing: invalid value (typically too big) for the size of the input (surface, "
            "pattern, etc.)");
  EXPECT_THAT(ErrorOf([&] { device->EndDoc(); }), StartsWith("57 Device I/O error: drawing: "));
  EXPECT_EQ(png, "");
}

}  // namespace
}  // namespace partnerkit::cairo
