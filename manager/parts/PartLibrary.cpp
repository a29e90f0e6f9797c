#include "manager/parts/PartLibrary.h"

#include <algorithm>
#include <filesystem>

#include "manager/parts/BsdlEntity.h"
#include "manager/parts/BsdlFile.h"
#include "manager/parts/BuiltInParts.h"
#include "manager/parts/Companion.h"
#include "manager/parts/Nearness.h"
#include "manager/parts/TextFile.h"

namespace {

constexpr std::size_t mostFiles = 20000;

std::string normalised(std::string_view name) {
  std::string result = BsdlWords::lower(name);
  std::replace(result.begin(), result.end(), '_', '-');
  return result;
}

std::string joined(const std::vector<std::string>& names) {
  std::string result;
  for (const std::string& name : names) result += (result.empty() ? "" : ", ") + name;
  return result;
}

bool isBsdl(const std::filesystem::path& path) {
  const std::string extension = BsdlWords::lower(path.extension().string());
  return extension == ".bsd" || extension == ".bsdl" || extension == ".bsm";
}

/// The name by which a user's file is asked for, without reading all of it; that of the file when it is damaged.
std::string nameOfFile(const std::string& path) {
  const std::filesystem::path companion = std::filesystem::path(path).replace_extension(".json");
  if (const auto json = TextFile::readIfThere(companion.string()); json && *json)
    if (std::string name = Companion::nameIn(**json); !name.empty()) return name;
  if (const auto text = TextFile::read(path)) {
    BsdlSource source(path, *text);
    if (std::string name = BsdlEntity::readName(source); !name.empty()) return name;
  }
  return std::filesystem::path(path).stem().string();
}

Result<Part> parseBuiltIn(const BuiltInPart& builtIn) {
  Result<Part> part = BsdlFile::parse(std::string(builtIn.name) + ".bsd", builtIn.bsdl);
  if (!part) return part;
  TESSEL_TRY(BsdlFile::parseCompanion(std::string(builtIn.name) + ".json", builtIn.companion, *part));
  part->source = "built in";
  return part;
}

}  // namespace

PartLibrary::PartLibrary(std::vector<std::string> directories) : directories_(std::move(directories)) {
  for (std::size_t i = 0; i < builtInParts().size(); ++i) {
    Entry entry;
    entry.name = normalised(builtInParts()[i].name);
    entry.builtIn = i;
    builtIn_.push_back(std::move(entry));
  }
}

std::vector<std::string> PartLibrary::builtInNames() {
  std::vector<std::string> names;
  for (const BuiltInPart& part : builtInParts()) names.emplace_back(part.name);
  return names;
}

Status PartLibrary::scanDirectory(const std::string& directory) {
  std::error_code error;
  std::filesystem::directory_iterator files(directory, error);
  std::vector<std::string> paths;
  for (; !error && files != std::filesystem::directory_iterator(); files.increment(error)) {
    if (isBsdl(files->path())) paths.push_back(files->path().string());
    if (users_.size() + paths.size() > mostFiles)
      return Failure{.text = "Directory " + directory + " has more than 20000 BSDL files."};
  }
  if (error) return Failure{.text = "Cannot read the directory of parts " + directory + ": " + error.message() + "."};
  std::sort(paths.begin(), paths.end());
  for (std::string& path : paths) {
    Entry entry;
    entry.name = normalised(nameOfFile(path));
    entry.path = std::move(path);
    users_.push_back(std::move(entry));
  }
  return {};
}

/// The failure is that of the first directory that can't be read; the others are searched nevertheless.
Status PartLibrary::scanDirectories() {
  if (scanned_) return scanResult_;
  scanned_ = true;
  for (const std::string& directory : directories_)
    if (const Status status = scanDirectory(directory); !status) {
      unreadable_.push_back(status.failure().text);
      if (scanResult_) scanResult_ = status;
    }
  return scanResult_;
}

Result<PartPointer> PartLibrary::load(Entry& entry) {
  if (entry.part) return entry.part;
  if (entry.failure) return *entry.failure;
  Result<Part> part = entry.path.empty() ? parseBuiltIn(builtInParts()[entry.builtIn]) : BsdlFile::read(entry.path);
  if (part)
    entry.part = std::make_shared<const Part>(std::move(*part));
  else
    entry.failure = part.failure();
  if (entry.failure) return *entry.failure;
  return entry.part;
}

Failure PartLibrary::unknown(std::string_view name) const {
  std::vector<std::string> names = builtInNames();
  for (const Entry& entry : users_) names.push_back(entry.name);
  const std::vector<std::string> near = nearNames(normalised(name), names);
  std::string text = "There is no part " + std::string(name) + ".";
  if (!near.empty())
    text += " Did you mean " + joined(near) + "?";
  else
    text += " Built in are " + joined(builtInNames()) + ".";
  return {.text = text};
}

Result<PartPointer> PartLibrary::find(std::string_view name) {
  const Status scanned = scanDirectories();
  const std::string wanted = normalised(name);
  for (std::vector<Entry>* entries : {&users_, &builtIn_})
    for (Entry& entry : *entries)
      if (entry.name == wanted) return load(entry);
  if (!scanned) return scanned.failure();
  return unknown(name);
}

Result<PartPointer> PartLibrary::read(const std::string& path) {
  for (Entry& entry : users_)
    if (entry.path == path) return load(entry);
  Result<Part> part = BsdlFile::read(path);
  if (!part) return part.failure();
  return PartPointer(std::make_shared<const Part>(std::move(*part)));
}

PartPointer PartLibrary::identify(const BitVector& idcode, std::vector<std::string>* problems) {
  // A directory's failure is among the problems instead.
  static_cast<void>(scanDirectories());
  if (problems != nullptr) {
    problems->insert(problems->end(), unreadable_.begin(), unreadable_.end());
    unreadable_.clear();
  }
  for (std::vector<Entry>* entries : {&users_, &builtIn_}) {
    for (Entry& entry : *entries) {
      const Result<PartPointer> part = load(entry);
      if (part && (*part)->matchesIdcode(idcode)) return *part;
      if (part || problems == nullptr || std::exchange(entry.reported, true)) continue;
      problems->push_back(part.failure().text);
    }
  }
  return nullptr;
}
