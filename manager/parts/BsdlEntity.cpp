#include "manager/parts/BsdlEntity.h"

#include <algorithm>

namespace {

constexpr std::size_t mostIndex = 65535;
constexpr std::size_t mostTokens = 16;  ///< of a value that is kept

class EntityReader {
 public:
  EntityReader(BsdlSource& source, std::span<const std::string_view> wanted) : lexer_(source), wanted_(wanted) {}

  BsdlEntity read() {
    readHead();
    while (!lexer_.atEnd() && !lexer_.at("end")) readStatement();
    lexer_.expect("end");
    return std::move(entity_);
  }
  void readHead();
  BsdlEntity& entity() { return entity_; }

 private:
  void readStatement();
  void readPorts();
  void readPortGroup();
  BsdlEntity::Port readRange();
  std::size_t readIndex();
  void readConstant();
  void readAttribute();
  void readValue(BsdlEntity::Attribute& attribute);
  bool atStatement() const;
  BsdlText readText();
  bool atString() const { return lexer_.peek().kind == BsdlToken::Kind::string; }

  BsdlLexer lexer_;
  std::span<const std::string_view> wanted_;
  BsdlEntity entity_;
};

/// Packages and clauses may stand before the entity: it is the word at the beginning of a statement.
void EntityReader::readHead() {
  bool begin = true;
  while (!lexer_.atEnd() && !(begin && lexer_.at("entity"))) begin = lexer_.next().text == ";";
  if (lexer_.atEnd()) return lexer_.fail(lexer_.peek(), "expected an entity, found the end of the file");
  lexer_.expect("entity");
  entity_.offset = lexer_.peek().offset;
  entity_.name = lexer_.expectName("the entity's name");
  lexer_.expect("is");
}

void EntityReader::readStatement() {
  if (lexer_.accept("port")) return readPorts();
  if (lexer_.accept("constant")) return readConstant();
  if (lexer_.accept("attribute")) return readAttribute();
  lexer_.skipStatement();
}

void EntityReader::readPorts() {
  lexer_.expect("(");
  while (!lexer_.atEnd() && !lexer_.at(")")) {
    readPortGroup();
    if (!lexer_.accept(";")) break;
  }
  lexer_.expect(")");
  lexer_.expect(";");
}

/// NAME, NAME : MODE TYPE [(RANGE)] [:= VALUE]
void EntityReader::readPortGroup() {
  std::vector<std::string> names;
  lexer_.accept("signal");
  do {
    names.push_back(BsdlWords::upper(lexer_.expectName("a port's name")));
  } while (lexer_.accept(","));
  lexer_.expect(":");
  for (const std::string_view mode : {"in", "out", "inout", "buffer", "linkage"})
    if (lexer_.accept(mode)) break;
  if (lexer_.peek().kind != BsdlToken::Kind::word || lexer_.at("is"))
    return lexer_.fail(lexer_.peek(), "expected a port's mode and type, found " + BsdlWords::describe(lexer_.peek()));
  lexer_.next();
  BsdlEntity::Port port;
  if (lexer_.accept("(")) port = readRange();
  while (!lexer_.atEnd() && !lexer_.at(";") && !lexer_.at(")")) lexer_.next();
  for (const std::string& name : names) entity_.ports[name] = port;
}

BsdlEntity::Port EntityReader::readRange() {
  BsdlEntity::Port port;
  port.vector = true;
  port.left = readIndex();
  const bool down = lexer_.accept("downto");
  if (!down) lexer_.expect("to");
  const BsdlToken last = lexer_.peek();
  port.right = readIndex();
  if (down ? port.left < port.right : port.left > port.right)
    lexer_.fail(last,
                std::string("the range of a vector is empty: ") + (down ? "'downto' counts down" : "'to' counts up"));
  lexer_.expect(")");
  return port;
}

std::size_t EntityReader::readIndex() {
  const BsdlToken token = lexer_.next();
  const auto index = BsdlWords::count(token.text, mostIndex);
  if (!index) lexer_.fail(token, "expected an index (0 to 65535), found " + BsdlWords::describe(token));
  return index.value_or(0);
}

/// NAME : PIN_MAP_STRING := TEXT; other constants are skipped.
void EntityReader::readConstant() {
  lexer_.expectName("the constant's name");
  lexer_.expect(":");
  if (entity_.pinMap || !lexer_.accept("PIN_MAP_STRING")) return lexer_.skipStatement();
  lexer_.expect(":=");
  entity_.pinMap = readText();
  lexer_.expect(";");
}

/// NAME of THING : CLASS is VALUE; a declaration (NAME : TYPE) is skipped.
void EntityReader::readAttribute() {
  const BsdlToken token = lexer_.peek();
  const std::string name = BsdlWords::upper(lexer_.expectName("the attribute's name"));
  if (!lexer_.at("of") || std::find(wanted_.begin(), wanted_.end(), name) == wanted_.end())
    return lexer_.skipStatement();
  lexer_.expect("of");
  lexer_.expectName("what the attribute belongs to");
  lexer_.expect(":");
  lexer_.expectName("'entity' or 'signal'");
  lexer_.expect("is");
  const auto [place, isNew] = entity_.attributes.try_emplace(name);
  if (!isNew) return lexer_.fail(token, "attribute " + name + " is given twice");
  readValue(place->second);
  lexer_.expect(";");
}

void EntityReader::readValue(BsdlEntity::Attribute& attribute) {
  attribute.offset = lexer_.peek().offset;
  if (atString()) {
    attribute.text = readText();
    return;
  }
  for (; !lexer_.atEnd() && !lexer_.at(";") && !atStatement(); lexer_.next())
    if (attribute.tokens.size() < mostTokens) attribute.tokens.push_back(lexer_.peek());
}

/// So that a forgotten ';' is missed where it should stand.
bool EntityReader::atStatement() const { return lexer_.at("attribute") || lexer_.at("constant") || lexer_.at("end"); }

BsdlText EntityReader::readText() {
  BsdlText text;
  do {
    if (!atString()) {
      lexer_.fail(lexer_.peek(), "expected a string, found " + BsdlWords::describe(lexer_.peek()));
      break;
    }
    text.add(lexer_.next());
  } while (lexer_.accept("&"));
  return text;
}

}  // namespace

const BsdlEntity::Attribute* BsdlEntity::find(std::string_view attribute) const {
  const auto place = attributes.find(std::string(attribute));
  return place == attributes.end() ? nullptr : &place->second;
}

BsdlEntity BsdlEntity::read(BsdlSource& source, std::span<const std::string_view> wanted) {
  return EntityReader(source, wanted).read();
}

std::string BsdlEntity::readName(BsdlSource& source) {
  EntityReader reader(source, {});
  reader.readHead();
  return source.failed() ? "" : reader.entity().name;
}
