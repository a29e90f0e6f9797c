#include "manager/simulator/SimulatedBoard.h"

#include <filesystem>

#include "manager/content/FileAccess.h"
#include "manager/simulator/Board.h"
#include "manager/simulator/BoardFile.h"

namespace {

constexpr std::string_view defaultBoard = R"({
  "name": "default",
  "chain": [
    {"part": "marlin3-4", "spi": {"part": "w25q64"}},
    {"part": "zp20s08"},
    {"part": "mullet-32"}
  ]
})";

Result<std::unique_ptr<SimulatedBoard>> make(std::string_view name, std::string_view text, const std::string& directory,
                                             const std::string& path, PartLibrary& parts) {
  Result<BoardDescription> description = BoardFile::parse(name, text, directory, parts);
  if (!description) return description.failure();
  auto board = std::make_unique<Board>(*description);
  board->setPath(path);
  TESSEL_TRY(board->loadState());
  return std::unique_ptr<SimulatedBoard>(std::move(board));
}

}  // namespace

Result<std::unique_ptr<SimulatedBoard>> SimulatedBoard::read(const std::string& path, PartLibrary& parts) {
  Result<std::string> text = FileAccess::read(path, BoardFile::mostBytes);
  if (!text) return text.failure();
  return make(path, *text, std::filesystem::path(path).parent_path().string(), path, parts);
}

Result<std::unique_ptr<SimulatedBoard>> SimulatedBoard::parse(std::string_view name, std::string_view text,
                                                              const std::string& directory, PartLibrary& parts) {
  return make(name, text, directory, "", parts);
}

std::unique_ptr<SimulatedBoard> SimulatedBoard::makeDefault() {
  // Its parts are built in, whatever parts the user has, and its text is our own, so that it can't fail.
  PartLibrary builtIn;
  return std::move(*make("default", defaultBoard, "", "", builtIn));
}
