#include "manager/devices/Registers.h"

#include "interfaces/portability/FormatArgument.h"

Status Registers::load(ScanChain& chain, std::size_t device, const Part& part, const std::string& instruction) {
  const BitVector* opcode = part.opcode(instruction);
  if (opcode == nullptr) return Failure{Port::format("%s has no instruction %s.", part.name, instruction)};
  BitVector captured;
  TESSEL_TRY(chain.loadInstruction(device, *opcode, &captured));
  if (chain.cable().recordsOnly() || part.irCapture.value.size() != captured.size() || part.irCapture.matches(captured))
    return {};
  return Failure{Port::format("The instruction register answered %s, expected %s: the chain is disturbed.",
                              captured.binary(), part.irCapture.value.binary()),
                 Failure::Kind::mismatch};
}

Result<BitVector> Registers::read(ScanChain& chain, std::size_t device, const Part& part,
                                  const std::string& instruction, std::size_t length) {
  if (const Status loaded = load(chain, device, part, instruction); !loaded) return loaded.failure();
  const BitVector out(length);
  BitVector in;
  if (const Status scanned = chain.scanData(device, {.out = out, .in = &in}); !scanned) return scanned.failure();
  return in;
}

Status Registers::write(ScanChain& chain, std::size_t device, const Part& part, const std::string& instruction,
                        const BitVector& bits) {
  TESSEL_TRY(load(chain, device, part, instruction));
  TESSEL_TRY(chain.scanData(device, {.out = bits}));
  return chain.cable().runTest(0, writeTime);
}
