#include <filesystem>
#include <memory>
#include <optional>
#include <utility>

#include "cairo/devices.h"
#include "cli/output/json_writer.h"
#include "cli/output/log_report.h"
#include "cli/output/text.h"
#include "cli/verbs/print_labels.h"
#include "cli/workspace/label_host.h"
#include "cli/workspace/workspace.h"
#include "partnerkit/run_time_error.h"
#include "partnerkit/spooling.h"

namespace partnerkit::cli {

namespace {

constexpr std::string_view kPreview = "preview";
constexpr double kTwipsPerDot = 1440.0 / 300;

using MakeDevice = std::unique_ptr<DrawingDevice> (*)(ByteSink sink);

// By the ending of the file's name.
MakeDevice DeviceFor(const std::string& file) {
  const std::string ending = std::filesystem::path(file).extension().string();
  if (ending == ".png") return [](ByteSink sink) { return cairo::MakePngDevice(std::move(sink)); };
  if (ending == ".pdf") return [](ByteSink sink) { return cairo::MakePdfDevice(std::move(sink)); };
  if (ending == ".svg") return [](ByteSink sink) { return cairo::MakeSvgDevice(std::move(sink)); };
  throw Refusal("--out " + file + ": wants a name that ends in .png, .pdf or .svg");
}

// An ordinary printer whose pages are kept.
class PreviewPrinter : public Spooler {
 public:
  explicit PreviewPrinter(MakeDevice makeDevice) : makeDevice_(makeDevice) {}

  std::vector<InstalledPrinter> InstalledPrinters() override {
    return {{std::string(kPreview), kTwipsPerDot, kTwipsPerDot}};
  }
  std::unique_ptr<RawJob> OpenRaw(const std::string& printer, const std::string&) override {
    throw RunTimeError(run_time::kPrinter, printer + " only takes drawings");
  }
  std::unique_ptr<DrawingDevice> OpenDrawing(const std::string&, const std::string&) override {
    return makeDevice_([this](std::string_view bytes) { document_ += bytes; });
  }
  std::int32_t JobCount(const std::string&) override { return 0; }

  const std::string& Document() const { return document_; }

 private:
  MakeDevice makeDevice_;
  std::string document_;
};

// A file of that name is there whole or not at all.
void WriteWhole(Files& files, const std::string& name, std::string_view bytes) {
  std::string draft;
  try {
    const std::unique_ptr<OutputFile> file = files.OpenDraft(name, draft);
    file->Write(bytes);
    file->Sync();
    files.Rename(draft, name);
    file->Close();
  } catch (const RunTimeError& error) {
    std::error_code ignored;
    std::filesystem::remove(draft, ignored);
    throw Failure(error.Description());
  }
}

void Report(const Command& command, const std::string& file, std::int32_t pack, bool drawn, const LabelHost& host,
            RecordStore& store) {
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("results");
    json.BeginArray();
    json.BeginObject();
    json.Name("pack");
    json.Int(pack);
    json.Name("result");
    json.Bool(drawn);
    json.EndObject();
    json.EndArray();
    json.Name("files");
    json.BeginArray();
    if (drawn) json.String(file);
    json.EndArray();
    WriteLogRecords(json, host.LogIds(), store);
    json.EndObject();
    return;
  }
  for (const std::string& message : LogMessages(host.LogIds(), store)) command.out << OneLine(message) << '\n';
  if (drawn) command.out << "Drew the label of pack " << pack << ": " << OneLine(file) << ".\n";
}

}  // namespace

int PreviewLabel(const Command& command, const std::string& className, std::int32_t packId, const std::string& file) {
  PreviewPrinter printer(DeviceFor(file));
  Workspace workspace(command);
  LabelHost host(workspace.Host(), {}, "WinPCL");
  Ports ports = workspace.ClassPorts();
  ports.spooler = &printer;
  const std::unique_ptr<LabelClass> label = MakeLabelClass(className, ports);
  const std::optional<Pack> pack = FindPack(command, workspace, packId);
  const bool drawn = pack && label->Init(host, std::string(kPreview)) && label->PrintLabel(*pack);
  if (drawn) WriteWhole(*ports.files, file, printer.Document());
  workspace.Host().Commit(0);
  Report(command, file, packId, drawn, host, workspace.Host().Records());
  const bool stored = workspace.CloseStore();
  return drawn && stored && !workspace.HadFault() ? kDone : kTurnedAway;
}

}  // namespace partnerkit::cli
