#include "labels/other_languages.h"

#include <span>
#include <string_view>

#include "labels/text_template.h"

namespace partnerkit::labels {

namespace {

// clang-format off
constexpr std::string_view kZpl =
    "^XA^MCY^XZ^XA^SZ2^MMT^MTT~JSN^LT0^MD0^MNY^PRA^PON^PMN^CI0^LRN"
    "^FO224,102^A0N,75,68^FD`ToLocnNo`^FS"
    "^FO611,400^A0N,114,117^FR^FD^FS"
    "^FO412,78^A0N,17,17^FD`BillOfLadingNo`^FS"
    "^FO412,49^A0N,17,17^FD`ConNoteNo`^FS"
    "^FO408,7^A0N,33,34^FD`CarrierName`^FS"
    "^FO328,66^A0N,33,17^FDB/L No:^FS"
    "^FO328,36^A0N,33,17^FDCon No:^FS"
    "^FO328,3^A0N,33,17^FDCARRIER:^FS"
    "^FO90,57^A0N,33,17^FD`FromSuburb``FromState`^FS"
    "^FO93,18^A0N,33,17^FD`FromName`^FS"
    "^FO24,18^A0N,33,17^FDFROM:^FS"
    "^FO191,518^A0N,49,51^FD`StoreZoneDept`^FS"
    "^FO191,461^A0N,49,51^FD`DeptText`^FS"
    "^FO191,373^A0N,65,51^FDSTORE ZONE/DEPT^FS"
    "^FO48,465^A0N,98,51^FD`ADDate`^FS"
    "^FO66,367^A0N,98,51^FD`ADFlag`^FS"
    "^FO24,200^A0N,33,17^FD`ToPostcode`^FS"
    "^FO24,155^A0N,33,17^FD`ToSuburb`^FS"
    "^FO81,102^A0N,49,17^FD`ToName`^FS"
    "^FO24,84^A0N,65,34^FDTO:^FS"
    "^FO569,199^A0N,33,17^FD`ForPostcode`^FS"
    "^FO379,199^A0N,33,17^FD`ForPostcode`^FS"
    "^FO379,155^A0N,33,17^FD`ForSuburb`^FS"
    "^FO459,102^A0N,49,17^FD`ForName`^FS"
    "^FO379,102^A0N,49,34^FDFOR:^FS"
    "^FO45,319^A0N,33,34^FD00`SSCCText`^FS"
    "^FO45,289^A0N,33,34^FDSSCC^FS"
    "^FO453,248^A0N,33,17^FD`POText`^FS"
    "^FO379,248^A0N,33,34^FDPO:^FS"
    "^FO616,81^A0N,94,68^FD`ForLocnNo`^FS"
    "^FO82,882^A0N,19,34^FV(421)`CountryCode``ToPostcode`(90)`ForLocnNo`^FS"
    "^FO82,1166^A0N,19,34^FV(00)`SSCCText`^FS"
    "^BY4,,305^FO45,575^BCN,,N,N,N,N^FV>;>8421`CountryCode``ToPostcode`>890`ForLocnNo`^FS"
    "^BY4,,234^FO42,924^BCN,,N,N,N,N^FV>;>800`SSCCText`^FS"
    "^PQ1,0,0,N^MCN^XZ";

constexpr std::string_view kAxiohmHead =
    "! 0 150 820 1\r\n"
    "CVARIABLE INDEX_SETTING 1\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE PRINT_MODE DT\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE FEED_TYPE GAP\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE WIDTH 400\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE COMM 9600,N,8,1\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE PITCH 200\r\n"
    "VARIABLE WRITE\r\n"
    "STRING 12X16(3,2,1,1) 18 5 FROM:\r\n"
    "STRING 12X16(3,2,1,1) 88 5 `FromName`\r\n"
    "STRING 12X16(3,2,1,1) 18 20 `FromSuburb`\r\n"
    "STRING 12X16(3,2,1,1) 250 20 `FromState`\r\n"
    "STRING 12X16(3,2,1,1) 380 5 CARRIER:\r\n"
    "STRING 12X16(3,2,1,1) 500 5 `CarrierName`\r\n"
    "STRING 12X16(3,2,1,1) 380 20 Con No :\r\n"
    "STRING 12X16(3,1,1,1) 500 20 `ConNoteNo`\r\n"
    "STRING 12X16(3,1,1,1) 380 40 B/L No :\r\n"
    "STRING 12X16(3,1,1,1) 500 40 `BillOfLadingNo`\r\n"
    "STRING 12X16(3,1,2,2) 18 80 TO:\r\n"
    "STRING 12X16(3,1,1,2) 98 80 `ToName`\r\n"
    "STRING 12X16(3,1,1,2) 18 110 `ToSuburb`\r\n"
    "STRING 12X16(3,1,1,2) 18 140 `ToPostcode`\r\n"
    "CJUSTIFY LEFT\r\n"
    "STRING 12X16(5,3,2,4) 240 55 `ToLocnNo`\r\n";
constexpr std::string_view kAxiohmFor =
    "STRING 12X16(5,3,2,4) 650 55 `ForLocnNo`\r\n"
    "STRING 12X16(3,1,2,2) 380 80 FOR:\r\n"
    "STRING 12X16(3,1,1,2) 500 80 `ForName`\r\n"
    "STRING 12X16(3,1,1,2) 380 110 `ForSuburb`\r\n"
    "STRING 12X16(3,1,1,2) 380 140 `ForPostcode`\r\n";
constexpr std::string_view kAxiohmFoot =
    "STRING 12X16(7,6,3,4) 660 260 \r\n"
    "FILL_BOX 635 240 140 100\r\n"
    "STRING 12X16(3,2,1,1) 18 200 SSCC\r\n"
    "STRING 12X16(3,2,1,1) 18 220 (00)`SSCCText`\r\n"
    "STRING 12X16(3,2,1,1) 500 220 `POText`\r\n"
    "STRING 12X16(5,3,2,3) 18 245 `ADFlag`\r\n"
    "STRING 12X16(5,3,2,3) 18 305 `ADDate`\r\n"
    "STRING 12X16(4,3,2,2) 170 245 STORE ZONE/DEPT\r\n"
    "STRING 12X16(3,3,1,2) 170 275 `DeptText`\r\n"
    "STRING 12X16(3,3,1,2) 170 310 `StoreZoneDept`\r\n"
    "C top barcode\r\n"
    "BARCODE_FONT 12X16\r\n"
    "B EAN128(w3) 18 560 200 421`CountryCode``ToPostcode`90`ForLocnNo`\r\n"
    "C bottom barcode\r\n"
    "BARCODE_FONT 12X16\r\n"
    "B EAN128(w4) 18 780 160 00`SSCCText`\r\n"
    "INDEX\r\n"
    "END\r\n";

constexpr std::string_view kSmallHead =
    "! 0 150 570 1\r\n"
    "VARIABLE INDEX_SETTING 1\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE PRINT_MODE DT\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE FEED_TYPE GAP\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE WIDTH 400\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE COMM 9600,N,8,1\r\n"
    "VARIABLE WRITE\r\n"
    "VARIABLE PITCH 200\r\n"
    "VARIABLE WRITE\r\n"
    "U B13 (2,0,0) 10 0 FROM:\r\n"
    "U B13 (2,0,0) 50 0 `FromName`\r\n"
    "U B13 (2,0,0) 10 15 `FromSuburb`\r\n"
    "U B13 (2,0,0) 125 15 `FromState`\r\n"
    "U B13 (2,0,0) 185 0 CARRIER:\r\n"
    "U B13 (2,0,0) 245 0 `CarrierName`\r\n"
    "U B13 (2,0,0) 185 15 Con No :\r\n"
    "U B13 (2,0,0) 245 15 `ConNoteNo`\r\n"
    "U B13 (2,0,0) 185 30 B/L No :\r\n"
    "U B13 (2,0,0) 245 30 `BillOfLadingNo`\r\n"
    "U B13 (2,0,0) 10 55 TO:\r\n"
    "U B14 (2,0,0) 40 55 `ToName`\r\n"
    "U B14 (2,0,0) 10 85 `ToSuburb`\r\n"
    "U B14 (2,0,0) 10 105 `ToPostcode`\r\n"
    "U B42 (5,0,0) 105 35 `ToLocnNo`\r\n";
constexpr std::string_view kSmallFor =
    "U B42 (5,0,0) 290 35 `ForLocnNo`\r\n"
    "U B13 (2,0,0)185 55 FOR:\r\n"
    "U B14 (2,0,0)215 55 `ForName`\r\n"
    "U B14 (2,0,0) 185 85 `ForSuburb` `ForPostcode`\r\n";
constexpr std::string_view kSmallFoot =
    "U B42 (5,0,0) 310 180 \r\n"
    "FILL_BOX 300 170 70 65\r\n"
    "U B13 (2,0,0) 10 130 SSCC\r\n"
    "U B13 (2,0,0) 10 145 (00)`SSCCText`\r\n"
    "U B13 (2,0,0) 240 145 `POText`\r\n"
    "U B42 (5,0,0) 10 170 `ADFlag`\r\n"
    "U B42 (5,0,0) 10 215 `ADDate`\r\n"
    "U B14 (2,0,0) 90 170 STORE ZONE/DEPT\r\n"
    "U B14 (2,0,0) 90 195 `DeptText`\r\n"
    "U B14 (2,0,0) 90 220 `StoreZoneDept`\r\n"
    "C bottom barcode\r\n"
    "B EAN128(w2) 10 520 110 00`SSCCText`\r\n"
    "CS 5X7 30 10 (00)`SSCCText`\r\n"
    "C top barcode\r\n"
    "B EAN128(w2) 10 390 140 421`CountryCode``ToPostcode`90`ForLocnNo`\r\n"
    "NO INDEX\r\n"
    "END\r\n";

struct SatoItem {
  std::string_view x, y, size, font, text;
};
constexpr SatoItem kSatoItems[] = {
    {"0196", "0511", "0101", "WL1", "`StoreZoneCapitals`"},
    {"0254", "0142", "0104", "M", "`ToLocnNo`"},
    {"0660", "0435", "0202", "WL1", ""},
    {"0468", "0088", "0101", "M", "`BillOfLadingNo`"},
    {"0468", "0056", "0101", "M", "`ConNoteNo`"},
    {"0468", "0022", "0101", "M", "`CarrierName`"},
    {"0331", "0087", "0101", "M", "B/L No :"},
    {"0331", "0056", "0101", "M", "Con No :"},
    {"0331", "0024", "0101", "M", "CARRIER :"},
    {"0044", "0071", "0101", "M", "`FromSuburb` `FromState`"},
    {"0115", "0024", "0101", "M", "`FromName`"},
    {"0036", "0024", "0101", "M", "FROM:"},
    {"0196", "0448", "0101", "WL1", "`DeptCapitals`"},
    {"0196", "0385", "0101", "WL1", "STORE ZONE/DEPT"},
    {"0046", "0492", "0101", "WL1", "`ADDate`"},
    {"0054", "0400", "0101", "WL1", "AD"},
    {"0036", "0248", "0102", "M", "`ToPostcode`"},
    {"0038", "0200", "0102", "M", "`ToSuburb`"},
    {"0094", "0142", "0102", "M", "`ToName`"},
    {"0038", "0142", "0102", "M", "TO:"},
    {"0670", "0248", "0101", "M", "`ForPostcode`"},
    {"0386", "0248", "0101", "M", "`ForSuburb`"},
    {"0386", "0200", "0101", "M", "`ForAddress`"},
    {"0407", "0142", "0102", "M", "`ForName`"},
    {"0333", "0142", "0102", "M", "FOR:"},
    {"0036", "0344", "0101", "M", "(00)`SSCCText`"},
    {"0036", "0320", "0101", "M", "SSCC"},
    {"0457", "0344", "0101", "M", "`POText`"},
    {"0396", "0328", "0102", "M", "PO:"},
    {"0644", "0127", "0102", "WL1", "`ForLocnNo`"},
    {"0086", "0882", "0101", "M", "(421)`CountryCode``ToPostcode`(90)`ForLocnNo`"},
    {"0086", "1166", "0101", "M", "(00)`SSCCText`"},
};
// clang-format on

constexpr std::string_view kSatoHead =
    "\x02\x1b"
    "A\x1b"
    "EX0\x1bZ\x03"
    "\x02\x1b"
    "A\x1b"
    "AR\x1bZ\x03"
    "\x02\x1b"
    "A\x1b"
    "CS2\x1bZ\x03"
    "\x02\x1b"
    "A\x1b#E3\x1bZ\x03"
    "\x02\x1b"
    "A\x1b"
    "A3H0021V0001\x1b%0\x1b";
constexpr std::string_view kSatoItemEnd = "\x1b%0\x1b";
constexpr std::string_view kSatoFoot =
    "H0044\x1bV0576\x1b"
    "BG03303>H421`CountryCode``ToPostcode`90`ForLocnNo`\x1b%0\x1b"
    "H0042\x1bV0923\x1b"
    "BG03234>H00`SSCCText`\x1b%0\x1b"
    "\x1b&\x1bZ\x03\x02\x1b"
    "A\x1b/\x1bQ1\x1bZ\x03";

std::string SatoSource() {
  std::string source(kSatoHead);
  for (const SatoItem& item : kSatoItems) {
    source.append("PR\x1bH").append(item.x).append("\x1bV").append(item.y).append("\x1bL").append(item.size);
    source.append("\x1b").append(item.font).append(item.text).append(kSatoItemEnd);
  }
  return source.append(kSatoFoot);
}

// The store's block stands only where the goods go on from the delivery point.
std::string InThreeParts(std::span<const TextTemplate, 3> parts, const LabelValues& values) {
  std::string text = parts[0].With(values);
  if (values.ForLocnNo != values.ToLocnNo) parts[1].AppendTo(text, values);
  parts[2].AppendTo(text, values);
  return text;
}

}  // namespace

std::string ZplLabel(const LabelValues& values) {
  static const TextTemplate kLabel(kZpl);
  return kLabel.With(values);
}

std::string AxiohmLabel(const LabelValues& values) {
  static const TextTemplate kParts[] = {TextTemplate(kAxiohmHead), TextTemplate(kAxiohmFor), TextTemplate(kAxiohmFoot)};
  return InThreeParts(kParts, values);
}

std::string SmallAxiohmLabel(const LabelValues& values) {
  static const TextTemplate kParts[] = {TextTemplate(kSmallHead), TextTemplate(kSmallFor), TextTemplate(kSmallFoot)};
  return InThreeParts(kParts, values);
}

std::string SatoLabel(const LabelValues& values) {
  static const std::string kSource = SatoSource();
  static const TextTemplate kLabel(kSource);
  return kLabel.With(values);
}

}  // namespace partnerkit::labels
