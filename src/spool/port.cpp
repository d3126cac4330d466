#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <cerrno>

#include "platform/posix_calls.h"
#include "spool/destination.h"

namespace partnerkit::spool {

using platform::Descriptor, platform::RaiseCause, platform::Uninterrupted;

namespace {

class Device : public Destination {
 public:
  Device(std::string path, const TimeOuts& timeOuts) : path_(std::move(path)), timeOuts_(timeOuts) {}

  std::string Deliver(std::string_view bytes, Content, const std::string&) override {
    Descriptor device = Open();
    for (std::string_view left = bytes; !left.empty();) {
      WaitForRoom(device, bytes.size() - left.size());
      const ssize_t taken = Uninterrupted([&] { return write(device.Number(), left.data(), left.size()); });
      if (taken >= 0) {
        left.remove_prefix(static_cast<std::size_t>(taken));
      } else if (errno != EAGAIN) {
        RaiseCause(errno, path_, run_time::kDeviceError);
      }
    }
    if (const int cause = device.Close(); cause != 0) RaiseCause(cause, path_, run_time::kDeviceError);
    return "port:" + path_;
  }

  void Check() override { Open(); }

 private:
  // Without waiting for a line that nobody answers on.
  Descriptor Open() const {
    constexpr int kMode = O_WRONLY | O_APPEND | O_NOCTTY | O_NONBLOCK | O_CLOEXEC;
    Descriptor device(Uninterrupted([&] { return open(path_.c_str(), kMode); }));
    if (!device.IsOpen()) RaiseCause(errno, path_, run_time::kDeviceError);
    return device;
  }

  void WaitForRoom(const Descriptor& device, std::size_t sent) const {
    pollfd room{device.Number(), POLLOUT, 0};
    const int ready = Uninterrupted([&] { return poll(&room, 1, static_cast<int>(timeOuts_.stall.count())); });
    if (ready < 0) RaiseCause(errno, path_, run_time::kDeviceError);
    if (ready > 0) return;
    platform::Raise(
        run_time::kDeviceError, path_,
        "The port has taken nothing for " + InSeconds(timeOuts_.stall) + ", after " + std::to_string(sent) + " bytes");
  }

  std::string path_;
  TimeOuts timeOuts_;
};

// "LPT1" and "COM2" by the names that this system gives the same lines; empty for any other.
std::string OwnLine(std::string_view port) {
  if (port.ends_with(':')) port.remove_suffix(1);
  const bool numbered = port.size() == 4 && port[3] >= '1' && port[3] <= '9';
  const std::string number = numbered ? std::string(1, static_cast<char>(port[3] - 1)) : "";
  if (numbered && port.starts_with("LPT")) return "/dev/lp" + number;
  if (numbered && port.starts_with("COM")) return "/dev/ttyS" + number;
  return {};
}

}  // namespace

std::unique_ptr<Destination> MakePort(const std::string& port, const TimeOuts& timeOuts) {
  if (const std::string line = OwnLine(port); !line.empty()) return std::make_unique<Device>(line, timeOuts);
  if (port.find('/') != std::string::npos) return std::make_unique<Device>(port, timeOuts);
  return MakeSocket(port, timeOuts);
}

}  // namespace partnerkit::spool
