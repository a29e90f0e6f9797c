#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace property {

/// The arguments of a property test: `--rounds N --seed S`.
struct Arguments {
  Arguments(int count, char** words, int defaultRounds) : rounds(defaultRounds) {
    for (int i = 1; i + 1 < count; i += 2) {
      if (std::strcmp(words[i], "--rounds") == 0) rounds = std::atoi(words[i + 1]);
      if (std::strcmp(words[i], "--seed") == 0) seed = std::strtoull(words[i + 1], nullptr, 10);
    }
  }

  int rounds;
  std::uint64_t seed = 1;
};

}  // namespace property
