#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "manager/parts/BsdlFile.h"
#include "tests/unit/manager/devices/SmallBsdl.h"

namespace parttext {

inline std::shared_ptr<Part> part(const std::string& text, const std::string& companion = "") {
  Result<Part> parsed = BsdlFile::parse("part.bsd", text);
  if (!parsed) {
    ADD_FAILURE() << parsed.failure().text;
    return std::make_shared<Part>();
  }
  if (!companion.empty())
    if (const Status status = BsdlFile::parseCompanion("part.json", companion, *parsed); !status)
      ADD_FAILURE() << status.failure().text;
  return std::make_shared<Part>(std::move(*parsed));
}

}  // namespace parttext
