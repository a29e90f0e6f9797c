#include "manager/simulator/JsonObject.h"

#include <cmath>

namespace {

/// As people write numbers: no trailing zeros.
std::string shown(double number) {
  if (std::abs(number) < 1e15 && number == std::floor(number)) return std::to_string(static_cast<long long>(number));
  return nlohmann::json(number).dump();
}

}  // namespace

void JsonProblems::report(const std::string& path, const std::string& problem) {
  if (!failure_) failure_ = Failure{name_ + ": " + (path.empty() ? "" : path + ": ") + problem};
}

JsonObject::JsonObject(const nlohmann::json& value, std::string path, JsonProblems& problems)
    : value_(&value), path_(std::move(path)), problems_(&problems) {
  if (value.is_object()) return;
  static const nlohmann::json none = nlohmann::json::object();
  problems.report(path_, std::string("expected an object, found ") + value.type_name());
  value_ = &none;
}

const nlohmann::json* JsonObject::find(const std::string& key) {
  asked_.insert(key);
  const auto found = value_->find(key);
  return found == value_->end() ? nullptr : &*found;
}

void JsonObject::report(const std::string& key, const std::string& problem) { problems_->report(pathOf(key), problem); }

std::optional<std::string> JsonObject::text(const std::string& key) {
  const nlohmann::json* value = find(key);
  if (value == nullptr) return std::nullopt;
  if (value->is_string()) return value->get<std::string>();
  report(key, std::string("expected a text, found ") + value->type_name());
  return std::nullopt;
}

std::optional<double> JsonObject::number(const std::string& key, double least, double most) {
  const nlohmann::json* value = find(key);
  if (value == nullptr) return std::nullopt;
  if (!value->is_number()) {
    report(key, std::string("expected a number, found ") + value->type_name());
    return std::nullopt;
  }
  const auto number = value->get<double>();
  if (number >= least && number <= most) return number;
  report(key, "expected a number from " + shown(least) + " to " + shown(most) + ", found " + value->dump());
  return std::nullopt;
}

std::optional<std::uint64_t> JsonObject::count(const std::string& key, std::uint64_t least, std::uint64_t most) {
  const nlohmann::json* value = find(key);
  if (value == nullptr) return std::nullopt;
  if (value->is_number_unsigned()) {
    const auto number = value->get<std::uint64_t>();
    if (number >= least && number <= most) return number;
  }
  report(key, "expected a whole number from " + std::to_string(least) + " to " + std::to_string(most) + ", found " +
                  (value->is_number() ? value->dump() : value->type_name()));
  return std::nullopt;
}

std::optional<bool> JsonObject::boolean(const std::string& key) {
  const nlohmann::json* value = find(key);
  if (value == nullptr) return std::nullopt;
  if (value->is_boolean()) return value->get<bool>();
  report(key, std::string("expected true or false, found ") + value->type_name());
  return std::nullopt;
}

std::optional<BitVector> JsonObject::hex(const std::string& key, std::size_t bits) {
  std::optional<std::string> digits = text(key);
  if (!digits) return std::nullopt;
  std::string_view plain = *digits;
  if (plain.starts_with("0x") || plain.starts_with("0X")) plain.remove_prefix(2);
  const std::size_t size = bits == 0 ? plain.size() * 4 : bits;
  std::optional<BitVector> value = plain.empty() ? std::nullopt : BitVector::fromHex(plain, size);
  if (!value)
    report(key, "expected hex digits" + (bits == 0 ? std::string() : " of at most " + std::to_string(bits) + " bits") +
                    ", found \"" + *digits + "\"");
  return value;
}

std::optional<JsonObject> JsonObject::object(const std::string& key) {
  const nlohmann::json* value = find(key);
  if (value == nullptr) return std::nullopt;
  return JsonObject(*value, pathOf(key), *problems_);
}

std::vector<JsonObject> JsonObject::objects(const std::string& key) {
  std::vector<JsonObject> result;
  const nlohmann::json* value = find(key);
  if (value == nullptr) return result;
  if (!value->is_array()) {
    report(key, std::string("expected a list, found ") + value->type_name());
    return result;
  }
  for (const nlohmann::json& item : *value)
    result.emplace_back(item, pathOf(key) + "[" + std::to_string(result.size()) + "]", *problems_);
  return result;
}

std::vector<std::vector<std::string>> JsonObject::textLists(const std::string& key) {
  std::vector<std::vector<std::string>> result;
  const nlohmann::json* value = find(key);
  if (value == nullptr) return result;
  bool right = value->is_array();
  if (right) {
    for (const nlohmann::json& list : *value) {
      right = right && list.is_array();
      if (!right) break;
      result.emplace_back();
      for (const nlohmann::json& item : list) {
        right = right && item.is_string();
        if (right) result.back().push_back(item.get<std::string>());
      }
    }
  }
  if (!right) report(key, "expected a list of lists of texts");
  return result;
}

std::vector<std::string> JsonObject::keys() const {
  std::vector<std::string> result;
  for (const auto& item : value_->items()) result.push_back(item.key());
  return result;
}

void JsonObject::finish() {
  std::string known;
  for (const std::string& key : asked_) known += (known.empty() ? "" : ", ") + key;
  for (const std::string& key : keys())
    if (asked_.count(key) == 0) report(key, "unknown key; known here are " + known);
}
