#include "interfaces/portability/UT_CMDARGS.h"

#include <cstring>

#include "interfaces/portability/UT_STR.h"

std::int32_t UT_CMDARGINFO::getargnum32() const { return UT_STR::AToL(text_); }

UT_CMDARGS::UT_CMDARGS(int count, const char* const* words) {
  if (count < 1) return;
  const std::span<const char* const> all(words, static_cast<std::size_t>(count));
  std::size_t size = 0;
  std::size_t switchCount = 0;
  for (const char* word : all) {
    size += std::strlen(word) + 1;
    if (isSwitch(word)) ++switchCount;
  }
  text_ = std::make_unique_for_overwrite<char[]>(size);
  switches_.reserve(switchCount);
  arguments_.reserve(all.size());  // never grows below: the switches point into it

  char* end = text_.get();
  const char* switchName = nullptr;
  std::size_t firstArgument = 0;
  const auto closeSwitch = [&] {
    if (switchName == nullptr)
      ownArguments_ = arguments_.size();
    else
      switches_.emplace_back(switchName, std::span<const UT_CMDARGINFO>(arguments_).subspan(firstArgument));
    firstArgument = arguments_.size();
  };
  for (const char* const& word : all) {
    const std::size_t length = std::strlen(word) + 1;
    std::memcpy(end, word, length);
    if (&word == &all.front()) {
      command_ = end;
    } else if (isSwitch(word)) {
      closeSwitch();
      switchName = end;
    } else {
      arguments_.emplace_back(end);
    }
    end += length;
  }
  closeSwitch();
}

const UT_CMDSWINFO* UT_CMDARGS::getsw(int index) const {
  const auto place = static_cast<std::size_t>(index);
  return index >= 0 && place < switches_.size() ? &switches_[place] : nullptr;
}

const UT_CMDSWINFO* UT_CMDARGS::getsw(const char* name, int occurrence) const {
  for (const UT_CMDSWINFO& each : switches_)
    if (UT_STR::ICompare(each.getswname(), name) == 0 && occurrence-- == 0) return &each;
  return nullptr;
}
