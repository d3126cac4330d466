#include "spool/printer_spooler.h"

#include <algorithm>
#include <utility>

#include "partnerkit/run_time_error.h"
#include "platform/posix_calls.h"
#include "spool/drawing_job.h"

namespace partnerkit::spool {

namespace fs = std::filesystem;

namespace {

constexpr double kTwipsPerDot = 1440.0 / 300;

}  // namespace

// Kept here until it is complete: a printer that has bytes cannot be made to forget them.
class PrinterSpooler::Job : public RawJob {
 public:
  Job(PrinterSpooler& spooler, std::shared_ptr<Destination> destination, std::string document, Content content)
      : spooler_(spooler), destination_(std::move(destination)), document_(std::move(document)), content_(content) {}

  void Write(std::string_view bytes) override {
    CheckOpen();
    bytes_.append(bytes);
  }

  void Close() override {
    CheckOpen();
    if (!bytes_.empty()) spooler_.AddJob(destination_->Deliver(bytes_, content_, document_));
    destination_.reset();
  }

 private:
  void CheckOpen() const {
    if (!destination_) platform::Raise(run_time::kBadFileName, document_, "The print job is closed");
  }

  PrinterSpooler& spooler_;
  std::shared_ptr<Destination> destination_;
  std::string document_;
  Content content_;
  std::string bytes_;
};

PrinterSpooler::PrinterSpooler(std::vector<Printer> printers, fs::path workspace, PdfDeviceFactory makePdfDevice,
                               const TimeOuts& timeOuts)
    : printers_(std::move(printers)),
      workspace_(std::move(workspace)),
      makePdfDevice_(std::move(makePdfDevice)),
      timeOuts_(timeOuts) {
  if (std::ranges::find(printers_, kFilePrinter, &Printer::Name) == printers_.end()) {
    printers_.push_back({std::string(kFilePrinter), "file", (workspace_ / kSpoolFolder).string()});
  }
}

std::vector<InstalledPrinter> PrinterSpooler::InstalledPrinters() {
  std::vector<InstalledPrinter> installed;
  for (const Printer& printer : printers_) installed.push_back({printer.Name, kTwipsPerDot, kTwipsPerDot});
  return installed;
}

std::unique_ptr<RawJob> PrinterSpooler::OpenRaw(const std::string& printer, const std::string& document) {
  return OpenJob(printer, document, Content::kRaw);
}

std::unique_ptr<DrawingDevice> PrinterSpooler::OpenDrawing(const std::string& printer, const std::string& document) {
  if (!makePdfDevice_) platform::Raise(run_time::kPrinter, printer, "Drawings are not printed here");
  std::shared_ptr<RawJob> job = OpenJob(printer, document, Content::kPdf);
  auto device = makePdfDevice_([job](std::string_view bytes) { job->Write(bytes); }, document);
  return std::make_unique<DrawingJob>(std::move(device), std::move(job));
}

std::int32_t PrinterSpooler::JobCount(const std::string& printer) { return DestinationOf(printer)->JobCount(); }

std::unique_ptr<RawJob> PrinterSpooler::OpenJob(const std::string& printer, const std::string& document,
                                                Content content) {
  return std::make_unique<Job>(*this, DestinationOf(printer), document, content);
}

void PrinterSpooler::Check(const std::string& printer) { DestinationOf(printer)->Check(); }

std::shared_ptr<Destination> PrinterSpooler::DestinationOf(const std::string& name) {
  std::shared_ptr<Destination>& known = destinations_[name];
  if (known == nullptr) known = MakeDestination(name);
  return known;
}

std::unique_ptr<Destination> PrinterSpooler::MakeDestination(const std::string& name) const {
  const auto printer = std::ranges::find(printers_, name, &Printer::Name);
  if (printer == printers_.end()) platform::Raise(run_time::kPrinter, name, "There is no such printer");
  const std::string target = printer->Target.value_or("");
  if (target.empty()) platform::Raise(run_time::kPrinter, name, "The printer's record has no Target");
  if (printer->Kind == "file") return MakeFolder((workspace_ / target).string(), timeOuts_);
  if (printer->Kind == "cups") return MakeCupsQueue(target, timeOuts_);
  if (printer->Kind == "tcp") return MakeSocket(target, timeOuts_);
  platform::Raise(run_time::kPrinter, name, "The printer's Kind \"" + printer->Kind + "\" is not file, cups or tcp");
}

void PrinterSpooler::SendToPort(const std::string& port, std::string_view bytes) {
  if (!bytes.empty()) AddJob(MakePort(port, timeOuts_)->Deliver(bytes, Content::kRaw, port));
}

void PrinterSpooler::AddJob(const std::string& name) {
  const fs::path below = fs::path(name).lexically_normal().lexically_relative(workspace_.lexically_normal());
  jobs_.push_back(below.empty() || *below.begin() == ".." ? name : below.string());
}

}  // namespace partnerkit::spool
