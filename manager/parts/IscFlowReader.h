#pragma once

#include <string>
#include <string_view>

#include "manager/parts/BsdlText.h"
#include "manager/parts/IscProgram.h"
#include "manager/parts/Part.h"

/// A flow of an ISC_FLOW attribute, up to its end. `taken` adds up what the flows of a part take, which is bounded.
Isc::Flow readIscFlow(BsdlTextCursor& cursor, const Part& part, std::size_t& taken);
/// A name that begins with `prefix`, in lower case and without it.
std::string readIscName(BsdlTextCursor& cursor, std::string_view prefix);
/// The name of an array in parentheses, in lower case; empty when there is none.
std::string readIscArray(BsdlTextCursor& cursor);
