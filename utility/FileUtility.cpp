#include "interfaces/utility/FileUtility.h"

#include <string>

#include "interfaces/portability/File.h"
#include "interfaces/portability/UT_PATH.h"

namespace {

bool isSeparator(char character) { return character == '/' || character == '\\'; }

bool isFull(std::string_view path) {
  if (!path.empty() && isSeparator(path[0])) return true;
  return path.size() > 2 && path[1] == ':' && isSeparator(path[2]);  // a drive
}

}  // namespace

StringBase FileUtility::convertPath(const StringBase& path, const StringBase& base) {
  if (isFull(path.view())) return path;
  StringBase full = base.empty() ? Port::File::getcwd() : base;
  if (full.empty()) full = StringBase(".");  // the current directory was removed
  if (!isSeparator(full.view().back())) full += '/';
  full += path.view();
  return full;
}

StringBase FileUtility::getHead(const StringBase& path) {
  const char* tail = UT_PATH::GetTail(path.c_str());
  auto length = static_cast<std::size_t>(tail - path.c_str());
  while (length > 1 && isSeparator(path.view()[length - 1])) --length;
  return StringBase(path.view().substr(0, length));
}

StringBase FileUtility::getTail(const StringBase& path) { return {UT_PATH::GetTail(path.c_str())}; }
