#pragma once

#include <cstdint>
#include <map>
#include <vector>

#include "interfaces/Export.h"
#include "interfaces/devicemanager/CollectionNS.h"
#include "interfaces/devicemanager/ConfigDeviceNS.h"
#include "interfaces/devicemanager/DesignNS.h"
#include "interfaces/devicemanager/DeviceNS.h"
#include "interfaces/devicemanager/tESSELNS.h"
#include "interfaces/portability/StringBase.h"
#include "interfaces/utility/TesselPreference.h"

class Callback;
class DeviceOptionsMgr;
class ModeInterface;
class UT_CMDARGS;

/// The facade of the device manager: everything that the interpreter asks of devices, cables and files.
/// A host with hardware of its own implements it in a library of its own, together with the static
/// functions of this class, of `ModeInterface` and of `Device`, `Collection` and `Design`.
///
/// One thread calls it. Positions, chain indexes and design numbers count from 0. A bool result is true
/// for success; an operation that fails has issued its own error, once. Texts are borrowed for the call;
/// texts given back are valid until the next call. Nothing throws unless said so.
class TESSEL_EXPORT DeviceManagerInterface {
 public:
  using MODE_TYPE = tESSELNS::MODE_TYPE;
  using SUBMODE_TYPE = tESSELNS::SUBMODE_TYPE;
  using FLASH_TYPE = tESSELNS::FLASH_TYPE;
  using CoreFiles = std::map<int, StringBase>;  ///< file path by processor-core number

  /// The one device manager of the process, made at the first call; null when there is none.
  static DeviceManagerInterface* getDeviceManager();
  /// Destroys it.
  static void removeDeviceManager();

  virtual ~DeviceManagerInterface();

  // Mode, submode, target, preferences.

  /// The mode selected, `NO_MODE` when none is.
  virtual MODE_TYPE getMode() = 0;
  /// The mode in force for the current content.
  virtual MODE_TYPE getActiveMode() = 0;
  virtual bool setMode(MODE_TYPE mode, bool makeActive) = 0;
  virtual SUBMODE_TYPE getSubmode() = 0;
  virtual bool setSubmode(SUBMODE_TYPE submode) = 0;
  /// Drops the content of one mode, its configuration device included.
  virtual bool clearMode(MODE_TYPE mode) = 0;
  virtual bool clearAllModes() = 0;
  virtual void setTargetDevice(MODE_TYPE mode, int position, bool attached) = 0;
  /// The target stored last; mode 9 or position -1 when there is none.
  virtual void getTargetDevice(MODE_TYPE& mode, int& position, bool& attached) = 0;
  virtual bool setPreference(TesselPreference::PREFERENCE preference, const char* value) = 0;
  virtual bool setMbBpiDevice(const char* device) = 0;
  virtual bool setMbBpiType(const char* type) = 0;
  virtual bool setMbBpiChain(const char* chain) = 0;
  virtual bool setBpiWidth(MODE_TYPE mode, const char* width) = 0;

  // Cable.

  /// Opens a cable. `type` is "com", "lpt", "usb", "usb2", "auto", "null", the name of the file that a
  /// file cable writes, or null for a port word that names no cable. `port` is the port's index, -1 for
  /// none; `baud` is in bits per second, -1 for automatic or not applicable; `server` is a host name or null.
  virtual bool setCable(const char* type, int port, int baud, bool open, const char* server, bool quiet) = 0;
  /// Takes the cable lock; false when another user holds the cable. Sessions ask with the number 5, whose
  /// meaning is the device manager's; the bundled one has one lock and does not look at it.
  virtual bool lockCable(int kind) = 0;
  virtual bool unlockCable() = 0;
  /// `final` is true at the end of a session.
  virtual bool closeCable(bool final) = 0;
  virtual int setCableSpeed(int speed) = 0;
  virtual bool setCableOption(const char* name, const char* value) = 0;
  virtual bool runDiagnostics() = 0;
  /// Reports the cable and the chain.
  virtual bool info() = 0;

  // Recording.

  /// Appends a line to the batch-command file.
  virtual bool writeBatchCommand(const StringBase& line) = 0;
  virtual void setBatchCommandFile(const char* file) = 0;

  // Operations.

  /// Registers the function that gets the progress events of operations.
  virtual void setCallbackFunction(bool (*function)(Callback&)) = 0;
  /// Carries out a command given as its words, the command word first, positions from 0.
  virtual bool performOperation(int count, const char* const* words) = 0;
  /// A text about the session by number; 2 is the state of the last boundary-scan operation.
  virtual const char* getAttribute(int number) = 0;
  /// The stored options of a device, or of the flash attached to it. Never null.
  virtual DeviceOptionsMgr* getDeviceOptionsMgr(MODE_TYPE mode, int position, bool attachedFlash) = 0;

  // The current chain.

  virtual int getDeviceChainCount() = 0;
  virtual bool addDeviceByPart(int position, const char* part) = 0;
  /// `bmmFile` (a block-memory map) is null when there is none.
  virtual bool addDeviceByFile(int position, const char* file, const char* bmmFile,
                               std::vector<StringBase> extraFiles) = 0;
  virtual bool addCoreFiles(int position, CoreFiles files) = 0;
  virtual bool clearCoreFiles(int position, int core) = 0;
  virtual bool addExtraFiles(int position, std::vector<StringBase> files) = 0;
  virtual bool clearAdditionalConfigFiles(int position) = 0;
  virtual bool assignFile(int position, const char* file) = 0;
  virtual bool removeDevice(int position) = 0;
  virtual bool attachDeviceByPart(int position, FLASH_TYPE type, const char* part) = 0;
  virtual bool assignFileToFlashDevice(int position, FLASH_TYPE type, const char* file) = 0;
  virtual bool deleteAttachedDevice(int position) = 0;

  // Attributes.

  /// Null when the attribute is not set.
  virtual const char* getDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute) = 0;
  virtual bool setDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute, const char* value, bool quiet) = 0;
  /// The form for the flash attached to the device (`attached` true).
  virtual bool setAttribute(int position, MODE_TYPE mode, DeviceNS::ATTRIBUTE attribute, const char* value,
                            bool attached) = 0;
  virtual bool setAttribute(ConfigDeviceNS::ATTRIBUTE attribute, const char* value) = 0;
  virtual bool setAttribute(CollectionNS::ATTRIBUTE attribute, const char* value) = 0;
  virtual bool setAttribute(DesignNS::ATTRIBUTE attribute, const char* value) = 0;
  /// The configuration-device attribute of that name; -1 for an unknown name.
  virtual ConfigDeviceNS::ATTRIBUTE string2Attribute(const char* name) = 0;

  // Content of the formatter and configuration-system modes.

  virtual int getNumberCollections() = 0;
  virtual int getNumberDesigns() = 0;
  virtual int getNumberDeviceChains() = 0;
  virtual bool addCollection(const char* name) = 0;
  virtual bool removeCollection(const char* name) = 0;
  virtual bool renameCollection(const char* oldName, const char* newName) = 0;
  /// `name` is null when the command's switch had no argument.
  virtual bool setCurrentCollection(const char* name) = 0;
  /// Empty or null when there is no current collection.
  virtual const char* getCurrentCollectionName() = 0;
  /// `value` is the design's name, or its start address in the PROM file formatter; `rs` may be null.
  virtual bool addDesign(int version, const char* value, bool data, const char* rs, int kind) = 0;
  virtual bool addDesign(int version, const char* startAddress, const char* rs, int kind) = 0;
  virtual bool removeDesign(int version) = 0;
  virtual bool setCurrentDesign(int version) = 0;
  virtual bool addDeviceChain(int index) = 0;
  virtual bool removeDeviceChain(int index) = 0;
  virtual bool setCurrentDeviceChain(int index) = 0;
  /// Makes the configuration device of a mode; null on failure. The manager owns it.
  virtual ModeInterface* createModeInterface(MODE_TYPE mode, const char* path, const char* name,
                                             std::uint32_t size) = 0;
  /// Throws `ACDEntryNotFoundException` when the name is no known PROM part. `size` is 0 for a PROM named
  /// by part.
  virtual bool addPromDevice2PromChain(int position, std::uint32_t size, const char* name) = 0;
  virtual bool removePromDevice(int position) = 0;
  /// Writes the output files of the active mode as the command's switches say.
  virtual bool generate(UT_CMDARGS* switches) = 0;

  // Project files.

  virtual bool writeProjectRepository(const StringBase& file) = 0;
  virtual bool readProjectRepository(const StringBase& file) = 0;
  virtual bool saveCdf(const char* file, const StringBase& name, bool flag) = 0;
  virtual bool createArchive(const StringBase& file, const StringBase& directory) = 0;
  virtual bool loadArchive(const StringBase& file, const StringBase& directory) = 0;
};
