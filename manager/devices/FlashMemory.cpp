#include "manager/devices/FlashMemory.h"

#include <algorithm>

namespace {

constexpr std::uint64_t bytesPerRead = 0x20000;
constexpr std::uint64_t bytesPerSelect = 0x10000;

Failure fail(const std::string& text) { return {.text = text, .kind = Failure::Kind::general}; }

/// One of two halves of the whole.
Progress half(const Progress& progress, int number) {
  if (!progress) return progress;
  return [=](std::uint64_t done, std::uint64_t total) { progress(done + (number == 0 ? 0 : total), 2 * total); };
}

}  // namespace

Status FlashMemory::erase(const DataImage* data, const Progress& progress) {
  if (data != nullptr) TESSEL_TRY(check(*data));
  TESSEL_TRY(select());
  TESSEL_TRY(refuseProtected());
  return eraseSectors(data, progress);
}

Status FlashMemory::eraseSectors(const DataImage* data, const Progress& progress) {
  std::vector<std::uint64_t> sectors;
  if (data != nullptr)
    for (ImageWindows windows(*data, sectorSize()); windows.next();)
      sectors.push_back(windows.first() / sectorSize() * sectorSize());
  if (data == nullptr || sectors.size() * sectorSize() >= size()) {
    TESSEL_TRY(eraseAll());
    if (progress) progress(size(), size());
    return {};
  }
  std::uint64_t done = 0;
  for (const std::uint64_t address : sectors) {
    TESSEL_TRY(select());
    TESSEL_TRY(eraseSector(address));
    done += sectorSize();
    if (progress) progress(done, sectors.size() * sectorSize());
  }
  return {};
}

Status FlashMemory::program(const DataImage& data, const ProgramOptions& options, const Progress& progress) {
  if (!options.key.empty()) return fail("a flash memory takes no encryption key with its data");
  TESSEL_TRY(check(data));
  TESSEL_TRY(select());
  TESSEL_TRY(refuseProtected());
  TESSEL_TRY(options.erase ? eraseSectors(&data, {}) : refuseOverwriting(data));
  if (!options.verify) {
    TESSEL_TRY(programBlocks(data, progress));
    return cable().flush();
  }
  TESSEL_TRY(programBlocks(data, half(progress, 0)));
  const Result<Comparison> comparison = compare(data, half(progress, 1));
  if (!comparison) return comparison.failure();
  if (!comparison->equal()) return DataCompare::failure(*comparison);
  return loader_.checkIdcode();
}

/// Fails when a bit would have to be set.
Status FlashMemory::refuseOverwriting(const DataImage& data) {
  for (ImageWindows windows(data, bytesPerRead); windows.next();) {
    const auto old = readBytes(windows.first(), windows.count());
    if (!old) return old.failure();
    // Bytes that the data lack may be anything.
    const std::vector<std::uint8_t> wanted = data.flatten(windows.first(), windows.count(), 0);
    for (std::size_t i = 0; i < wanted.size(); ++i)
      if ((wanted[i] & ~(*old)[i]) != 0)
        return fail("address " + DataCompare::hex(windows.first() + i) + " holds " + DataCompare::hex((*old)[i], 2) +
                    ", which can't become " + DataCompare::hex(wanted[i], 2) + " without an erase");
  }
  return {};
}

Status FlashMemory::programBlocks(const DataImage& data, const Progress& progress) {
  const std::uint64_t total = DataCompare::count(data);
  std::uint64_t done = 0;
  std::uint64_t selectedUpTo = 0;
  for (ImageWindows windows(data, blockSize()); windows.next();) {
    if (windows.first() >= selectedUpTo) {
      TESSEL_TRY(select());
      selectedUpTo = windows.first() + bytesPerSelect;
    }
    const std::vector<std::uint8_t> bytes = data.flatten(windows.first(), windows.count());
    const bool blank = std::all_of(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte == 0xFF; });
    if (!blank) TESSEL_TRY(programBlock(windows.first(), bytes));
    done = std::min(done + windows.count(), total);
    if (progress) progress(done, total);
  }
  return {};
}

Result<Comparison> FlashMemory::compare(const DataImage& data, const Progress& progress) {
  TESSEL_TRY(check(data));
  TESSEL_TRY(select());
  const std::uint64_t total = DataCompare::count(data);
  Comparison comparison;
  for (ImageWindows windows(data, bytesPerRead); windows.next();) {
    const auto found = readBytes(windows.first(), windows.count());
    if (!found) return found.failure();
    DataCompare::add(comparison, &data, windows.first(), *found);
    if (progress) progress(comparison.compared, total);
  }
  return comparison;
}

Result<Comparison> FlashMemory::blankCheck(const Progress& progress) {
  TESSEL_TRY(select());
  Comparison comparison;
  while (comparison.compared < size()) {
    const std::uint64_t first = comparison.compared;
    const auto found = readBytes(first, std::min(bytesPerRead, size() - first));
    if (!found) return found.failure();
    DataCompare::add(comparison, nullptr, first, *found);
    if (progress) progress(comparison.compared, size());
  }
  return comparison;
}

Result<std::vector<std::uint8_t>> FlashMemory::read(std::uint64_t first, std::uint64_t count,
                                                    const Progress& progress) {
  TESSEL_TRY(DataCompare::inside(first, count, size()));
  TESSEL_TRY(select());
  std::vector<std::uint8_t> bytes;
  bytes.reserve(count);
  while (bytes.size() < count) {
    const auto part = readBytes(first + bytes.size(), std::min(bytesPerRead, count - bytes.size()));
    if (!part) return part.failure();
    bytes.insert(bytes.end(), part->begin(), part->end());
    if (progress) progress(bytes.size(), count);
  }
  return bytes;
}
