#include "render/label_packets.h"

#include <array>
#include <cmath>
#include <unordered_map>

#include "partnerkit/run_time_error.h"
#include "values/numbers.h"

namespace partnerkit::render {

namespace {

constexpr std::size_t kNone = std::string_view::npos;
// A hundred metres: beyond any roll of labels, and within what a page can be.
constexpr double kFarthest = 400'000;
constexpr std::size_t kMostColumns = 12;

// The columns of one record, from 1. A twelfth one goes on to the record's end, commas and all.
class Record {
 public:
  Record(std::string_view text, int number) : number_(number) {
    for (std::size_t column = 0; column < kMostColumns; ++column) {
      const std::size_t end = column + 1 < kMostColumns ? text.find(',') : kNone;
      columns_[column] = text.substr(0, end);
      if (end == kNone) return;
      text.remove_prefix(end + 1);
    }
  }

  std::string_view operator[](std::size_t column) const { return columns_[column - 1]; }

  double Number(std::size_t column) const {
    const std::string_view text = (*this)[column];
    const double number = DecimalOf(text) ? NumberAtStart(text) : kFarthest * 2;
    if (std::abs(number) <= kFarthest) return number;
    throw RunTimeError(run_time::kTypeMismatch, "Type mismatch: \"" + std::string(text.substr(0, 30)) +
                                                    "\" in column " + std::to_string(column) + " of record " +
                                                    std::to_string(number_) + " of the label's format");
  }

 private:
  int number_;
  std::array<std::string_view, kMostColumns> columns_{};
};

[[noreturn]] void RaiseUnended(std::string_view what, std::string_view from) {
  throw RunTimeError(run_time::kInvalidCall, "The label's " + std::string(what) + " ends within the record \"" +
                                                 std::string(from.substr(0, 30)) + "\"");
}

std::string Unquoted(std::string_view text) {
  if (text.starts_with('"')) text.remove_prefix(1);
  if (text.ends_with('"')) text.remove_suffix(1);
  return std::string(text);
}

int FontOf(std::string_view text) { return text.size() == 1 && text[0] >= '1' && text[0] <= '3' ? text[0] - '0' : 0; }

void ReadText(LabelField& field, const Record& record, std::size_t place) {
  field.row = record.Number(place);
  field.col = record.Number(place + 1);
  field.font = FontOf(record[place + 3]);
  field.heightMult = record.Number(place + 4);
  field.widthMult = record.Number(place + 5);
  field.colour = record[place + 6];
}

void ReadBarcode(LabelField& field, const Record& record) {
  field.row = record.Number(5);
  field.col = record.Number(6);
  field.density = record[8];
  static_cast<void>(record.Number(8));
  field.heightMult = record.Number(9);
}

void ReadLine(LabelField& field, const Record& record) {
  field.row = record.Number(3);
  field.col = record.Number(4);
  field.row2 = record.Number(5);
  field.col2 = record.Number(6);
  field.thickness = record.Number(7);
}

// True for a record that is drawn.
bool ReadRecord(LabelField& field, std::string_view text) {
  const Record record(text, field.recordNo);
  field.recordType = text.empty() ? ' ' : text.front();
  switch (field.recordType) {
    case 'T':
      field.fieldNo = record[2];
      ReadText(field, record, 5);
      return true;
    case 'C':
      ReadText(field, record, 2);
      field.text = Unquoted(record[12]);
      return true;
    case 'B':
      field.fieldNo = record[2];
      ReadBarcode(field, record);
      return true;
    case 'L':
      if (record[2] != "S" && record[2] != "s") return false;
      ReadLine(field, record);
      return true;
    default:
      return false;
  }
}

class Reader {
 public:
  LabelPackets Read(std::string_view format, std::string_view batch) {
    ReadFormat(format);
    ReadBatch(batch);
    return std::move(packets_);
  }

 private:
  void ReadFormat(std::string_view format) {
    const std::size_t open = format.find('{');
    const std::size_t bar = format.find('|');
    if (open == kNone || bar == kNone || bar < open) RaiseUnended("format", format);
    const Record header(format.substr(open + 1, bar - open - 1), 0);
    packets_.length = ToLong(header.Number(6));
    packets_.width = ToLong(header.Number(7));
    format.remove_prefix(bar + 1);
    for (int number = 1; format.find(',') != kNone; ++number) {
      const std::size_t end = format.find('|');
      if (end == kNone) RaiseUnended("format", format);
      LabelField field;
      field.recordNo = number;
      if (ReadRecord(field, format.substr(0, end))) Add(std::move(field));
      format.remove_prefix(end + 1);
    }
  }

  void Add(LabelField field) {
    if (!field.fieldNo.empty() && !byNumber_.emplace(field.fieldNo, packets_.fields.size()).second) {
      throw RunTimeError(run_time::kKeyInUse, "The label's format has two fields " + field.fieldNo);
    }
    packets_.fields.push_back(std::move(field));
  }

  // A value that holds a bar has its rest skipped: the next record begins with a number, a comma and a quote.
  static bool StartsRecord(std::string_view text) {
    const std::size_t digits = text.find_first_not_of("0123456789");
    return digits != 0 && digits != kNone && text.substr(digits).starts_with(",\"");
  }

  void ReadBatch(std::string_view batch) {
    for (std::size_t bar = batch.find('|'); bar != kNone; bar = batch.find('|')) {
      batch.remove_prefix(bar + 1);
      if (batch.starts_with('}')) return;
      if (StartsRecord(batch)) ReadValue(batch);
    }
    RaiseUnended("batch", batch);
  }

  void ReadValue(std::string_view record) {
    const std::size_t comma = record.find(',');
    const std::string number(record.substr(0, comma));
    const std::size_t end = record.find('|', comma);
    if (end == kNone) RaiseUnended("batch", record);
    const auto field = byNumber_.find(number);
    if (field == byNumber_.end()) {
      throw RunTimeError(run_time::kNotSet, "The label's format has no field " + number.substr(0, 30));
    }
    packets_.fields[field->second].text = Unquoted(record.substr(comma + 1, end - comma - 1));
  }

  LabelPackets packets_;
  std::unordered_map<std::string, std::size_t> byNumber_;
};

}  // namespace

int LabelField::Number() const {
  if (fieldNo.empty()) return recordNo;
  const double number = DecimalOf(fieldNo) ? NumberAtStart(fieldNo) : 0;
  return std::abs(number) < kFarthest ? static_cast<int>(number) : 0;
}

LabelPackets ReadPackets(std::string_view format, std::string_view batch) { return Reader().Read(format, batch); }

}  // namespace partnerkit::render
