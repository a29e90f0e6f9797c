#pragma once

#include <string>

namespace conformance {

/// The directory of one case, removed with everything in it at the end: the working directory and, beside
/// it, the files for console input and standard output.
class Workplace {
 public:
  /// Throws `std::system_error`.
  Workplace();
  ~Workplace();
  Workplace(const Workplace&) = delete;
  Workplace& operator=(const Workplace&) = delete;

  /// Full, free of links.
  std::string directory() const { return root_ + "/work"; }
  std::string inputFile() const { return root_ + "/input"; }
  std::string outputFile() const { return root_ + "/output"; }

 private:
  std::string root_;
};

}  // namespace conformance
