#include "cli/verbs/listings.h"

#include <array>
#include <string>
#include <vector>

#include "cli/output/log_report.h"
#include "cli/output/record_json.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "cli/workspace/workspace.h"
#include "frame/translator_base.h"
#include "partnerkit/catalogue.h"

namespace partnerkit::cli {

namespace {

template <class R>
void WriteRecord(JsonWriter& json, const R& record) {
  json.BeginObject();
  WriteMembers(json, R::kType, &record);
  json.EndObject();
}

std::string Shown(const Text& text) { return OneLine(Str(text)); }

std::string Checks(const EDIDoc& document) {
  std::string checks;
  const auto add = [&](bool checked, std::string_view name) {
    if (checked) checks += (checks.empty() ? "" : ", ") + std::string(name);
  };
  add(document.ValidateProduct, "product");
  add(document.ValidateCost, "cost");
  add(document.ValidateRetail, "retail");
  return checks.empty() ? "none" : checks;
}

std::string When(const Log& log) {
  std::string when = log.LogDate ? log.LogDate->Iso() : "";
  if (const std::size_t t = when.find('T'); t != std::string::npos) when[t] = ' ';
  return when;
}

}  // namespace

int ListClasses(const Command& command) {
  const std::span<const PublicClass> classes = Catalogue();
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("classes");
    json.BeginArray();
    for (const PublicClass& row : classes) {
      json.BeginObject();
      json.Name("ProgId");
      json.String(row.progId);
      json.Name("Document");
      json.String(row.document);
      json.Name("Direction");
      json.String(row.direction);
      json.Name("Format");
      json.String(row.format);
      json.EndObject();
    }
    json.EndArray();
    json.EndObject();
    return kDone;
  }
  PrintTable(
      command.out, {{"ProgID"}, {"Document"}, {"Direction"}, {"Format"}}, classes.size(),
      [&](std::size_t row, std::size_t column) {
        const PublicClass& shown = classes[row];
        return std::string(std::array{shown.progId, shown.document, shown.direction, shown.format}[column]);
      },
      OutputWidth());
  return kDone;
}

int ListDocuments(const Command& command) {
  Workspace workspace(command);
  const std::vector<EDIDoc> documents = workspace.Host().EDIDocList();
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("docs");
    json.BeginArray();
    for (const EDIDoc& document : documents) WriteRecord(json, document);
    json.EndArray();
    json.EndObject();
    return kDone;
  }
  PrintTable(
      command.out, {{"Doc", true}, {"Class"}, {"Document"}, {"Partner"}, {"Vendor"}, {"Map"}, {"Checks"}},
      documents.size(),
      [&](std::size_t row, std::size_t column) {
        const EDIDoc& document = documents[row];
        switch (column) {
          case 0:
            return std::to_string(document.EDIDocId);
          case 1:
            return OneLine(document.ProgId);
          case 2:
            return OneLine(document.DocumentCode);
          case 3:
            return OneLine(document.PartnerId);
          case 4:
            return OneLine(document.VendorId);
          case 5:
            return Shown(document.MapFile);
          default:
            return Checks(document);
        }
      },
      OutputWidth());
  return kDone;
}

int ListLog(const Command& command, std::int32_t since) {
  Workspace workspace(command);
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("log");
    json.BeginArray();
    host::ForEach<Log>(workspace.Host().Records(), [&](const Log& log) {
      if (log.LogId > since) WriteRecord(json, log);
    });
    json.EndArray();
    json.EndObject();
    return kDone;
  }
  std::vector<Log> records;
  host::ForEach<Log>(workspace.Host().Records(), [&](const Log& log) {
    if (log.LogId > since) records.push_back(log);
  });
  PrintTable(
      command.out, {{"Id", true}, {"Date"}, {"Class"}, {"Procedure"}, {"Message"}}, records.size(),
      [&](std::size_t row, std::size_t column) {
        const Log& log = records[row];
        switch (column) {
          case 0:
            return std::to_string(log.LogId);
          case 1:
            return When(log);
          case 2:
            return Shown(log.Source).substr(Shown(log.Source).find('.') + 1);
          case 3:
            return Shown(log.Procedure);
          default:
            return LogLine(log);
        }
      },
      OutputWidth());
  return kDone;
}

}  // namespace partnerkit::cli
