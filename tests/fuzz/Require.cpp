#include "tests/fuzz/Require.h"

#include <cstdio>
#include <cstdlib>

namespace fuzz {

void require(bool holds, const char* property, std::source_location where) {
  if (holds) return;
  std::fprintf(stderr, "%s:%u: it does not hold that %s\n", where.file_name(), where.line(), property);
  std::abort();
}

}  // namespace fuzz
