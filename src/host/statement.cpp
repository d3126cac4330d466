#include "host/statement.h"

#include <cstdint>
#include <optional>

namespace partnerkit::host {
namespace {

std::vector<Cell> CellsFor(std::span<const MemberKind> kinds, const KeptPaths& paths) {
  std::vector<Cell> cells(kinds.size());
  for (std::size_t n = 0; n < kinds.size(); ++n) {
    cells[n].kind = kinds[n];
    cells[n].paths = &paths;
  }
  return cells;
}

// Hands the part of the cell that its kind uses to `bind`.
template <class F>
void WithValue(Cell& cell, F&& bind) {
  switch (cell.kind) {
    case MemberKind::kInt:
    case MemberKind::kLong:
    case MemberKind::kBool:
      return bind(cell.whole);
    case MemberKind::kDouble:
    case MemberKind::kNumber:
      return bind(cell.real);
    default:
      return bind(cell.text);
  }
}

template <class T>
const T& As(const void* value) {
  return *static_cast<const T*>(value);
}

template <class T>
T& As(void* value) {
  return *static_cast<T*>(value);
}

}  // namespace

void Cell::Set(std::string_view value) {
  text.assign(value);
  paths->Keep(text);
  state = soci::i_ok;
}

std::string Cell::Given() const {
  std::string given = text;
  paths->GiveBack(given);
  return given;
}

void Cell::Set(std::int64_t value) {
  whole = value;
  state = soci::i_ok;
}

void Cell::CopyFrom(const void* value) {
  bool present = true;
  switch (kind) {
    case MemberKind::kString:
      text = As<std::string>(value);
      paths->Keep(text);
      break;
    case MemberKind::kText:
      if ((present = As<Text>(value).has_value())) {
        text = *As<Text>(value);
        paths->Keep(text);
      }
      break;
    case MemberKind::kInt:
      whole = As<std::int32_t>(value);
      break;
    case MemberKind::kLong:
      whole = As<std::int64_t>(value);
      break;
    case MemberKind::kBool:
      whole = As<bool>(value) ? 1 : 0;
      break;
    case MemberKind::kDouble:
      real = As<double>(value);
      break;
    case MemberKind::kNumber:
      if ((present = As<std::optional<double>>(value).has_value())) real = *As<std::optional<double>>(value);
      break;
    case MemberKind::kDate:
      if ((present = As<std::optional<DateTime>>(value).has_value())) text = As<std::optional<DateTime>>(value)->Iso();
      break;
  }
  state = present ? soci::i_ok : soci::i_null;
}

void Cell::CopyTo(void* value) const {
  const bool null = IsNull();
  switch (kind) {
    case MemberKind::kString:
      As<std::string>(value).assign(null ? std::string_view() : std::string_view(text));
      paths->GiveBack(As<std::string>(value));
      break;
    case MemberKind::kText:
      As<Text>(value) = null ? Text() : Text(text);
      if (!null) paths->GiveBack(*As<Text>(value));
      break;
    case MemberKind::kInt:
      As<std::int32_t>(value) = null ? 0 : static_cast<std::int32_t>(whole);
      break;
    case MemberKind::kLong:
      As<std::int64_t>(value) = null ? 0 : whole;
      break;
    case MemberKind::kBool:
      As<bool>(value) = !null && whole != 0;
      break;
    case MemberKind::kDouble:
      As<double>(value) = null ? 0 : real;
      break;
    case MemberKind::kNumber:
      As<std::optional<double>>(value) = null ? std::nullopt : std::optional(real);
      break;
    case MemberKind::kDate:
      As<std::optional<DateTime>>(value) = null ? std::nullopt : DateTime::FromIso(text);
      break;
  }
}

Statement::Statement(SqlSession& session, const std::string& sql, std::span<const MemberKind> parameters,
                     std::span<const MemberKind> columns)
    : parameters_(CellsFor(parameters, session.Paths())),
      columns_(CellsFor(columns, session.Paths())),
      statement_(session.Soci()) {
  statement_.alloc();
  for (Cell& cell : columns_) {
    WithValue(cell, [&](auto& value) { statement_.exchange(soci::into(value, cell.state)); });
  }
  for (Cell& cell : parameters_) {
    WithValue(cell, [&](auto& value) { statement_.exchange(soci::use(value, cell.state)); });
  }
  statement_.prepare(sql);
  statement_.define_and_bind();
  session.CountPrepared();
}

void Statement::Reset() noexcept {
  sqlite_api::sqlite3_reset(static_cast<soci::sqlite3_statement_backend*>(statement_.get_backend())->stmt_);
}

}  // namespace partnerkit::host
