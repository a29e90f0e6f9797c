#pragma once

#include <memory>
#include <string>

#include "manager/devices/DataBits.h"
#include "manager/devices/FlowRunner.h"
#include "manager/devices/Memory.h"

/// A device's own memory, erased, programmed, verified and read as the ISC actions of its part say.
class IscMemory : public Memory {
 public:
  static Result<std::unique_ptr<Memory>> make(ScanChain& chain, std::size_t device, PartPointer part);

  Status open() override;
  std::uint64_t size() const override { return sizeOf(memory_); }
  std::string name() const override { return part_->name; }
  Status check(const DataImage& data) override;
  Status erase(const DataImage* data, const Progress& progress) override;
  Status program(const DataImage& data, const ProgramOptions& options, const Progress& progress) override;
  Result<Comparison> compare(const DataImage& data, const Progress& progress) override;
  Result<Comparison> blankCheck(const Progress& progress) override;
  Result<std::vector<std::uint8_t>> read(std::uint64_t first, std::uint64_t count, const Progress& progress) override;

 private:
  /// The names of the actions on a memory; a part may have two.
  struct Actions {
    const char* program;
    const char* verify;
    const char* read;
    const char* erase;
  };
  struct Region {
    Actions actions;
    IscLayout layout;
    std::size_t bits = 0;  ///< of the memory
  };
  static const Actions memoryActions;
  static const Actions configurationActions;

  IscMemory(ScanChain& chain, std::size_t device, PartPointer part)
      : part_(part), loader_(chain, device, std::move(part)) {}

  static Result<Region> region(const Part& part, const Actions& actions);
  static std::uint64_t sizeOf(const Region& region) { return (region.bits + 7) / 8; }
  Status checkFor(const Region& region, const DataImage& data) const;
  static Status checkLastByte(const Region& region, const DataImage& data);
  Status checkBitstream(const Region& region, const DataImage& data) const;
  Status checkProtection(const ProgramOptions& options);
  Status refuseReadProtected();
  Status refuseErrors();
  Result<FlowRunner::Outcome> run(const Region& region, const char* action, const FlowRunner::Choice& choice,
                                  const DataBits* bits, const Progress& progress);
  Status runErase(const Region& region, const Progress& progress);
  Result<Comparison> compareBits(const Region& region, const DataBits& bits, const Progress& progress);
  Status judge(const Region& region, const DataBits& bits, const FlowRunner::Outcome& outcome, bool verified) const;
  Result<Comparison> comparisonOf(const DataBits& bits, const FlowRunner::Outcome& outcome) const;

  PartPointer part_;
  InstructionLoader loader_;
  Region memory_;
  Region configuration_;  ///< the same as `memory_` when the part has only one
};
