#include "tests/conformance/runner/Diff.h"

#include <algorithm>
#include <cstdint>

namespace conformance {
namespace {

constexpr std::size_t contextLines = 3;
/// Above this many pairs of lines the differing middle is shown whole instead of aligned.
constexpr std::size_t largestTable = 4'000'000;
constexpr std::size_t largestDiff = 1000;

/// A line of the diff and how many lines of both sides stand before it.
struct Step {
  char sign;
  const std::string* text;
  std::size_t expectedBefore;
  std::size_t actualBefore;
};

class Alignment {
 public:
  Alignment(const std::vector<TraceLine>& expected, const std::vector<TraceLine>& actual)
      : expected_(expected), actual_(actual) {}

  std::vector<Step> steps();

 private:
  void keep() {
    steps_.push_back({' ', &expected_[i_].text, i_, j_});
    ++i_;
    ++j_;
  }
  void drop() {
    steps_.push_back({'-', &expected_[i_].text, i_, j_});
    ++i_;
  }
  void add() {
    steps_.push_back({'+', &actual_[j_].text, i_, j_});
    ++j_;
  }
  void alignMiddle(std::size_t expectedEnd, std::size_t actualEnd);
  void showMiddle(std::size_t expectedEnd, std::size_t actualEnd);

  const std::vector<TraceLine>& expected_;
  const std::vector<TraceLine>& actual_;
  std::vector<Step> steps_;
  std::size_t i_ = 0;
  std::size_t j_ = 0;
};

std::vector<Step> Alignment::steps() {
  const std::size_t shorter = std::min(expected_.size(), actual_.size());
  while (i_ < shorter && matches(expected_[i_], actual_[i_])) keep();
  std::size_t tail = 0;
  while (tail < shorter - i_ && matches(expected_[expected_.size() - 1 - tail], actual_[actual_.size() - 1 - tail]))
    ++tail;
  const std::size_t expectedEnd = expected_.size() - tail;
  const std::size_t actualEnd = actual_.size() - tail;
  if ((expectedEnd - i_ + 1) * (actualEnd - j_ + 1) <= largestTable) alignMiddle(expectedEnd, actualEnd);
  showMiddle(expectedEnd, actualEnd);
  while (i_ < expected_.size()) keep();
  return std::move(steps_);
}

void Alignment::showMiddle(std::size_t expectedEnd, std::size_t actualEnd) {
  while (i_ < expectedEnd) drop();
  while (j_ < actualEnd) add();
}

/// Goes along a longest common subsequence, up to the end of one side.
void Alignment::alignMiddle(std::size_t expectedEnd, std::size_t actualEnd) {
  const std::size_t width = actualEnd - j_ + 1;
  const std::size_t firstExpected = i_;
  const std::size_t firstActual = j_;
  std::vector<std::uint32_t> common((expectedEnd - i_ + 1) * width);
  const auto at = [&](std::size_t i, std::size_t j) -> std::uint32_t& {
    return common[(i - firstExpected) * width + (j - firstActual)];
  };
  for (std::size_t i = expectedEnd; i-- > firstExpected;)
    for (std::size_t j = actualEnd; j-- > firstActual;)
      at(i, j) = std::max({at(i + 1, j), at(i, j + 1), matches(expected_[i], actual_[j]) ? at(i + 1, j + 1) + 1 : 0});
  while (i_ < expectedEnd && j_ < actualEnd) {
    if (matches(expected_[i_], actual_[j_]) && at(i_, j_) == at(i_ + 1, j_ + 1) + 1)
      keep();
    else if (at(i_ + 1, j_) >= at(i_, j_ + 1))
      drop();
    else
      add();
  }
}

std::string range(std::size_t before, std::size_t count) {
  return std::to_string(count == 0 ? before : before + 1) + "," + std::to_string(count);
}

std::string renderHunk(const Step* begin, const Step* end) {
  std::string lines;
  std::size_t expected = 0;
  std::size_t actual = 0;
  for (const Step* step = begin; step != end; ++step) {
    expected += step->sign != '+';
    actual += step->sign != '-';
    lines += step->sign + *step->text + "\n";
  }
  return "@@ -" + range(begin->expectedBefore, expected) + " +" + range(begin->actualBefore, actual) + " @@\n" + lines;
}

/// The diff up to a length that a person may read.
std::string shorten(std::string diff) {
  std::size_t end = 0;
  for (std::size_t line = 0; line < largestDiff && end < diff.size(); ++line) end = diff.find('\n', end) + 1;
  const auto left = std::count(diff.begin() + static_cast<std::ptrdiff_t>(end), diff.end(), '\n');
  if (left == 0) return diff;
  diff.resize(end);
  return diff + "# " + std::to_string(left) + " more lines of the diff are left out\n";
}

bool isChange(const Step& step) { return step.sign != ' '; }

}  // namespace

std::string unifiedDiff(const std::vector<TraceLine>& expected, const std::vector<TraceLine>& actual) {
  const std::vector<Step> steps = Alignment(expected, actual).steps();
  const Step* const end = steps.data() + steps.size();
  std::string diff;
  for (const Step* change = std::find_if(steps.data(), end, isChange); change != end;) {
    const auto before = std::min<std::ptrdiff_t>(change - steps.data(), contextLines);
    const Step* const begin = change - before;
    // A hunk goes on as long as the next change is so near that their contexts would touch.
    const Step* last = change;
    const Step* next = std::find_if(change + 1, end, isChange);
    while (next != end && next - last <= static_cast<std::ptrdiff_t>(2 * contextLines)) {
      last = next;
      next = std::find_if(next + 1, end, isChange);
    }
    const auto after = std::min<std::ptrdiff_t>(end - last - 1, contextLines);
    diff += renderHunk(begin, last + 1 + after);
    change = next;
  }
  return diff.empty() ? diff : shorten("--- expected\n+++ actual\n" + diff);
}

}  // namespace conformance
