// Map files: the columns of a partner's CSV file by name, and the outbound lines made of them.
#pragma once

#include <cstdint>
#include <deque>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit {

// One named column.
struct MapField {
  std::string FieldName;         // upper case, compared exactly
  std::string FieldValue;        // of the current line
  std::int32_t FieldIndex = -1;  // the column from 0, -1 while the map file hasn't named it

  void Clear() { FieldValue.clear(); }
};

// Named fields, in the order added, found by name in constant time.
class FieldMap {
 public:
  // A field of a name that is already there is a run-time error.
  MapField& Add(std::string_view name);
  // An unknown name is a run-time error.
  MapField& Item(std::string_view name);
  MapField* Find(std::string_view name);
  void Clear();

  std::size_t Count() const { return fields_.size(); }
  auto begin() { return fields_.begin(); }
  auto end() { return fields_.end(); }

 private:
  std::deque<MapField> fields_;  // a deque, so that the names stay where the index sees them
  std::unordered_map<std::string_view, MapField*> byName_;
};

// The lines of a map file, blanks cut from both ends; entry i names column i.
using MapHeader = std::vector<std::string>;

MapHeader ReadMapHeader(InputFile& file);

// Sets `field.FieldIndex` to the first entry of the header that is its name. False when there is none.
bool FindColumn(const MapHeader& header, MapField& field);

// A column of an outbound line: the field's value, blanks cut, and a comma, behind the last column too. Nothing is
// quoted or escaped, so that a comma in a value splits its column. A column that the map doesn't know (null) is empty.
void AppendColumn(const MapField* field, std::string& line);

}  // namespace partnerkit
