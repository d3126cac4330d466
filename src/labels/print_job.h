// The print job that a label or ticket class has open: raw text for a label printer, or drawn pages.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "frame/hosted_class.h"
#include "partnerkit/drawing.h"
#include "partnerkit/spooling.h"
#include "render/drawing.h"

namespace partnerkit::labels {

class PrintJob {
 public:
  // `owner` writes the log and has the handler that failures reach.
  explicit PrintJob(HostedClass& owner) : owner_(owner) {}

  // Opens a job in the name of the class, and waits while the printer's queue is full. False, with a log record, when
  // it cannot be opened; a printer to draw on that isn't installed is passed over without one, for the host offers the
  // installed ones.
  bool Open(const std::string& printer, bool drawn);
  bool IsOpen() const { return raw_ != nullptr || drawing_ != nullptr; }

  // Raises RunTimeError when no raw job is open.
  void Write(std::string_view text);
  // A new page of the size, in hundredths of an inch. Raises RunTimeError when no drawn job is open.
  void NewPage(int width, int length);
  // What to draw on it with. Raises as well.
  render::DrawingContext Page() const;

  // Delivers the job. False, with a log record, when that failed; the job is then lost. Without an open job, nothing.
  bool Close();

  // Gives up an open job; nothing of it is delivered.
  void Abandon();

  std::int32_t SpooledJobCount(const std::string& printer);

 private:
  bool FindInstalled();
  void WaitForRoom();
  Spooler& Printers() const;
  [[noreturn]] void RaiseNotOpen() const;

  HostedClass& owner_;
  std::string printer_;
  std::unique_ptr<RawJob> raw_;
  std::unique_ptr<DrawingDevice> drawing_;
  double twipsPerPixelX_ = 0, twipsPerPixelY_ = 0;
  bool pageOpen_ = false;
};

}  // namespace partnerkit::labels
