#include "cli/verbs/printers.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "cli/output/json_writer.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::cli {

namespace {

struct Looked {
  Printer printer;
  std::string trouble;  // empty: it takes jobs
  std::optional<std::int32_t> jobs;
};

struct Tried {
  std::string printer;
  bool sent = false;
};

Looked LookAt(spool::PrinterSpooler& spooler, const Printer& printer) {
  Looked looked = {printer, {}, {}};
  try {
    spooler.Check(printer.Name);
  } catch (const RunTimeError& error) {
    looked.trouble = error.Description();
  }
  try {
    looked.jobs = spooler.JobCount(printer.Name);
  } catch (const RunTimeError&) {
    // A printer whose jobs cannot be counted has told its trouble.
  }
  return looked;
}

std::vector<Printer> Chosen(const spool::PrinterSpooler& spooler, const std::vector<std::string>& names,
                            const Workspace& workspace) {
  if (names.empty()) return spooler.Printers();
  std::vector<Printer> chosen;
  chosen.reserve(names.size());
  for (const std::string& name : names) {
    chosen.push_back(CheckPrinter(spooler, name, workspace));
  }
  return chosen;
}

void WriteJson(const Command& command, const std::vector<Looked>& printers) {
  JsonWriter json(command.out);
  json.BeginObject();
  json.Name("printers");
  json.BeginArray();
  for (const Looked& looked : printers) {
    json.BeginObject();
    json.Name("Name");
    json.String(looked.printer.Name);
    json.Name("Kind");
    json.String(looked.printer.Kind);
    json.Name("Target");
    looked.printer.Target ? json.String(*looked.printer.Target) : json.Null();
    json.Name("reachable");
    json.Bool(looked.trouble.empty());
    json.Name("trouble");
    json.String(looked.trouble);
    json.Name("jobs");
    looked.jobs ? json.Int(*looked.jobs) : json.Null();
    json.EndObject();
  }
  json.EndArray();
  json.EndObject();
}

void WriteTable(const Command& command, const std::vector<Looked>& printers) {
  PrintTable(
      command.out, {{"Name"}, {"Kind"}, {"Target"}, {"Jobs", true}, {"State"}}, printers.size(),
      [&](std::size_t row, std::size_t column) {
        const Looked& looked = printers[row];
        switch (column) {
          case 0:
            return OneLine(looked.printer.Name);
          case 1:
            return OneLine(looked.printer.Kind);
          case 2:
            return OneLine(looked.printer.Target.value_or(""));
          case 3:
            return looked.jobs ? std::to_string(*looked.jobs) : "?";
          default:
            return looked.trouble.empty() ? "reachable" : OneLine(looked.trouble);
        }
      },
      OutputWidth());
}

std::string TestText(const std::string& printer, const DateTime& now) {
  return "PartnerKit test\r\nPrinter " + printer + "\r\n" + now.Iso() + "\r\n\f";
}

// False, with the cause said, when the printer didn't get it.
bool SendTest(const Command& command, spool::PrinterSpooler& spooler, const std::string& printer, const DateTime& now) {
  try {
    const std::unique_ptr<RawJob> job = spooler.OpenRaw(printer, "PartnerKit test");
    job->Write(TestText(printer, now));
    job->Close();
    return true;
  } catch (const RunTimeError& error) {
    command.Say("printer " + printer + ": " + error.Description());
    return false;
  }
}

void WriteJson(const Command& command, const std::vector<Tried>& tried, const std::vector<std::string>& jobs) {
  JsonWriter json(command.out);
  json.BeginObject();
  json.Name("results");
  json.BeginArray();
  for (const Tried& one : tried) {
    json.BeginObject();
    json.Name("printer");
    json.String(one.printer);
    json.Name("result");
    json.Bool(one.sent);
    json.EndObject();
  }
  json.EndArray();
  json.Name("jobs");
  json.BeginArray();
  for (const std::string& job : jobs) json.String(job);
  json.EndArray();
  json.EndObject();
}

}  // namespace

spool::PrinterSpooler OpenSpooler(Workspace& workspace, spool::PdfDeviceFactory makePdfDevice) {
  std::vector<Printer> printers;
  host::ForEach<Printer>(workspace.Host().Records(), [&](const Printer& printer) { printers.push_back(printer); });
  return {std::move(printers), workspace.Folder(), std::move(makePdfDevice)};
}

const Printer& CheckPrinter(const spool::PrinterSpooler& spooler, const std::string& name, const Workspace& workspace) {
  const auto printer = std::ranges::find(spooler.Printers(), name, &Printer::Name);
  if (printer != spooler.Printers().end()) return *printer;
  throw Refusal("printer " + name + ": no such printer in " + workspace.Folder().string());
}

int ListPrinters(const Command& command, const std::vector<std::string>& names) {
  Workspace workspace(command);
  spool::PrinterSpooler spooler = OpenSpooler(workspace);
  std::vector<Looked> printers;
  for (const Printer& printer : Chosen(spooler, names, workspace)) printers.push_back(LookAt(spooler, printer));
  if (command.options.json) {
    WriteJson(command, printers);
  } else {
    WriteTable(command, printers);
  }
  const bool all = std::ranges::all_of(printers, [](const Looked& looked) { return looked.trouble.empty(); });
  return all ? kDone : kTurnedAway;
}

int TestPrinters(const Command& command, const std::vector<std::string>& names) {
  if (names.empty()) throw Refusal("--test: the name of a printer is wanted");
  Workspace workspace(command);
  spool::PrinterSpooler spooler = OpenSpooler(workspace);
  std::vector<Tried> tried;
  for (const Printer& printer : Chosen(spooler, names, workspace)) tried.push_back({printer.Name});
  for (Tried& one : tried) one.sent = SendTest(command, spooler, one.printer, workspace.ClassPorts().clock->Now());
  if (command.options.json) {
    WriteJson(command, tried, spooler.Jobs());
  } else {
    for (const std::string& job : spooler.Jobs()) command.out << "Sent " << OneLine(job) << ".\n";
  }
  return std::ranges::all_of(tried, &Tried::sent) ? kDone : kTurnedAway;
}

}  // namespace partnerkit::cli
