#include "interfaces/portability/Port_Env.h"

#include <cstdlib>
#include <cstring>
#include <string>

#include "portability/Environment.h"

const char* Port_Env::GetEnv(const char* name) { return std::getenv(name); }

int Port_Env::PutEnv(const char* text) {
  const char* equals = std::strchr(text, '=');
  if (equals == nullptr) return EINVAL;
  return setVariable(std::string(text, equals).c_str(), equals + 1);
}

int Port_Env::UnsetEnv(const char* name) { return unsetVariable(name); }
