#include "cli/verbs/print_labels.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <utility>

#include "cairo/devices.h"
#include "cli/output/json_writer.h"
#include "cli/output/log_report.h"
#include "cli/output/progress.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "cli/verbs/printers.h"
#include "cli/workspace/label_host.h"
#include "cli/workspace/workspace.h"
#include "partnerkit/catalogue.h"

namespace partnerkit::cli {

namespace {

std::unique_ptr<DrawingDevice> MakePdf(ByteSink pdf, const std::string& title) {
  return cairo::MakePdfDevice(std::move(pdf), {.title = title});
}

// One command's labels, from the workspace to the report.
class LabelRun {
 public:
  LabelRun(const Command& command, const LabelOrder& order)
      : command_(command),
        workspace_(command),
        spooler_(OpenSpooler(workspace_, MakePdf)),
        host_(
            workspace_.Host(),
            [this](const std::string& port, std::string_view text) { spooler_.SendToPort(port, text); },
            order.language),
        order_(order) {
    Ports ports = workspace_.ClassPorts();
    ports.spooler = &spooler_;
    label_ = MakeLabelClass(order.className, ports);
    CheckLanguage();
    printer_ = Printer();
    for (const std::int32_t id : order.packs) packs_.push_back(FindPack(command, workspace_, id));
  }

  void PrintEach(std::int16_t quantity) {
    // Without a carton there is nothing to set a printer up for.
    const bool any = std::ranges::any_of(packs_, [](const std::optional<Pack>& pack) { return pack.has_value(); });
    const bool ready = any && label_->Init(host_, printer_);
    for (std::size_t at = 0; at < packs_.size(); ++at) {
      const std::optional<Pack>& pack = packs_[at];
      results_.push_back({order_.packs[at], ready && pack && label_->PrintLabel(*pack, quantity)});
      progress_.Show("printing", at + 1, packs_.size());
    }
  }

  // A run that lacks a carton is not begun.
  void PrintAll(bool separators, bool styleSort) {
    std::vector<Pack> packs;
    for (const std::optional<Pack>& pack : packs_) {
      if (pack) packs.push_back(*pack);
    }
    const bool whole = packs.size() == packs_.size();
    results_.push_back(
        {{}, whole && label_->Init(host_, printer_) && label_->PrintAllLabels(packs, separators, styleSort)});
  }

  int Finish() {
    label_.reset();
    progress_.Clear();
    workspace_.Host().Commit(0);
    Report();
    const bool all = std::ranges::all_of(results_, &Result::printed);
    const bool logged = !host_.LogIds().empty();
    const bool stored = workspace_.CloseStore();
    return all && !logged && stored && !workspace_.HadFault() ? kDone : kTurnedAway;
  }

 private:
  struct Result {
    std::optional<std::int32_t> pack;
    bool printed;
  };

  void CheckLanguage() {
    if (host_.PrinterLanguage().empty()) {
      throw Refusal(
          "no printer language: load the setting, such as {\"System\": {\"PrinterLanguage\": \"ZPL\"}}, or give "
          "--language");
    }
    const std::string known(FindClass(label_->ClassName())->format);
    if (order_.language.empty() || (", " + known + ", ").find(", " + order_.language + ", ") != std::string::npos)
      return;
    throw Refusal("--language " + order_.language + ": " + order_.className + " prints " + known + " only");
  }

  std::string Printer() const {
    std::string name = PrinterName();
    CheckPrinter(spooler_, name, workspace_);
    return name;
  }

  std::string PrinterName() const {
    if (!order_.printer.empty()) return order_.printer;
    std::vector<std::string> named;
    for (const partnerkit::Printer& printer : spooler_.Printers()) {
      if (printer.Name != spool::kFilePrinter) named.push_back(printer.Name);
    }
    if (named.empty()) return std::string(spool::kFilePrinter);
    if (named.size() == 1) return named.front();
    throw Refusal("the workspace has " + std::to_string(named.size()) + " printers: name one with --printer");
  }

  void Report() {
    if (command_.options.json) return ReportJson();
    PrintTable(
        command_.out, {{"Pack", true}, {"Result"}}, results_.size(),
        [&](std::size_t row, std::size_t column) {
          const Result& result = results_[row];
          if (column == 0) return result.pack ? std::to_string(*result.pack) : "all " + std::to_string(packs_.size());
          return std::string(result.printed ? "printed" : "NOT PRINTED");
        },
        OutputWidth());
    for (const std::string& message : LogMessages(host_.LogIds(), workspace_.Host().Records())) {
      PrintWrapped(command_.out, message, 2, OutputWidth());
    }
    command_.out << '\n' << Counted(spooler_.Jobs().size(), "job", "jobs");
    for (std::size_t at = 0; at < spooler_.Jobs().size(); ++at) {
      command_.out << (at == 0 ? ": " : ", ") << OneLine(spooler_.Jobs()[at]);
    }
    command_.out << ".\n";
  }

  void ReportJson() {
    JsonWriter json(command_.out);
    json.BeginObject();
    json.Name("results");
    json.BeginArray();
    for (const Result& result : results_) {
      json.BeginObject();
      if (result.pack) {
        json.Name("pack");
        json.Int(*result.pack);
      }
      json.Name("result");
      json.Bool(result.printed);
      json.EndObject();
    }
    json.EndArray();
    json.Name("jobs");
    json.BeginArray();
    for (const std::string& job : spooler_.Jobs()) json.String(job);
    json.EndArray();
    WriteLogRecords(json, host_.LogIds(), workspace_.Host().Records());
    json.EndObject();
  }

  const Command& command_;
  Workspace workspace_;
  spool::PrinterSpooler spooler_;
  LabelHost host_;
  const LabelOrder& order_;
  Progress progress_;
  std::unique_ptr<LabelClass> label_;
  std::string printer_;
  std::vector<std::optional<Pack>> packs_;  // as the command names them
  std::vector<Result> results_;
};

}  // namespace

int PrintLabels(const Command& command, const LabelOrder& order, std::int16_t quantity) {
  LabelRun run(command, order);
  run.PrintEach(quantity);
  return run.Finish();
}

int PrintAllLabels(const Command& command, const LabelOrder& order, bool separators, bool styleSort) {
  LabelRun run(command, order);
  run.PrintAll(separators, styleSort);
  return run.Finish();
}

}  // namespace partnerkit::cli
