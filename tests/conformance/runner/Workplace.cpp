#include "tests/conformance/runner/Workplace.h"

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <system_error>

namespace conformance {

Workplace::Workplace() {
  std::string pattern = (std::filesystem::canonical(std::filesystem::temp_directory_path()) / "tessel-XXXXXX").string();
  if (mkdtemp(pattern.data()) == nullptr) throw std::system_error(errno, std::generic_category(), pattern);
  root_ = pattern;
  std::filesystem::create_directory(directory());
}

Workplace::~Workplace() {
  std::error_code ignored;
  std::filesystem::remove_all(root_, ignored);
}

}  // namespace conformance
