// A prepared statement together with the cells that its parameters and columns are bound to.
#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <vector>

#include "host/sql_session.h"
#include "partnerkit/record_type.h"

namespace partnerkit::host {

// One value on its way in or out. Its address is bound once and its text keeps its room, so that a row costs no
// allocation.
struct Cell {
  MemberKind kind = MemberKind::kString;
  soci::indicator state = soci::i_ok;
  long long whole = 0;  // kInt, kLong, kBool
  double real = 0;      // kDouble, kNumber
  std::string text;     // kString, kText, kDate; as the store keeps it
  const KeptPaths* paths = nullptr;

  void Set(std::string_view value);
  void Set(std::int64_t value);
  // As it was given.
  std::string Given() const;
  bool IsNull() const { return state == soci::i_null; }
  // Copies from and to a member's own memory, which is of the cell's kind. A null read into a member that has no null
  // gives its zero.
  void CopyFrom(const void* value);
  void CopyTo(void* value) const;
};

// The methods raise soci::soci_error.
class Statement {
 public:
  // The parameters stand in `sql` as :p0, :p1 ... in the order given.
  Statement(SqlSession& session, const std::string& sql, std::span<const MemberKind> parameters,
            std::span<const MemberKind> columns);

  Cell& Parameter(std::size_t index) { return parameters_[index]; }
  const Cell& Column(std::size_t index) const { return columns_[index]; }
  // True when there is a row, which the columns then hold.
  bool Execute() { return statement_.execute(true); }
  bool Next() { return statement_.fetch(); }
  long long RowsChanged() { return statement_.get_affected_rows(); }
  // Lets go of the rows not read. Until then they hold on to an old state of the database.
  void Reset() noexcept;

 private:
  std::vector<Cell> parameters_;
  std::vector<Cell> columns_;
  soci::statement statement_;
};

}  // namespace partnerkit::host
