#include "manager/parts/IscProgram.h"

#include <algorithm>

namespace Isc {

namespace {

template <class Things, class Fits>
auto findIn(const Things& things, const Fits& fits) {
  const auto place = std::find_if(things.begin(), things.end(), fits);
  return place == things.end() ? nullptr : &*place;
}

}  // namespace

const Flow* Program::findFlow(const std::string& name, const std::string& array) const {
  return findIn(flows, [&](const Flow& flow) { return flow.name == name && flow.array == array; });
}

const Procedure* Program::findProcedure(const std::string& name, const std::string& array) const {
  return findIn(procedures, [&](const Procedure& one) { return one.name == name && one.array == array; });
}

const Action* Program::findAction(const std::string& name) const {
  return findIn(actions, [&](const Action& action) { return action.name == name; });
}

}  // namespace Isc
