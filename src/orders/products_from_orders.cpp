#include "orders/products_from_orders.h"

#include <array>

#include "files/free_format.h"
#include "values/delimited.h"
#include "values/numbers.h"

namespace partnerkit::orders {

namespace {

constexpr std::size_t kColumns = 22;
constexpr double kLeastWeight = 0.01;  // a product never weighs nothing

// A number that is empty or a single blank is none.
bool IsProductNo(const std::string& productNo) { return !productNo.empty() && productNo != " "; }

void SetDefaults(const TranslatorBase& translator, Product& product) {
  product.PartnerId = translator.TradingPartner().PartnerId;
  product.ProductClass = "MEDIUM";
  product.Symbology = "EN";
}

void SetStyle(Product& product, std::string_view style, std::string_view colour, std::string_view size) {
  product.InHouseProdNo = std::string(style);
  product.Colour = colour;
  product.Size = size;
}

void FillFromLine(TranslatorBase& translator, const ProductOfLine& line, Product& product) {
  SetStyle(product, line.style, line.colour, line.size);
  SetDefaults(translator, product);
  product.Description = std::string(line.description);
  product.UOM = line.uom.empty() ? "EA" : std::string(line.uom);
  product.Bin = std::string(line.bin);
  const double weight = translator.Try([&] { return NumberAtStart(line.weight); });
  product.Weight = weight == 0 ? kLeastWeight : weight;
  product.Volume = translator.Try([&] { return NumberAtStart(line.volume); });
}

// The columns of the product file, counted from 1.
class ImportRecord {
 public:
  explicit ImportRecord(const std::vector<std::string>& items) : items_(items) {}
  const std::string& operator[](std::size_t column) const { return items_[column - 1]; }

 private:
  const std::vector<std::string>& items_;
};

void FillFromImport(const TranslatorBase& translator, const ImportRecord& record, Product& product) {
  SetStyle(product, record[1], record[2], record[3]);
  SetDefaults(translator, product);
  product.Description = record[4];
  product.UOM = "EA";
  product.Bin = record[8];
  product.Weight = kLeastWeight;
  product.Volume = 0;
}

// Gives the product of one record its number and members. False when the store refuses.
bool ImportOneProduct(TranslatorBase& translator, const ImportRecord& record) {
  RecordStore& store = translator.Records();
  Product product;
  SetStyle(product, record[1], record[2], record[3]);
  Find(store, Product::kByStyle, product);
  bool known = IsProductNo(product.ProductNo);
  if (known && product.ProductNo != record[7]) {
    ProductPrice price;
    price.ProductNo = product.ProductNo;
    price.VendorId = translator.OwnCompany().VendorId;
    Delete(store, price);
    if (!Delete(store, product)) return false;
    known = false;
  }
  if (!known) {
    product = {};
    product.ProductNo = record[7];
  }
  FillFromImport(translator, record, product);
  return known ? Update(store, product) : Add(store, product);
}

void ImportOnePrice(TranslatorBase& translator, const ImportRecord& record) {
  RecordStore& store = translator.Records();
  ProductPrice price;
  price.VendorId = translator.OwnCompany().VendorId;
  price.ProductNo = record[7];
  const bool known = Load(store, price);
  price.ImportValue1 = record[11];
  price.ImportValue2 = record[16];
  price.ImportValue3 = record[17];
  known ? Update(store, price) : Add(store, price);
}

// False when the file could not be read to its end.
bool ImportRecords(TranslatorBase& translator, InputFile& file, const std::string& path) {
  FreeFormatReader records(file, path, kColumns);
  std::vector<std::string> items;
  for (;;) {
    bool more = false;
    if (!translator.Try([&] { more = records.Read(items); })) return false;
    if (!more) return true;
    translator.Try([&] {
      const ImportRecord record(items);
      if (ImportOneProduct(translator, record)) ImportOnePrice(translator, record);
    });
  }
}

}  // namespace

void AddProduct(TranslatorBase& translator, const ProductOfLine& line) {
  translator.Procedure("Sub AddProduct", false, [&](bool&) {
    RecordStore& store = translator.Records();
    Product product;
    SetStyle(product, line.style, line.colour, line.size);
    translator.Try([&] { return Find(store, Product::kByStyle, product); });
    bool known = IsProductNo(product.ProductNo);
    if (known && product.ProductNo != line.numberAsRead) {
      if (!translator.Try([&] { return Delete(store, product); })) return;
      known = false;
    }
    if (!known) {
      product = {};
      product.ProductNo = TrimBlanks(line.numberAsRead);
    }
    FillFromLine(translator, line, product);
    translator.Try([&] { return known ? Update(store, product) : Add(store, product); });
  });
}

bool ImportProduct(TranslatorBase& translator) {
  return translator.Procedure("Function ImportProduct", false, [&](bool& imported) {
    Files& files = translator.FileSystem();
    const std::string path(Str(translator.OwnCompany().ProductImportFile));
    std::uint64_t length = 0;
    std::unique_ptr<InputFile> file;
    {
      const HandlerOff off(translator.Errors());
      if (!translator.Try([&] { length = files.Length(path); })) {
        translator.WriteLog(translator.ErrorNumber(), "ImportProduct", "File " + path + " does not exist.");
        return;
      }
      if (length == 0) {
        translator.WriteLog(translator.ErrorNumber(), "ImportProduct", "File " + path + " is empty.");
        return;
      }
      if (!translator.Try([&] { file = files.OpenInput(path, Share::kExclusive); })) return;
    }
    if (!ImportRecords(translator, *file, path)) return;
    // The file goes only once the store holds what it said.
    if (!translator.Try([&] { translator.Host().Commit(0); })) return;
    file.reset();
    try {
      files.Delete(path);
    } catch (const RunTimeError& error) {
      translator.Tell(Told::kFailed, "The product file is read, and will be read again: " + error.Description());
    }
    imported = true;
  });
}

}  // namespace partnerkit::orders
