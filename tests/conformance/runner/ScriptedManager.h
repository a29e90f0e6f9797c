#pragma once

#include <deque>
#include <map>
#include <string>
#include <tuple>
#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "interfaces/utility/DeviceOptionsMgr.h"
#include "tests/conformance/runner/CallValues.h"
#include "tests/conformance/runner/Stage.h"

namespace conformance {

/// The device manager of a case: every operation is a call on the stage.
/// A text that it gives back is crossed out with `#` at the next call, when the contract lets it go, so that
/// one that is used too long shows up.
class ScriptedManager : public DeviceManagerInterface {
 public:
  explicit ScriptedManager(Stage& stage) : stage_(stage) {}

  MODE_TYPE getMode() override;
  MODE_TYPE getActiveMode() override;
  bool setMode(MODE_TYPE mode, bool makeActive) override;
  SUBMODE_TYPE getSubmode() override;
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
  bool lockCable(int tries) override;
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

  int getNumberCollections() override;
  int getNumberDesigns() override;
  int getNumberDeviceChains() override;
  bool addCollection(const char* name) override;
  bool removeCollection(const char* name) override;
  bool renameCollection(const char* oldName, const char* newName) override;
  bool setCurrentCollection(const char* name) override;
  const char* getCurrentCollectionName() override;
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

 private:
  using DeviceKey = std::tuple<int, int, bool>;

  template <class... Arguments>
  Value ask(const char* name, const Arguments&... arguments) {
    std::vector<Value> values{toValue(arguments)...};
    crossOutTexts();
    return stage_.call(name, std::move(values));
  }
  template <class... Arguments>
  std::int64_t number(const char* name, const Arguments&... arguments) {
    return ask(name, arguments...).number;
  }
  template <class... Arguments>
  bool succeeds(const char* name, const Arguments&... arguments) {
    return number(name, arguments...) != 0;
  }
  const char* keep(const Value& text);
  void crossOutTexts();

  Stage& stage_;
  std::deque<std::string> texts_;
  std::map<DeviceKey, DeviceOptionsMgr> options_;
  ModeInterface modeInterface_;
};

}  // namespace conformance
