#include <gmock/gmock.h>

#include "cli/supplier.h"

namespace partnerkit::testing {
namespace {

using nlohmann::json;
using ::testing::EndsWith;
using ::testing::HasSubstr;

// The sample supplier, and Kmart's X12 orders in its inbox: three orders, a change and a cancellation.
class RunX12 : public Supplier {
 protected:
  void SetUp() override {
    Supplier::SetUp();
    folder.Write("kmart.json", Sample("records.json", "kmart850x12"));
    folder.Write("inbox/kmart.x12", Sample("orders.x12", "kmart850x12"));
    EXPECT_EQ(Run({"data", "load", "kmart.json"}).status, 0);
  }

  json Orders() { return Json({"data", "dump", "Order"})["Order"]; }
};

TEST_F(RunX12, ProcessesAnInterchangeAndAcknowledgesItsGroups) {
  const json done = Json({"--now", "2006-03-08T10:15:00", "process", "14", "inbox/kmart.x12"}, 1);
  EXPECT_EQ(done["rows"], json::parse(R"([["K441301", "2006-03-06", "000000770/771/0001", ""],
                                          ["K441302 REL# 2", "2006-03-06", "000000770/771/0002", ""],
                                          ["K441303", "2006-03-07", "000000770/771/0003", ""],
                                          ["K441301", "2006-03-07", "000000770/772/0001", ""],
                                          ["K441302 REL# 2", "2006-03-07", "000000770/772/0002", ""]])"));
  EXPECT_EQ(done["results"], json::parse(R"([{"row": 0, "result": 1, "errorLog": [1]},
                                             {"row": 1, "result": 2, "errorLog": [2]},
                                             {"row": 2, "result": 0, "errorLog": [3, 4]},
                                             {"row": 3, "result": 3, "errorLog": [5, 6]},
                                             {"row": 4, "result": 2, "errorLog": [7]}])"));
  EXPECT_EQ(done["log"].size(), 7U);
  EXPECT_EQ(done["log"][6], json::parse(R"({"LogId": 7, "Source": "PartnerKit.clsKMart850ansix12",
      "Procedure": "Process", "ErrorNumber": -2147221503, "NativeError": 0,
      "Message": "... Warning Purchase Order Cancel Request K441302 REL# 2."})"));
  EXPECT_EQ(Orders().size(), 1U);
  EXPECT_THAT(folder.Read("outbox/FA_PO_771_0603081015.TXT"), HasSubstr("AK1*PO*771\r\nAK9*A*3*3*3\r\n"));
  EXPECT_THAT(folder.Read("outbox/FA_PO_772_0603081015.TXT"), HasSubstr("AK1*PO*772\r\nAK9*A*2*2*2\r\n"));
  EXPECT_EQ(folder.Read("archive/kmart.x12"), Sample("orders.x12", "kmart850x12"));
  const std::string kept = folder.Read("inbox/kmart.x12");
  EXPECT_THAT(kept, HasSubstr("*771*X*003020*FA DONE*~\r\n"));
  EXPECT_THAT(kept, HasSubstr("BEG*00*SA*K441303**060307~\r\n"));
  EXPECT_EQ(kept.find("K441301"), std::string::npos);
}

// Packing of the first order has begun, so only its dates change, which its flag allows.
TEST_F(RunX12, TellsAChangeAndACancellationAsSuch) {
  EXPECT_EQ(Run({"process", "14", "inbox/kmart.x12", "--row", "0", "--row", "1"}).status, 0);
  Load(R"({"Order": [{"OrderId": 1, "VendorId": "ACME", "PartnerId": "KMART", "PONo": "K441301", "ChangeFlag": "1"}],
           "Job": [{"OrderId": 1}]})");
  const Ran ran = Run({"process", "14", "inbox/kmart.x12", "--row", "1", "--row", "2"});
  EXPECT_EQ(ran.status, 0) << ran.err;
  EXPECT_THAT(ran.out, HasSubstr("  1  K441301         2006-03-07  000000770/772/0001  changed, id 1\n"));
  EXPECT_THAT(ran.out, HasSubstr("  2  K441302 REL# 2  2006-03-07  000000770/772/0002  cancelled\n"));
  EXPECT_THAT(ran.out, EndsWith("\n3 rows, 1 changed, 1 cancelled.\n"));
  const json orders = Orders();
  ASSERT_EQ(orders.size(), 1U);
  EXPECT_EQ(orders[0]["NotBefore"], "2006-03-22");
  EXPECT_EQ(orders[0]["CancelAfter"], "2006-04-05");
}

// Of two transactions, one that has no beginning before another set's comes, and one that ends before it begins.
TEST_F(RunX12, PostsNoOrderThatHasNoBeginningOfItsOwn) {
  const std::string sample = Sample("orders.x12", "kmart850x12");
  const std::string broken = sample.substr(0, sample.find("ST*")) +
                             "ST*850*0001~REF*IA*901177~ST*855*0002~BEG*00*SA*K5**060306~CTT*0~SE*5*0002~"
                             "ST*850*0003~CTT*0~BEG*00*SA*K6**060306~SE*4*0003~GE*2*771~IEA*1*000000770~";
  folder.Write("inbox/kmart.x12", broken);
  const json done = Json({"process", "14", "inbox/kmart.x12"}, 1);
  EXPECT_EQ(done["rows"], json::parse(R"([["K6", "2006-03-06", "000000770/771/0003", ""]])"));
  EXPECT_EQ(done["log"].size(), 2U);
  EXPECT_THAT(done["log"][0]["Message"], ::testing::HasSubstr(": the transaction ends here without its beginning."));
  EXPECT_EQ(done["log"][1]["Message"], "PO K6 import incomplete.");
  EXPECT_EQ(Orders().size(), 0U);
}

}  // namespace
}  // namespace partnerkit::testing
