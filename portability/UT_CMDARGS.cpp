#include "interfaces/portability/UT_CMDARGS.h"

#include <cstring>
#include <memory>
#include <type_traits>

#include "interfaces/portability/Secret.h"
#include "interfaces/portability/UT_STR.h"

std::int32_t UT_CMDARGINFO::getargnum32() const { return UT_STR::AToL(text_); }

UT_CMDARGS::UT_CMDARGS(int count, const char* const* words) {
  // No destructor has anything to do, so that one block of memory can hold all.
  static_assert(std::is_trivially_destructible_v<UT_CMDSWINFO> && std::is_trivially_destructible_v<UT_CMDARGINFO>);
  static_assert(alignof(UT_CMDSWINFO) >= alignof(UT_CMDARGINFO) && sizeof(UT_CMDSWINFO) % alignof(UT_CMDARGINFO) == 0);
  if (count < 1) return;
  const std::span<const char* const> all(words, static_cast<std::size_t>(count));
  std::size_t textSize = 0;
  std::size_t switchCount = 0;
  for (const char* word : all) {
    textSize += std::strlen(word) + 1;
    if (isSwitch(word)) ++switchCount;
  }
  const std::size_t switchBytes = switchCount * sizeof(UT_CMDSWINFO);
  const std::size_t argumentBytes = all.size() * sizeof(UT_CMDARGINFO);
  memorySize_ = switchBytes + argumentBytes + textSize;
  memory_ = std::make_unique_for_overwrite<std::byte[]>(memorySize_);
  auto* const switches = reinterpret_cast<UT_CMDSWINFO*>(memory_.get());
  auto* const arguments = reinterpret_cast<UT_CMDARGINFO*>(memory_.get() + switchBytes);
  auto* text = reinterpret_cast<char*>(memory_.get() + switchBytes + argumentBytes);

  auto* nextSwitch = switches;
  auto* nextArgument = arguments;
  auto* firstArgument = arguments;
  const char* switchName = nullptr;
  const auto closeSwitch = [&] {
    if (switchName == nullptr)
      ownArguments_ = static_cast<std::size_t>(nextArgument - arguments);
    else
      std::construct_at(nextSwitch++, switchName, std::span<const UT_CMDARGINFO>(firstArgument, nextArgument));
    firstArgument = nextArgument;
  };
  for (const char* const& word : all) {
    const std::size_t size = std::strlen(word) + 1;
    std::memcpy(text, word, size);
    if (&word == &all.front()) {
      command_ = text;
    } else if (isSwitch(word)) {
      closeSwitch();
      switchName = text;
    } else {
      std::construct_at(nextArgument++, text);
    }
    text += size;
  }
  closeSwitch();
  switches_ = {switches, nextSwitch};
}

UT_CMDARGS::~UT_CMDARGS() {
  for (const UT_CMDSWINFO& each : switches_) {
    if (!Port::Secret::announces(each.getswname())) continue;
    Port::Secret::wipe(memory_.get(), memorySize_);
    return;
  }
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
