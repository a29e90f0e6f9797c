#pragma once

#include <concepts>
#include <type_traits>
#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"
#include "tests/conformance/runner/Value.h"

namespace conformance {

/// Arguments of the interpreter's calls as values of a trace.
inline Value toValue(Value value) { return value; }
Value toValue(bool value);
Value toValue(const char* text);
Value toValue(const StringBase& text);
Value toValue(const std::vector<StringBase>& texts);
Value toValue(const DeviceManagerInterface::CoreFiles& files);
Value toValue(DeviceNS::ATTRIBUTE attribute);
Value toValue(ConfigDeviceNS::ATTRIBUTE attribute);
Value toValue(CollectionNS::ATTRIBUTE attribute);
Value toValue(DesignNS::ATTRIBUTE attribute);
template <class Number>
requires std::integral<Number> || std::is_enum_v<Number> Value toValue(Number number) {
  return Value(Value::Kind::number, static_cast<std::int64_t>(number));
}

/// `count` words as one list.
Value wordList(int count, const char* const* words);
/// A parsed command line as one list: the command word, then each switch and its arguments; null for null.
Value parsedWords(const UT_CMDARGS* line);

}  // namespace conformance
