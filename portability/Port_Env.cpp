#include "interfaces/portability/Port_Env.h"

#include <cerrno>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <string>

#include "portability/Environment.h"

const char* Port_Env::GetEnv(const char* name) { return std::getenv(name); }

int Port_Env::PutEnv(const char* text) {
  const char* equals = std::strchr(text, '=');
  if (equals == nullptr) return EINVAL;
  std::string name(text);
  const auto length = static_cast<std::size_t>(equals - text);
  name[length] = '\0';
  return setVariable(name.c_str(), name.c_str() + length + 1);
}

int Port_Env::UnsetEnv(const char* name) { return unsetVariable(name); }
