#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

#include "manager/parts/BsdlEntity.h"
#include "manager/parts/Part.h"

constexpr std::size_t mostBoundaryCells = 65536;

/// The cells of a BOUNDARY_REGISTER by number; `length` is that of BOUNDARY_LENGTH, 0 when the file does not tell.
/// `offset` is the place of the attribute's value.
std::vector<BoundaryCell> readBoundaryRegister(BsdlSource& source, const BsdlText& text, std::size_t offset,
                                               std::size_t length);
/// Package pins by port in upper case; bits of a vector have their index behind, as in "D(3)".
std::map<std::string, std::string> readPinMap(BsdlSource& source, const BsdlText& text, const BsdlEntity& entity);
