#include "cli/demo.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iomanip>
#include <span>
#include <sstream>
#include <vector>

#include "cli/output/json_writer.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "cli/program.h"
#include "cli/verbs/demo_packer.h"
#include "cli/workspace/demo_files.h"
#include "cli/workspace/workspace.h"
#include "partnerkit/records.h"
#include "values/format.h"

namespace partnerkit::cli {

namespace fs = std::filesystem;

namespace {

constexpr std::string_view kOrders = "inbox/orders.csv";
constexpr std::string_view kBackup = "backup/po.csv";
constexpr std::string_view kNotice = "outbox/cmlda1.csv";
constexpr std::string_view kAcknowledged = "FA_PO_771_";  // its file's name behind that is the time

// The columns of the order file worth looking at, from 0: transaction, order, store, product, cost, quantity.
constexpr std::size_t kShownColumns[] = {2, 7, 16, 20, 23, 24};
// Of the notice: number, consignment, ship-to, order, container, product, trade item, quantity.
constexpr std::size_t kNoticeColumns[] = {2, 7, 11, 15, 20, 24, 25, 26};

void CopyFiles() {
  fs::create_directory("records");
  for (const DemoFile& file : DemoFiles()) {
    std::ofstream out(fs::path(file.path), std::ios::binary);
    if (!(out << file.text).flush()) {
      throw Refusal(std::string(file.path) + ": cannot be written: " + std::strerror(errno));
    }
  }
}

std::vector<std::string> LinesOf(const fs::path& path) {
  std::ifstream in(path);
  std::vector<std::string> lines;
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

// As `cut -d,` gives them.
std::string ShownFields(std::string_view line, std::span<const std::size_t> columns) {
  std::string shown;
  std::size_t column = 0;
  std::istringstream fields{std::string(line)};
  for (std::string field; std::getline(fields, field, ','); ++column) {
    if (std::ranges::find(columns, column) != columns.end()) shown += (shown.empty() ? "" : ",") + field;
  }
  return shown;
}

// As `wc -l` gives them.
void PrintLineCounts(std::ostream& out, std::vector<std::pair<std::string_view, std::size_t>> files) {
  std::size_t total = 0;
  for (const auto& [name, lines] : files) total += lines;
  files.emplace_back("total", total);
  const auto width = static_cast<int>(std::to_string(total).size()) + 1;
  for (const auto& [name, lines] : files) out << std::setw(width) << lines << ' ' << name << '\n';
}

// The program's own verbs, run as a user would type them within the workspace.
class Steps {
 public:
  explicit Steps(const Command& command) : command_(command) {
    const Options& options = command.options;
    if (options.now) before_.insert(before_.end(), {"--now", options.now->Iso()});
    if (!options.database.empty()) before_.insert(before_.end(), {"--database", options.database});
  }

  bool WentAsExpected() const { return asExpected_; }

  int Run(const std::vector<std::string>& words, std::ostream& out) {
    std::vector<std::string> arguments = {"--workspace", "."};
    if (command_.options.json) arguments.push_back("--json");
    arguments.insert(arguments.end(), before_.begin(), before_.end());
    arguments.insert(arguments.end(), words.begin(), words.end());
    return RunProgram(arguments, out, command_.err);
  }

  std::string Typed(const std::vector<std::string>& words) const {
    std::string line = "partnerkit";
    for (const auto* part : {&before_, &words}) {
      for (const std::string& word : *part) line += " " + word;
    }
    return line;
  }

  void Expect(int status, int expected) { asExpected_ = asExpected_ && status == expected; }

 private:
  const Command& command_;
  std::vector<std::string> before_;
  bool asExpected_ = true;
};

struct Step {
  std::string_view told;
  std::vector<std::string> words;
  int status;
  std::string_view typed = {};  // what stands for the words, where a user would type less
};

const std::vector<Step>& MainJob() {
  static const std::vector<Step> kSteps = {
      {"The supplier's partner, stores, products and prices are records. They come from a file:",
       {"data", "load", "records.json"},
       kDone},
      {"One document is defined: purchase orders of MGB Stores, checked against product, cost and retail price:",
       {"docs"},
       kDone},
      {"MGB has sent a file of orders. This is what it holds; looking at it changes nothing:",
       {"rows", "1", std::string(kOrders)},
       kDone},
      {"Now they are imported. An order that fails a check is not posted, and the exit status is 1:",
       {"process", "1", std::string(kOrders)},
       kTurnedAway},
      {"Everything that was said is kept in the run log:", {"log"}, kDone},
  };
  return kSteps;
}

// The other partners' samples. Their records are loaded in one go, as a shell's "*" would name them.
std::vector<Step> OtherPartners() {
  std::vector<std::string> load = {"data", "load"};
  for (const DemoFile& file : DemoFiles()) {
    if (file.path.starts_with("records/")) load.emplace_back(file.path);
  }
  return {
      {"The supplier trades with more partners. Their records, maps and order files lie in the workspace as well:",
       load, kDone, "data load records/*.json"},
      {"Kmart, for one, releases parts of a blanket order; each release is an order of its own:",
       {"process", "6", "inbox/kmart850.csv"},
       kDone},
      {"Orders also come as X12 interchanges. Kmart's holds three orders and, in a group of their own, a change and a "
       "cancellation of orders just posted:",
       {"process", "14", "inbox/kmart850x12.x12"},
       kTurnedAway},
  };
}

// The way of an order from the file to the notice of its cartons.
const Step kImportToPack = {
    "CML's order is to be packed. It is imported like the others:", {"process", "8", "inbox/cmlflf.csv"}, kTurnedAway};

std::vector<Step> OnTheWay() {
  return {
      {"CML wants a label on every carton. The label printer gets the layout once, and then a job of values for each; "
       "a "
       "workspace without printers keeps the jobs in spool/:",
       {"print", "PartnerKit.clsCMLSCM", "--pack", "1", "2", "3"},
       kDone},
      {"The same label on an ordinary printer, or here as a picture:",
       {"preview", "PartnerKit.clsCMLSCM", "--pack", "1", "--out", "label.png"},
       kDone},
      {"And the ship notice, which tells CML what is on its way. The * is the notice's number:",
       {"process", "20", "outbox/cmlda*.csv"},
       kDone,
       "process 20 'outbox/cmlda*.csv'"},
  };
}

void PrintOrders(const Command& command) {
  Command inWorkspace = command;
  inWorkspace.options.workspace = ".";
  Workspace workspace(inWorkspace);
  host::SqlStore& store = workspace.Host().Records();
  std::vector<std::vector<std::string>> rows;
  std::vector<Order> orders;
  host::ForEach<Order>(store, [&](const Order& order) { orders.push_back(order); });
  for (const Order& order : orders) {
    OrderLine line;
    OrderLocn locn;
    line.OrderId = locn.OrderId = order.OrderId;
    double units = 0;
    double value = 0;
    const auto lines = Select(store, OrderLine::kByOrder, line);
    for (const auto& each : lines) {
      units += each->Quantity;
      value += each->Quantity * each->Cost;
    }
    rows.push_back({std::to_string(order.OrderId), OneLine(order.PONo), order.PODate ? order.PODate->Iso() : "",
                    order.NotBefore ? order.NotBefore->Iso() : "", std::to_string(lines.size()),
                    std::to_string(Count(store, OrderLocn::kByOrder, locn)), ShortestNumber(units),
                    Format(value, "0.00")});
  }
  PrintTable(
      command.out,
      {{"Id", true},
       {"PO Number"},
       {"Date"},
       {"Not before"},
       {"Products", true},
       {"Stores", true},
       {"Units", true},
       {"Cost", true}},
      rows.size(), [&](std::size_t row, std::size_t column) { return rows[row][column]; }, OutputWidth());
}

void Tell(const Command& command, std::string_view text) {
  command.out << '\n';
  PrintWrapped(command.out, text, 0, OutputWidth());
}

void TellStep(const Command& command, Steps& steps, const Step& step) {
  if (!step.told.empty()) Tell(command, step.told);
  command.out << "\n$ " << (step.typed.empty() ? steps.Typed(step.words) : steps.Typed({std::string(step.typed)}))
              << '\n';
  // Errors of the step go to another stream; they are not to overtake it.
  command.out.flush();
  steps.Expect(steps.Run(step.words, command.out), step.status);
}

void TellFiles(const Command& command) {
  const std::vector<std::string> left = LinesOf(kOrders);
  Tell(command,
       "The order file is a work queue: it now holds only the order that failed, to be imported again once its "
       "cost is settled. The lines of the others went to the backup file:");
  command.out << "\n$ wc -l " << kOrders << ' ' << kBackup << '\n';
  PrintLineCounts(command.out, {{kOrders, left.size()}, {kBackup, LinesOf(kBackup).size()}});
  command.out << "\n$ cut -d, -f3,8,17,21,24,25 " << kOrders << '\n';
  for (const std::string& line : left) command.out << ShownFields(line, kShownColumns) << '\n';
}

void TellAcknowledgement(const Command& command) {
  Tell(command,
       "The acknowledgement of each group waits in outbox/ for Kmart, written when the file was listed. The first:");
  command.out << "\n$ cat outbox/" << kAcknowledged << "*.TXT\n";
  for (const auto& entry : fs::directory_iterator("outbox")) {
    if (!entry.path().filename().string().starts_with(kAcknowledged)) continue;
    for (const std::string& line : LinesOf(entry.path())) command.out << line.substr(0, line.find('\r')) << '\n';
  }
}

void TellPacking(const Command& command) {
  Command inWorkspace = command;
  inWorkspace.options.workspace = ".";
  Workspace workspace(inWorkspace);
  const PackedOrder packed = PackNewestOrder(workspace.Host(), "CML");
  workspace.Host().Close();
  Tell(command, "The warehouse packs it; in this demo a small packer of its own does. Order " + packed.PONo + ":");
  command.out << '\n';
  PrintTable(
      command.out, {{"Pack", true}, {"SSCC"}, {"Holds"}}, packed.cartons.size(),
      [&](std::size_t row, std::size_t column) {
        const PackedCarton& carton = packed.cartons[row];
        if (column == 0) return std::to_string(carton.id);
        if (column == 1) return carton.sscc;
        std::string contents;
        for (const std::string& each : carton.contents) contents += (contents.empty() ? "" : ", ") + each;
        return contents;
      },
      OutputWidth());
}

void TellNotice(const Command& command) {
  command.out << "\n$ cut -d, -f3,8,12,16,21,25-27 " << kNotice << '\n';
  for (const std::string& line : LinesOf(kNotice)) command.out << ShownFields(line, kNoticeColumns) << '\n';
}

void Talk(const Command& command, Steps& steps, const fs::path& workspace, const std::string& folder) {
  PrintWrapped(command.out,
               "Made the workspace " + workspace.string() +
                   ": a database and the files of Acme Apparel, a supplier of MGB Stores.",
               0, OutputWidth());
  command.out << "\n$ cd " << folder << '\n';
  for (const Step& step : MainJob()) TellStep(command, steps, step);
  Tell(command, "The orders as they are stored (`partnerkit data dump Order OrderLine` writes every member):");
  command.out << '\n';
  PrintOrders(command);
  TellFiles(command);
  for (const Step& step : OtherPartners()) TellStep(command, steps, step);
  TellAcknowledgement(command);
  TellStep(command, steps, kImportToPack);
  TellPacking(command);
  for (const Step& step : OnTheWay()) TellStep(command, steps, step);
  TellNotice(command);
  Tell(command,
       "To go on with the order of MGB that failed: correct the price in records.json, load it again and run the same "
       "`process` command.");
}

void TalkJson(const Command& command, Steps& steps, const fs::path& workspace) {
  JsonWriter json(command.out);
  json.BeginObject();
  json.Name("workspace");
  json.String(workspace.string());
  json.Name("steps");
  json.BeginArray();
  for (const Step& step : MainJob()) {
    std::ostringstream output;
    const int status = steps.Run(step.words, output);
    steps.Expect(status, step.status);
    json.BeginObject();
    json.Name("command");
    json.String(steps.Typed(step.words));
    json.Name("status");
    json.Int(status);
    json.Name("output");
    json.Literal(output.view().empty() ? "null" : output.view());
    json.EndObject();
  }
  json.EndArray();
  json.EndObject();
}

// The current folder for as long as the object lives.
class CurrentFolder {
 public:
  explicit CurrentFolder(const fs::path& folder) : before_(fs::current_path()) { fs::current_path(folder); }
  ~CurrentFolder() {
    std::error_code ignored;
    fs::current_path(before_, ignored);
  }
  CurrentFolder(const CurrentFolder&) = delete;
  CurrentFolder& operator=(const CurrentFolder&) = delete;

 private:
  fs::path before_;
};

}  // namespace

int RunDemo(const Command& command, const std::string& folder) {
  std::error_code failure;
  if (fs::exists(folder, failure) && (!fs::is_directory(folder, failure) || !fs::is_empty(folder, failure))) {
    throw Refusal(folder + ": the demo wants a new or an empty folder");
  }
  const fs::path workspace = MakeWorkspace(folder, command.options.database);
  const CurrentFolder within(workspace);
  CopyFiles();
  Steps steps(command);
  if (command.options.json) {
    TalkJson(command, steps, workspace);
  } else {
    Talk(command, steps, workspace, folder);
  }
  return steps.WentAsExpected() ? kDone : kTurnedAway;
}

}  // namespace partnerkit::cli
