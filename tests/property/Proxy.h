#pragma once

#include <atomic>
#include <cstdint>
#include <string>
#include <thread>

/// Stands between a client and a server on this machine, and can cut the connection in the middle. Serves one client
/// after the other until it goes.
class Proxy {
 public:
  /// Forwards to a port of this machine.
  explicit Proxy(std::uint16_t serverPort);
  ~Proxy();
  Proxy(const Proxy&) = delete;
  Proxy& operator=(const Proxy&) = delete;

  /// The port to connect to.
  std::uint16_t port() const { return port_; }
  /// Cuts a connection once so many bytes have come from the client; 0 for never.
  void cutAfter(std::uint64_t bytes) { cutAfter_ = bytes; }
  /// How many bytes the client of the connection that ended last had sent.
  std::uint64_t sent() const { return sent_; }
  /// Whether it was cut.
  bool cut() const { return cut_; }

 private:
  void serve();
  void forward(int client, int server);
  bool forwardOnce(int from, int to, std::uint64_t* count) const;

  std::uint16_t serverPort_;
  std::uint16_t port_ = 0;
  int listener_ = -1;
  std::atomic<bool> ending_ = false;
  std::atomic<std::uint64_t> cutAfter_ = 0;
  std::atomic<std::uint64_t> sent_ = 0;
  std::atomic<bool> cut_ = false;
  std::thread thread_;
};
