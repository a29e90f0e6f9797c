#pragma once

#include <cstdint>
#include <nlohmann/json.hpp>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "manager/scan/BitVector.h"
#include "manager/support/Result.h"

/// Collects the first problem of a JSON file, with the way to it: "board.json: chain[1].spi.part: ...".
class JsonProblems {
 public:
  explicit JsonProblems(std::string name) : name_(std::move(name)) {}

  void report(const std::string& path, const std::string& problem);
  bool any() const { return failure_.has_value(); }
  const Failure& first() const { return *failure_; }

 private:
  std::string name_;
  std::optional<Failure> failure_;
};

/// An object of a JSON file, whose keys are asked for by type. What is missing is empty; what has another type or is
/// out of range is reported and then empty. `finish` reports the keys that nobody asked for.
class JsonObject {
 public:
  /// `path` is the way to the object, empty for the file's own.
  JsonObject(const nlohmann::json& value, std::string path, JsonProblems& problems);

  std::optional<std::string> text(const std::string& key);
  std::optional<double> number(const std::string& key, double least, double most);
  std::optional<std::uint64_t> count(const std::string& key, std::uint64_t least, std::uint64_t most);
  std::optional<bool> boolean(const std::string& key);
  /// Hex digits in a text, with or without "0x"; as many bits as given, or as the digits have for 0.
  std::optional<BitVector> hex(const std::string& key, std::size_t bits);
  std::optional<JsonObject> object(const std::string& key);
  std::vector<JsonObject> objects(const std::string& key);
  /// A list of lists of texts.
  std::vector<std::vector<std::string>> textLists(const std::string& key);

  bool has(const std::string& key) const { return value_->contains(key); }
  std::vector<std::string> keys() const;
  /// About the value of a key, or about the whole object when the key is empty.
  void report(const std::string& key, const std::string& problem);
  void finish();

 private:
  const nlohmann::json* find(const std::string& key);
  std::string pathOf(const std::string& key) const {
    return path_.empty() || key.empty() ? path_ + key : path_ + "." + key;
  }

  const nlohmann::json* value_;
  std::string path_;
  JsonProblems* problems_;
  std::set<std::string> asked_;
};
