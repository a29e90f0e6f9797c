#include "manager/parts/BsdlText.h"

#include <algorithm>

namespace {

bool isDigit(char character) { return character >= '0' && character <= '9'; }

/// Whether a word goes on at `place`: a name or a number, with its fraction and the sign of its exponent (1.0e-3).
bool goesOn(std::string_view text, std::size_t first, std::size_t place) {
  const char character = text[place];
  if (BsdlWords::isNameCharacter(character)) return true;
  if (place == first || !isDigit(text[first])) return false;
  if (character == '.') return true;
  const char last = text[place - 1];
  return (character == '-' || character == '+') && (last == 'e' || last == 'E') &&
         text.substr(first, place - first).find('.') != std::string_view::npos;
}

}  // namespace

void BsdlText::add(const BsdlToken& literal) {
  std::string_view content = literal.text.substr(1, literal.text.size() - 2);
  std::size_t offset = literal.offset + 1;
  for (std::size_t quotes = content.find("\"\""); quotes != content.npos; quotes = content.find("\"\"")) {
    pieces_.push_back({text_.size(), offset});
    text_ += content.substr(0, quotes + 1);
    content.remove_prefix(quotes + 2);
    offset += quotes + 2;
  }
  pieces_.push_back({text_.size(), offset});
  text_ += content;
}

std::size_t BsdlText::fileOffset(std::size_t place) const {
  const auto behind = std::upper_bound(pieces_.begin(), pieces_.end(), place,
                                       [](std::size_t value, const Piece& piece) { return value < piece.place; });
  if (behind == pieces_.begin()) return 0;
  const Piece& piece = *(behind - 1);
  return piece.fileOffset + (place - piece.place);
}

BsdlTextCursor::Token BsdlTextCursor::scan(std::size_t& place) const {
  const std::string_view text = text_.text();
  while (place < text.size() && static_cast<unsigned char>(text[place]) <= ' ') ++place;
  const std::size_t first = place;
  while (place < text.size() && goesOn(text, first, place)) ++place;
  if (place == first && place < text.size()) ++place;
  return {text.substr(first, place - first), first};
}

BsdlTextCursor::Token BsdlTextCursor::next() {
  const Token result = token_;
  advance();
  return result;
}

bool BsdlTextCursor::at(std::string_view wordOrSymbol) const {
  return !atEnd() && BsdlWords::same(token_.text, wordOrSymbol);
}

bool BsdlTextCursor::accept(std::string_view wordOrSymbol) {
  if (!at(wordOrSymbol)) return false;
  advance();
  return true;
}

void BsdlTextCursor::expect(std::string_view wordOrSymbol) {
  if (!accept(wordOrSymbol)) failExpected("'" + std::string(wordOrSymbol) + "'");
}

bool BsdlTextCursor::atWord() const { return !atEnd() && BsdlWords::isNameCharacter(token_.text[0]); }

bool BsdlTextCursor::atNumber() const { return !atEnd() && isDigit(token_.text[0]); }

BsdlTextCursor::Token BsdlTextCursor::expectWord(std::string_view what) {
  if (atWord()) return next();
  failExpected(what);
  return {{}, token_.place};
}

std::size_t BsdlTextCursor::expectCount(std::string_view what, std::size_t least, std::size_t most) {
  const auto number = BsdlWords::count(token_.text, most);
  if (number && *number >= least) {
    advance();
    return *number;
  }
  failExpected(std::string(what) + " (" + std::to_string(least) + " to " + std::to_string(most) + ")");
  return least;
}

double BsdlTextCursor::expectReal(std::string_view what, double most) {
  const auto number = BsdlWords::real(token_.text, most);
  if (number)
    advance();
  else
    failExpected(what);
  return number.value_or(0);
}

std::string_view BsdlTextCursor::ahead(int tokens) const {
  std::size_t place = place_;
  std::string_view text = token_.text;
  for (; tokens > 0; --tokens) text = scan(place).text;
  return text;
}

void BsdlTextCursor::failExpected(std::string_view what) {
  const bool end = token_.text.empty();
  const BsdlToken shown{BsdlToken::Kind::word, token_.text, 0};
  fail(token_,
       "expected " + std::string(what) + ", found " + (end ? "the end of the text" : BsdlWords::describe(shown)));
}
