#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "manager/cables/ByteChannel.h"

/// Where a server listens: a host and a port, or the path of a UNIX socket.
struct ServerAddress {
  std::string host;  ///< a name or an address; empty for a UNIX socket
  std::uint16_t port = 0;
  std::string path;

  /// HOST, HOST:PORT, [ADDRESS], [ADDRESS]:PORT or unix:PATH. More than one colon without brackets is an address.
  static Result<ServerAddress> parse(std::string_view text, std::uint16_t defaultPort);
  /// As it is written, with the port.
  std::string text() const;
};

namespace Socket {

/// Tries the addresses of the host one after the other, for so many seconds in all. The look-up of the name has the
/// system's own time limit.
Result<std::unique_ptr<ByteChannel>> connect(const ServerAddress& address, double seconds);
/// One text for one server, however its host is written: the first numeric address that the host has, this machine
/// by one name. The text of the address itself when the host can't be looked up.
std::string resolved(const ServerAddress& address);
/// A channel over a connected socket, which it closes.
std::unique_ptr<ByteChannel> over(int descriptor);

}  // namespace Socket
