#include "cli/output/run_report.h"

#include <algorithm>
#include <string_view>

#include "cli/output/json_writer.h"
#include "cli/output/log_report.h"
#include "cli/output/table.h"
#include "cli/output/text.h"

namespace partnerkit::cli {

namespace {

void WriteColumns(JsonWriter& json, const ColumnTable& columns) {
  json.Name("columns");
  json.BeginArray();
  for (const GridColumn& column : columns) {
    json.BeginArray();
    json.String(column.caption);
    json.Int(column.kind);
    json.Int(column.width);
    json.EndArray();
  }
  json.EndArray();
}

void WriteRows(JsonWriter& json, const RowTable& rows) {
  json.Name("rows");
  json.BeginArray();
  for (std::size_t row = 0; row < rows.Rows(); ++row) {
    json.BeginArray();
    for (std::size_t column = 0; column < rows.Columns(); ++column) json.Value(rows.At(row, column));
    json.EndArray();
  }
  json.EndArray();
}

void WriteResults(JsonWriter& json, const std::vector<RowResult>& results) {
  json.Name("results");
  json.BeginArray();
  for (const RowResult& result : results) {
    json.BeginObject();
    json.Name("row");
    json.Int(result.row);
    json.Name("result");
    if (const auto* id = std::get_if<std::int32_t>(&result.result)) {
      json.Int(*id);
    } else {
      json.Bool(std::get<bool>(result.result));
    }
    json.Name("errorLog");
    if (result.errorLog) {
      json.BeginArray();
      for (const std::int32_t logId : *result.errorLog) json.Int(logId);
      json.EndArray();
    } else {
      json.Null();
    }
    json.EndObject();
  }
  json.EndArray();
}

std::string_view DoneWord(const RunReport& report) { return report.outbound ? "compiled" : "posted"; }

std::string Told(const RunReport& report, const RowResult& result) {
  const auto withId = [&](std::string_view word) {
    return std::string(word) + ", id " + std::to_string(std::get<std::int32_t>(result.result));
  };
  switch (result.outcome) {
    case Outcome::kPosted:
      return withId(DoneWord(report));
    case Outcome::kChanged:
      return withId("changed");
    case Outcome::kCancelled:
      return "cancelled";
    case Outcome::kDeleted:
      return "deleted";
    case Outcome::kStoredEarlier:
      return "stored earlier";
    default:
      return "NOT DONE";
  }
}

// Rows carried out are shown in the order in which that was done, others in the order of the file.
void PrintGrid(const Command& command, const RunReport& report, RecordStore& store) {
  const bool done = report.withResults;
  std::vector<TableColumn> columns = {{"Row", true}};
  for (const GridColumn& column : report.columns) columns.push_back({std::string(column.caption)});
  const auto rowOf = [&](std::size_t line) { return done ? static_cast<std::size_t>(report.results[line].row) : line; };
  const CellText cell = [&](std::size_t line, std::size_t column) {
    if (column == 0) return std::to_string(rowOf(line));
    if (done && column + 1 == columns.size()) return Told(report, report.results[line]);
    return CellAsText(report.rows.At(rowOf(line), column - 1));
  };
  NotesBelow notes;
  if (done) {
    notes = [&](std::size_t line) {
      const ErrorList& list = report.results[line].errorLog;
      return LogMessages(list.value_or(std::vector<std::int32_t>()), store);
    };
  }
  PrintTable(command.out, columns, done ? report.results.size() : report.rows.Rows(), cell, OutputWidth(), notes);
}

void PrintSummary(const Command& command, const RunReport& report) {
  command.out << '\n' << Counted(report.rows.Rows(), "row", "rows");
  const std::pair<Outcome, std::string_view> outcomes[] = {
      {Outcome::kPosted, DoneWord(report)},        {Outcome::kChanged, "changed"},
      {Outcome::kCancelled, "cancelled"},          {Outcome::kDeleted, "deleted"},
      {Outcome::kStoredEarlier, "stored earlier"}, {Outcome::kTurnedAway, "not done"}};
  for (const auto& [outcome, word] : outcomes) {
    const auto count = std::ranges::count(report.results, outcome, &RowResult::outcome);
    if (count > 0) command.out << ", " << count << ' ' << word;
  }
  if (report.untried > 0) command.out << ", " << report.untried << " not tried";
  command.out << ".\n";
}

// The records that stand below no row: those of `Init`, `Load` and `Term`.
void PrintOtherMessages(const Command& command, const RunReport& report, RecordStore& store) {
  std::vector<std::int32_t> others;
  std::vector<std::int32_t> shown;
  for (const RowResult& result : report.results) {
    if (result.errorLog) shown.insert(shown.end(), result.errorLog->begin(), result.errorLog->end());
  }
  std::ranges::sort(shown);
  std::ranges::set_difference(report.logIds, shown, std::back_inserter(others));
  for (const std::string& message : LogMessages(others, store)) PrintWrapped(command.out, message, 2, OutputWidth());
}

}  // namespace

void PrintRun(const Command& command, const RunReport& report, RecordStore& store) {
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    WriteColumns(json, report.columns);
    WriteRows(json, report.rows);
    if (report.withResults) WriteResults(json, report.results);
    WriteLogRecords(json, report.logIds, store);
    json.EndObject();
    return;
  }
  PrintOtherMessages(command, report, store);
  if (report.rows.Rows() == 0) return;
  PrintGrid(command, report, store);
  PrintSummary(command, report);
}

}  // namespace partnerkit::cli
