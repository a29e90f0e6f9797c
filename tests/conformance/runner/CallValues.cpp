#include "tests/conformance/runner/CallValues.h"

namespace conformance {
namespace {

template <class Attribute>
Value attributeOf(const char* family, Attribute attribute) {
  return Value(Value::Kind::attribute, family, static_cast<std::int64_t>(attribute));
}

}  // namespace

Value toValue(bool value) { return Value(Value::Kind::boolean, value ? 1 : 0); }

Value toValue(const char* text) {
  return text == nullptr ? Value(Value::Kind::null) : Value(Value::Kind::text, std::string(text));
}

Value toValue(const StringBase& text) { return Value(Value::Kind::text, std::string(text.view())); }

Value toValue(const std::vector<StringBase>& texts) {
  std::vector<Value> items;
  for (const StringBase& text : texts) items.push_back(toValue(text));
  return Value(Value::Kind::list, std::move(items));
}

Value toValue(const DeviceManagerInterface::CoreFiles& files) {
  std::vector<Value> entries;
  for (const auto& [core, file] : files)
    entries.emplace_back(Value::Kind::entry, std::vector<Value>{toValue(file)}, core);
  return Value(Value::Kind::map, std::move(entries));
}

Value toValue(DeviceNS::ATTRIBUTE attribute) { return attributeOf("DeviceNS", attribute); }
Value toValue(ConfigDeviceNS::ATTRIBUTE attribute) { return attributeOf("ConfigDeviceNS", attribute); }
Value toValue(CollectionNS::ATTRIBUTE attribute) { return attributeOf("CollectionNS", attribute); }
Value toValue(DesignNS::ATTRIBUTE attribute) { return attributeOf("DesignNS", attribute); }

Value wordList(int count, const char* const* words) {
  std::vector<Value> items;
  for (int i = 0; i < count; ++i) items.push_back(toValue(words[i]));
  return Value(Value::Kind::list, std::move(items));
}

Value parsedWords(const UT_CMDARGS* line) {
  if (line == nullptr) return Value(Value::Kind::null);
  std::vector<Value> items{toValue(line->getcmd())};
  for (int i = 0; i < line->getnumsw(); ++i) {
    const UT_CMDSWINFO& option = *line->getsw(i);
    items.push_back(toValue(option.getswname()));
    for (int j = 0; j < option.getnumargs(); ++j) items.push_back(toValue(option.getargtxt(j)));
  }
  return Value(Value::Kind::list, std::move(items));
}

}  // namespace conformance
