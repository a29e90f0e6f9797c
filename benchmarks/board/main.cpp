// How fast a simulated board is behind the remote-bitbang protocol. Fails when a bar is missed.

#include "benchmarks/board/Rate.h"

int main() {
  const bool decoder = reportDecoder();
  return reportRoundTrip() && decoder ? 0 : 1;
}
