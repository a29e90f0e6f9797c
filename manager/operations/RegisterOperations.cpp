// Words that read or write one register of a device.

#include <algorithm>

#include "interfaces/portability/UT_STR.h"
#include "manager/devices/Registers.h"
#include "manager/operations/Operation.h"
#include "manager/operations/RegisterWork.h"

namespace {

constexpr std::size_t codeBits = 32;

/// A word that reads a register, and how its messages call it.
struct ReadRow {
  const char* word;
  const char* reg;
  const char* title;
  bool text = false;  ///< characters
};
constexpr ReadRow readRows[] = {
    {"readdna", "dna", "DNA"},
    {"readStatusRegister", "status", "status register"},
    {"readmfgcode", "mfg_code", "manufacturer's code"},
    {"readues", "ues", "user electronic signature", true},
    {"readEFuse", "efuse", "eFuse"},
    {"readEFuseControlReg", "efuse_control", "eFuse control register"},
    {"readPromOptions", "options", "PROM option register"},
    {"readTemperatureAndVoltage", "monitor", "temperature and voltage"},
    {"readCustomerCode", "customer_code", "customer code"},
    {"readSecurityRegister", "security", "security register"},
};

const ReadRow& rowOf(const char* word) {
  return *std::find_if(std::begin(readRows), std::end(readRows),
                       [word](const ReadRow& row) { return UT_STR::ICompare(row.word, word) == 0; });
}

std::string shownField(const RegisterField& field, const BitVector& value) {
  const BitVector bits = value.slice(field.first, field.length);
  if (field.scale != 0 && field.length <= BitVector::wordBits) {
    const double measured = static_cast<double>(bits.number()) * field.scale + field.offset;
    return Port::format("%s is %.3f %s", field.name, measured, field.unit);
  }
  const std::string shown = field.length == 1 ? bits.binary() : "0x" + bits.hex();
  return field.meaning.empty() ? Port::format("%s is %s", field.name, shown)
                               : Port::format("%s is %s (%s)", field.name, shown, field.meaning);
}

/// The characters of a register up to the first zero; what can't be shown is a question mark.
std::string shownText(const BitVector& value) {
  std::string text;
  for (const std::uint8_t byte : value.bytes()) {
    if (byte == 0) break;
    text += byte >= ' ' && byte < 0x7F ? static_cast<char>(byte) : '?';
  }
  return text;
}

Status readRegister(DeviceWork& work) {
  const ReadRow& row = rowOf(work.args().getcmd());
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const Result<const NamedRegister*> found = RegisterWork::find(work, **part, row.reg, row.title);
  if (!found) return found.failure();
  const NamedRegister& named = **found;
  work.status("Reading %s...", row.title);
  const Result<BitVector> value = Registers::read(work.scan(), work.index(), **part, named.instruction, named.length);
  if (!value) return value.failure();
  // A monitor's values say more than its bits.
  const bool measures = std::ranges::any_of(named.fields, [](const auto& field) { return field.scale != 0; });
  if (!measures) work.status("%s is 0x%s", row.title, value->hex());
  if (row.text) work.status("%s reads \"%s\"", row.title, shownText(*value));
  for (const RegisterField& field : named.fields)
    if (field.length < named.length) work.status("%s", shownField(field, *value));
  return {};
}

/// The instruction behind which the user code stands, and its length.
Result<BitVector> readUsercodeOf(DeviceWork& work, const Part& part) {
  const NamedRegister* named = part.findRegister("usercode");
  const std::string instruction = named == nullptr ? "USERCODE" : named->instruction;
  return Registers::read(work.scan(), work.index(), part, instruction, named == nullptr ? codeBits : named->length);
}

Status readUsercode(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  if ((*part)->opcode("USERCODE") == nullptr)
    return Failure{Port::format("%s can't do readusercode: it has no user code.", (*part)->name)};
  work.status("Reading USERCODE...");
  const Result<BitVector> value = readUsercodeOf(work, **part);
  if (!value) return value.failure();
  work.status("USERCODE is 0x%s", value->hex());
  return {};
}

Status writeRegister(DeviceWork& work) {
  const RegisterWork::Row& row = RegisterWork::rowOf(work.args().getcmd());
  const char* value = work.text(row.switchName);
  if (value == nullptr) return Failure{Port::format("%s needs %s.", row.word, row.switchName)};
  const Result<RegisterWork::Write> write = RegisterWork::prepare(work, row, value);
  if (!write) return write.failure();
  return RegisterWork::write(work, *write);
}

/// Whether a bit of the eFuse control register, found by its name, is blown; false for a part without it.
Result<bool> isBlown(DeviceWork& work, const Part& part, const char* fieldName) {
  const NamedRegister* control = part.findRegister("efuse_control");
  if (control == nullptr) return false;
  const auto field = std::ranges::find(control->fields, fieldName, &RegisterField::name);
  if (field == control->fields.end()) return false;
  const Result<BitVector> value =
      Registers::read(work.scan(), work.index(), part, control->instruction, control->length);
  if (!value) return value.failure();
  return value->get(field->first);
}

/// Blows the key and, as long as it can be read, sees that it is right. It is never shown.
Status blowKey(DeviceWork& work, const Part& part, const char* key) {
  const NamedRegister* named = part.findRegister("efuse");
  if (named == nullptr || named->writeInstruction.empty())
    return Failure{Port::format("%s can't do programEFuse: it has no eFuse key.", part.name)};
  const Result<BitVector> bits = RegisterWork::bitsOfHex(key, named->length, "The key");
  if (!bits) return bits.failure();
  const auto read = [&] { return Registers::read(work.scan(), work.index(), part, named->instruction, named->length); };
  const Result<bool> closed = isBlown(work, part, "key_write_disabled");
  if (!closed) return closed.failure();
  if (*closed) return Failure{Port::format("The eFuse key of %s can't be blown any more.", part.name)};
  const Result<bool> hidden = isBlown(work, part, "key_read_disabled");
  if (!hidden) return hidden.failure();
  const bool reads = !*hidden && !work.cable().recordsOnly();
  if (reads) {
    const Result<BitVector> before = read();
    if (!before) return before.failure();
    // What is blown and is no part of the key.
    const BitVector others = ~*bits;
    if (firstDifference(*before, BitVector(named->length), &others) != BitVector::npos)
      return Failure{Port::format("Another eFuse key has been blown into %s already.", part.name)};
  }
  work.status("Programming eFuse key...");
  TESSEL_TRY(Registers::write(work.scan(), work.index(), part, named->writeInstruction, *bits));
  if (reads) {
    const Result<BitVector> after = read();
    if (!after) return after.failure();
    if (*after != *bits) return Failure{"The eFuse key that was blown reads back wrong.", Failure::Kind::mismatch};
  }
  work.status("Programmed eFuse key");
  return {};
}

Status programEFuse(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const std::string& stored = work.device().efuseKey.get();
  const char* key = work.text("-key");
  if (key == nullptr && !stored.empty()) key = stored.c_str();
  const char* control = work.text("-control");
  if (key == nullptr && control == nullptr) return Failure{"programEFuse needs -key or -control."};
  // Before the key: what can't be done is refused while nothing has been blown.
  std::optional<RegisterWork::Write> controlWrite;
  if (control != nullptr) {
    Result<RegisterWork::Write> write = RegisterWork::prepare(work, RegisterWork::controlRow, control);
    if (!write) return write.failure();
    controlWrite = std::move(*write);
  }
  Status blown;
  if (key != nullptr) blown = blowKey(work, **part, key);
  work.device().efuseKey.set("");
  if (!blown || !controlWrite) return blown;
  return RegisterWork::write(work, *controlWrite);
}

/// The revision that a command names; a failure that says which there are.
Result<std::size_t> revisionOf(DeviceWork& work, const Part& part) {
  const UT_CMDSWINFO* given = work.args().getsw("-revision", 0);
  if (given == nullptr) return Failure{Port::format("%s needs -revision.", work.args().getcmd())};
  if (part.revisions == 0)
    return Failure{Port::format("%s can't do %s: it keeps one revision only.", part.name, work.args().getcmd())};
  const std::int32_t revision = given->getargnum32(0);
  if (revision < 0 || static_cast<std::size_t>(revision) >= part.revisions)
    return Failure{Port::format("%s has no revision %d, expected 0 to %d.", part.name, revision, part.revisions - 1)};
  return static_cast<std::size_t>(revision);
}

Status setActiveRevision(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  const Result<std::size_t> revision = revisionOf(work, **part);
  if (!revision) return revision.failure();
  const Result<RegisterWork::Write> write =
      RegisterWork::prepare(work, RegisterWork::revisionRow, Port::format("%x", *revision).c_str());
  if (!write) return write.failure();
  TESSEL_TRY(RegisterWork::write(work, *write));
  work.status("Active revision is %d", *revision);
  return {};
}

Status loadConfigurationRevision(DeviceWork& work) {
  const Result<PartPointer> part = work.part();
  if (!part) return part.failure();
  if ((*part)->opcode("REVISION_LOAD") == nullptr)
    return Failure{
        Port::format("%s can't do loadConfigurationRevision: it has no instruction REVISION_LOAD.", (*part)->name)};
  TESSEL_TRY(setActiveRevision(work));
  TESSEL_TRY(Registers::load(work.scan(), work.index(), **part, "REVISION_LOAD"));
  TESSEL_TRY(work.cable().runTest(0, Registers::writeTime));
  work.status("Revision loaded");
  return {};
}

constexpr OperationRow rows[] = {
    {"readusercode", readUsercode},
    {"readdna", readRegister},
    {"readStatusRegister", readRegister},
    {"readmfgcode", readRegister},
    {"readues", readRegister},
    {"readEFuse", readRegister},
    {"readEFuseControlReg", readRegister},
    {"readPromOptions", readRegister},
    {"readTemperatureAndVoltage", readRegister},
    {"readCustomerCode", readRegister},
    {"readSecurityRegister", readRegister},
    {"programues", writeRegister},
    {"programSecurityRegister", writeRegister},
    {"programUsercode", writeRegister},
    {"programCustomercode", writeRegister},
    {"setEFuseControlReg", writeRegister},
    {"programEFuse", programEFuse},
    {"setActiveRevision", setActiveRevision},
    {"loadConfigurationRevision", loadConfigurationRevision},
};

}  // namespace

const std::span<const OperationRow> registerOperations = rows;
