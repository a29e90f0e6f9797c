#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "manager/support/Result.h"

/// The failure at byte `offset` of `text`, the content of the file `name`, with its place and the line itself:
///
///     board.json:3:12: expected a number
///       "length": many
///                 ^
///
/// Lines and columns count from 1; a tab is one column. A line that is too long to show is cut around the place.
Failure failureAt(std::string_view name, std::string_view text, std::size_t offset, std::string_view message);
