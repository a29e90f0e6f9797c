#pragma once

#include <string>
#include <string_view>

#include "manager/parts/PartLibrary.h"
#include "manager/simulator/BoardDescription.h"
#include "manager/support/Result.h"

/// Reads board files (docs/boards.md).
namespace BoardFile {

inline constexpr std::uint64_t mostBytes = std::uint64_t{16} << 20;
inline constexpr std::size_t mostDevices = 256;
/// Of all memories of a board together, in bytes.
inline constexpr std::uint64_t mostMemory = std::uint64_t{1} << 30;

/// `name` is the file's for messages, `directory` where its relative paths start; it is empty for the current one.
Result<BoardDescription> parse(std::string_view name, std::string_view text, const std::string& directory,
                               PartLibrary& parts);

/// How many bytes the memories of a board take.
std::uint64_t memoryBytes(const BoardDescription& board);

}  // namespace BoardFile
