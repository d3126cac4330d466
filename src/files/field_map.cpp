#include "files/field_map.h"

#include <algorithm>

#include "files/line_reader.h"
#include "values/delimited.h"
#include "values/outbound_value.h"

namespace partnerkit {

MapField& FieldMap::Add(std::string_view name) {
  if (Find(name) != nullptr) {
    throw RunTimeError(run_time::kKeyInUse, "The field " + std::string(name) + " is already in the map");
  }
  MapField& field = fields_.emplace_back();
  field.FieldName = name;
  byName_.emplace(field.FieldName, &field);
  return field;
}

MapField& FieldMap::Item(std::string_view name) {
  MapField* const field = Find(name);
  if (field == nullptr) throw RunTimeError(run_time::kInvalidCall, "No field " + std::string(name) + " in the map");
  return *field;
}

MapField* FieldMap::Find(std::string_view name) {
  const auto found = byName_.find(name);
  return found == byName_.end() ? nullptr : found->second;
}

void FieldMap::Clear() {
  byName_.clear();
  fields_.clear();
}

MapHeader ReadMapHeader(InputFile& file) {
  MapHeader header;
  LineReader lines(file);
  for (Line line; lines.Read(line);) header.emplace_back(TrimBlanks(line.text));
  return header;
}

bool FindColumn(const MapHeader& header, MapField& field) {
  const auto found = std::find(header.begin(), header.end(), field.FieldName);
  if (found == header.end()) return false;
  field.FieldIndex = static_cast<std::int32_t>(found - header.begin());
  return true;
}

void AppendColumn(const MapField* field, std::string& line) {
  if (field != nullptr) AppendTrimmedValue(field->FieldValue, line);
  line += ',';
}

}  // namespace partnerkit
