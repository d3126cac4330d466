// A printer on this machine's network that behaves as told.
#pragma once

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <functional>
#include <string>
#include <thread>

namespace partnerkit::spool {

class FakePrinter {
 public:
  // Does `serve` to one connection; without it, nobody takes the connections.
  explicit FakePrinter(std::function<void(int connection)> serve = {}, int family = AF_INET, int backlog = 4)
      : listener_(socket(family, SOCK_STREAM, 0)), family_(family) {
    // Little room, so that a job soon depends on what the printer reads.
    const int room = 4096;
    setsockopt(listener_, SOL_SOCKET, SO_RCVBUF, &room, sizeof room);
    sockaddr_in6 six{};
    six.sin6_family = AF_INET6;
    six.sin6_addr = in6addr_loopback;
    sockaddr_in four{};
    four.sin_family = AF_INET;
    four.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    sockaddr* own = family == AF_INET6 ? reinterpret_cast<sockaddr*>(&six) : reinterpret_cast<sockaddr*>(&four);
    socklen_t length = family == AF_INET6 ? sizeof six : sizeof four;
    if (bind(listener_, own, length) != 0 || listen(listener_, backlog) != 0 ||
        getsockname(listener_, own, &length) != 0) {
      std::abort();
    }
    port_ = ntohs(family == AF_INET6 ? six.sin6_port : four.sin_port);
    if (serve) thread_ = std::thread([this, serve = std::move(serve)] { Serve(serve); });
  }
  ~FakePrinter() {
    if (thread_.joinable()) thread_.join();
    close(listener_);
  }
  FakePrinter(const FakePrinter&) = delete;
  FakePrinter& operator=(const FakePrinter&) = delete;

  std::string Target() const { return (family_ == AF_INET6 ? "[::1]:" : "127.0.0.1:") + std::to_string(port_); }

  // Reads until `most` bytes are there, or the end; gives them.
  static std::string Read(int connection, std::size_t most) {
    std::string bytes;
    std::array<char, 4096> block{};
    while (bytes.size() < most) {
      const ssize_t count = read(connection, block.data(), std::min(block.size(), most - bytes.size()));
      if (count <= 0) break;
      bytes.append(block.data(), static_cast<std::size_t>(count));
    }
    return bytes;
  }

 private:
  void Serve(const std::function<void(int)>& serve) const {
    const int connection = accept(listener_, nullptr, nullptr);
    if (connection == -1) return;
    serve(connection);
    close(connection);
  }

  int listener_;
  int family_;
  int port_ = 0;
  std::thread thread_;
};

}  // namespace partnerkit::spool
