#include "interfaces/converters/Converters.h"

#include "interfaces/portability/Port_MsgManData.h"

namespace {

/// The utilities have no code behind them yet; each says so and fails.
bool refuse(const char* word) {
  Port_MsgManData::createObject("tESSEL", "../s/Converters", __LINE__, "").issueError("%s is not built yet\n", word);
  return false;
}

}  // namespace

bool ObaInterface(int /*count*/, const char* const* words) { return refuse(words[0]); }
int playCsvfInterface(int /*count*/, const char* const* words) { return refuse(words[0]) ? 1 : 0; }
int svf2CsvfInterface(int /*count*/, const char* const* words) { return refuse(words[0]) ? 1 : 0; }
