#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "interfaces/portability/UT_CMDARGS.h"

namespace {

struct Texts {
  const char* wrongMode;
  const char* missingSwitch;
};

/// The command's first switch, when the session is in PROM file formatter mode; null after a message.
const UT_CMDSWINFO* firstSwitch(const CmdParser& session, const UT_CMDARGS& args, const Texts& texts) {
  if (!session.isActiveMode(tESSELNS::PROM_FILE_FORMATTER)) {
    Messages::error(texts.wrongMode);
    return nullptr;
  }
  const UT_CMDSWINFO* first = args.getsw(0);
  if (first == nullptr) Messages::error(texts.missingSwitch);
  return first;
}

const char* firstArgument(const CmdParser& session, const UT_CMDARGS& args, const Texts& texts) {
  const UT_CMDSWINFO* first = firstSwitch(session, args, texts);
  return first == nullptr ? nullptr : first->getargtxt(0);
}

}  // namespace

bool CmdParser::setMbBpiDevice(UT_CMDARGS& args) {
  const char* device =
      firstArgument(*this, args, {"setMbBpiDevice is only allowed in PFF mode.\n", "Device type is required\n"});
  return device != nullptr && deviceManager->setMbBpiDevice(device);
}

bool CmdParser::setMbBpiType(UT_CMDARGS& args) {
  const char* type =
      firstArgument(*this, args, {"setMbBpiType is only allowed in PFF mode.\n", "Multiboot BPI Type is required\n"});
  return type != nullptr && deviceManager->setMbBpiType(type);
}

bool CmdParser::setMbBpiChain(UT_CMDARGS& args) {
  // Deliberate: the mode message names setMbBpiType.
  const UT_CMDSWINFO* chain = firstSwitch(
      *this, args, {"setMbBpiType is only allowed in PFF mode.\n", "Multiboot BPI Chain Type is required\n"});
  return chain != nullptr && deviceManager->setMbBpiChain(chain->getswname() + 1);
}

bool CmdParser::setBpiWidth(UT_CMDARGS& args) {
  const char* width =
      firstArgument(*this, args, {"setBpiWidth is only allowed in PFF mode.\n", "BPI Data Width is required\n"});
  return width != nullptr && deviceManager->setBpiWidth(tESSELNS::PROM_FILE_FORMATTER, width);
}
