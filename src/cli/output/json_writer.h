// JSON written as it comes, so that a listing of any length takes no memory.
#pragma once

#include <cstdint>
#include <optional>
#include <ostream>
#include <string_view>
#include <vector>

#include "partnerkit/values.h"

namespace partnerkit::cli {

class JsonWriter {
 public:
  explicit JsonWriter(std::ostream& out) : out_(out) {}
  // Closes what is still open: a listing that was cut short by an error is a document all the same.
  ~JsonWriter();
  JsonWriter(const JsonWriter&) = delete;
  JsonWriter& operator=(const JsonWriter&) = delete;

  void BeginObject() { Begin('{'); }
  void EndObject() { End(); }
  void BeginArray() { Begin('['); }
  void EndArray() { End(); }
  // Names the next value of the object.
  void Name(std::string_view name);

  void Null() { Literal("null"); }
  void Bool(bool value) { Literal(value ? "true" : "false"); }
  void Int(std::int64_t value);
  // Null for a value that JSON has no form for (infinity).
  void Number(double value);
  void String(std::string_view bytes);
  void Date(const DateTime& value) { String(value.Iso()); }
  void Value(const Cell& cell);
  // A JSON text as it stands.
  void Literal(std::string_view json);

 private:
  struct Level {
    char close;
    bool empty;
  };

  void Begin(char open);
  void End();
  void Separate();
  void BreakLine();
  void Quote(std::string_view bytes);

  std::ostream& out_;
  std::vector<Level> levels_;
  bool named_ = false;
};

}  // namespace partnerkit::cli
