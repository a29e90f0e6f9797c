#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Selection.h"
#include "batch/Switches.h"
#include "batch/chain/Position.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_STR.h"

using Messages::failure;

bool CmdParser::defineDevice(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const int count = deviceManager->getDeviceChainCount();
  const UT_CMDSWINFO* given = findSwitch(args, "-p", "-position");
  if (given == nullptr) return failure("Position is required\n");
  const int position = given->getargnum(0);
  // Deliberate: this text shows the position counted from 0.
  if (position >= count) return failure("Device %d does not exist, can't define it.\n", position);
  const char* oldName = deviceManager->getDeviceAttribute(position, DeviceNS::NAME);
  if (UT_STR::ICompare(oldName, "unknown") != 0) return failure("Can't define a named device, %s.\n", oldName);
  const UT_CMDSWINFO* irLength = args.getsw("-ireg", 0);
  if (irLength == nullptr) return failure("Instruction register length is required.\n");
  const UT_CMDSWINFO* name = args.getsw("-name", 0);
  if (name == nullptr) return failure("Name of the device is required.\n");
  deviceManager->setDeviceAttribute(position, DeviceNS::IR_LENGTH, irLength->getargtxt(0), true);
  deviceManager->setDeviceAttribute(position, DeviceNS::NAME, name->getargtxt(0), true);
  return true;
}

namespace {

/// From 0 to n-1, whatever the device manager makes of the numbers after a removal.
bool removeAll(DeviceManagerInterface& manager) {
  const int count = manager.getDeviceChainCount();
  for (int i = 0; i < count; ++i)
    if (!manager.removeDevice(i)) return false;
  return true;
}

/// The selection that the content modes need before a device is deleted. False after a message.
bool selectChain(CmdParser& session, const UT_CMDARGS& args) {
  if (!selectCollection(session, args.getsw("-collection", 0))) return false;
  const UT_CMDSWINFO* version = args.getsw("-version", 0);
  if (version != nullptr && !selectDesign(session, version->getargnum32(0))) return false;
  const UT_CMDSWINFO* index = args.getsw("-index", 0);
  if (index == nullptr) return failure("Chain index is requlired.\n");
  return session.deviceManager->setCurrentDeviceChain(index->getargnum32(0)) || failure("Set current chain failed.\n");
}

}  // namespace

bool CmdParser::deleteDevice(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  // Of the chain that is current now: the selection below may change it.
  const int count = deviceManager->getDeviceChainCount();
  if (args.findsw("-all")) return removeAll(*deviceManager);
  const UT_CMDSWINFO* positions = findSwitch(args, "-p", "-position");
  if (positions == nullptr) return failure("Position is required\n");
  if (mode >= tESSELNS::SYSTEM_OBA_CF && !selectChain(*this, args)) return false;
  return removeEach(*positions, count, "Device %d not in chain, can't delete\n",
                    [this](int position) { return deviceManager->removeDevice(position); });
}
