#pragma once

#include <string_view>

#include "tests/conformance/runner/Case.h"

namespace fuzz {

/// Makes the first line of an input into what the scripted device manager answers. The line is made of words:
///
///   0003..1 !assignFile !performOperation@2 throw log
///
/// The first word chooses answers by a character each (`.` for the usual one): getMode, getActiveMode,
/// getSubmode, the chain's device count, how much content there is, device attributes, the current collection,
/// the target, stored options, and what happens while an operation runs. `!NAME` makes a call fail, or with
/// `@N` its N-th occurrence; `throw` means an unknown PROM part, `log` a batch log. Other words are nothing.
struct Answers {
  explicit Answers(std::string_view line);

  conformance::Case script;
  bool batchLog = false;

 private:
  void choose(std::string_view choices);
  void takeWord(std::string_view word);
  void give(std::string_view call, conformance::Value answer, int occurrence = 0);
  void giveAttribute(int attribute, const char* text);
  void giveNumber(std::string_view call, std::int64_t number);
  void chooseContent(int choice);
  void chooseAttributes(int choice);
  void chooseCollection(int choice);
  void chooseTarget(int choice);
  void chooseOptions(int choice);
  void chooseEvents(int choice);
};

}  // namespace fuzz
