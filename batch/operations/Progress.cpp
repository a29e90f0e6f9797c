#include "batch/operations/Progress.h"

#include <cstdint>

#include "batch/Messages.h"
#include "interfaces/portability/Console.h"
#include "interfaces/utility/Callback.h"

namespace {

/// In 32-bit arithmetic, which wraps for more than about 21 million units; 0 of nothing is 0.
std::int32_t percentOf(const Callback& progress) {
  const std::int32_t total = progress.getTotalCount();
  const auto scaled =
      static_cast<std::int32_t>(static_cast<std::uint32_t>(progress.getCurrentCount()) * std::uint32_t{100});
  if (total == 0) return 0;
  // The one quotient that 32 bits do not hold.
  if (total == -1) return static_cast<std::int32_t>(0U - static_cast<std::uint32_t>(scaled));
  return scaled / total;
}

void showUpdate(const Callback& progress) {
  const std::int32_t percent = percentOf(progress);
  // Straight to the console, so that the progress line starts on a line of its own.
  if (percent == 0) Port::Console::print("\n");
  // The carriage return lets the next update overwrite this one.
  Messages::status(" %d%c\r\f", percent, '%');
}

}  // namespace

bool progressCallback(Callback& progress) {
  switch (progress.getProgressStatus()) {
    case Callback::start:
      Messages::debug("PROGRESS_START - Starting Operation.\n");
      break;
    case Callback::end:
      Messages::debug("PROGRESS_END - End Operation.\n");
      break;
    case Callback::update:
      showUpdate(progress);
      break;
    default:
      break;
  }
  return false;
}
