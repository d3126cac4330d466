// Where print jobs go. The label and ticket classes ask for these; the bundled program answers with folders, CUPS
// queues and sockets.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace partnerkit {

class DrawingDevice;

struct InstalledPrinter {
  std::string deviceName;
  // Size of a dot in twentieths of a point: 1440 divided by the dots an inch, 4.8 at 300.
  double twipsPerPixelX;
  double twipsPerPixelY;
};

// A job whose bytes reach the printer as they are. It is delivered at Close, as a whole; one that is let go without
// Close is abandoned, and one without a byte is no job. Every operation may raise RunTimeError; after a failed Close
// the job is still whole, so that Close may be called again. A job must not outlive its spooler.
class RawJob {
 public:
  virtual ~RawJob() = default;
  virtual void Write(std::string_view bytes) = 0;
  virtual void Close() = 0;
};

// Printers by name, which is compared exactly. Every operation but InstalledPrinters raises RunTimeError for a name
// that no printer has.
class Spooler {
 public:
  virtual ~Spooler() = default;
  virtual std::vector<InstalledPrinter> InstalledPrinters() = 0;
  // `document` is the job's name, as a print queue shows it.
  virtual std::unique_ptr<RawJob> OpenRaw(const std::string& printer, const std::string& document) = 0;
  // A job that is drawn. It is delivered as the device says.
  virtual std::unique_ptr<DrawingDevice> OpenDrawing(const std::string& printer, const std::string& document) = 0;
  // Jobs that wait at the printer, at most 999. Raises RunTimeError when the printer cannot be asked.
  virtual std::int32_t JobCount(const std::string& printer) = 0;
};

}  // namespace partnerkit
