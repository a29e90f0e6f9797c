#include "manager/parts/BsdlFile.h"

#include <filesystem>

#include "manager/parts/BsdlAttributes.h"
#include "manager/parts/BsdlEntity.h"
#include "manager/parts/Companion.h"
#include "manager/parts/IscReader.h"
#include "manager/parts/TextFile.h"

namespace BsdlFile {

Result<Part> parse(std::string_view name, std::string_view text) {
  BsdlSource source(name, text);
  const BsdlEntity entity = BsdlEntity::read(source, BsdlAttributes::wanted());
  Part part;
  part.source = name;
  BsdlAttributes::interpret(source, entity, part);
  if (!source.failed()) readIscProgram(source, entity, part);
  if (source.failed()) return source.failure();
  return part;
}

Status parseCompanion(std::string_view name, std::string_view text, Part& part) {
  return Companion::apply(name, text, part);
}

Result<Part> read(const std::string& path) {
  Result<std::string> text = TextFile::read(path);
  if (!text) return text.failure();
  Result<Part> part = parse(path, *text);
  if (!part) return part;
  const std::string companion = std::filesystem::path(path).replace_extension(".json").string();
  Result<std::optional<std::string>> json = TextFile::readIfThere(companion);
  if (!json) return json.failure();
  if (*json) TESSEL_TRY(parseCompanion(companion, **json, *part));
  return part;
}

}  // namespace BsdlFile
