#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Command utility(const char* word, const char* example) {
  return {
      word, 0, "An external conversion utility; all words after it are its own.", {}, {}, example, Switches::anything};
}

constexpr Command rows[] = {
    utility("svf2Oba", "svf2Oba in.svf out.oba"),      utility("qinterlv", "qinterlv in.mcs out.mcs"),
    utility("qmpm2svf", "qmpm2svf in.mpm out.svf"),    utility("qmselmap", "qmselmap in.bit out.mpm"),
    utility("qmcslink", "qmcslink a.mcs b.mcs c.mcs"), utility("q_compex", "q_compex in.mpm out.mpm"),
    utility("playCsvf", "playCsvf board.csvf"),        utility("svf2csvf", "svf2csvf in.svf out.csvf"),
};

}  // namespace

const std::span<const Command> converterCommands = rows;

}  // namespace CommandTable
