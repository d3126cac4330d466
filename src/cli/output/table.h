// Tables for a person.
#pragma once

#include <cstddef>
#include <functional>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/values.h"

namespace partnerkit::cli {

struct TableColumn {
  std::string caption;
  bool right = false;  // numbers stand to the right
};

// Text of a cell; asked for more than once.
using CellText = std::function<std::string(std::size_t row, std::size_t column)>;
// Text that goes below a row, a line for each; none at all for most.
using NotesBelow = std::function<std::vector<std::string>(std::size_t row)>;

// Writes the table in `width` columns; the last column is broken over lines where it would not fit.
void PrintTable(std::ostream& out, const std::vector<TableColumn>& columns, std::size_t rows, const CellText& cell,
                std::size_t width, const NotesBelow& notes = {});

// Writes the text in lines of at most `width` columns, the later ones indented by `indent`.
void PrintWrapped(std::ostream& out, std::string_view text, std::size_t indent, std::size_t width);

// Columns of the terminal on standard output, or what COLUMNS says; 100 when neither is known.
std::size_t OutputWidth();

std::string CellAsText(const Cell& cell);

// "1 row", "2 rows".
std::string Counted(std::size_t count, std::string_view one, std::string_view many);

}  // namespace partnerkit::cli
