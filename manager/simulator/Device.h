#pragma once

#include <deque>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "manager/simulator/BoardDescription.h"
#include "manager/simulator/Boundary.h"
#include "manager/simulator/BpiBridge.h"
#include "manager/simulator/Configuration.h"
#include "manager/simulator/DeviceStatus.h"
#include "manager/simulator/EraseInstruction.h"
#include "manager/simulator/IscControl.h"
#include "manager/simulator/PagedMemory.h"
#include "manager/simulator/RegisterFile.h"
#include "manager/simulator/SpiBridge.h"

/// One device of a board: its TAP and the models behind the instructions that its part has.
class Device {
 public:
  /// `position` is that in the chain.
  Device(const DeviceDescription& description, std::size_t position, BoardClock& clock, Nets& nets);

  TapDevice& tap() { return tap_; }
  const Part& part() const { return *part_; }
  /// The device's own memory: the pages, or the configuration of a part without pages. Empty when it has none.
  std::vector<std::uint8_t> memory() const;
  const SpiFlash* spi() const { return spi_.get(); }
  const BpiFlash* bpi() const { return bpi_.get(); }
  void visit(StateVisitor& visitor);

 private:
  void makeFlash(const DeviceDescription& description, BoardClock& clock);
  void makeMemories(const DeviceDescription& description);
  void makeRegisters(const DeviceDescription& description);
  void defineStandard();
  void defineIsc(const IscModel& model);
  /// Instructions that no model knows have a register of their length at least.
  void defineOthers();
  void define(Instruction instruction);
  BitVector usercode();

  PartPointer part_;
  std::string prefix_;  ///< of the names in a state file
  std::uint32_t idcode_;
  DeviceStatus status_;
  TapDevice tap_;
  std::set<std::string> taken_;  ///< the instructions that have a meaning
  ShiftRegister idcodeRegister_;
  ShiftRegister usercodeRegister_;
  BitVector usercode_;  ///< of a part that neither stores one nor takes it from a bitstream
  Boundary boundary_;
  std::unique_ptr<PagedMemory> pages_;
  std::unique_ptr<Configuration> configuration_;
  std::unique_ptr<RegisterFile> registers_;
  std::unique_ptr<IscControl> control_;
  std::vector<std::unique_ptr<EraseInstruction>> erasures_;
  std::unique_ptr<SpiFlash> spi_;
  std::unique_ptr<BpiFlash> bpi_;
  std::unique_ptr<SpiBridge> spiBridge_;
  std::unique_ptr<BpiBridge> bpiBridge_;
  std::deque<ShiftRegister> others_;
};
