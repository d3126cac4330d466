// Keeping the product master up to date from orders and from the supplier's own product file. The style, colour and
// size are a product's identity; its number may change, and then the old record goes and a new one takes its place.
#pragma once

#include <string_view>

#include "frame/translator_base.h"

namespace partnerkit::orders {

// What an order line says of a product. The number as it was read, blanks included; the others with blanks cut.
struct ProductOfLine {
  std::string_view numberAsRead;
  std::string_view style;
  std::string_view colour;
  std::string_view size;
  std::string_view description;
  std::string_view uom;
  std::string_view bin;
  std::string_view weight;
  std::string_view volume;
};

// Fits the product master to an order line. Reports nothing: the check that follows tells of a product still missing.
void AddProduct(TranslatorBase& translator, const ProductOfLine& line);

// Reads the supplier's product file into the product and price masters and deletes it. A record that the store refuses
// is passed over. False when the file is missing or empty, which is logged, or held by another program; a record that
// isn't one stops the import through the error trail, with the file kept.
bool ImportProduct(TranslatorBase& translator);

}  // namespace partnerkit::orders
