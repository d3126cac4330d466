#include "labels/label_trade.h"

namespace partnerkit::testing {
namespace {

struct ScanningTest : ::testing::Test {
  ScanningTest() {
    trade.vendor.PartnerCode = "AC";
    trade.order.PONo = "4500012345";
    EXPECT_TRUE(Update(records, trade.vendor));
    trade.New<Product>([](auto& r) {
      r.ProductNo = "9312347000300", r.ItemCode = "APRON-10", r.Description = "Kitchen apron, caf\u00e9 stripes";
      r.ProductSize = "M", r.UOM = "EA";
    });
    for (const auto& inner : {std::pair("19312347000307", 6.0), {"29312347000304", 12.5}}) {
      trade.New<ProductInner>(
          [&](auto& r) { r.ProductNo = "9312347000300", r.InnerEAN = inner.first, r.InnerQty = inner.second; });
    }
    line = trade.New<PSlipLine>([&](auto& r) {
      r.PSlipId = trade.slip.Id, r.APN = "9312347000300", r.OrderQty = 10, r.PackedQty = 9, r.PackedCount = 12.5;
    });
    terminal = trade.Created();
    EXPECT_TRUE(terminal->Init(trade.labelHost));
  }

  std::string Record(std::string_view model) {
    trade.Set({{"PDTType", model}});
    return terminal->PDTLookupLine(trade.job, line);
  }

  LabelTrade trade;
  RecordStore& records = trade.system->Records();
  PSlipLine line;
  std::unique_ptr<LabelClass> terminal;
};

TEST_F(ScanningTest, ADensoRecordHasFixedWidths) {
  EXPECT_EQ(Record("Denso"),
            "AC     KIM   1         4500012345            1                   0464         Geelong             "
            "9312347000300APRON-10            Kitchen apron, caf\xE9 M         1          1029312347000304  12.5  ");
  // The product's first inner pack, where none has as many units as there are packs; scanned by itself it counts whole.
  line.PackedCount = 7, line.APN = "19312347000307", line.OrderQty = 1234567.5;
  trade.New<ProductInner>([&](auto& r) { r.ProductNo = line.APN, r.InnerEAN = "19312347000307", r.InnerQty = 6; });
  trade.slip.StoreCode = "DC", trade.order.PONo = "A number of more than 22 characters";
  EXPECT_TRUE(Update(records, trade.slip) && Update(records, trade.order));
  trade.hub.PartnerLocnNo = "DC", trade.hub.DeliverToCode = "25", trade.hub.Name = "Where it all comes together";
  trade.Stored(trade.hub);
  // That number is cut to the field's 13 digits, and so is not the inner pack's.
  EXPECT_EQ(Record("Denso"),
            "AC     KIM   1         A number of more than 1                   0025         Where it all comes t"
            "1931234700030                                                  123455     1019312347000307  6     ");
  line.APN = "931", line.OrderQty = 9, line.PSlipId = trade.slip.Id;
  trade.New<ProductInner>([](auto& r) { r.ProductNo = "931", r.InnerEAN = "931 ", r.InnerQty = 6; });
  EXPECT_THAT(Record("Denso"), ::testing::EndsWith("0     6     0931             6     "));
  line.APN = "77", line.PSlipId = 0;
  EXPECT_EQ(Record("Denso").size(), 196U);
  EXPECT_EQ(Record("Denso"), "       KIM   1                               1                   " +
                                 std::string(33, ' ') + "77           " + std::string(50, ' ') + "0          10" +
                                 std::string(22, ' '));
}

TEST_F(ScanningTest, AFenwickRecordHasCommas) {
  EXPECT_EQ(Record("Fenwick6030"), "AC,1,KIM,4500012345,1,0464,9312347000300,1,1,19312347000307,6");
  trade.slip.StoreCode = "DC";
  EXPECT_TRUE(Update(records, trade.slip));
  line.APN = " 77 ", line.PackedQty = 9.5;
  EXPECT_EQ(Record("Fenwick6030"), "AC,1,KIM,4500012345,1,DC,77,0.5,,,");
  EXPECT_EQ(Record("fenwick6030"), "");
  EXPECT_EQ(Record(""), "");
  trade.Sql("DROP TABLE \"tbProduct\"");
  EXPECT_EQ(Record("Denso"), "");
  ASSERT_EQ(trade.reports.size(), 1U);
  EXPECT_THAT(trade.reports[0], HasSubstr("cCMLSCM, Function PDTLookupLine,"));
}

struct Scan {
  const char* name;
  std::string number;
  double quantity;
  std::int32_t lineId, code, foundId;
};

// Lines of the slip: 1 has 9 of 10, 2 the same number with 0 of 2, 3 another with 5 of 5.
const Scan kScans[] = {
    {"fits", "9312347000300", 1, 0, 0, 1},
    {"the later line of a number takes what the first does not", "9312347000300", 2, 0, 0, 2},
    {"too many for either", "9312347000300", 3, 0, 8103, 0},
    {"taken back", "9312347000300", -9, 0, 0, 1},
    {"more taken back than was packed", "9312347000300", -10, 0, 8103, 0},
    {"nothing", "555", 0, 0, 0, 3},
    {"half a unit too many", "9312347000300", 1.5, 1, 8103, 0},
    {"the line asked for", "9312347000300", 1, 2, 0, 2},
    {"another line than the one asked for", "555", -1, 1, 8102, 0},
    {"unknown", "666", 1, 0, 8102, 0},
    {"blanks count", " 555", -1, 0, 8102, 0},
    {"an outer carton, whatever line is asked for", "1555", -5, 1, 0, 3},
    {"an outer carton of a full line", "1555", 1, 0, 8103, 0},
    {"an outer carton of what isn't on the slip", "1666", 1, 0, 8102, 0},
    {"a product that is no outer carton", "1777", 1, 0, 8102, 0},
};

TEST_F(ScanningTest, AScanIsHeldAgainstTheSlip) {
  const auto add = [&](const char* number, double ordered, double packed) {
    trade.New<PSlipLine>(
        [&](auto& r) { r.PSlipId = trade.slip.Id, r.APN = number, r.OrderQty = ordered, r.PackedQty = packed; });
  };
  add("9312347000300", 2, 0), add("555", 5, 5);
  for (const auto& outer : {std::pair("1555", "555"), {"1666", "666"}, {"1777", ""}}) {
    trade.New<Product>([&](auto& r) { r.ProductNo = outer.first, r.CartonAPN = outer.second; });
  }
  trade.pack.BuyStoreCode = "464";
  EXPECT_TRUE(Update(records, trade.pack));
  for (const Scan& scan : kScans) {
    SCOPED_TRACE(scan.name);
    std::int32_t error = -1;
    const auto line = std::get<std::shared_ptr<PSlipLine>>(
        terminal->PackLineValid(&trade.slip, &trade.pack, scan.number, scan.quantity, &error, scan.lineId));
    EXPECT_EQ(line ? line->LineId : 0, scan.foundId);
    EXPECT_EQ(error, scan.code);
    EXPECT_EQ(trade.labelHost.ErrorCode, scan.code);
    trade.labelHost.ErrorCode = -1;
    EXPECT_EQ(std::get<std::int32_t>(terminal->PackLineValid(trade.slip.Id, trade.pack.Id, scan.number, scan.quantity,
                                                             nullptr, scan.lineId)),
              scan.foundId);
    EXPECT_EQ(trade.labelHost.ErrorCode, scan.code);
  }
  // Without a pack no store is compared; a quantity left out is 1.
  const Pack* const none = nullptr;
  EXPECT_EQ(std::get<std::int32_t>(terminal->PackLineValid(trade.slip.Id, none, "9312347000300")), 1);
  trade.pack.BuyStoreCode = "0464";
  EXPECT_EQ(std::get<std::int32_t>(terminal->PackLineValid(trade.slip.Id, &trade.pack, "9312347000300")), 0);
  EXPECT_EQ(trade.labelHost.ErrorCode, 8106);
  EXPECT_TRUE(trade.reports.empty());
}

TEST_F(ScanningTest, ASlipOrPackThatIsNotThereIsACode) {
  const PSlip* const noSlip = nullptr;
  const Pack* const noPack = nullptr;
  const std::pair<LabelClass::PSlipArgument, LabelClass::PackArgument> table[] = {
      {77, noPack}, {trade.slip.Id, 77}, {noSlip, noPack}};
  const auto check = [&](const LabelClass::PSlipArgument& slip, const LabelClass::PackArgument& pack) {
    std::int32_t error = 0;
    const auto found = terminal->PackLineValid(slip, pack, "9312347000300", 1, &error);
    EXPECT_EQ(error, 8101);
    EXPECT_TRUE(found.index() == 0 ? std::get<0>(found) == nullptr : std::get<1>(found) == 0);
    EXPECT_EQ(found.index(), slip.index());
  };
  for (const auto& [slip, pack] : table) check(slip, pack);
  trade.Sql("DROP TABLE \"tbPSlip\"");
  check(trade.slip.Id, noPack);
  EXPECT_TRUE(trade.reports.empty());
  trade.Sql("DROP TABLE \"tbPSlipLine\"");
  check(&trade.slip, noPack);
  EXPECT_EQ(trade.reports.size(), 1U);
}

}  // namespace
}  // namespace partnerkit::testing
