#include <gmock/gmock.h>
#include <sys/resource.h>

#include "cli/supplier.h"

namespace partnerkit::testing {
namespace {

using ::testing::HasSubstr;

using Data = Supplier;

TEST_F(Data, RefusesAFaultyLoadWhole) {
  const std::pair<std::string, std::string> table[] = {
      {"{\"Partner\":\n  [{\"PartnerId\" \"X\"}]}", "more.json: line 2, column 19: "},
      {"{\"Partner\": [{\"PartnerId\": \"\xff\"}]}", "more.json: line 1, column 29: "},
      {R"({"Partner": [{"PartnerId": "X"}]} {})", "more.json: line 1, column 35: "},
      {R"({"ProductPrice": [{"Cost": 1e999}]})", "more.json: line 1, column 33: number overflow"},
      {R"({"Partner": [{"PartnerId": "X",
                         "PartnerId": "Y"}]})",
       "more.json: line 2, column 36: \"PartnerId\" is given twice"},
      {R"([])", "more.json: wants one JSON object"},
      {R"({"Partners": []})", "more.json: Partners: no such kind of record"},
      {R"({"Partner": {}})", "more.json: Partner: wants an array of records"},
      {R"({"Partner": [7]})", "more.json: Partner[0]: wants an object"},
      {R"({"Partner": [{"PartnerId": "X"}, {"PartnerId": "Y", "Colour": 1}]})", "Partner[1].Colour: no such member"},
      {R"({"Partner": [{"Name": "X"}]})", "Partner[0].PartnerId: is part of the key and must be given"},
      {R"({"Partner": [{"PartnerId": 5}]})", "Partner[0].PartnerId: wants a text, not 5"},
      {R"({"Partner": [{"PartnerId": "X", "LastASNNo": "5"}]})", "Partner[0].LastASNNo: wants a number, not \"5\""},
      {R"({"Partner": [{"PartnerId": "X", "LastASNNo": 5.5}]})", "Partner[0].LastASNNo: wants a whole number, not 5.5"},
      {R"({"Partner": [{"PartnerId": "X", "LastASNNo": 2147483648}]})", "2147483648 is out of range (-2147483648 to"},
      {R"({"Partner": [{"PartnerId": "X", "LastASNNo": 1e300}]})", "is out of range"},
      {R"({"EDIDoc": [{"EDIDocId": 32768}]})", "EDIDoc[0].EDIDocId: 32768 is out of range (1 to 32767)"},
      {R"({"EDIDoc": [{"EDIDocId": 3, "TestMode": 1}]})", "EDIDoc[0].TestMode: wants true or false, not 1"},
      {R"({"Order": [{"PODate": "2004-02-30"}]})", "Order[0].PODate: wants a date such as"},
      {R"({"OrderLine": [{"OrderId": 77}]})", "OrderLine[0].OrderId: no Order with this OrderId"},
      {R"({"Order": [{"PONo": "1"}, {"PONo": "1"}]})", "Order[1]: the Order with OrderId 1 has the same"},
      {R"({"LabelJobItem": []})", "LabelJobItem: stands inside LabelJob records, as Items"},
      {R"({"LabelJob": [{"PackNo": "P", "Items": [{"PackQty": 1}, {"Id": 4}]}]})",
       "LabelJob[0].Items[1].Id: no such member"},
      {R"({"System": [{}]})", "System: wants one object"},
      {R"({"System": {"Password": "x"}})", "System.Password: no such setting"},
      {R"({"System": {"BatchControl": "1"}})", "System.BatchControl: wants a number"},
  };
  folder.Write("good.json", R"({"Partner": [{"PartnerId": "GOOD"}], "System": {"ComPort": "LPT1"}})");
  for (const auto& [json, says] : table) {
    folder.Write("more.json", json);
    ExpectRefused({"data", "load", "good.json", "more.json"}, says);
  }
}

TEST_F(Data, SurvivesDeepNesting) {
  const Ran ran = Load("{\"Partner\": [{\"PartnerId\": " + std::string(200000, '[') + std::string(200000, ']') + "}]}");
  EXPECT_EQ(ran.status, 2);
  EXPECT_THAT(ran.err, HasSubstr("wants a text, not an array"));
}

TEST_F(Data, KeepsEveryValueOverDumpAndLoad) {
  Put(R"({
    "System": {"UserId": "kim", "BatchControl": 3, "ComDirect": true},
    "Partner": [{"PartnerId": "P1", "Name": "", "City": null, "State": "Zürich \"q\" \\ \u0000 \t", "LastASNNo": 7}],
    "LabelJob": [{"PackNo": "PK1", "Items": [{"StyleText": "B", "PackQty": 2}, {"StyleText": "A", "PackQty": 1.5}]}],
    "OrderLine": [{"LineId": 21, "OrderId": 20, "ProductNo": "X", "Quantity": 1e308, "GSTRate": 0.1}],
    "Order": [{"OrderId": 20, "PONo": "N1", "PODate": "2004-07-31T10:15:00", "FilePos": 5000000000}]})");
  const std::string dumped = Run({"data", "dump"}).out;
  const auto all = nlohmann::json::parse(dumped);
  EXPECT_EQ(all["Partner"][1]["Name"], "");
  EXPECT_EQ(all["Partner"][1]["City"], nullptr);
  EXPECT_EQ(all["Partner"][1]["State"], std::string("Z\u00fcrich \"q\" \\ \0 \t", 17));
  EXPECT_EQ(all["Order"][0]["FilePos"], 5000000000);
  EXPECT_EQ(all["Order"][0]["PODate"], "2004-07-31T10:15:00");
  EXPECT_EQ(all["OrderLine"][0]["Quantity"], 1e308);
  EXPECT_EQ(all["OrderLine"][0]["PackSize"], nullptr);
  EXPECT_EQ(all["LabelJob"][0]["Items"][0]["StyleText"], "B");
  EXPECT_EQ(all["System"],
            nlohmann::json::parse(
                R"({"UserId": "kim", "CompanyName": "Acme Apparel", "BatchControl": 3, "ComDirect": true})"));

  folder.Write("dumped.json", dumped);
  EXPECT_EQ(Run({"new", "second"}).status, 0);
  EXPECT_EQ(Run({"--workspace", "second", "data", "load", "dumped.json"}).status, 0);
  EXPECT_EQ(Run({"--workspace", "second", "data", "dump"}).out, dumped);
  EXPECT_EQ(Run({"data", "load", "dumped.json"}).status, 0);
  EXPECT_EQ(Run({"data", "dump"}).out, dumped);
}

TEST_F(Data, ReplacesByKeyAsAWhole) {
  Put(R"({"Partner": [{"PartnerId": "MGB", "City": "Geelong"}],
          "LabelJob": [{"PackNo": "PK1", "Items": [{"PackQty": 1}, {"PackQty": 2}]}]})");
  Put(R"({"LabelJob": [{"PackNo": "PK1", "Items": [{"PackQty": 9}]}], "System": {"ComPort": "LPT1"}})");
  const auto all = Json({"data", "dump", "System", "LabelJob", "Partner", "Job"});
  EXPECT_EQ(all["Partner"].size(), 1U);
  EXPECT_EQ(all["Partner"][0]["City"], "Geelong");
  EXPECT_EQ(all["Partner"][0]["Name"], nullptr);
  EXPECT_EQ(all["LabelJob"][0]["Items"].size(), 1U);
  EXPECT_EQ(all["LabelJob"][0]["Items"][0]["PackQty"], 9);
  EXPECT_EQ(all["Job"], nlohmann::json::array());
  EXPECT_EQ(all["System"], nlohmann::json::parse(R"({"CompanyName": "Acme Apparel", "ComPort": "LPT1"})"));
}

TEST_F(Data, NeverTakesAPartnersNumbersBack) {
  Put(R"({"Partner": [{"PartnerId": "P1", "LastASNNo": 7, "LastInterchangeNo": 8, "LastGroupNo": 9}]})");
  Put(R"({"Partner": [{"PartnerId": "P1", "City": "Geelong", "LastInterchangeNo": 5, "LastGroupNo": 12}]})");
  const auto stored = Json({"data", "dump", "Partner"})["Partner"][1];
  EXPECT_EQ(stored["City"], "Geelong");
  EXPECT_EQ(stored["LastASNNo"], 7);
  EXPECT_EQ(stored["LastInterchangeNo"], 8);
  EXPECT_EQ(stored["LastGroupNo"], 12);
}

TEST_F(Data, FindsTheOwnerInTheStoreOrInAnyFileOfTheLoad) {
  folder.Write("lines.json", R"({"OrderLine": [{"OrderId": 30, "ProductNo": "A"}]})");
  folder.Write("order.json", R"({"Order": [{"OrderId": 30, "PONo": "N30"}]})");
  EXPECT_EQ(Json({"data", "load", "lines.json", "order.json"})["loaded"],
            nlohmann::json::parse(R"({"Order": 1, "OrderLine": 1})"));
  EXPECT_EQ(Run({"data", "load", "lines.json"}).out, "Stored 1 record: 1 OrderLine.\n");
  EXPECT_EQ(Json({"data", "dump", "OrderLine"})["OrderLine"].size(), 2U);
}

TEST_F(Data, TakesARecordOfManyNoLongerThanOneOfFew) {
  // Processor seconds of a load of so many packs with a line each.
  const auto load = [&](int count) {
    std::string packs = R"({"PackLine": [{"PackId": 1})", lines = R"(], "Pack": [{"Id": 1})";
    for (int n = 2; n <= count; ++n) {
      packs += ", {\"PackId\": " + std::to_string(n) + "}";
      lines += ", {\"Id\": " + std::to_string(n) + "}";
    }
    const auto busy = [] {
      rusage usage{};
      getrusage(RUSAGE_CHILDREN, &usage);
      const auto seconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
      };
      return seconds(usage.ru_utime) + seconds(usage.ru_stime);
    };
    const double before = busy();
    Put(packs + lines + "]}");
    return busy() - before;
  };
  const double few = load(5'000);
  EXPECT_LT(load(80'000), 16 * few * 2);
}

TEST_F(Data, PutsTheWorkspaceIntoTexts) {
  Put(R"({"Vendor": [{"VendorId": "V", "Name": "${workspace}:${workspace}/x $workspace"}]})");
  const std::string path = (folder / "x").substr(0, (folder / "x").size() - 2);
  EXPECT_EQ(Json({"data", "dump", "Vendor"})["Vendor"][1]["Name"], path + ":" + path + "/x $workspace");
}

}  // namespace
}  // namespace partnerkit::testing
