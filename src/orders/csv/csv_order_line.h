// The line in hand of a CSV order file, by field name.
#pragma once

#include <algorithm>
#include <array>
#include <span>
#include <string>
#include <string_view>

#include "files/field_map.h"
#include "orders/csv/order_fields.h"
#include "values/delimited.h"

namespace partnerkit::orders {

// The fields of a line by its commas; quotes that protect some aside.
inline std::size_t CountFields(std::string_view line) {
  return static_cast<std::size_t>(std::ranges::count(line, ',')) + 1;
}

class CsvOrderLine {
 public:
  // Takes the columns of the fields from the map, whose header has `columns` entries.
  void SetColumns(FieldMap& map, std::size_t columns, bool quotesProtectCommas) {
    split_ = DelimitedLine(columns, quotesProtectCommas);
    columns_.fill(kNoColumn);
    for (std::size_t field = 0; field < kOrderFields; ++field) {
      const MapField* const found = map.Find(kOrderFieldNames[field]);
      if (found != nullptr && found->FieldIndex >= 0) columns_[field] = static_cast<std::size_t>(found->FieldIndex);
    }
  }

  // The columns up to the last of these fields: all that a pass needs that looks at these only.
  std::size_t ColumnsFor(std::span<const OrderField> fields) const {
    std::size_t columns = 0;
    for (const OrderField field : fields) {
      const std::size_t column = columns_[static_cast<std::size_t>(field)];
      if (column != kNoColumn && column + 1 > columns) columns = column + 1;
    }
    return columns;
  }

  // Takes a line apart; the text must outlive the views.
  void Read(std::string_view line) { split_.Split(line); }
  void Read(std::string_view line, std::size_t columns) { split_.Split(line, columns); }

  // The field as read, and with blanks cut from both ends.
  std::string_view Raw(OrderField field) const { return split_[columns_[static_cast<std::size_t>(field)]]; }
  std::string_view operator[](OrderField field) const { return TrimBlanks(Raw(field)); }

  // The fields joined without separator, put into `into`.
  void Join(std::span<const OrderField> fields, std::string& into) const {
    into.clear();
    for (const OrderField field : fields) into += (*this)[field];
  }

 private:
  static constexpr std::size_t kNoColumn = static_cast<std::size_t>(-1);

  DelimitedLine split_;
  std::array<std::size_t, kOrderFields> columns_{};
};

}  // namespace partnerkit::orders
