#include "interfaces/portability/Stream.h"

#include <algorithm>
#include <cstring>

#include "interfaces/portability/Secret.h"
#include "portability/Descriptor.h"

namespace Port {
namespace {

constexpr std::size_t bufferSize = 65536;
constexpr char substitute = 0x1A;

}  // namespace

Stream::Stream(std::string path, int descriptor, bool writing, bool ownsDescriptor)
    : path_(std::move(path)),
      descriptor_(descriptor),
      writing_(writing),
      ownsDescriptor_(ownsDescriptor),
      buffer_(bufferSize) {}

Stream::~Stream() { close(); }

bool Stream::fill() {
  // What is not yet taken moves to the front; at most a look-ahead of one byte.
  std::copy(buffer_.data() + begin_, buffer_.data() + end_, buffer_.data());
  end_ -= begin_;
  begin_ = wiped_ = 0;
  char* const free = buffer_.data() + end_;
  const long count = Descriptor::read(descriptor_, free, buffer_.size() - end_, error_);
  if (count <= 0) return false;
  end_ += static_cast<std::size_t>(count);
  if (std::memchr(free, '\0', static_cast<std::size_t>(count)) != nullptr)
    std::replace(free, free + count, '\0', substitute);
  return true;
}

std::size_t Stream::takeLineEnd() {
  for (const std::string_view lineEnd : {std::string_view("\n"), std::string_view("\r\n")}) {
    std::size_t matched = 0;
    while (matched < lineEnd.size() && (begin_ + matched < end_ || fill()) &&
           buffer_[begin_ + matched] == lineEnd[matched])
      ++matched;
    if (matched < lineEnd.size()) continue;
    begin_ += matched;
    return matched;
  }
  return 0;
}

bool Stream::readline(Stream& stream, char* buffer, int size) {
  const std::size_t room = static_cast<std::size_t>(size) - 1;
  std::size_t length = 0;
  bool any = false;
  bool ended = false;
  while (!ended && length < room) {
    if (stream.begin_ == stream.end_ && !stream.fill()) break;
    any = true;
    const char* from = stream.buffer_.data() + stream.begin_;
    const std::size_t wanted = std::min(stream.end_ - stream.begin_, room - length);
    const auto* lineEnd = static_cast<const char*>(std::memchr(from, '\n', wanted));
    ended = lineEnd != nullptr;
    const std::size_t taken = ended ? static_cast<std::size_t>(lineEnd - from) : wanted;
    std::memcpy(buffer + length, from, taken);
    length += taken;
    stream.begin_ += taken + (ended ? 1 : 0);
  }
  // A line of exactly the buffer's length takes its line end along, of which the `\r` may be in the buffer.
  if (!ended && length == room) ended = stream.takeLineEnd() == 1;
  // A line that a read error cuts off is no line.
  if (!any || stream.error_ != 0) return false;
  if (ended && length > 0 && buffer[length - 1] == '\r') --length;
  buffer[length] = '\0';
  return true;
}

void Stream::wipeRead() {
  Secret::wipe(buffer_.data() + wiped_, begin_ - wiped_);
  wiped_ = begin_;
}

Stream& Stream::write(std::string_view text) {
  while (!text.empty()) {
    const std::size_t count = std::min(text.size(), buffer_.size() - end_);
    std::memcpy(buffer_.data() + end_, text.data(), count);
    end_ += count;
    text.remove_prefix(count);
    if (end_ == buffer_.size()) flush();
  }
  return *this;
}

Stream& Stream::flush() {
  if (writing_) Descriptor::write(descriptor_, buffer_.data(), end_, error_);
  if (writing_) end_ = 0;
  return *this;
}

bool Stream::close() {
  if (descriptor_ >= 0) {
    flush();
    if (ownsDescriptor_) Descriptor::close(descriptor_, error_);
  }
  descriptor_ = -1;
  return error_ == 0;
}

Stream& endl(Stream& stream) { return stream.write("\n").flush(); }

}  // namespace Port
