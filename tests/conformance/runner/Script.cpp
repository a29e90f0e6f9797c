#include "tests/conformance/runner/Script.h"

namespace conformance {
namespace {

/// True when the pattern is about this call; `count` is raised by every call that fits but for the number.
bool applies(const CallPattern& pattern, int& count, std::string_view name, const std::vector<Value>& arguments) {
  if (pattern.name != name || (pattern.arguments && !matches(*pattern.arguments, arguments))) return false;
  ++count;
  return pattern.occurrence == 0 || pattern.occurrence == count;
}

}  // namespace

Script::Script(const std::vector<Given>& givens, const std::vector<During>& durings)
    : givens_(givens), durings_(durings), givenCounts_(givens.size()), duringCounts_(durings.size()) {}

Script::Turn Script::next(std::string_view name, const std::vector<Value>& arguments) {
  Turn turn;
  for (std::size_t i = 0; i < givens_.size(); ++i)
    if (applies(givens_[i].call, givenCounts_[i], name, arguments)) turn.answer = &givens_[i].answer;
  for (std::size_t i = 0; i < durings_.size(); ++i)
    if (applies(durings_[i].call, duringCounts_[i], name, arguments)) turn.happenings.push_back(&durings_[i]);
  return turn;
}

}  // namespace conformance
