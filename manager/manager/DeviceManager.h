#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/utility/DeviceOptionsMgr.h"
#include "manager/cables/CableChoice.h"
#include "manager/chain/DeviceChain.h"
#include "manager/manager/BatchCommandFile.h"
#include "manager/manager/CableLock.h"

/// The bundled device manager. It keeps the session's device-side state and the chain of each mode, holds the cable
/// and its lock, has operations carried out and records steps in the batch-command file. What needs content of the
/// formatter modes, projects or archives refuses with an error that says so.
class DeviceManager : public DeviceManagerInterface {
 public:
  DeviceManager();
  ~DeviceManager() override;

  MODE_TYPE getMode() override { return mode_; }
  MODE_TYPE getActiveMode() override { return activeMode_; }
  bool setMode(MODE_TYPE mode, bool makeActive) override;
  SUBMODE_TYPE getSubmode() override { return submode_; }
  bool setSubmode(SUBMODE_TYPE submode) override;
  bool clearMode(MODE_TYPE mode) override;
  bool clearAllModes() override;
  void setTargetDevice(MODE_TYPE mode, int position, bool attached) override;
  void getTargetDevice(MODE_TYPE& mode, int& position, bool& attached) override;
  bool setPreference(TesselPreference::PREFERENCE preference, const char* value) override;
  bool setMbBpiDevice(const char* device) override;
  bool setMbBpiType(const char* type) override;
  bool setMbBpiChain(const char* chain) override;
  bool setBpiWidth(MODE_TYPE mode, const char* width) override;

  bool setCable(const char* type, int port, int baud, bool open, const char* server, bool quiet) override;
  bool lockCable(int kind) override;
  bool unlockCable() override;
  bool closeCable(bool final) override;
  int setCableSpeed(int speed) override;
  bool setCableOption(const char* name, const char* value) override;
  bool runDiagnostics() override;
  bool info() override;

  bool writeBatchCommand(const StringBase& line) override;
  void setBatchCommandFile(const char* file) override;

  void setCallbackFunction(bool (*function)(Callback&)) override;
  bool performOperation(int count, const char* const* words) override;
  const char* getAttribute(int number) override;
  DeviceOptionsMgr* getDeviceOptionsMgr(MODE_TYPE mode, int position, bool attachedFlash) override;

  int getDeviceChainCount() override;
  bool addDeviceByPart(int position, const char* part) override;
  bool addDeviceByFile(int position, const char* file, const char* bmmFile,
                       std::vector<StringBase> extraFiles) override;
  bool addCoreFiles(int position, CoreFiles files) override;
  bool clearCoreFiles(int position, int core) override;
  bool addExtraFiles(int position, std::vector<StringBase> files) override;
  bool clearAdditionalConfigFiles(int position) override;
  bool assignFile(int position, const char* file) override;
  bool removeDevice(int position) override;
  bool attachDeviceByPart(int position, FLASH_TYPE type, const char* part) override;
  bool assignFileToFlashDevice(int position, FLASH_TYPE type, const char* file) override;
  bool deleteAttachedDevice(int position) override;

  const char* getDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute) override;
  bool setDeviceAttribute(int position, DeviceNS::ATTRIBUTE attribute, const char* value, bool quiet) override;
  bool setAttribute(int position, MODE_TYPE mode, DeviceNS::ATTRIBUTE attribute, const char* value,
                    bool attached) override;
  bool setAttribute(ConfigDeviceNS::ATTRIBUTE attribute, const char* value) override;
  bool setAttribute(CollectionNS::ATTRIBUTE attribute, const char* value) override;
  bool setAttribute(DesignNS::ATTRIBUTE attribute, const char* value) override;
  ConfigDeviceNS::ATTRIBUTE string2Attribute(const char* name) override;

  int getNumberCollections() override { return 0; }
  int getNumberDesigns() override { return 0; }
  int getNumberDeviceChains() override { return 0; }
  bool addCollection(const char* name) override;
  bool removeCollection(const char* name) override;
  bool renameCollection(const char* oldName, const char* newName) override;
  bool setCurrentCollection(const char* name) override;
  const char* getCurrentCollectionName() override { return ""; }
  bool addDesign(int version, const char* value, bool data, const char* rs, int kind) override;
  bool addDesign(int version, const char* startAddress, const char* rs, int kind) override;
  bool removeDesign(int version) override;
  bool setCurrentDesign(int version) override;
  bool addDeviceChain(int index) override;
  bool removeDeviceChain(int index) override;
  bool setCurrentDeviceChain(int index) override;
  ModeInterface* createModeInterface(MODE_TYPE mode, const char* path, const char* name, std::uint32_t size) override;
  bool addPromDevice2PromChain(int position, std::uint32_t size, const char* name) override;
  bool removePromDevice(int position) override;
  bool generate(UT_CMDARGS* switches) override;

  bool writeProjectRepository(const StringBase& file) override;
  bool readProjectRepository(const StringBase& file) override;
  bool saveCdf(const char* file, const StringBase& name, bool flag) override;
  bool createArchive(const StringBase& file, const StringBase& directory) override;
  bool loadArchive(const StringBase& file, const StringBase& directory) override;

  /// Whether the steps that the manager carries out are recorded.
  static bool recording;

 private:
  struct Target {
    MODE_TYPE mode = tESSELNS::NO_MODE;
    int position = -1;
    bool attached = false;
    bool operator==(const Target&) const = default;
  };
  struct Multiboot {
    std::string device;
    std::string type;
    std::string chain;
    std::string width;
  };

  /// Stores a text and records the step when that changed something.
  bool store(std::string& field, const char* value, const std::string& step);
  void recordStep(const std::string& line);

  bool hasChain(MODE_TYPE mode) const { return mode >= tESSELNS::BOUNDARY_SCAN && mode <= tESSELNS::SPI; }
  /// The chain of the active mode; null, after an error, in a mode without one.
  DeviceChain* chain(const char* command);
  /// A device of that chain; null after an error.
  ChainDevice* device(const char* command, int position);
  /// Puts a device into the chain.
  bool insert(int position, ChainDevice device, const std::string& step);

  /// The parts, from the directories that are named now.
  PartLibrary& parts();
  /// Carries out a command of operations; its words are parsed.
  bool runOperation(Cable& cable, const UT_CMDARGS& args);

  /// The open cable, opened again after a link was lost; null after an error.
  Cable* openCable();
  bool connect();
  void disconnect();
  int multibootBpiWidth() const;

  MODE_TYPE mode_ = tESSELNS::NO_MODE;
  MODE_TYPE activeMode_ = tESSELNS::NO_MODE;
  SUBMODE_TYPE submode_ = tESSELNS::PFF_SERIAL;
  bool submodeSet_ = false;  ///< since the mode was chosen
  Target target_;
  Multiboot multiboot_;
  int cableSpeed_ = 0;
  bool (*progress_)(Callback&) = nullptr;
  DeviceOptionsMgr noOptions_;
  std::vector<std::string> partsDirectories_;  ///< those that `parts_` searches
  PartLibrary parts_;
  std::map<MODE_TYPE, DeviceChain> chains_;
  std::string answer_;         ///< the text that was given away last
  std::string lastOperation_;  ///< how it ended, for `getAttribute`
  bool lastFailed_ = false;

  CableLock cableLock_;
  CableOpener opener_{parts_};
  CableChoice choice_;
  std::string boardFile_;
  std::uint32_t tckLimit_ = 0;  ///< Hz; 0 for none
  std::unique_ptr<Cable> cable_;
  BatchCommandFile batchCommands_;
};
