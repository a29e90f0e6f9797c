#include "tests/conformance/runner/Value.h"

#include <algorithm>
#include <string_view>

namespace conformance {
namespace {

constexpr std::string_view directoryMark = "${CWD}";

void replaceAll(std::string& text, std::string_view from, std::string_view to) {
  for (std::size_t at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size()))
    text.replace(at, from.size(), to);
}

bool isContinuation(char byte) { return (static_cast<unsigned char>(byte) & 0xC0) == 0x80; }

/// The length of the UTF-8 character at the start of the text, at least 2; 0 when there is none.
std::size_t wideCharacter(std::string_view text) {
  const auto lead = static_cast<unsigned char>(text[0]);
  std::size_t length = 0;
  if (lead >= 0xC2 && lead <= 0xDF) length = 2;
  if (lead >= 0xE0 && lead <= 0xEF) length = 3;
  if (lead >= 0xF0 && lead <= 0xF4) length = 4;
  if (length == 0 || text.size() < length) return 0;
  const std::string_view rest = text.substr(1, length - 1);
  return std::all_of(rest.begin(), rest.end(), isContinuation) ? length : 0;
}

std::string escape(char character) {
  switch (character) {
    case '\n':
      return "\\n";
    case '\t':
      return "\\t";
    case '\r':
      return "\\r";
    case '\f':
      return "\\f";
    case '"':
      return "\\\"";
    case '\\':
      return "\\\\";
    default:
      break;
  }
  constexpr char digits[] = "0123456789ABCDEF";
  const auto byte = static_cast<unsigned char>(character);
  if (byte >= 0x20 && byte < 0x7F) return {character};
  return {'\\', 'x', digits[byte >> 4], digits[byte & 15]};
}

}  // namespace

bool matches(const Value& pattern, const Value& value) {
  if (pattern.kind == Value::Kind::any) return true;
  // An attribute may also be given by its number alone.
  if (pattern.kind == Value::Kind::number && value.kind == Value::Kind::attribute)
    return pattern.number == value.number;
  return pattern.kind == value.kind && pattern.number == value.number && pattern.text == value.text &&
         matches(pattern.items, value.items);
}

bool matches(const std::vector<Value>& patterns, const std::vector<Value>& values) {
  return std::equal(patterns.begin(), patterns.end(), values.begin(), values.end(),
                    [](const Value& pattern, const Value& value) { return matches(pattern, value); });
}

std::string renderList(const std::vector<Value>& values) {
  std::string text;
  for (const Value& value : values) {
    if (!text.empty()) text += ", ";
    text += render(value);
  }
  return text;
}

std::string render(const Value& value) {
  switch (value.kind) {
    case Value::Kind::none:
      return "";
    case Value::Kind::any:
      return "*";
    case Value::Kind::null:
      return "null";
    case Value::Kind::boolean:
      return value.number != 0 ? "true" : "false";
    case Value::Kind::number:
      return std::to_string(value.number);
    case Value::Kind::text:
      return quote(value.text);
    case Value::Kind::attribute:
      return value.text + " " + std::to_string(value.number);
    case Value::Kind::list:
      return "[" + renderList(value.items) + "]";
    case Value::Kind::map:
      return "{" + renderList(value.items) + "}";
    case Value::Kind::entry:
      return std::to_string(value.number) + ": " + renderList(value.items);
    case Value::Kind::tuple:
      return "(" + renderList(value.items) + ")";
    case Value::Kind::modeInterface:
      return "interface";
    case Value::Kind::exception:
      return "throw " + value.text;
  }
  return "";
}

std::string quote(const std::string& text) {
  std::string quoted = "\"";
  for (std::size_t i = 0; i < text.size();) {
    const std::size_t length = wideCharacter(std::string_view(text).substr(i));
    if (length == 0)
      quoted += escape(text[i]);
    else
      quoted.append(text, i, length);
    i += std::max<std::size_t>(length, 1);
  }
  return quoted + '"';
}

std::string expandDirectory(std::string text, const std::string& directory) {
  replaceAll(text, directoryMark, directory);
  return text;
}

std::string foldDirectory(std::string text, const std::string& directory) {
  replaceAll(text, directory, directoryMark);
  return text;
}

Value foldDirectory(Value value, const std::string& directory) {
  if (value.kind == Value::Kind::text) value.text = foldDirectory(std::move(value.text), directory);
  for (Value& item : value.items) item = foldDirectory(std::move(item), directory);
  return value;
}

}  // namespace conformance
