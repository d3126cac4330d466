#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"
#include "support/other_program.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr const char* kMgb = "clsMGB850csv";

using Texts = std::vector<std::string>;

class ProductsTest : public ::testing::Test {
 protected:
  static Product Train(const std::string& number) {
    return With<Product>([&](Product& product) {
      product.ProductNo = number;
      product.PartnerId = "MYER";
      product.InHouseProdNo = "TRAIN";
      product.Colour = "RED";
      product.Size = "XL";
      product.Description = "Old train";
      product.UOM = "DZ";
      product.Symbology = "UP";
      product.Weight = 9;
      product.Volume = 8;
      product.CartonAPN = "C7";
    });
  }
  void StorePrice(const std::string& number) {
    trade_.Stored(With<ProductPrice>([&](ProductPrice& price) {
      price.VendorId = "ACME";
      price.ProductNo = number;
      price.Cost = 12.5;
      price.ImportValue1 = "old";
    }));
  }
  template <class R>
  Texts All() {
    Texts all;
    R record;
    trade_.system->Records().ForEach(R::kType, &record, [&] { all.push_back(Shown(record)); });
    return all;
  }
  // Lists an order file while the product file is there; what that tells.
  Texts Import(std::string_view products) {
    trade_.UseProductFile(products);
    return Listed();
  }
  Texts Listed() {
    const auto importer = trade_.Loaded(trade_.Line());
    importer->Cancel();
    return trade_.NewLog();
  }
  bool FileIsThere() { return trade_.folder.Has("products.csv"); }

  CsvTrade trade_{kMgb};
};

const std::string kBall = "BALL,BLUE,S,\"Ball, soft\",e,f,93010,B1,i,j,v11,l,m,n,o,v16,v17,r,s,t,u,v\n";
const std::string kTrain = "TRAIN,RED,XL,Train,,,93001,B2,,,w11,,,,,w16,w17,,,,,\n";

TEST_F(ProductsTest, FitsTheProductToTheOrderLine) {
  const std::string made =
      R"( PartnerId="MGB" InHouseProdNo="TRAIN" Colour="RED" Size="XL" Description="Wooden train" )";
  const std::string completed = "0 Process: PO 450001 import completed.";
  const std::string incomplete = "0 Process: PO 450001 import incomplete.";
  const std::string old = R"( PartnerId="MYER" InHouseProdNo="TRAIN" Colour="RED" Size="XL" Description="Old train" )"
                          R"(UOM="DZ" Symbology="UP" Weight=9 Volume=8 CartonAPN="C7")";
  const std::string usual =
      made + R"(UOM="CT" Symbology="EN" ProductClass="MEDIUM" Bin="B12" Weight=0.75 Volume=0.003)";
  const struct {
    std::string what, className;
    Texts known;  // numbers the product is stored under
    std::string line;
    Texts products, log;
    std::string trigger = {};
  } cases[] = {
      // clang-format off
      {"new", kMgb, {}, "", {R"(ProductNo="93001")" + usual}, {completed}},
      {"known", kMgb, {"93001"}, "", {R"(ProductNo="93001")" + usual + R"( CartonAPN="C7")"}, {completed}},
      {"renumbered", kMgb, {"93000"}, "", {R"(ProductNo="93001")" + usual}, {completed}},
      {"under no number", kMgb, {" "}, "", {R"(ProductNo=" ")" + old, R"(ProductNo="93001")" + usual}, {completed}},
      {"no weight, no unit", kMgb, {}, "WEIGHT=0; UNITMEASURECODE=; VOLUME=; BIN=",
       {R"(ProductNo="93001")" + made + R"(UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="" Weight=0.01)"},
       {"R Process: ...Cannot process PO 450001, product 93001 UOM  does not agree with database UOM EA", incomplete}},
      {"another symbology", kMgb, {}, "PRODUCTQUALIFIER=UP; WEIGHT=; COLOUR=; SIZE=",
       {R"(ProductNo="93001" PartnerId="MGB" InHouseProdNo="TRAIN" Colour="" Size="" Description="Wooden train" )"
        R"(UOM="CT" Symbology="EN" ProductClass="MEDIUM" Bin="B12" Weight=0.01 Volume=0.003)"},
       {"R Process: ...Cannot process PO 450001, barcode 93001 symbology UP does not agree with database symbology EN",
        incomplete}},
      {"no style at all", kMgb, {}, "STYLE=; COLOUR=; SIZE=", {},
       {"R Process: ...Cannot process PO 450001, product 93001 does not exist.", incomplete}},
      {"the old number cannot go", kMgb, {"93000"}, "", {R"(ProductNo="93000")" + old},
       {"R Process: ...Cannot process PO 450001, product 93001 does not exist.", incomplete},
       "CREATE TRIGGER refuse BEFORE DELETE ON tbProduct BEGIN SELECT RAISE(ABORT, 'in use'); END"},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    for (const bool validate : {false, true}) {
      CsvTrade trade(c.className);
      trade.document.ValidateProduct = validate;
      for (const std::string& number : c.known) trade.Stored(Train(number));
      if (!c.trigger.empty()) trade.Sql(c.trigger);
      const auto run = trade.Import(trade.Line(c.line));
      Texts products;
      Product product;
      trade.system->Records().ForEach(Product::kType, &product, [&] { products.push_back(Shown(product)); });
      if (validate) {
        EXPECT_EQ(products, c.products);
        EXPECT_EQ(run.log, c.log);
      } else {
        EXPECT_EQ(products.size(), c.known.size());
        EXPECT_THAT(run.log, ElementsAre(completed));
      }
      EXPECT_THAT(trade.reports, IsEmpty());
    }
  }
}

TEST_F(ProductsTest, ImportsTheProductFileAndDeletesIt) {
  trade_.Stored(Train("93000"));
  StorePrice("93000");
  StorePrice("93010");
  EXPECT_THAT(Import(kBall + "\n" + kTrain), IsEmpty());
  EXPECT_FALSE(FileIsThere());
  EXPECT_THAT(
      All<Product>(),
      ElementsAre(
          R"(ProductNo="93001" PartnerId="MGB" InHouseProdNo="TRAIN" Colour="RED" Size="XL" Description="Train" )"
          R"(UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="B2" Weight=0.01)",
          R"(ProductNo="93010" PartnerId="MGB" InHouseProdNo="BALL" Colour="BLUE" Size="S" )"
          R"(Description="Ball, soft" UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="B1" Weight=0.01)"));
  EXPECT_THAT(
      All<ProductPrice>(),
      ElementsAre(R"(VendorId="ACME" ProductNo="93001" ImportValue1="w11" ImportValue2="w16" ImportValue3="w17")",
                  R"(VendorId="ACME" ProductNo="93010" Cost=12.5 ImportValue1="v11" ImportValue2="v16" )"
                  R"(ImportValue3="v17")"));
}

TEST_F(ProductsTest, ResetsTheWeightOfAProductItKnows) {
  trade_.Stored(Train("93001"));
  EXPECT_THAT(Import(kTrain), IsEmpty());
  EXPECT_THAT(All<Product>(), ElementsAre(::testing::EndsWith(R"(Bin="B2" Weight=0.01 CartonAPN="C7")")));
}

TEST_F(ProductsTest, PassesOverARecordThatTheStoreRefuses) {
  trade_.Stored(Train("93000"));
  trade_.Sql("CREATE TRIGGER refuse BEFORE DELETE ON tbProduct BEGIN SELECT RAISE(ABORT, 'in use'); END");
  EXPECT_THAT(Import(kTrain + kBall), IsEmpty());
  EXPECT_FALSE(FileIsThere());
  EXPECT_THAT(All<Product>(),
              ElementsAre(::testing::StartsWith("ProductNo=\"93000\""), ::testing::StartsWith("ProductNo=\"93010\"")));
  EXPECT_THAT(All<ProductPrice>(), ElementsAre(::testing::StartsWith("VendorId=\"ACME\" ProductNo=\"93010\"")));
}

// The run ends at the bad line, whatever the trail answers; what came before it is stored.
TEST_F(ProductsTest, KeepsAFileWithABadLine) {
  for (const Button answer : {Button::kAbort, Button::kIgnore}) {
    trade_.answer = answer;
    trade_.reports.clear();
    EXPECT_THAT(Import(kBall + "bad,line\n" + kTrain), IsEmpty());
    EXPECT_THAT(
        trade_.reports,
        ElementsAre("TLE error - program error #13 (File " + (trade_.folder / "products.csv") +
                    ", line 2 has 2 columns instead of 22) occured in module cMGB850csv, Function ImportProduct, "
                    "line 0."));
    EXPECT_TRUE(FileIsThere());
    EXPECT_THAT(All<Product>(), ElementsAre(::testing::StartsWith("ProductNo=\"93010\"")));
  }
}

TEST_F(ProductsTest, ComesUpAgainWhenABadLineIsRetried) {
  int asked = 0;
  trade_.ports.errorOutlets.dialog = [&](const ErrorReport&, const std::string&) {
    return ++asked < 3 ? Button::kRetry : Button::kAbort;
  };
  Import("bad,line\n" + kTrain);
  EXPECT_EQ(asked, 3);
  EXPECT_TRUE(FileIsThere());
  EXPECT_THAT(All<Product>(), IsEmpty());
}

TEST_F(ProductsTest, ListsOrdersWithoutAProductFile) {
  EXPECT_THAT(Import(""), ElementsAre("0 ImportProduct: File " + (trade_.folder / "products.csv") + " is empty."));
  EXPECT_TRUE(FileIsThere());
  std::filesystem::remove(trade_.folder / "products.csv");
  EXPECT_THAT(Listed(), ElementsAre("53 ImportProduct: File " + (trade_.folder / "products.csv") + " does not exist."));
  trade_.UseProductFile(kBall);
  {
    const OtherProgram other(trade_.folder / "products.csv");
    EXPECT_THAT(Listed(), IsEmpty());
    EXPECT_THAT(All<Product>(), IsEmpty());
  }
  EXPECT_TRUE(FileIsThere());
  EXPECT_THAT(trade_.reports, IsEmpty());
}

}  // namespace
}  // namespace partnerkit::testing
