// A place that takes print jobs, one at a time.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <sstream>
#include <string>
#include <string_view>

namespace partnerkit::spool {

// How long a destination is waited for before a job has failed.
struct TimeOuts {
  std::chrono::milliseconds connect{10'000};  // a connection, the look-up of the printer's name included
  std::chrono::milliseconds stall{20'000};    // no byte taken, no answer, or a folder that another program holds
  std::chrono::milliseconds closing{5'000};   // a printer that has every byte may close the connection; then it is done
};

inline std::string InSeconds(std::chrono::milliseconds time) {
  std::ostringstream text;
  text << static_cast<double>(time.count()) / 1000 << " s";
  return text.str();
}

enum class Content { kRaw, kPdf };

// Every operation may raise RunTimeError, whose description names the destination and the cause.
class Destination {
 public:
  virtual ~Destination() = default;
  // Delivers a job and gives the name that it can be found by.
  virtual std::string Deliver(std::string_view bytes, Content content, const std::string& document) = 0;
  // Raises the reason why jobs would fail or wait, as far as can be seen without one.
  virtual void Check() = 0;
  // Jobs that wait, at most 999; a destination that keeps none has none.
  virtual std::int32_t JobCount() { return 0; }
};

// One numbered file for each job: "0001.prn", "0002.pdf".
std::unique_ptr<Destination> MakeFolder(const std::string& folder, const TimeOuts& timeOuts);

// A queue of the CUPS server that the environment's CUPS_SERVER or CUPS's client.conf names, else of this machine.
// Its jobs are named "cups:queue/17"; one that the queue took is delivered, even while the queue is stopped.
std::unique_ptr<Destination> MakeCupsQueue(const std::string& queue, const TimeOuts& timeOuts);

// A printer that prints what it is sent over TCP: "host", "host:port" or "[address]:port", the port 9100 where none is
// given. Jobs are named "tcp:host:9100".
std::unique_ptr<Destination> MakeSocket(const std::string& target, const TimeOuts& timeOuts);

// A port that labels go to directly: the path of a device, "LPT1" and "COM1" and so on for this machine's own, or else
// a socket's target. Jobs are named "port:/dev/lp0".
std::unique_ptr<Destination> MakePort(const std::string& port, const TimeOuts& timeOuts);

}  // namespace partnerkit::spool
