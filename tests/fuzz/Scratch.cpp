#include "tests/fuzz/Scratch.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "tests/fuzz/Require.h"

namespace fuzz {
namespace {

constexpr const char* descriptionFile = "board.pdr";
constexpr std::string_view content = "a file\n";
constexpr std::array files = {"top.bit", "top.mcs",  "top.exo", "top.mpm", "top.bsd",
                              "x.mcs",   "boot.elf", "map.bmm", "x.mpm"};

void write(const std::filesystem::path& path, std::string_view text) {
  std::ofstream stream(path, std::ios::binary);
  stream << text;
  stream.close();
  require(static_cast<bool>(stream), "a file can be written in the scratch directory");
}

std::vector<std::string> currentEnvironment() {
  std::vector<std::string> variables;
  for (char** variable = environ; variable != nullptr && *variable != nullptr; ++variable)
    variables.emplace_back(*variable);
  return variables;
}

void restoreEnvironment(const std::vector<std::string>& variables) {
  if (currentEnvironment() == variables) return;
  ::clearenv();
  for (const std::string& variable : variables) {
    const std::size_t equals = variable.find('=');
    ::setenv(variable.substr(0, equals).c_str(), variable.c_str() + equals + 1, 1);
  }
}

}  // namespace

Scratch::Scratch() : home_(::open(".", O_RDONLY | O_DIRECTORY | O_CLOEXEC)) {
  std::string place = (std::filesystem::temp_directory_path() / "tessel-fuzz-XXXXXX").string();
  require(::mkdtemp(place.data()) != nullptr && home_ >= 0, "there is a place for a scratch directory");
  path_ = place;
  ::unsetenv("ZOR_TESSEL_ALLOWBATCHMODECALLBACK");
  environment_ = currentEnvironment();
  for (const char* file : files) write(std::filesystem::path(path_) / file, content);
}

Scratch::~Scratch() {
  std::error_code error;
  std::filesystem::remove_all(path_, error);
  ::close(home_);
}

void Scratch::tidy() const {
  const auto isOurs = [](const std::filesystem::directory_entry& entry) {
    return std::find(files.begin(), files.end(), entry.path().filename().string()) != files.end();
  };
  for (const auto& entry : std::filesystem::directory_iterator(path_)) {
    if (!isOurs(entry)) std::filesystem::remove_all(entry.path());
    // A session that wrote into it left its transcript there, which ends otherwise, or nothing.
    else if (entry.file_size() != content.size())
      write(entry.path(), content);
  }
}

Scratch::Visit::Visit(const Scratch& scratch, std::string_view description) : scratch_(scratch) {
  require(::chdir(scratch_.path_.c_str()) == 0, "the scratch directory is there");
  write(descriptionFile, description);
}

Scratch::Visit::~Visit() {
  restoreEnvironment(scratch_.environment_);
  scratch_.tidy();
  require(::fchdir(scratch_.home_) == 0, "the first directory is still there");
}

}  // namespace fuzz
