// A device manager of one's own: a libTesselModeInterface.so to put in place of the bundled one. This one has
// no devices either; it prints each operation that the interpreter asks for and says that it went well. Such a
// library defines the facade and the static functions at the end of this file, and nothing else is needed.

#include <cstdio>
#include <memory>

#include "interfaces/devicemanager/AttributeNames.h"
#include "interfaces/devicemanager/Collection.h"
#include "interfaces/devicemanager/Design.h"
#include "interfaces/devicemanager/Device.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/devicemanager/ModeInterface.h"
#include "interfaces/utility/DeviceOptionsMgr.h"

namespace {

bool done(const char* operation) {
  std::printf("device manager: %s\n", operation);
  std::fflush(stdout);
  return true;
}

class PrintingDeviceManager : public DeviceManagerInterface {
 public:
  MODE_TYPE getMode() override { return mode_; }
  MODE_TYPE getActiveMode() override { return mode_; }
  bool setMode(MODE_TYPE mode, bool /*makeActive*/) override {
    mode_ = mode;
    return done("setMode");
  }
  SUBMODE_TYPE getSubmode() override { return submode_; }
  bool setSubmode(SUBMODE_TYPE submode) override {
    submode_ = submode;
    return done("setSubmode");
  }
  bool clearMode(MODE_TYPE) override { return done("clearMode"); }
  bool clearAllModes() override { return done("clearAllModes"); }
  void setTargetDevice(MODE_TYPE, int position, bool) override {
    target_ = position;
    done("setTargetDevice");
  }
  void getTargetDevice(MODE_TYPE& mode, int& position, bool& attached) override {
    mode = mode_;
    position = target_;
    attached = false;
  }
  bool setPreference(TesselPreference::PREFERENCE preference, const char* value) override {
    return TesselPreference::getPreferenceObject().set(preference, value) && done("setPreference");
  }
  bool setMbBpiDevice(const char*) override { return done("setMbBpiDevice"); }
  bool setMbBpiType(const char*) override { return done("setMbBpiType"); }
  bool setMbBpiChain(const char*) override { return done("setMbBpiChain"); }
  bool setBpiWidth(MODE_TYPE, const char*) override { return done("setBpiWidth"); }

  bool setCable(const char*, int, int, bool, const char*, bool) override { return done("setCable"); }
  bool lockCable(int) override { return done("lockCable"); }
  bool unlockCable() override { return done("unlockCable"); }
  bool closeCable(bool) override { return done("closeCable"); }
  int setCableSpeed(int speed) override { return done("setCableSpeed") ? speed : 0; }
  bool setCableOption(const char*, const char*) override { return done("setCableOption"); }
  bool runDiagnostics() override { return done("runDiagnostics"); }
  bool info() override { return done("info"); }

  bool writeBatchCommand(const StringBase&) override { return true; }
  void setBatchCommandFile(const char*) override {}

  void setCallbackFunction(bool (*)(Callback&)) override {}
  bool performOperation(int, const char* const* words) override { return done(words[0]); }
  const char* getAttribute(int) override { return ""; }
  DeviceOptionsMgr* getDeviceOptionsMgr(MODE_TYPE, int, bool) override { return &noOptions_; }

  int getDeviceChainCount() override { return 0; }
  bool addDeviceByPart(int, const char*) override { return done("addDeviceByPart"); }
  bool addDeviceByFile(int, const char*, const char*, std::vector<StringBase>) override {
    return done("addDeviceByFile");
  }
  bool addCoreFiles(int, CoreFiles) override { return done("addCoreFiles"); }
  bool clearCoreFiles(int, int) override { return done("clearCoreFiles"); }
  bool addExtraFiles(int, std::vector<StringBase>) override { return done("addExtraFiles"); }
  bool clearAdditionalConfigFiles(int) override { return done("clearAdditionalConfigFiles"); }
  bool assignFile(int, const char*) override { return done("assignFile"); }
  bool removeDevice(int) override { return done("removeDevice"); }
  bool attachDeviceByPart(int, FLASH_TYPE, const char*) override { return done("attachDeviceByPart"); }
  bool assignFileToFlashDevice(int, FLASH_TYPE, const char*) override { return done("assignFileToFlashDevice"); }
  bool deleteAttachedDevice(int) override { return done("deleteAttachedDevice"); }

  const char* getDeviceAttribute(int, DeviceNS::ATTRIBUTE) override { return nullptr; }
  bool setDeviceAttribute(int, DeviceNS::ATTRIBUTE, const char*, bool) override { return done("setDeviceAttribute"); }
  bool setAttribute(int, MODE_TYPE, DeviceNS::ATTRIBUTE, const char*, bool) override { return done("setAttribute"); }
  bool setAttribute(ConfigDeviceNS::ATTRIBUTE, const char*) override { return done("setAttribute"); }
  bool setAttribute(CollectionNS::ATTRIBUTE, const char*) override { return done("setAttribute"); }
  bool setAttribute(DesignNS::ATTRIBUTE, const char*) override { return done("setAttribute"); }
  ConfigDeviceNS::ATTRIBUTE string2Attribute(const char* name) override {
    return AttributeNames::find<ConfigDeviceNS::ATTRIBUTE>(AttributeNames::configDevice, name);
  }

  int getNumberCollections() override { return 0; }
  int getNumberDesigns() override { return 0; }
  int getNumberDeviceChains() override { return 0; }
  bool addCollection(const char*) override { return done("addCollection"); }
  bool removeCollection(const char*) override { return done("removeCollection"); }
  bool renameCollection(const char*, const char*) override { return done("renameCollection"); }
  bool setCurrentCollection(const char*) override { return done("setCurrentCollection"); }
  const char* getCurrentCollectionName() override { return ""; }
  bool addDesign(int, const char*, bool, const char*, int) override { return done("addDesign"); }
  bool addDesign(int, const char*, const char*, int) override { return done("addDesign"); }
  bool removeDesign(int) override { return done("removeDesign"); }
  bool setCurrentDesign(int) override { return done("setCurrentDesign"); }
  bool addDeviceChain(int) override { return done("addDeviceChain"); }
  bool removeDeviceChain(int) override { return done("removeDeviceChain"); }
  bool setCurrentDeviceChain(int) override { return done("setCurrentDeviceChain"); }
  ModeInterface* createModeInterface(MODE_TYPE, const char*, const char*, std::uint32_t) override {
    return done("createModeInterface") ? &content_ : nullptr;
  }
  bool addPromDevice2PromChain(int, std::uint32_t, const char*) override { return done("addPromDevice2PromChain"); }
  bool removePromDevice(int) override { return done("removePromDevice"); }
  bool generate(UT_CMDARGS*) override { return done("generate"); }

  bool writeProjectRepository(const StringBase&) override { return done("writeProjectRepository"); }
  bool readProjectRepository(const StringBase&) override { return done("readProjectRepository"); }
  bool saveCdf(const char*, const StringBase&, bool) override { return done("saveCdf"); }
  bool createArchive(const StringBase&, const StringBase&) override { return done("createArchive"); }
  bool loadArchive(const StringBase&, const StringBase&) override { return done("loadArchive"); }

 private:
  MODE_TYPE mode_ = tESSELNS::NO_MODE;
  SUBMODE_TYPE submode_ = tESSELNS::PFF_SERIAL;
  int target_ = -1;
  DeviceOptionsMgr noOptions_;
  ModeInterface content_;
};

std::unique_ptr<PrintingDeviceManager>& theDeviceManager() {
  static std::unique_ptr<PrintingDeviceManager> manager;
  return manager;
}

}  // namespace

DeviceManagerInterface::~DeviceManagerInterface() = default;
ModeInterface::~ModeInterface() = default;

DeviceManagerInterface* DeviceManagerInterface::getDeviceManager() {
  if (theDeviceManager() == nullptr) theDeviceManager() = std::make_unique<PrintingDeviceManager>();
  return theDeviceManager().get();
}
void DeviceManagerInterface::removeDeviceManager() { theDeviceManager().reset(); }

void ModeInterface::setBatchCommandOff() {}
void ModeInterface::setBatchCommandOn() {}

DeviceNS::ATTRIBUTE Device::string2Attribute(const char* name) {
  return AttributeNames::find<DeviceNS::ATTRIBUTE>(AttributeNames::device, name);
}
CollectionNS::ATTRIBUTE Collection::string2Attribute(const char* name) {
  return AttributeNames::find<CollectionNS::ATTRIBUTE>(AttributeNames::collection, name);
}
DesignNS::ATTRIBUTE Design::string2Attribute(const char* name) {
  return AttributeNames::find<DesignNS::ATTRIBUTE>(AttributeNames::design, name);
}
