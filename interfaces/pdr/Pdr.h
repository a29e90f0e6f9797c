#pragma once

#include <string>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/devicemanager/tESSELNS.h"
#include "interfaces/portability/StringBase.h"

/// A description of PROM-file-formatter content, read from a text file of lines `KEYWORD value`; `#`
/// begins a comment line; keywords in any letter case:
///
///   MODE pffparallel        FILE_FORMAT mcs     SWAP_BIT off     FILL_VALUE FF     DIRECTION UP
///   PROM 4M                 one a line, in chain order
///   DESIGN 0                its start address; one a line
///   DEVICE marlin3-1        a part name, of the design above it
class TESSEL_EXPORT Pdr {
 public:
  explicit Pdr(const char* path);

  /// Reads the file. False after one error that names file, line and reason.
  bool read();

  tESSELNS::SUBMODE_TYPE getMode() const { return mode_; }
  // Texts are empty when the file does not give them.
  const char* getFileFormat() const { return fileFormat_.c_str(); }
  const char* getSwapBit() const { return swapBit_.c_str(); }
  const char* getFillValue() const { return fillValue_.c_str(); }
  const char* getDirection() const { return direction_.c_str(); }

  int getNumberPromDevices() const { return static_cast<int>(proms_.size()); }
  /// A part name, or a size such as `512` or `4M`. Null past the last one.
  const char* getPromDevice(int index) const;

  int getNumberDesignRecords() const { return static_cast<int>(designs_.size()); }
  const char* getStartAddress(int design) const;
  int getNumberDevices(int design) const;
  const char* getDevice(int design, int index) const;

 private:
  struct Design {
    std::string startAddress;
    std::vector<std::string> devices;
  };

  /// Takes one line; what is wrong with it, or the empty text.
  std::string takeLine(const std::string& keyword, const std::string& value, bool& modeSeen);

  std::string path_;
  tESSELNS::SUBMODE_TYPE mode_ = tESSELNS::PFF_SERIAL;
  std::string fileFormat_;
  std::string swapBit_;
  std::string fillValue_;
  std::string direction_;
  std::vector<std::string> proms_;
  std::vector<Design> designs_;
};
