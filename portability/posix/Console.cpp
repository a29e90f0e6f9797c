#include "interfaces/portability/Console.h"

#include <unistd.h>

#include <cstdio>
#include <cstring>

void Port::Console::print(const char* text) {
  std::fputs(text, stdout);
  std::fflush(stdout);
}

void Port::Console::printFromSignalHandler(const char* text) {
  [[maybe_unused]] const ssize_t written = ::write(STDOUT_FILENO, text, std::strlen(text));
}

bool Port::Console::readLine(char* buffer, int size) {
  constexpr int substitute = 0x1A;
  int length = 0;
  ::flockfile(stdin);
  while (length + 1 < size) {
    const int character = ::getc_unlocked(stdin);
    if (character == EOF) break;
    buffer[length++] = static_cast<char>(character == '\0' ? substitute : character);
    if (character == '\n') break;
  }
  ::funlockfile(stdin);
  buffer[length] = '\0';
  // A line that a read error cuts off is no line.
  return length > 0 && std::ferror(stdin) == 0;
}
