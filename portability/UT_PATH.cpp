#include "interfaces/portability/UT_PATH.h"

#include <cstring>

#include "interfaces/portability/UT_STR.h"

const char* UT_PATH::GetTail(const char* path) {
  const char* tail = path;
  for (const char* place = path; *place != '\0'; ++place)
    if (*place == '/' || *place == '\\') tail = place + 1;
  return tail;
}

const char* UT_PATH::GetExt(const char* path) {
  if (path == nullptr) return nullptr;
  const char* dot = std::strrchr(GetTail(path), '.');
  return dot == nullptr ? nullptr : dot + 1;
}

bool UT_PATH::GetExt(const char* path, char* buffer, int size) { return UT_STR::Copy(buffer, size, GetExt(path)); }
