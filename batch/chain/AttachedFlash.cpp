#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "batch/Switches.h"
#include "batch/chain/FileAssignment.h"
#include "batch/chain/Position.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"

using Messages::failure;

bool CmdParser::attachFlash(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  if (!isActiveMode(tESSELNS::BOUNDARY_SCAN))
    return failure("Command attachFlash can only be used in the Boundary Scan mode.\n");
  int position = -1;
  if (!positionToAdd(*this, args, position)) return false;
  if (const UT_CMDSWINFO* spi = args.getsw("-spi", 0))
    return deviceManager->attachDeviceByPart(position, tESSELNS::SPI_FLASH, spi->getargtxt(0));
  if (const UT_CMDSWINFO* bpi = args.getsw("-bpi", 0))
    return deviceManager->attachDeviceByPart(position, tESSELNS::BPI_FLASH, bpi->getargtxt(0));
  Messages::error("One of either '-spi' or '-bpi' switch is required argument to the attachFlash command.\n");
  // Deliberate: the wording of addDevice.
  if (!args.findsw("-file")) Messages::error("Either -file or -part is required for addDevice.\n");
  return false;
}

bool CmdParser::assignFileToAttachedFlash(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  Assignment assignment;
  if (!findAssignment(*this, args,
                      {"Can only assign file to attached  device 1.\n",
                       "Can only assign files to attached devices between positions 1 to %d\n",
                       "A configuration data file is required\n"},
                      assignment))
    return false;
  const bool hasSpi = deviceManager->getDeviceAttribute(assignment.position, DeviceNS::SPI_PART) != nullptr;
  const bool hasBpi = deviceManager->getDeviceAttribute(assignment.position, DeviceNS::BPI_PART) != nullptr;
  // Deliberate: without any flash the device manager is asked all the same, for SPI.
  if (!hasSpi && !hasBpi) Messages::error("No attached device found at position '%d'.\n", assignment.position + 1);
  const tESSELNS::FLASH_TYPE type = !hasSpi && hasBpi ? tESSELNS::BPI_FLASH : tESSELNS::SPI_FLASH;
  const bool result = deviceManager->assignFileToFlashDevice(assignment.position, type, assignment.path);
  if (result) lastIdentifyOk = true;
  return result;
}

bool CmdParser::deleteAttachedFlash(UT_CMDARGS& args) {
  if (!checkModeSet()) return false;
  const tESSELNS::MODE_TYPE mode = deviceManager->getActiveMode();
  const int count = deviceManager->getDeviceChainCount();
  const UT_CMDSWINFO* positions = findSwitch(args, "-p", "-position");
  if (positions == nullptr) return failure("Position is required\n");
  if (mode != tESSELNS::BOUNDARY_SCAN)
    return failure("Command deleteAttachedFlash is only valid in the Boundary Scan mode.\n");
  return removeEach(*positions, count, "Device position %d not in chain, can't delete\n", [this](int position) {
    return deviceManager->deleteAttachedDevice(position) ||
           failure("Attached Flash device at position %d could not be deleted.\n", position + 1);
  });
}
