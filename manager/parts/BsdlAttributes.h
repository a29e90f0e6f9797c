#pragma once

#include "manager/parts/BsdlEntity.h"
#include "manager/parts/Part.h"

/// The attributes of IEEE 1149.1 that say something about a part; those of IEEE 1532 stand in IscReader.h.
namespace BsdlAttributes {

/// The names of all attributes that are looked into, in upper case, with those of IEEE 1532.
std::span<const std::string_view> wanted();
/// Fills in everything but the ISC program. Failures go to the source.
void interpret(BsdlSource& source, const BsdlEntity& entity, Part& part);

/// The text of an attribute; null, with a failure, when its value is none.
const BsdlText* textOf(BsdlSource& source, const BsdlEntity::Attribute& attribute, std::string_view name);
/// A pattern of the binary digits 0, 1 and X, as many as `length` when that is not 0; empty, with a failure, else.
std::optional<BitPattern> readPattern(BsdlTextCursor& cursor, std::string_view what, std::size_t length);

}  // namespace BsdlAttributes
