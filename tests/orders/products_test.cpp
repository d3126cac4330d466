#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/csv_orders.h"
#include "support/other_program.h"

namespace partnerkit::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::IsEmpty;
using ::testing::StartsWith;

class ProductsTest : public ::testing::Test {
 protected:
  static void StoreTrain(CsvTrade& trade, const std::string& number) {
    trade.Sql(
        "INSERT INTO tbProduct (ProductNo, PartnerId, InHouseProdNo, Colour, Size, Description, UOM, Symbology, "
        "Weight, Volume, CartonAPN) VALUES ('" +
        number + "', 'MYER', 'TRAIN', 'RED', 'XL', 'Old train', 'DZ', 'UP', 9, 8, 'C7')");
  }
  // Lists an order file while the product file is there; what that tells.
  Texts Import(std::string_view products) {
    trade_.UseProductFile(products);
    return Listed();
  }
  Texts Listed() {
    EXPECT_EQ(trade_.Listed(trade_.Line()).size(), 1U);
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
  const std::string old = R"( PartnerId="MYER" InHouseProdNo="TRAIN" Colour="RED" Size="XL" Description="Old train" )"
                          R"(UOM="DZ" Symbology="UP" Weight=9 Volume=8 CartonAPN="C7")";
  const std::string usual =
      made + R"(UOM="CT" Symbology="EN" ProductClass="MEDIUM" Bin="B12" Weight=0.75 Volume=0.003)";
  const struct {
    std::string what;
    Texts known;  // numbers the product is stored under
    std::string line;
    Texts products, log;
    bool refuses = false;  // to delete a product
  } cases[] = {
      // clang-format off
      {"new", {}, "", {R"(ProductNo="93001")" + usual}, {kCompleted}},
      {"known", {"93001"}, "", {R"(ProductNo="93001")" + usual + R"( CartonAPN="C7")"}, {kCompleted}},
      {"renumbered", {"93000"}, "", {R"(ProductNo="93001")" + usual}, {kCompleted}},
      {"under no number", {" "}, "", {R"(ProductNo=" ")" + old, R"(ProductNo="93001")" + usual}, {kCompleted}},
      {"no weight, no unit", {}, "WEIGHT=0; UNITMEASURECODE=; VOLUME=; BIN=",
       {R"(ProductNo="93001")" + made + R"(UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="" Weight=0.01)"},
       {Refused("product 93001 UOM  does not agree with database UOM EA"), kIncomplete}},
      {"another symbology", {}, "PRODUCTQUALIFIER=UP; WEIGHT=; COLOUR=; SIZE=",
       {R"(ProductNo="93001" PartnerId="MGB" InHouseProdNo="TRAIN" Colour="" Size="" Description="Wooden train" )"
        R"(UOM="CT" Symbology="EN" ProductClass="MEDIUM" Bin="B12" Weight=0.01 Volume=0.003)"},
       {Refused("barcode 93001 symbology UP does not agree with database symbology EN"),
        kIncomplete}},
      {"no style at all", {}, "STYLE=; COLOUR=; SIZE=", {},
       {Refused("product 93001 does not exist."), kIncomplete}},
      {"the old number cannot go", {"93000"}, "", {R"(ProductNo="93000")" + old},
       {Refused("product 93001 does not exist."), kIncomplete},
       true},
      // clang-format on
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    for (const bool validate : {false, true}) {
      CsvTrade trade(kMgb);
      trade.document.ValidateProduct = validate;
      for (const std::string& number : c.known) StoreTrain(trade, number);
      if (c.refuses) trade.Refuse("DELETE", "tbProduct");
      const auto run = trade.Import(trade.Line(c.line));
      if (validate) {
        EXPECT_EQ(trade.Every<Product>(), c.products);
        EXPECT_EQ(run.log, c.log);
      } else {
        EXPECT_EQ(trade.Every<Product>().size(), c.known.size());
        EXPECT_THAT(run.log, ElementsAre(kCompleted));
      }
      EXPECT_THAT(trade.reports, IsEmpty());
    }
  }
}

TEST_F(ProductsTest, ImportsTheProductFileAndDeletesIt) {
  StoreTrain(trade_, "93000");
  trade_.Sql(
      "INSERT INTO tbProductPrice (VendorId, ProductNo, Cost, ImportValue1) "
      "VALUES ('ACME', '93000', 12.5, 'old'), ('ACME', '93010', 12.5, 'old')");
  EXPECT_THAT(Import(kBall + "\n" + kTrain), IsEmpty());
  EXPECT_FALSE(FileIsThere());
  EXPECT_THAT(
      trade_.Every<Product>(),
      ElementsAre(
          R"(ProductNo="93001" PartnerId="MGB" InHouseProdNo="TRAIN" Colour="RED" Size="XL" Description="Train" )"
          R"(UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="B2" Weight=0.01)",
          R"(ProductNo="93010" PartnerId="MGB" InHouseProdNo="BALL" Colour="BLUE" Size="S" )"
          R"(Description="Ball, soft" UOM="EA" Symbology="EN" ProductClass="MEDIUM" Bin="B1" Weight=0.01)"));
  EXPECT_THAT(
      trade_.Every<ProductPrice>(),
      ElementsAre(R"(VendorId="ACME" ProductNo="93001" ImportValue1="w11" ImportValue2="w16" ImportValue3="w17")",
                  R"(VendorId="ACME" ProductNo="93010" Cost=12.5 ImportValue1="v11" ImportValue2="v16" )"
                  R"(ImportValue3="v17")"));
}

TEST_F(ProductsTest, ResetsTheWeightOfAProductItKnows) {
  StoreTrain(trade_, "93001");
  EXPECT_THAT(Import(kTrain), IsEmpty());
  EXPECT_THAT(trade_.Every<Product>(), ElementsAre(EndsWith(R"(Bin="B2" Weight=0.01 CartonAPN="C7")")));
}

TEST_F(ProductsTest, PassesOverARecordThatTheStoreRefuses) {
  StoreTrain(trade_, "93000");
  trade_.Refuse("DELETE", "tbProduct");
  EXPECT_THAT(Import(kTrain + kBall), IsEmpty());
  EXPECT_FALSE(FileIsThere());
  EXPECT_THAT(trade_.Every<Product>(),
              ElementsAre(StartsWith("ProductNo=\"93000\""), StartsWith("ProductNo=\"93010\"")));
  EXPECT_THAT(trade_.Every<ProductPrice>(), ElementsAre(StartsWith("VendorId=\"ACME\" ProductNo=\"93010\"")));
}

// The run ends at the bad line, whatever the trail answers; what came before it is stored.
TEST_F(ProductsTest, KeepsAFileWithABadLine) {
  const std::string products = kBall + "bad,line\n" + kTrain;
  for (const Button answer : {Button::kAbort, Button::kIgnore}) {
    trade_.answer = answer;
    trade_.reports.clear();
    EXPECT_THAT(Import(products), IsEmpty());
    EXPECT_THAT(
        trade_.reports,
        ElementsAre("TLE error - program error #13 (File " + (trade_.folder / "products.csv") +
                    ", line 2 has 2 columns instead of 22) occured in module cMGB850csv, Function ImportProduct, "
                    "line 0."));
    EXPECT_TRUE(FileIsThere());
    EXPECT_THAT(trade_.Every<Product>(), ElementsAre(StartsWith("ProductNo=\"93010\"")));
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
  EXPECT_THAT(trade_.Every<Product>(), IsEmpty());
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
    EXPECT_THAT(trade_.Every<Product>(), IsEmpty());
  }
  EXPECT_TRUE(FileIsThere());
  EXPECT_THAT(trade_.reports, IsEmpty());
}

}  // namespace
}  // namespace partnerkit::testing
