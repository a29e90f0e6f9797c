#include "manager/parts/Companion.h"

#include <algorithm>
#include <cmath>
#include <nlohmann/json.hpp>
#include <optional>

#include "manager/parts/BsdlLexer.h"
#include "manager/support/TextPlace.h"

namespace {

using Json = nlohmann::json;

constexpr std::size_t mostMemoryBits = std::size_t{1} << 36;
constexpr std::size_t mostRevisions = 256;
constexpr std::size_t mostRegisterBits = 65536;
constexpr std::size_t mostFieldBits = 64;
constexpr std::size_t mostItems = 1024;

/// Reads values and keeps the first failure, which names the key.
class Reader {
 public:
  Reader(std::string_view name, const Part& part) : name_(name), part_(part) {}

  Part read(const Json& json);
  const std::optional<Failure>& failure() const { return failure_; }

 private:
  /// A value and its key from the top, such as "registers[2].length".
  struct Place {
    const Json& value;
    std::string key;
  };
  template <class Target>
  struct Member {
    std::string_view key;
    void (Reader::*read)(const Place&, Target&);
    bool required = false;
  };

  void fail(const std::string& key, const std::string& message) {
    if (!failure_) failure_ = Failure{.text = std::string(name_) + ": " + key + ": " + message};
  }
  template <class Target, std::size_t Count>
  void readObject(const Place& place, const Member<Target> (&members)[Count], Target& target);
  template <class Item, std::size_t Count>
  void readList(const Place& place, const Member<Item> (&members)[Count], std::vector<Item>& items);
  std::string text(const Place& place);
  double number(const Place& place);
  std::size_t count(const Place& place, std::size_t least, std::size_t most);
  std::string instruction(const Place& place);
  void checkField(const std::string& key, const NamedRegister& reg);
  void checkLength(const Place& place, const NamedRegister& reg, const std::string& instruction);

  void partName(const Place& place, Part& part) { part.name = BsdlWords::lower(text(place)); }
  void kind(const Place& place, Part& part);
  void memoryBits(const Place& place, Part& part) { part.memoryBits = count(place, 1, mostMemoryBits); }
  void revisions(const Place& place, Part& part) { part.revisions = count(place, 0, mostRevisions); }
  void registers(const Place& place, Part& part);
  void bridge(const Place& place, Part& part);
  void spi(const Place& place, Bridge& bridge) { bridge.spiInstruction = instruction(place); }
  void bpi(const Place& place, Bridge& bridge) { bridge.bpiInstruction = instruction(place); }
  void registerName(const Place& place, NamedRegister& reg) { reg.name = text(place); }
  void readInstruction(const Place& place, NamedRegister& reg) { reg.instruction = instruction(place); }
  void writeInstruction(const Place& place, NamedRegister& reg) { reg.writeInstruction = instruction(place); }
  void length(const Place& place, NamedRegister& reg) { reg.length = count(place, 1, mostRegisterBits); }
  void fields(const Place& place, NamedRegister& reg);
  void fieldName(const Place& place, RegisterField& field) { field.name = text(place); }
  void first(const Place& place, RegisterField& field) { field.first = count(place, 0, mostRegisterBits - 1); }
  void fieldLength(const Place& place, RegisterField& field) { field.length = count(place, 1, mostFieldBits); }
  void meaning(const Place& place, RegisterField& field) { field.meaning = text(place); }
  void scale(const Place& place, RegisterField& field) { field.scale = number(place); }
  void offset(const Place& place, RegisterField& field) { field.offset = number(place); }
  void unit(const Place& place, RegisterField& field) { field.unit = text(place); }

  std::string_view name_;
  const Part& part_;
  std::optional<Failure> failure_;
};

std::string joined(const std::string& outer, std::string_view inner) {
  return outer.empty() ? std::string(inner) : outer + '.' + std::string(inner);
}

template <class Target, std::size_t Count>
void Reader::readObject(const Place& place, const Member<Target> (&members)[Count], Target& target) {
  if (!place.value.is_object()) return fail(place.key.empty() ? "the file" : place.key, "expected an object in {}");
  for (const auto& [key, value] : place.value.items()) {
    const auto member = std::find_if(std::begin(members), std::end(members),
                                     [&name = key](const Member<Target>& one) { return one.key == name; });
    if (member == std::end(members)) return fail(joined(place.key, key), "no such key");
    (this->*member->read)({value, joined(place.key, key)}, target);
  }
  for (const Member<Target>& member : members)
    if (member.required && !place.value.contains(member.key)) fail(joined(place.key, member.key), "is missing");
}

template <class Item, std::size_t Count>
void Reader::readList(const Place& place, const Member<Item> (&members)[Count], std::vector<Item>& items) {
  if (!place.value.is_array()) return fail(place.key, "expected a list in []");
  if (place.value.size() > mostItems) return fail(place.key, "expected at most 1024 entries");
  for (const Json& value : place.value) {
    const std::string key = place.key + '[' + std::to_string(items.size()) + ']';
    Item item;
    readObject({value, key}, members, item);
    const bool twice = std::any_of(items.begin(), items.end(), [&](const Item& one) { return one.name == item.name; });
    if (twice) fail(joined(key, "name"), "\"" + item.name + "\" is given twice");
    items.push_back(std::move(item));
    if (failure_) return;
  }
}

std::string Reader::text(const Place& place) {
  const auto* value = place.value.get_ptr<const std::string*>();
  if (value != nullptr && !value->empty()) return *value;
  fail(place.key, "expected a text that is not empty");
  return {};
}

double Reader::number(const Place& place) {
  if (place.value.is_number()) return place.value.get<double>();
  fail(place.key, "expected a number");
  return 0;
}

std::size_t Reader::count(const Place& place, std::size_t least, std::size_t most) {
  const std::size_t value = place.value.is_number_unsigned() ? place.value.get<std::size_t>() : most + 1;
  if (value >= least && value <= most) return value;
  fail(place.key, "expected a whole number from " + std::to_string(least) + " to " + std::to_string(most));
  return least;
}

std::string Reader::instruction(const Place& place) {
  const std::string name = BsdlWords::upper(text(place));
  if (!failure_ && part_.opcode(name) == nullptr) fail(place.key, "the BSDL file has no instruction " + name);
  return name;
}

void Reader::kind(const Place& place, Part& part) {
  static constexpr std::pair<std::string_view, Part::Kind> kinds[] = {{"plain", Part::Kind::plain},
                                                                      {"fpga", Part::Kind::fpga},
                                                                      {"prom", Part::Kind::prom},
                                                                      {"cpld", Part::Kind::cpld},
                                                                      {"mpm", Part::Kind::mpm}};
  const std::string name = text(place);
  for (const auto& [word, value] : kinds) {
    if (name != word) continue;
    part.kind = value;
    return;
  }
  fail(place.key, "expected \"plain\", \"fpga\", \"prom\", \"cpld\" or \"mpm\"");
}

void Reader::fields(const Place& place, NamedRegister& reg) {
  static constexpr Member<RegisterField> members[] = {{"name", &Reader::fieldName, true},
                                                      {"first", &Reader::first, true},
                                                      {"length", &Reader::fieldLength},
                                                      {"meaning", &Reader::meaning},
                                                      {"scale", &Reader::scale},
                                                      {"offset", &Reader::offset},
                                                      {"unit", &Reader::unit}};
  readList(place, members, reg.fields);
}

void Reader::checkField(const std::string& key, const NamedRegister& reg) {
  for (std::size_t i = 0; i < reg.fields.size(); ++i)
    if (reg.fields[i].first + reg.fields[i].length > reg.length)
      fail(key + ".fields[" + std::to_string(i) + "]",
           "the field ends beyond the register's " + std::to_string(reg.length) + " bits");
}

/// A length in the BSDL file is the same.
void Reader::checkLength(const Place& place, const NamedRegister& reg, const std::string& instruction) {
  const auto access = part_.access.find(instruction);
  if (access == part_.access.end() || access->second.length == 0 || access->second.length == reg.length) return;
  fail(joined(place.key, "length"), "the register behind " + instruction + " has " +
                                        std::to_string(access->second.length) + " bits in the BSDL file");
}

void Reader::registers(const Place& place, Part& part) {
  static constexpr Member<NamedRegister> members[] = {{"name", &Reader::registerName, true},
                                                      {"instruction", &Reader::readInstruction, true},
                                                      {"writeInstruction", &Reader::writeInstruction},
                                                      {"length", &Reader::length, true},
                                                      {"fields", &Reader::fields}};
  readList(place, members, part.registers);
  for (std::size_t i = 0; i < part.registers.size() && !failure_; ++i) {
    const Place item{place.value[i], place.key + '[' + std::to_string(i) + ']'};
    checkField(item.key, part.registers[i]);
    checkLength(item, part.registers[i], part.registers[i].instruction);
    checkLength(item, part.registers[i], part.registers[i].writeInstruction);
  }
}

void Reader::bridge(const Place& place, Part& part) {
  static constexpr Member<Bridge> members[] = {{"spi", &Reader::spi}, {"bpi", &Reader::bpi}};
  readObject(place, members, part.bridge);
}

Part Reader::read(const Json& json) {
  static constexpr Member<Part> members[] = {{"name", &Reader::partName},         {"kind", &Reader::kind},
                                             {"memoryBits", &Reader::memoryBits}, {"revisions", &Reader::revisions},
                                             {"registers", &Reader::registers},   {"bridge", &Reader::bridge}};
  Part part = part_;
  part.registers.clear();
  readObject({json, ""}, members, part);
  return part;
}

}  // namespace

namespace Companion {

Status apply(std::string_view name, std::string_view text, Part& part) {
  Json json;
  try {
    json = Json::parse(text.begin(), text.end());
  } catch (const Json::parse_error& error) {
    // The library's place counts from 1 and is that of the byte it stumbled over.
    const std::size_t offset = error.byte > 0 ? error.byte - 1 : 0;
    return failureAt(name, text, offset, "this is no JSON from here on");
  } catch (const Json::exception&) {
    return failureAt(name, text, 0, "this JSON file has a number out of range");
  }
  Reader reader(name, part);
  Part result = reader.read(json);
  if (reader.failure()) return *reader.failure();
  part = std::move(result);
  return {};
}

std::string nameIn(std::string_view text) {
  const Json json = Json::parse(text.begin(), text.end(), nullptr, false);
  const auto place = json.is_object() ? json.find("name") : json.end();
  return json.is_object() && place != json.end() && place->is_string() ? place->get<std::string>() : "";
}

}  // namespace Companion
