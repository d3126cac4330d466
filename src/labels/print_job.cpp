#include "labels/print_job.h"

#include <algorithm>
#include <chrono>
#include <thread>
#include <vector>

#include "values/numbers.h"

namespace partnerkit::labels {

namespace {

// A queue tells of so many jobs at most; then it counts as full.
constexpr std::int32_t kFullQueue = 999;
constexpr std::chrono::milliseconds kPause{100};
// The host's number for a system whose queues needn't be watched.
constexpr std::int32_t kUnwatched = 2;

}  // namespace

bool PrintJob::Open(const std::string& printer, bool drawn) {
  return owner_.Procedure("Function OpenPtr", false, [&](bool& opened) {
    Abandon();
    printer_ = printer;
    if (drawn && !FindInstalled()) return;
    try {
      if (drawn) {
        drawing_ = Printers().OpenDrawing(printer_, owner_.OwnProgId());
      } else {
        raw_ = Printers().OpenRaw(printer_, owner_.OwnProgId());
      }
    } catch (const RunTimeError& error) {
      owner_.WriteLog(error.Number(), "OpenPtr",
                      "Error " + std::to_string(error.Number()) + "Unable to open printer " + printer_);
      return;
    }
    WaitForRoom();
    opened = true;
  });
}

bool PrintJob::FindInstalled() {
  if (owner_.PrintSpooler() == nullptr) return false;
  const auto installed = owner_.Try([&] { return Printers().InstalledPrinters(); });
  const auto entry = std::ranges::find(installed, printer_, &InstalledPrinter::deviceName);
  if (entry == installed.end()) return false;
  twipsPerPixelX_ = RoundHalfEven(entry->twipsPerPixelX, 2);
  twipsPerPixelY_ = RoundHalfEven(entry->twipsPerPixelY, 2);
  return true;
}

void PrintJob::WaitForRoom() {
  owner_.Yield();
  if (owner_.Host().PlatformId() == kUnwatched) return;
  while (SpooledJobCount(printer_) >= kFullQueue) {
    owner_.Yield();
    std::this_thread::sleep_for(kPause);
  }
}

std::int32_t PrintJob::SpooledJobCount(const std::string& printer) {
  return owner_.Procedure("Function SpooledJobCount", std::int32_t{0}, [&](std::int32_t& count) {
    if (printer.empty()) return;
    try {
      count = std::min(Printers().JobCount(printer), kFullQueue);
    } catch (const RunTimeError&) {
      // A printer that can't be asked shows its trouble when the job is sent.
    }
  });
}

void PrintJob::Write(std::string_view text) {
  if (raw_ == nullptr) RaiseNotOpen();
  raw_->Write(text);
}

void PrintJob::NewPage(int width, int length) {
  if (drawing_ == nullptr) RaiseNotOpen();
  if (std::exchange(pageOpen_, false)) drawing_->EndPage();
  drawing_->StartPage(width, length);
  pageOpen_ = true;
}

render::DrawingContext PrintJob::Page() const {
  if (drawing_ == nullptr) RaiseNotOpen();
  return {*drawing_, twipsPerPixelX_, twipsPerPixelY_};
}

bool PrintJob::Close() {
  const std::unique_ptr<RawJob> raw = std::move(raw_);
  const std::unique_ptr<DrawingDevice> drawing = std::move(drawing_);
  try {
    if (raw != nullptr) raw->Close();
    if (drawing != nullptr && std::exchange(pageOpen_, false)) drawing->EndPage();
    if (drawing != nullptr) drawing->EndDoc();
    return true;
  } catch (const RunTimeError& error) {
    owner_.WriteLog(
        error.Number(), "ClosePtr",
        "Error " + std::to_string(error.Number()) + "Unable to print on " + printer_ + ": " + error.Description());
    return false;
  }
}

void PrintJob::Abandon() {
  raw_.reset();
  drawing_.reset();
  pageOpen_ = false;
}

Spooler& PrintJob::Printers() const {
  if (owner_.PrintSpooler() == nullptr) throw RunTimeError(run_time::kPrinter, "There are no printers");
  return *owner_.PrintSpooler();
}

void PrintJob::RaiseNotOpen() const {
  throw RunTimeError(run_time::kPrinter, "No print job is open" + (printer_.empty() ? "" : " on " + printer_));
}

}  // namespace partnerkit::labels
