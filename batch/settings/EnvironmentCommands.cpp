#include <string>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/portability/Port_Env.h"
#include "interfaces/portability/UT_CMDARGS.h"

using Messages::failure;

bool CmdParser::setEnv(UT_CMDARGS& args) {
  const UT_CMDSWINFO* name = args.getsw("-env", 0);
  if (name == nullptr) return failure("-env is required.\n");
  const UT_CMDSWINFO* value = args.getsw("-value", 0);
  if (value == nullptr) return failure("-value is required.\n");
  std::string text = name->getargtxt(0);
  text.append("=").append(value->getargtxt(0));
  Port_Env::PutEnv(text.c_str());
  return true;
}

bool CmdParser::unsetEnv(UT_CMDARGS& args) {
  const UT_CMDSWINFO* name = args.getsw("-env", 0);
  if (name == nullptr) return failure("-env is required.\n");
  Port_Env::UnsetEnv(name->getargtxt(0));
  return true;
}
