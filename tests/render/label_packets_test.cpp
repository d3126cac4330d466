#include "render/label_packets.h"

#include <gmock/gmock.h>

#include "support/error_of.h"

namespace partnerkit::render {
namespace {

using partnerkit::testing::ErrorOf;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::string_view kHeader = R"({F,10,A,R,E,600,400,"CMLDC"|)";

// A field as its type, its numbers and its text.
std::string Told(const LabelField& f) {
  std::ostringstream told;
  told << f.recordType << f.recordNo << ' ' << (f.fieldNo.empty() ? "-" : f.fieldNo) << '=' << f.Number() << " @"
       << f.row << ',' << f.col << ' ';
  if (f.recordType == 'L') {
    told << f.row2 << ',' << f.col2 << " thick " << f.thickness;
  } else if (f.recordType == 'B') {
    told << f.heightMult << " high, density " << f.density << ": " << f.text;
  } else {
    told << "font " << f.font << ' ' << f.heightMult << 'x' << f.widthMult << ' ' << f.colour << ": " << f.text;
  }
  return told.str();
}

std::vector<std::string> Fields(const std::string& records, const std::string& batch) {
  std::vector<std::string> told;
  for (const LabelField& field : ReadPackets(std::string(kHeader) + records, batch).fields) told.push_back(Told(field));
  return told;
}

TEST(LabelPacketsTest, EachRecordHasItsColumns) {
  const LabelPackets label = ReadPackets("lead in{F,10,A,R,E,300.5,800,\"X\",more|}", "{B,10,N,1|}");
  EXPECT_EQ(label.length, 300);
  EXPECT_EQ(label.width, 800);
  EXPECT_THAT(label.fields, IsEmpty());
  EXPECT_THAT(Fields("T,9,50,V,514,125.5,0,3,4,2,w,L,0,0,0|C,578,5,0,1,1,2,O,L,0,0,\"FROM, US\"|"
                     "G,99,555,320,0,0|B,15,27,V,182,40,8,6,152,8,L,0|L,S,10,20,30,40,5,\"11111111\"|"
                     "L,s,-1,2,3,4,0,|L,D,1,2,3,4,5,|X|T,20,,,1,2,,7,3,4,W|}",
                     "{B,10,N,3|E,0,0,1,1,0,1|9,\"0464\"|15,\"~20100\"|}"),
              ElementsAre("T1 9=9 @514,125.5 font 3 4x2 w: 0464", "C2 -=2 @578,5 font 1 1x2 O: FROM, US",
                          "B4 15=15 @182,40 152 high, density 6: ~20100", "L5 -=5 @10,20 30,40 thick 5",
                          "L6 -=6 @-1,2 3,4 thick 0", "T9 20=20 @1,2 font 0 3x4 W: "));
}

TEST(LabelPacketsTest, ABatchFillsTheFieldsThatItNames) {
  const std::string records = "T,1,50,V,1,1,0,1,1,1,O|T,02,50,V,1,1,0,1,1,1,O|}";
  const struct {
    std::string batch, first, second;
  } table[] = {
      {R"({B,10,N,1|E,0,0|1,"a"|02,"b"|})", "a", "b"},
      {R"({B,10,N,1|02,"b"|})", "", "b"},
      {R"({B|E,1|1,"a"|1,"again"|})", "again", ""},
      {R"({B|1,""|02,"say "hi", so"|})", "", "say \"hi\", so"},
      {R"({B|1,"a|b"|02,"c"|})", "a", "c"},
      {R"({B|1,"a|2|3,4|5,b|"|02,"c"|})", "a", "c"},
      {R"({B|1,"a"|}02,"c"|02,"c"|})", "a", ""},
      {R"({B|1,"a}"|02,"|}"|})", "a}", ""},
      {R"({B|1x,"a"|,"a"|E,"a"|})", "", ""},
  };
  for (const auto& c : table) {
    SCOPED_TRACE(c.batch);
    const LabelPackets label = ReadPackets(std::string(kHeader) + records, c.batch);
    ASSERT_EQ(label.fields.size(), 2U);
    EXPECT_EQ(label.fields[0].text, c.first);
    EXPECT_EQ(label.fields[1].text, c.second);
  }
}

TEST(LabelPacketsTest, AMistakeIsFoundBeforeAnythingIsDrawn) {
  const std::string text = "T,1,50,V,1,1,0,1,1,1,O|", whole = std::string(kHeader) + text + "}";
  const std::string batch = "{B,10,N,1|1,\"a\"|}", from30(30, 'x');
  const std::string header(kHeader);
  const struct {
    std::string format, batch, error;
  } table[] = {
      {"", batch, "5 The label's format ends within the record \"\""},
      {"|{F,10", batch, "5 The label's format ends within the record \"|{F,10\""},
      {header + "T,1," + from30 + "y", batch,
       "5 The label's format ends within the record \"T,1," + from30.substr(4) + "\""},
      {"{F,10,A,R,E,x,400|}", batch, "13 Type mismatch: \"x\" in column 6 of record 0 of the label's format"},
      {header + text + "C,5,1e9,0,1,1,1|}", batch,
       "13 Type mismatch: \"1e9\" in column 3 of record 2 of the label's format"},
      {header + "B,1,27,V,-400001,1|}", batch,
       "13 Type mismatch: \"-400001\" in column 5 of record 1 of the label's format"},
      {header + "B,1,27,V,1,1,8,1e999,1|}", batch,
       "13 Type mismatch: \"1e999\" in column 8 of record 1 of the label's format"},
      {header + text + text + "}", batch, "457 The label's format has two fields 1"},
      {whole, "{B,10,N,1", "5 The label's batch ends within the record \"{B,10,N,1\""},
      {whole, "{B|1,\"a", "5 The label's batch ends within the record \"1,\"a\""},
      {whole, "{B|1,\"a\"|", "5 The label's batch ends within the record \"\""},
      {whole, "{B|01,\"a\"|}", "91 The label's format has no field 01"},
      {whole, "{B|" + std::string(50, '7') + ",\"a\"|}", "91 The label's format has no field " + std::string(30, '7')},
  };
  for (const auto& c : table) {
    EXPECT_EQ(ErrorOf([&] { ReadPackets(c.format, c.batch); }), c.error) << c.format << "\n" << c.batch;
  }
}

}  // namespace
}  // namespace partnerkit::render
