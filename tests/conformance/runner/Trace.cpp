#include "tests/conformance/runner/Trace.h"

#include <unistd.h>

namespace conformance {

std::string readFrom(int file, std::size_t place) {
  std::string text;
  char buffer[4096];
  for (;;) {
    const ssize_t count = pread(file, buffer, sizeof buffer, static_cast<off_t>(place + text.size()));
    if (count <= 0) return text;
    text.append(buffer, static_cast<std::size_t>(count));
  }
}

void Trace::addOutput() {
  const std::string text = readFrom(output_, outputRead_);
  if (text.empty()) return;
  outputRead_ += text.size();
  Event event;
  event.kind = Event::Kind::standardOutput;
  event.value = Value(Value::Kind::text, foldDirectory(text, directory_));
  report_.event(event);
  report_.outputRead(outputRead_);
}

void Trace::add(Event event) {
  addOutput();
  event.value = foldDirectory(std::move(event.value), directory_);
  report_.event(event);
}

void Trace::add(Event::Kind kind, Value value) {
  Event event;
  event.kind = kind;
  event.value = std::move(value);
  add(std::move(event));
}

}  // namespace conformance
