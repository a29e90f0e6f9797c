#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "manager/simulator/BitbangDecoder.h"
#include "manager/simulator/SimulatedBoard.h"
#include "manager/support/Result.h"

/// Serves a board to remote-bitbang clients, one at a time: while one is there, others are let in and sent away at
/// once. Real time passes on the board besides the periods of its clocks. One thread, but for `stop`.
class BoardServer {
 public:
  /// An open file of the system, closed at the end.
  class Handle {
   public:
    explicit Handle(int number = -1) : number_(number) {}
    Handle(Handle&& other) noexcept : number_(other.number_) { other.number_ = -1; }
    Handle& operator=(Handle&& other) noexcept;
    ~Handle();
    int number() const { return number_; }
    bool open() const { return number_ >= 0; }

   private:
    int number_;
  };

  explicit BoardServer(SimulatedBoard& board);

  /// Waits for clients at a host's name or address; port "0" has one chosen.
  Status listen(const std::string& host, const std::string& port);
  /// Such as "127.0.0.1:3335".
  const std::string& address() const { return address_; }

  /// Serves clients until `stop`; with `once` until the first one is gone. The board is saved after each.
  Status run(bool once);
  /// Serves the client at the other end of a connected socket until it is gone.
  void serve(Handle client);
  /// Ends `run` and `serve`; from any thread or signal handler.
  void stop();

 private:
  bool stopped() const;
  void refuseClient();
  bool waitFor(int client, bool input, bool output);
  bool receive(int client);
  bool send(int client);
  /// Gives a client that has sent all its bytes the rest of the answers.
  void sendRest(int client);
  std::size_t queued() const { return answers_.size() - sent_; }
  void passTime();

  SimulatedBoard& board_;
  Handle listener_;
  Handle stopReader_;
  Handle stopWriter_;
  std::string address_;
  std::unique_ptr<BitbangDecoder> decoder_;
  std::vector<std::uint8_t> input_;
  std::vector<std::uint8_t> answers_;
  std::size_t sent_ = 0;
  std::chrono::steady_clock::time_point lastTime_;
  bool readable_ = false;
  bool writable_ = false;
  bool hungUp_ = false;
};
