#include "manager/simulator/BoardFile.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <filesystem>

#include "manager/simulator/DeviceReader.h"
#include "manager/simulator/JsonObject.h"
#include "manager/support/TextPlace.h"

namespace {

constexpr std::uint64_t mostDropBytes = std::uint64_t{1} << 53;
constexpr int mostNesting = 32;

Result<nlohmann::json> parseJson(std::string_view name, std::string_view text) {
  bool tooDeep = false;
  const auto guard = [&tooDeep](int depth, nlohmann::json::parse_event_t /*event*/, nlohmann::json& /*value*/) {
    tooDeep = tooDeep || depth > mostNesting;
    return !tooDeep;
  };
  try {
    nlohmann::json json = nlohmann::json::parse(text.begin(), text.end(), guard);
    if (!tooDeep) return json;
    return Failure{std::string(name) + ": nests deeper than " + std::to_string(mostNesting) + " levels"};
  } catch (const nlohmann::json::parse_error& error) {
    std::string_view what = error.what();
    // The library's own prefix tells the place, which stands in front already.
    if (const std::size_t colon = what.find(": "); colon != std::string_view::npos) what.remove_prefix(colon + 2);
    return failureAt(name, text, error.byte > 0 ? error.byte - 1 : 0, what);
  } catch (const nlohmann::json::exception& error) {
    return Failure{std::string(name) + ": " + error.what()};
  }
}

BoardDescription::Noise readNoise(JsonObject& faults, const std::string& key) {
  BoardDescription::Noise noise;
  std::optional<JsonObject> object = faults.object(key);
  if (!object) return noise;
  const std::optional<double> rate = object->number("rate", 0, 1);
  if (!object->has("rate")) object->report("rate", "missing");
  noise.rate = rate.value_or(0);
  noise.seed = object->count("seed", 0, ~std::uint64_t{0}).value_or(1);
  object->finish();
  return noise;
}

void readFaults(JsonObject& board, BoardDescription& description) {
  std::optional<JsonObject> faults = board.object("faults");
  if (!faults) return;
  if (const auto level = faults->count("stuckTdo", 0, 1)) description.stuckTdo = *level == 1;
  description.tdoNoise = readNoise(*faults, "flipTdo");
  description.tdiNoise = readNoise(*faults, "flipTdi");
  description.dropAfter = faults->count("dropAfter", 0, mostDropBytes);
  faults->finish();
}

/// "2.IO(3)" is port IO(3) of device 2.
std::optional<std::pair<std::size_t, std::string>> readPin(const std::string& text, const BoardDescription& board) {
  std::size_t device = 0;
  const char* end = text.data() + text.size();
  const auto [behind, problem] = std::from_chars(text.data(), end, device);
  if (problem != std::errc() || behind == end || *behind != '.' || device >= board.devices.size()) return std::nullopt;
  std::string port(behind + 1, end);
  const auto lower = [](std::string name) {
    std::transform(name.begin(), name.end(), name.begin(),
                   [](unsigned char letter) { return static_cast<char>(std::tolower(letter)); });
    return name;
  };
  port = lower(port);
  for (const BoundaryCell& cell : board.devices[device].part->boundary)
    if (!cell.port.empty() && lower(cell.port) == port) return std::pair(device, port);
  return std::nullopt;
}

void readNets(JsonObject& board, BoardDescription& description) {
  const std::vector<std::vector<std::string>> lists = board.textLists("nets");
  for (std::size_t i = 0; i < lists.size(); ++i) {
    description.nets.emplace_back();
    for (const std::string& text : lists[i]) {
      const auto pin = readPin(text, description);
      if (pin) {
        description.nets.back().push_back(*pin);
      } else {
        board.report("nets[" + std::to_string(i) + "]",
                     "\"" + text +
                         "\" is no pin; expected a device's position, a dot, and a port of its boundary "
                         "register, such as \"0.IO(3)\"");
      }
    }
  }
}

}  // namespace

std::uint64_t BoardFile::memoryBytes(const BoardDescription& board) {
  std::uint64_t bytes = 0;
  for (const DeviceDescription& device : board.devices) {
    bytes += (device.isc.pages * device.isc.bits + device.part->memoryBits) / 8 + device.content.size();
    if (device.spi) bytes += device.spi->part->size + device.spi->content.size();
    if (device.bpi) bytes += device.bpi->part->size + device.bpi->content.size();
  }
  return bytes;
}

Result<BoardDescription> BoardFile::parse(std::string_view name, std::string_view text, const std::string& directory,
                                          PartLibrary& parts) {
  Result<nlohmann::json> json = parseJson(name, text);
  if (!json) return json.failure();
  JsonProblems problems{std::string(name)};
  JsonObject board(*json, "", problems);
  BoardDescription description;
  description.name = board.text("name").value_or(std::filesystem::path(name).filename().string());
  description.tck = board.number("tck", 1, 1e9).value_or(description.tck);
  std::vector<JsonObject> chain = board.objects("chain");
  if (!board.has("chain")) board.report("chain", "missing");
  if (chain.size() > mostDevices) board.report("chain", "more than " + std::to_string(mostDevices) + " devices");
  DeviceReader reader(directory, parts);
  for (JsonObject& device : chain) {
    if (problems.any()) break;
    description.devices.push_back(reader.read(device));
    if (!problems.any() && memoryBytes(description) > mostMemory)
      device.report("", "the memories up to here are larger than 2^30 bytes in all");
  }
  if (!problems.any()) readNets(board, description);
  readFaults(board, description);
  if (const auto state = board.text("state")) description.statePath = reader.pathOf(*state);
  board.finish();
  if (problems.any()) return problems.first();
  return description;
}
