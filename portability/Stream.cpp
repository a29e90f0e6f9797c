#include "interfaces/portability/Stream.h"

#include <algorithm>
#include <cstring>

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
  begin_ = end_ = 0;
  const long count = Descriptor::read(descriptor_, buffer_.data(), buffer_.size(), error_);
  end_ = count > 0 ? static_cast<std::size_t>(count) : 0;
  if (std::memchr(buffer_.data(), '\0', end_) != nullptr)
    std::replace(buffer_.data(), buffer_.data() + end_, '\0', substitute);
  return end_ > 0;
}

bool Stream::readline(Stream& stream, char* buffer, int size) {
  const std::size_t room = static_cast<std::size_t>(size) - 1;
  std::size_t length = 0;
  bool any = false;
  bool ended = false;
  while (!ended) {
    if (stream.begin_ == stream.end_ && !stream.fill()) break;
    any = true;
    const char* from = stream.buffer_.data() + stream.begin_;
    // One more than fits, so that a line of exactly the buffer's length takes its line end along.
    const std::size_t wanted = std::min(stream.end_ - stream.begin_, room - length + 1);
    const auto* lineEnd = static_cast<const char*>(std::memchr(from, '\n', wanted));
    ended = lineEnd != nullptr;
    const std::size_t taken = ended ? static_cast<std::size_t>(lineEnd - from) : std::min(wanted, room - length);
    std::memcpy(buffer + length, from, taken);
    length += taken;
    stream.begin_ += taken + (ended ? 1 : 0);
    if (!ended && taken < wanted) break;
  }
  if (!any) return false;
  if (ended && length > 0 && buffer[length - 1] == '\r') --length;
  buffer[length] = '\0';
  return true;
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
