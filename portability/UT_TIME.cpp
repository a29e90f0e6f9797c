#include "interfaces/portability/UT_TIME.h"

#include <array>
#include <ctime>

#include "portability/LocalTime.h"

std::int64_t UT_TIME::Time() { return static_cast<std::int64_t>(std::time(nullptr)); }

StringBase UT_TIME::CTime(std::int64_t time) {
  const std::tm parts = localTime(time);
  std::array<char, 64> text{};
  std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &parts);
  return StringBase(text.data());
}

std::int64_t _time64(std::int64_t* time) {
  const std::int64_t now = UT_TIME::Time();
  if (time != nullptr) *time = now;
  return now;
}

double _difftime64(std::int64_t end, std::int64_t start) {
  return static_cast<double>(end) - static_cast<double>(start);
}
