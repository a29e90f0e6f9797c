#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <thread>

#include "tests/unit/manager/scan/FakeChain.h"

/// A server on this machine for one client, in a thread of its own. What it does with the connection is given; the
/// socket is closed behind it.
class TestServer {
 public:
  using Behaviour = std::function<void(int socket)>;

  /// Over TCP on a free port of 127.0.0.1, or over a UNIX socket when there is a path.
  explicit TestServer(Behaviour behaviour, const std::string& path = "");
  /// Waits for the end of the behaviour.
  ~TestServer();
  TestServer(const TestServer&) = delete;
  TestServer& operator=(const TestServer&) = delete;

  /// As RemoteCable::connect wants it.
  const std::string& address() const { return address_; }
  /// Waits for the end of the behaviour: what it wrote can be read then.
  void join();

  /// Reads until the client closes; gives everything.
  static std::string readAll(int socket);
  /// False when the connection is gone.
  static bool write(int socket, const std::string& bytes);
  /// Serves a chain as the protocol wants it, until the client quits or closes.
  static void serve(int socket, FakeChain& chain);
  /// Answers each sample with the next byte, then with nothing more; gives all that the client sent.
  static std::string answer(int socket, const std::string& answers);
  /// Answers the first `answers` samples with zeros, then closes.
  static void dropAfter(int socket, std::size_t answers);

 private:
  int listener_ = -1;
  std::string path_;
  std::string address_;
  std::thread thread_;
};

/// A port of 127.0.0.1 on which nobody listens.
std::string addressOfNobody();
