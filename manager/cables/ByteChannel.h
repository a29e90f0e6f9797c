#pragma once

#include <cstddef>
#include <span>

#include "manager/support/Result.h"

/// Bytes to and from a peer. `send` and `receive` never wait. Failures are of kind `link`, and their text says what
/// happened only, such as "Connection refused": the caller knows to whom.
class ByteChannel {
 public:
  virtual ~ByteChannel() = default;

  /// How many of the bytes went on their way; 0 when there is no room now.
  virtual Result<std::size_t> send(std::span<const char> bytes) = 0;
  /// How many bytes came; 0 when there are none now. That the peer closed the connection is a failure.
  virtual Result<std::size_t> receive(std::span<char> bytes) = 0;
  /// Waits until there is something to receive, or room to send when that is asked for; false when there was
  /// neither for so many seconds.
  virtual Result<bool> wait(bool forReceiving, bool forSending, double seconds) = 0;
};
