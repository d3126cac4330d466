#include "cli/program.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cstdint>
#include <functional>
#include <new>

#include "cli/demo.h"
#include "cli/output/command.h"
#include "cli/output/json_writer.h"
#include "cli/output/text.h"
#include "cli/verbs/data_commands.h"
#include "cli/verbs/example.h"
#include "cli/verbs/listings.h"
#include "cli/verbs/print_labels.h"
#include "cli/verbs/printers.h"
#include "cli/verbs/run_document.h"
#include "cli/workspace/workspace.h"
#include "partnerkit/version.h"

namespace partnerkit::cli {

namespace {

constexpr std::string_view kNextSteps =
    "  partnerkit classes                             # every document of every partner\n"
    "  partnerkit data example clsMGB850csv --out .   # records, map and order file of one, to be filled in\n"
    "  partnerkit data load clsMGB850csv.json\n"
    "  partnerkit docs                                # what is defined now\n"
    "  partnerkit process 1 inbox/orders.csv\n";

int MakeNew(const Command& command, const std::string& folder) {
  const std::filesystem::path made = MakeWorkspace(folder, command.options.database);
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("workspace");
    json.String(made.string());
    json.EndObject();
  } else {
    command.out << "Made the workspace " << OneLine(made.string())
                << ". What comes next, for instance with MGB's orders:\n\n"
                << "  cd " << OneLine(folder) << "\n"
                << kNextSteps;
  }
  return kDone;
}

// Decimal digits and no more: CLI11 takes an empty text, which an unset variable of a shell leaves, for 0, and "010"
// for eight.
std::string CheckWhole(std::string& text) {
  const std::size_t sign = text.starts_with('-') ? 1 : 0;
  if (text.size() == sign || text.find_first_not_of("0123456789", sign) != std::string::npos)
    return "wants a whole number, not \"" + text + "\"";
  const std::size_t zeros = std::min(text.find_first_not_of('0', sign), text.size() - 1) - sign;
  text.erase(sign, zeros);
  return {};
}

CLI::Option* Whole(CLI::Option* option, const std::string& name) {
  return option->transform(CLI::Validator(CheckWhole, ""))->type_name(name);
}

// The verbs as CLI11 knows them, and the one that the command line chose.
class Verbs {
 public:
  explicit Verbs(Options& options) : options_(options) {
    app_.name("partnerkit");
    app_.set_version_flag("--version", "partnerkit " + std::string(kVersion), "Show the version and end");
    app_.set_help_flag("-h,--help", "Show this help and end");
    app_.get_formatter()->label("SUBCOMMAND", "VERB");
    app_.require_subcommand(1);
    app_.fallthrough();
    app_.footer(
        "Example:\n  partnerkit demo try-it\n\nExit status: 0 all done; 1 something was turned away, failed or "
        "found nothing; 2 the command could not run.");
    app_.add_option("--workspace", options.workspace,
                    "The workspace; else the folder in PARTNERKIT_WORKSPACE, else the current one")
        ->type_name("DIR");
    app_.add_option("--database", options.database, "Another store than the workspace's own SQLite file")
        ->type_name("URL");
    app_.add_flag("--json", options.json, "Write one JSON document to standard output and nothing else");
    app_.add_option("--now", now_, "Run as of this local time, such as 2006-03-08T10:15:00")->type_name("TIME");
    AddWorkspaceVerbs();
    AddDataVerbs();
    AddRunVerbs();
    AddLabelVerbs();
    AddPrinterVerbs();
  }

  CLI::App& App() { return app_; }

  void Parse(std::vector<std::string> arguments) {
    std::reverse(arguments.begin(), arguments.end());
    app_.parse(std::move(arguments));
    if (now_.empty()) return;
    options_.now = DateTime::FromIso(now_);
    if (!options_.now) throw Refusal("--now " + now_ + ": wants a time such as 2006-03-08T10:15:00");
  }

  int Run(const Command& command) const { return action_(command); }

 private:
  using Action = std::function<int(const Command&)>;

  CLI::App* Add(CLI::App& parent, const std::string& name, const std::string& about, const std::string& example,
                Action action = {}) {
    CLI::App* verb = parent.add_subcommand(name, about);
    verb->group("Verbs");
    verb->footer("Example:\n  partnerkit " + example);
    if (action) verb->callback([this, action = std::move(action)] { action_ = action; });
    return verb;
  }

  static CLI::Option* Required(CLI::App* verb, const std::string& name, std::string& value, const std::string& about) {
    return verb->add_option(name, value, about)->required()->type_name("");
  }

  void AddWorkspaceVerbs() {
    CLI::App* made = Add(app_, "new", "Make an empty workspace", "new acme",
                         [this](const Command& command) { return MakeNew(command, folder_); });
    Required(made, "DIR", folder_, "Folder of the workspace");
    CLI::App* demo =
        Add(app_, "demo", "Make a workspace with a small supplier and run the main job on it, step by step",
            "demo try-it", [this](const Command& command) { return RunDemo(command, folder_); });
    Required(demo, "DIR", folder_, "Folder of the workspace, new or empty");
    Add(app_, "classes", "List every public class: ProgID, document, direction, format", "classes", ListClasses);
    Add(app_, "docs", "List the document definitions of the workspace", "docs", ListDocuments);
    CLI::App* log = Add(app_, "log", "Show the run log", "log --since 120",
                        [this](const Command& command) { return ListLog(command, since_); });
    Whole(log->add_option("--since", since_, "Only the records after the one with this id"), "ID");
  }

  void AddDataVerbs() {
    CLI::App* data = Add(app_, "data", "Store records from JSON, or write them as JSON", "data load records.json");
    data->require_subcommand(1);
    CLI::App* example = Add(*data, "example", "Write a first set of records for a class, to be filled in",
                            "data example PartnerKit.clsMGB850csv --out .",
                            [this](const Command& command) { return WriteExample(command, document_, file_); });
    Required(example, "CLASS", document_, "The class, as `classes` lists it; its last part alone will do");
    example
        ->add_option("--out", file_,
                     "Write a records file into this folder, and the map and the order file that it names")
        ->type_name("DIR");
    CLI::App* load = Add(*data, "load", "Store the records of all files, or none of them", "data load records.json",
                         [this](const Command& command) { return LoadData(command, words_); });
    load->add_option("FILE", words_, "JSON files of records by kind")->required()->type_name("");
    CLI::App* dump =
        Add(*data, "dump", "Write records as the JSON that `data load` takes", "data dump Product ProductPrice",
            [this](const Command& command) { return DumpData(command, words_); });
    dump->add_option("KIND", words_, "Kinds of record; every kind that has any when none is named")->type_name("");
  }

  CLI::App* AddRunVerb(const std::string& name, const std::string& about, const std::string& example, Action action) {
    CLI::App* verb = Add(app_, name, about, example, std::move(action));
    Required(verb, "DOC", document_, "Id of the document definition, which says what class runs");
    Required(verb, "FILE", file_, "The input, handed to the class as it is given");
    return verb;
  }

  void AddRunVerbs() {
    AddRunVerb("rows", "Show the rows of a file and carry none out", "rows 1 inbox/orders.csv",
               [this](const Command& command) { return ShowRows(command, document_, file_); });
    CLI::App* process =
        AddRunVerb("process", "Carry out rows of a file and settle it", "process 1 inbox/orders.csv --row 0 --row 2",
                   [this](const Command& command) { return ProcessRows(command, document_, file_, rows_); });
    Whole(process->add_option("--row", rows_,
                              "A row to carry out, counted from 0; give it again for more. All rows without it"),
          "N")
        ->allow_extra_args(false);
    CLI::App* erase = AddRunVerb("delete", "Take a row's lines out of the file without carrying it out",
                                 "delete 1 inbox/orders.csv --row 3",
                                 [this](const Command& command) { return DeleteRow(command, document_, file_, row_); });
    Whole(erase->add_option("--row", row_, "The row, counted from 0"), "N")->required();
  }

  CLI::App* AddLabelVerb(const std::string& name, const std::string& about, const std::string& example, Action action) {
    CLI::App* verb = Add(app_, name, about, example, std::move(action));
    Required(verb, "CLASS", labels_.className, "The label class, such as PartnerKit.clsCMLSCM");
    return verb;
  }

  CLI::App* AddPrintVerb(const std::string& name, const std::string& about, const std::string& example, Action action) {
    CLI::App* verb = AddLabelVerb(name, about, example, std::move(action));
    Whole(verb->add_option("--pack", labels_.packs, "Ids of the packs"), "ID...")->required();
    verb->add_option("--printer", labels_.printer, "The printer; else the workspace's only one, else its folder spool/")
        ->type_name("P");
    verb->add_option("--language", labels_.language, "In place of the setting PrinterLanguage: LBXII, ZPL or WinPCL")
        ->type_name("L");
    return verb;
  }

  void AddLabelVerbs() {
    CLI::App* print = AddPrintVerb("print", "Print the labels of packs, a print job for each",
                                   "print PartnerKit.clsCMLSCM --pack 1 2 --printer warehouse",
                                   [this](const Command& command) { return PrintLabels(command, labels_, quantity_); });
    Whole(print->add_option("--qty", quantity_, "Labels of each pack; ZPL and drawn labels are single")
              ->check(CLI::Range(1, 32767)),
          "N");
    CLI::App* all = AddPrintVerb(
        "print-all", "Print the labels of packs as one print job",
        "print-all PartnerKit.clsCMLSCM --pack 1 2 3 --separators",
        [this](const Command& command) { return PrintAllLabels(command, labels_, separators_, styleSort_); });
    all->add_flag("--separators", separators_, "Put a separator label ahead of each store's labels");
    all->add_flag("--style-sort", styleSort_, "From the last pack to the first, separators behind each prepack");
    CLI::App* preview =
        AddLabelVerb("preview", "Draw a pack's label as it would leave an ordinary printer",
                     "preview PartnerKit.clsCMLSCM --pack 1 --out label.png",
                     [this](const Command& command) { return PreviewLabel(command, labels_.className, pack_, file_); });
    Whole(preview->add_option("--pack", pack_, "Id of the pack"), "ID")->required();
    preview->add_option("--out", file_, "The file, .png, .pdf or .svg")->required()->type_name("FILE");
  }

  void AddPrinterVerbs() {
    CLI::App* verb = Add(app_, "printers", "List the printers and whether they can be reached",
                         "printers --test warehouse", [this](const Command& command) {
                           return test_ ? TestPrinters(command, words_) : ListPrinters(command, words_);
                         });
    verb->add_option("NAME", words_, "Printers; all of them when none is named")->type_name("");
    verb->add_flag("--test", test_, "Send a short text to the printers named");
  }

  Options& options_;
  CLI::App app_{"Trading-partner documents: orders in, ship notices and labels out."};
  Action action_;
  std::string now_, folder_, document_, file_;
  std::vector<std::string> words_;
  std::vector<std::int64_t> rows_;
  std::int64_t row_ = 0;
  LabelOrder labels_;
  std::int16_t quantity_ = 1;
  std::int32_t pack_ = 0;
  bool separators_ = false, styleSort_ = false;
  std::int32_t since_ = 0;
  bool test_ = false;
};

// The sentence for a command line that doesn't parse.
std::string UsageFault(CLI::App& app, const CLI::ParseError& error) {
  const CLI::App* chosen = &app;
  while (!chosen->get_subcommands().empty()) chosen = chosen->get_subcommands().front();
  if (chosen->get_require_subcommand_min() == 0) return error.what();
  const std::vector<std::string> left = app.remaining(true);
  if (left.empty()) return "a verb is wanted";
  if (left.front().starts_with('-')) return "no such option: " + left.front();
  return "no such verb: " + (chosen == &app ? "" : chosen->get_name() + " ") + left.front();
}

int Guarded(const Command& command, const std::function<int()>& work) {
  try {
    return work();
  } catch (const Refusal& refusal) {
    command.Say(refusal.what());
    return kCannotRun;
  } catch (const std::bad_alloc&) {
    command.Say("out of memory");
  } catch (const std::exception& error) {
    command.Say(error.what());
  } catch (...) {
    command.Say("unknown error");
  }
  return kTurnedAway;
}

int ParseAndRun(Verbs& verbs, const std::vector<std::string>& arguments, Command& command, const Options& options) {
  try {
    verbs.Parse(arguments);
  } catch (const CLI::Success& wanted) {
    verbs.App().exit(wanted, command.out, command.err);
    return kDone;
  } catch (const CLI::ParseError& error) {
    throw Refusal(UsageFault(verbs.App(), error) + " (`partnerkit --help` tells more)");
  }
  command.options = options;
  return verbs.Run(command);
}

}  // namespace

int RunProgram(const std::vector<std::string>& arguments, std::ostream& out, std::ostream& err) {
  Options options;
  Command command = {{}, out, err};
  int status = Guarded(command, [&] {
    Verbs verbs(options);
    return ParseAndRun(verbs, arguments, command, options);
  });
  out.flush();
  if (!out) {
    command.Say("standard output cannot be written");
    status = std::max(status, kTurnedAway);
  }
  return status;
}

}  // namespace partnerkit::cli
