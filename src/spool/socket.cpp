#include <linux/sockios.h>
#include <netdb.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <future>
#include <iterator>
#include <thread>

#include "platform/posix_calls.h"
#include "spool/destination.h"

namespace partnerkit::spool {

using platform::CauseText, platform::Descriptor, platform::Uninterrupted;
using Clock = std::chrono::steady_clock;

namespace {

constexpr std::uint16_t kUsualPort = 9100;
// What a printer has acknowledged wakes nobody up; it is looked at this often.
constexpr std::chrono::milliseconds kLookAgain{20};

struct Address {
  std::string host;
  std::uint16_t port = kUsualPort;

  // "tcp:host:9100"; colons within the host stand in brackets.
  std::string Name() const {
    return "tcp:" + (host.find(':') == std::string::npos ? host : "[" + host + "]") + ":" + std::to_string(port);
  }
};

Address ParseAddress(const std::string& target) {
  const auto refuse = [&] {
    platform::Raise(run_time::kPrinter, "tcp:" + target, "The target is not a host, or host:port");
  };
  std::string_view host = target, port;
  if (target.starts_with('[')) {
    const std::size_t end = target.find(']');
    if (end == std::string::npos || (end + 1 < target.size() && target[end + 1] != ':')) refuse();
    host = std::string_view(target).substr(1, end - 1);
    port = std::string_view(target).substr(end + 1);
  } else if (std::ranges::count(target, ':') == 1) {
    host = host.substr(0, target.find(':'));
    port = std::string_view(target).substr(host.size());
  }
  Address address{std::string(host)};
  if (host.empty()) refuse();
  if (port.empty()) return address;
  port.remove_prefix(1);
  const auto read = std::from_chars(port.data(), port.data() + port.size(), address.port);
  if (read.ec != std::errc() || read.ptr != port.data() + port.size() || address.port == 0) refuse();
  return address;
}

std::chrono::milliseconds Until(Clock::time_point deadline) {
  return std::max(std::chrono::ceil<std::chrono::milliseconds>(deadline - Clock::now()), std::chrono::milliseconds(0));
}

short Poll(int socket, short events, std::chrono::milliseconds time) {
  pollfd entry = {socket, events, 0};
  Uninterrupted([&] { return poll(&entry, 1, static_cast<int>(time.count())); });
  return entry.revents;
}

// Takes the error that waits on the socket; 0 for none.
int TakeError(int socket) {
  int error = 0;
  socklen_t length = sizeof error;
  return getsockopt(socket, SOL_SOCKET, SO_ERROR, &error, &length) == 0 ? error : errno;
}

struct FreeAddresses {
  void operator()(addrinfo* list) const { freeaddrinfo(list); }
};
using AddressList = std::unique_ptr<addrinfo, FreeAddresses>;

// The system's look-up of a name cannot be told how long to take, so it has a thread, which may be left behind.
AddressList LookUp(const Address& address, Clock::time_point deadline, std::string& failure) {
  std::packaged_task<std::pair<int, AddressList>()> lookUp([host = address.host, port = std::to_string(address.port)] {
    addrinfo wanted{};
    wanted.ai_socktype = SOCK_STREAM;
    wanted.ai_flags = AI_NUMERICSERV;
    addrinfo* list = nullptr;
    const int status = getaddrinfo(host.c_str(), port.c_str(), &wanted, &list);
    return std::pair(status, AddressList(status == 0 ? list : nullptr));
  });
  auto answer = lookUp.get_future();
  std::thread(std::move(lookUp)).detach();
  if (answer.wait_until(deadline) != std::future_status::ready) {
    failure = "Its name was not found in time";
    return {};
  }
  auto [status, list] = answer.get();
  if (status != 0) failure = "Its name cannot be found: " + std::string(gai_strerror(status));
  return std::move(list);
}

Descriptor ConnectTo(const addrinfo& address, Clock::time_point deadline, std::string& failure) {
  Descriptor made(socket(address.ai_family, address.ai_socktype | SOCK_NONBLOCK | SOCK_CLOEXEC, address.ai_protocol));
  int error = 0;
  if (!made.IsOpen() || (connect(made.Number(), address.ai_addr, address.ai_addrlen) != 0 && errno != EINPROGRESS)) {
    error = errno;
  } else {
    error = Poll(made.Number(), POLLOUT, Until(deadline)) == 0 ? ETIMEDOUT : TakeError(made.Number());
  }
  if (error == 0) return made;
  failure = CauseText(error);
  return {};
}

Descriptor Connect(const Address& address, std::chrono::milliseconds patience) {
  const auto deadline = Clock::now() + patience;
  std::string failure;
  const AddressList list = LookUp(address, deadline, failure);
  int left = 0;
  for (const addrinfo* one = list.get(); one != nullptr; one = one->ai_next) ++left;
  for (const addrinfo* one = list.get(); one != nullptr; one = one->ai_next) {
    // An address that nobody answers at leaves the others their share of the time.
    Descriptor made = ConnectTo(*one, Clock::now() + Until(deadline) / left--, failure);
    if (made.IsOpen()) return made;
  }
  platform::Raise(run_time::kPrinter, address.Name(), "No connection: " + failure);
}

// One job on its way through a connection.
class Transfer {
 public:
  Transfer(const Address& address, const TimeOuts& timeOuts, std::string_view bytes)
      : address_(address), timeOuts_(timeOuts), bytes_(bytes), socket_(Connect(address, timeOuts.connect)) {}

  // Returns when the printer has acknowledged every byte and closed the connection, or had time to.
  void Run() {
    auto progressAt = Clock::now();
    while (true) {
      if (const int error = TakeError(socket_.Number()); error != 0) Fail(CauseText(error));
      Send();
      DiscardAnswers();
      if (const std::size_t taken = Acknowledged(); taken != taken_) {
        taken_ = taken;
        progressAt = Clock::now();
      }
      const bool done = ended_ && Unacknowledged() == 0;
      if (done && peerClosed_) return CheckBroken();
      const auto deadline = progressAt + (done ? timeOuts_.closing : timeOuts_.stall);
      if (Until(deadline) == std::chrono::milliseconds(0)) {
        if (done) return;
        Fail("It took no more for " + InSeconds(timeOuts_.stall));
      }
      Wait(deadline);
    }
  }

 private:
  void Send() {
    while (sent_ < bytes_.size()) {
      const ssize_t count = Uninterrupted(
          [&] { return send(socket_.Number(), bytes_.data() + sent_, bytes_.size() - sent_, MSG_NOSIGNAL); });
      if (count < 0 && errno == EAGAIN) return;
      if (count < 0) Fail(CauseText(errno));
      sent_ += static_cast<std::size_t>(count);
    }
    if (!std::exchange(ended_, true)) shutdown(socket_.Number(), SHUT_WR);
  }

  // Printers tell their state while they print. Left unread, it would break the connection when it is closed. A printer
  // that sends nothing may end its own side at once and still listen.
  void DiscardAnswers() {
    if (peerClosed_) return;
    std::array<char, 65536> answer;
    const ssize_t count = Uninterrupted([&] { return recv(socket_.Number(), answer.data(), answer.size(), 0); });
    if (count < 0 && errno != EAGAIN) Fail(CauseText(errno));
    peerClosed_ = count == 0;
  }

  // Bytes that the printer's side hasn't confirmed; the end of the transmission counts as one.
  std::size_t Unacknowledged() const {
    int count = 0;
    return ioctl(socket_.Number(), SIOCOUTQ, &count) == 0 ? static_cast<std::size_t>(count) : 0;
  }
  std::size_t Acknowledged() const { return sent_ - std::min(sent_, Unacknowledged()); }

  void Wait(Clock::time_point deadline) const {
    const bool sending = sent_ < bytes_.size();
    const auto events = static_cast<short>((sending ? POLLOUT : 0) | (peerClosed_ ? 0 : POLLIN));
    // A connection that both sides have ended counts as ready at any time.
    Poll(events == 0 ? -1 : socket_.Number(), events, std::min(Until(deadline), kLookAgain));
  }

  void CheckBroken() {
    if (const int error = TakeError(socket_.Number()); error != 0) Fail(CauseText(error));
  }

  [[noreturn]] void Fail(std::string_view cause) const {
    platform::Raise(run_time::kPrinter, address_.Name(),
                    "It took " + std::to_string(Acknowledged()) + " of " + std::to_string(bytes_.size()) +
                        " bytes, then failed: " + std::string(cause));
  }

  const Address& address_;
  const TimeOuts& timeOuts_;
  std::string_view bytes_;
  Descriptor socket_;
  std::size_t sent_ = 0, taken_ = 0;
  bool ended_ = false, peerClosed_ = false;
};

class SocketDestination : public Destination {
 public:
  SocketDestination(const std::string& target, const TimeOuts& timeOuts)
      : address_(ParseAddress(target)), timeOuts_(timeOuts) {}

  std::string Deliver(std::string_view bytes, Content, const std::string&) override {
    Transfer(address_, timeOuts_, bytes).Run();
    return address_.Name();
  }
  void Check() override { Connect(address_, timeOuts_.connect); }

 private:
  Address address_;
  TimeOuts timeOuts_;
};

}  // namespace

std::unique_ptr<Destination> MakeSocket(const std::string& target, const TimeOuts& timeOuts) {
  return std::make_unique<SocketDestination>(target, timeOuts);
}

}  // namespace partnerkit::spool
