// The texts that label printers get, byte for byte, and the values in them.
#include "labels/cml_carton_layout.h"
#include "labels/label_fields.h"
#include "labels/other_languages.h"
#include "labels/text_template.h"
#include "platform/clocks.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {
namespace {

using labels::LabelValues;

// A value of its own in every place.
LabelValues DistinctValues() {
  LabelValues values;
  values.FromName = "Acme", values.FromSuburb = "Preston", values.FromState = "VIC";
  values.CarrierName = "Linehaul", values.ConNoteNo = "CN77", values.BillOfLadingNo = "BL88";
  values.ToName = "Laverton", values.ToAddress = "1 Depot Rd", values.ToSuburb = "Truganina";
  values.ToPostcode = "3028", values.ToLocnNo = "0900";
  values.ForName = "Marion", values.ForLocnName = "Marion store", values.ForAddress = "5 Sturt Rd";
  values.ForSuburb = "Oaklands", values.ForPostcode = "5046", values.ForLocnNo = "0204";
  values.FinalLocnNo = "0205", values.CountryCode = "036";
  values.SSCCText = "093123450000000011", values.POText = "PO 4500012345", values.ADFlag = "AD";
  values.ADDate = "1203", values.DeptText = "dept45", values.DeptCapitals = "DEPT45", values.PalletText = "PALLET";
  values.User1 = "PACK ID 9", values.User2 = "JOB ID 3";
  values.StoreZoneDept = "zone7", values.StoreZoneCapitals = "ZONE7";
  values.ComponentItem = "2", values.ComponentCount = "5", values.ComponentStyle = "TEE-100";
  values.FormatNo = "10", values.Qty = "3", values.BatchControl = "1";
  return values;
}

TEST(LabelTextsTest, AFormatHasTheFieldsOfItsLabel) {
  const std::string carton = FormatPacket(labels::kCmlCarton, "10", false);
  EXPECT_TRUE(carton.starts_with(
      R"({F,10,A,R,E,600,400,"CMLDC"|T,1,50,V,578,57,0,1,1,1,O,L,0,0,0|C,578,5,0,1,1,1,O,L,0,0,"FROM:"|T,2,)"));
  EXPECT_TRUE(carton.ends_with(R"(T,28,6,V,378,270,0,1,2,2,B,L,0,0,0|T,29,20,V,484,188,0,1,1,1,O,L,0,0,0|})"));
  EXPECT_EQ(carton.size(), 1130U);
  EXPECT_NE(carton.find("|B,24,21,V,25,40,8,4,135,8,L,0|T,25,"), std::string::npos);
}

// Nothing is escaped, and an empty value still sends its record.
TEST(LabelTextsTest, ABatchShowsValuesAsTheyAre) {
  LabelValues odd = DistinctValues();
  odd.ADFlag = "", odd.User1 = "a\"b|c`ToName`";
  const std::string source = BatchTemplate(labels::kCmlCarton, true);
  const std::string batch = labels::TextTemplate(source).With(odd);
  EXPECT_TRUE(batch.starts_with(R"({B,10,N,3|E,1,0,1,1,0,1|1,"Acme"|)"));
  EXPECT_NE(batch.find(R"(|14,"0204"|15,"~2014210363028~201900205"|16,"(421)0363028(90)0205"|)"), std::string::npos);
  EXPECT_TRUE(batch.ends_with(R"(|18,"PO 4500012345"|19,""|20,"1203"|21,"DEPT45"|22,"2 OF 5"|23,"TEE-100"|)"
                              R"(26,"a"b|c`ToName`"|27,"JOB ID 3"|28,"PALLET"|29,"Marion store"|})"));
}

TEST(LabelTextsTest, ASeparatorHasAPlaceForEachLine) {
  constexpr std::string_view kHead = R"({F,9,A,R,E,600,400,"SCMSEP"|C,580,300,0,3,2,2,W,L,0,3,"SEPARATOR"|)"
                                     R"(C,580,250,0,3,1,1,B,L,0,3,"NEW STORE/ITEM/LOCATION:"|)";
  const struct {
    std::string message, records;
  } cases[] = {
      {"one\r\ntwo", R"(C,580,150,0,3,2,2,B,L,0,3,"ONE"|C,580,10,0,3,2,2,B,L,0,3,"TWO"|)"},
      {"caf\xE9", "C,580,150,0,3,2,2,B,L,0,3,\"CAF\xC9\"|C,580,10,0,3,2,2,B,L,0,3,\"CAF\xC9\"|"},
      {"a\r\nb\r\nc", R"(C,580,150,0,3,2,2,B,L,0,3,"A"|C,580,110,0,1,2,2,B,L,0,3,"B"|C,580,10,0,3,2,2,B,L,0,3,"C"|)"},
      {"a\r\nb\r\nc\r\nd\r\ne\r\nf",
       R"(C,580,150,0,3,2,2,B,L,0,3,"A"|C,580,110,0,1,2,2,B,L,0,3,"B"|C,580,10,0,3,2,2,B,L,0,3,"C"|)"
       "C,580,55,0,1,2,2,B,L,0,3,\"D\"|C,580,83,0,1,2,2,B,L,0,3,\"E\r\nF\"|"},
      {"abcdefghijklmnopqrstuvwxyz",
       R"(C,580,150,0,3,2,2,B,L,0,3,"ABCDEFGHIJKLMNOPQRST"|C,580,10,0,3,2,2,B,L,0,3,"ABCDEFGHIJKLMNOPQRST"|)"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(labels::SeparatorPackets(c.message, "4"), std::string(kHead) + c.records + "}{B,9,N,1|E,4,0,1,1,0,1|}");
  }
}

TEST(LabelTextsTest, OtherMakersLanguages) {
  const LabelValues values = DistinctValues();
  const std::string zpl = labels::ZplLabel(values);
  EXPECT_TRUE(
      zpl.starts_with("^XA^MCY^XZ^XA^SZ2^MMT^MTT~JSN^LT0^MD0^MNY^PRA^PON^PMN^CI0^LRN"
                      "^FO224,102^A0N,75,68^FD0900^FS^FO611,400^A0N,114,117^FR^FD^FS"
                      "^FO412,78^A0N,17,17^FDBL88^FS^FO412,49^A0N,17,17^FDCN77^FS"));
  EXPECT_TRUE(
      zpl.ends_with("^BY4,,305^FO45,575^BCN,,N,N,N,N^FV>;>84210363028>8900204^FS"
                    "^BY4,,234^FO42,924^BCN,,N,N,N,N^FV>;>800093123450000000011^FS^PQ1,0,0,N^MCN^XZ"));
  const std::string axiohm = labels::AxiohmLabel(values);
  EXPECT_TRUE(
      axiohm.starts_with("! 0 150 820 1\r\nCVARIABLE INDEX_SETTING 1\r\nVARIABLE WRITE\r\nVARIABLE PRINT_MODE"));
  EXPECT_NE(axiohm.find("STRING 12X16(3,1,2,2) 380 80 FOR:\r\nSTRING 12X16(3,1,1,2) 500 80 Marion\r\n"),
            std::string::npos);
  EXPECT_TRUE(axiohm.ends_with("B EAN128(w4) 18 780 160 00093123450000000011\r\nINDEX\r\nEND\r\n"));
  EXPECT_TRUE(
      labels::SmallAxiohmLabel(values).ends_with("B EAN128(w2) 10 390 140 4210363028900204\r\nNO INDEX\r\nEND\r\n"));
  LabelValues direct = values;
  direct.ForLocnNo = "0900";
  EXPECT_EQ(labels::AxiohmLabel(direct).find("FOR:"), std::string::npos);
  EXPECT_EQ(labels::SmallAxiohmLabel(direct).find("FOR:"), std::string::npos);
  const std::string sato = labels::SatoLabel(values);
  EXPECT_TRUE(
      sato.starts_with("\x02\x1b"
                       "A\x1b"
                       "EX0\x1bZ\x03\x02\x1b"
                       "A\x1b"
                       "AR\x1bZ\x03"));
  EXPECT_NE(sato.find("A3H0021V0001\x1b%0\x1bPR\x1bH0196\x1bV0511\x1bL0101\x1bWL1ZONE7\x1b%0\x1bPR\x1bH0254\x1bV0142"),
            std::string::npos);
  EXPECT_TRUE(
      sato.ends_with("H0042\x1bV0923\x1b"
                     "BG03234>H00093123450000000011\x1b%0\x1b\x1b&\x1bZ\x03\x02\x1b"
                     "A\x1b/\x1bQ1\x1bZ\x03"));
}

}  // namespace
}  // namespace partnerkit::testing
