#include "interfaces/portability/Secret.h"

#include <string.h>
#include <sys/resource.h>

void Port::Secret::wipe(void* memory, std::size_t size) { ::explicit_bzero(memory, size); }

void Port::Secret::forbidCoreDump() {
  const rlimit none{0, 0};
  ::setrlimit(RLIMIT_CORE, &none);
}
