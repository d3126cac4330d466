// The spooler of the bundled program: printers are the `Printer` records of the workspace.
#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "files/byte_sink.h"
#include "partnerkit/records.h"
#include "partnerkit/spooling.h"
#include "spool/destination.h"

namespace partnerkit::spool {

// The printer that is there without a record, and its folder below the workspace.
inline constexpr std::string_view kFilePrinter = "file";
inline constexpr std::string_view kSpoolFolder = "spool";

// Makes a device that gives its document to `pdf`, the last of it at EndDoc; `title` is the document's.
using PdfDeviceFactory = std::function<std::unique_ptr<DrawingDevice>(ByteSink pdf, const std::string& title)>;

class PrinterSpooler : public Spooler {
 public:
  // Folders of printers are relative to the workspace, where they aren't absolute.
  PrinterSpooler(std::vector<Printer> printers, std::filesystem::path workspace, PdfDeviceFactory makePdfDevice = {},
                 const TimeOuts& timeOuts = {});

  // Every printer at 300 dots an inch.
  std::vector<InstalledPrinter> InstalledPrinters() override;
  std::unique_ptr<RawJob> OpenRaw(const std::string& printer, const std::string& document) override;
  // The job is a PDF, delivered at the device's EndDoc.
  std::unique_ptr<DrawingDevice> OpenDrawing(const std::string& printer, const std::string& document) override;
  // 0 for folders and sockets, which hold no queue.
  std::int32_t JobCount(const std::string& printer) override;

  // Sends text to a port, past all printers; it counts as a job.
  void SendToPort(const std::string& port, std::string_view bytes);

  // Raises the reason why the printer would not take a job now.
  void Check(const std::string& printer);

  const std::vector<Printer>& Printers() const { return printers_; }
  // Every job delivered so far, in order: a file's path, relative to the workspace when it is below it, "cups:queue/17"
  // or "tcp:host:9100".
  const std::vector<std::string>& Jobs() const { return jobs_; }

 private:
  class Job;

  std::unique_ptr<RawJob> OpenJob(const std::string& printer, const std::string& document, Content content);
  std::shared_ptr<Destination> DestinationOf(const std::string& printer);
  std::unique_ptr<Destination> MakeDestination(const std::string& printer) const;
  void AddJob(const std::string& name);

  std::vector<Printer> printers_;
  std::filesystem::path workspace_;
  PdfDeviceFactory makePdfDevice_;
  TimeOuts timeOuts_;
  std::map<std::string, std::shared_ptr<Destination>> destinations_;  // by printer
  std::vector<std::string> jobs_;
};

}  // namespace partnerkit::spool
