#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "interfaces/devicemanager/DeviceNS.h"
#include "interfaces/utility/DeviceOptionsMgr.h"
#include "manager/parts/FlashParts.h"
#include "manager/parts/Part.h"

/// A text that is a secret: overwritten when it goes or changes.
class SecretText {
 public:
  SecretText() = default;
  SecretText(const SecretText&) = delete;
  SecretText& operator=(const SecretText&) = delete;
  SecretText(SecretText&& other) noexcept { text_.swap(other.text_); }
  SecretText& operator=(SecretText&& other) noexcept {
    text_.swap(other.text_);
    return *this;
  }
  ~SecretText() { set(""); }

  const std::string& get() const { return text_; }
  void set(const char* text);

 private:
  std::string text_;
};

/// What a `program`, `verify` or `erase` of a target does besides, as attributes say.
struct StoredOptions {
  using Values = std::map<DeviceNS::ATTRIBUTE, std::string>;

  Values values;
  SecretText key;

  /// Fills in the words of an options manager; `defaults` counts where no value is set.
  void give(DeviceOptionsMgr& options, const Values& defaults) const;
};

/// A flash memory behind a device of the chain.
struct AttachedFlash {
  std::string partName;
  std::string file;
  StoredOptions stored;
  DeviceOptionsMgr options;
};

/// A device of the chain, as the user or a chain scan described it.
struct ChainDevice {
  static constexpr const char* unknown = "unknown";

  std::string name = unknown;
  PartPointer part;                   ///< null for a device that is unknown, or known by name and IR length only
  const SpiFlashPart* spi = nullptr;  ///< of a chain of SPI flash memories
  std::size_t irLength = 0;           ///< in bits; 0 when not known
  std::optional<BitVector> idcode;    ///< as a chain scan found it
  std::string file;
  std::string bmmFile;
  std::vector<std::string> extraFiles;
  std::map<int, std::string> coreFiles;
  std::map<DeviceNS::ATTRIBUTE, std::string> texts;  ///< attributes that are kept only
  std::optional<AttachedFlash> spiFlash;
  std::optional<AttachedFlash> bpiFlash;
  StoredOptions stored;
  DeviceOptionsMgr options;
  SecretText efuseKey;

  /// The flash that operations on the attached flash mean; null when there is none.
  AttachedFlash* attached();
};
