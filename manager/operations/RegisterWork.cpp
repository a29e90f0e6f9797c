#include "manager/operations/RegisterWork.h"

#include <algorithm>

#include "interfaces/portability/UT_STR.h"
#include "manager/devices/Registers.h"

namespace {

constexpr RegisterWork::Row rows[] = {
    {"programues", "ues", "user electronic signature", "-ues", true, false},
    {"programSecurityRegister", "security", "security register", "-data", false, false},
    {"programUsercode", "usercode", "user code", "-usercode", false, false},
    {"programCustomercode", "customer_code", "customer code", "-data", false, false},
    {"setEFuseControlReg", "efuse_control", "eFuse control register", "-data", false, true},
};

Result<BitVector> bitsOfText(const std::string& text, std::size_t length, const char* title) {
  if (text.size() * 8 > length)
    return Failure{Port::format("The %s \"%s\" is too long, expected up to %d characters.", title, text, length / 8)};
  BitVector bits(length);
  for (std::size_t i = 0; i < text.size(); ++i) bits.setNumber(i * 8, 8, static_cast<unsigned char>(text[i]));
  return bits;
}

}  // namespace

const RegisterWork::Row& RegisterWork::rowOf(const char* word) {
  return *std::find_if(std::begin(rows), std::end(rows),
                       [word](const Row& row) { return UT_STR::ICompare(row.word, word) == 0; });
}

Result<const NamedRegister*> RegisterWork::find(DeviceWork& work, const Part& part, const char* reg,
                                                const char* title) {
  if (const NamedRegister* found = part.findRegister(reg)) return found;
  return Failure{Port::format("%s can't do %s: it has no %s.", part.name, work.args().getcmd(), title)};
}

Result<BitVector> RegisterWork::bitsOfHex(std::string digits, std::size_t length, const std::string& what) {
  if (digits.starts_with("0x") || digits.starts_with("0X")) digits.erase(0, 2);
  std::optional<BitVector> bits = BitVector::fromHex(digits, length);
  if (digits.empty() || !bits)
    return Failure{Port::format("%s is not what was expected: hex digits of up to %d bits.", what, length)};
  return *std::move(bits);
}

Result<RegisterWork::Write> RegisterWork::prepare(DeviceWork& work, const Row& row, const char* value) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const Result<const NamedRegister*> reg = find(work, **part, row.reg, row.title);
  if (!reg) return reg.failure();
  if ((*reg)->writeInstruction.empty())
    return Failure{Port::format("%s can't do %s: its %s can't be written.", (*part)->name, row.word, row.title)};
  const std::size_t length = (*reg)->length;
  Result<BitVector> bits = row.text ? bitsOfText(value, length, row.title)
                                    : bitsOfHex(value, length, Port::format("%s %s", row.switchName, value));
  if (!bits) return bits.failure();
  return Write{&row, *reg, std::move(*bits)};
}

Result<RegisterWork::Write> RegisterWork::prepare(DeviceWork& work, const char* switchName, const char* value) {
  const auto* row = std::find_if(std::begin(rows), std::end(rows), [switchName](const Row& each) {
    return UT_STR::ICompare(each.switchName, switchName) == 0;
  });
  return prepare(work, *row, value);
}

Status RegisterWork::write(DeviceWork& work, const Write& write) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const Row& row = *write.row;
  const NamedRegister& reg = *write.reg;
  const bool reads = !work.cable().recordsOnly() && !reg.instruction.empty();
  const auto read = [&] { return Registers::read(work.scan(), work.index(), **part, reg.instruction, reg.length); };
  work.status("Programming %s...", row.title);
  BitVector expected = write.bits;
  if (reads && row.onlyBlows) {
    const Result<BitVector> before = read();
    if (!before) return before.failure();
    for (std::size_t i = 0; i < expected.size(); ++i) expected.set(i, expected.get(i) || before->get(i));
  }
  TESSEL_TRY(Registers::write(work.scan(), work.index(), **part, reg.writeInstruction, write.bits));
  if (reads) {
    const Result<BitVector> found = read();
    if (!found) return found.failure();
    if (*found != expected)
      return Failure{
          Port::format("The %s is 0x%s after it was written, expected 0x%s.", row.title, found->hex(), expected.hex()),
          Failure::Kind::mismatch};
  }
  work.status("Programmed %s 0x%s", row.title, expected.hex());
  return {};
}
