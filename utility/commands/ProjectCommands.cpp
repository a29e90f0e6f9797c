#include "utility/CommandTable.h"

namespace CommandTable {
namespace {

constexpr Switch fileSwitch[] = {text("-file", "path", "the file")};
constexpr Switch archiveSwitches[] = {
    text("-file", "name", "the archive; without a path when -dir is given"),
    text("-dir", "path", "its directory"),
};

constexpr Command rows[] = {
    {"saveProjectFile", 0, "Saves the session to a project file.", {}, fileSwitch, "saveProjectFile -file board.prj"},
    {"loadProjectFile",
     0,
     "Replaces the session by a project file's.",
     {},
     fileSwitch,
     "loadProjectFile -file board.prj"},
    {"saveCdf", 0, "Saves the chain description.", {}, fileSwitch, "saveCdf -file board.cdf"},
    {"loadCdf", 0, "Loads a chain description.", {}, fileSwitch, "loadCdf -file board.cdf"},
    {"saveArchive", 0, "Packs the project and its files.", {}, archiveSwitches, "saveArchive -file board.tar -dir out"},
    {"loadArchive",
     0,
     "Unpacks an archive and loads its project.",
     {},
     archiveSwitches,
     "loadArchive -file board.tar -dir out"},
    {"saveCmd",
     0,
     "Writes the transcript of the commands to a file when the run ends.",
     {},
     fileSwitch,
     "saveCmd -file session.cmd"},
    {"setLog", 0, "Moves the batch log to a file.", {}, fileSwitch, "setLog -file bench.log"},
    {"renameBatchCmdFile",
     0,
     "Names the file that steps are recorded in.",
     {},
     fileSwitch,
     "renameBatchCmdFile -file steps.cmd"},
};

}  // namespace

const std::span<const Command> projectCommands = rows;

}  // namespace CommandTable
