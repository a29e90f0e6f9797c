#include "manager/parts/BsdlLexer.h"

#include <algorithm>

#include "manager/support/TextPlace.h"

namespace {

bool isBlank(char character) { return static_cast<unsigned char>(character) <= ' '; }

bool isDigit(char character) { return character >= '0' && character <= '9'; }

/// Whether the sign at `place` belongs to the exponent of the number that begins at `first`: 1.0e-3.
bool isExponentSign(std::string_view text, std::size_t first, std::size_t place) {
  if (place == first || !isDigit(text[first]) || (text[place] != '-' && text[place] != '+')) return false;
  const std::string_view number = text.substr(first, place - first);
  return BsdlWords::lower(number.substr(number.size() - 1)) == "e" && number.find('.') != number.npos;
}

}  // namespace

void BsdlSource::fail(std::size_t offset, std::string_view message) {
  if (!failure_) failure_ = failureAt(name_, text_, offset, message);
}

BsdlToken BsdlLexer::next() {
  BsdlToken result = token_;
  advance();
  return result;
}

bool BsdlLexer::at(std::string_view wordOrSymbol) const {
  return !atEnd() && token_.kind != BsdlToken::Kind::string && BsdlWords::same(token_.text, wordOrSymbol);
}

bool BsdlLexer::accept(std::string_view wordOrSymbol) {
  if (!at(wordOrSymbol)) return false;
  advance();
  return true;
}

void BsdlLexer::expect(std::string_view wordOrSymbol) {
  if (accept(wordOrSymbol)) return;
  fail(token_, "expected '" + std::string(wordOrSymbol) + "', found " + BsdlWords::describe(token_));
}

std::string_view BsdlLexer::expectName(std::string_view what) {
  if (token_.kind != BsdlToken::Kind::word) {
    fail(token_, "expected " + std::string(what) + ", found " + BsdlWords::describe(token_));
    return {};
  }
  return next().text;
}

void BsdlLexer::skipStatement() {
  while (!atEnd() && !at(";")) advance();
  expect(";");
}

void BsdlLexer::skipBlanks() {
  const std::string_view text = source_.text();
  while (place_ < text.size()) {
    if (isBlank(text[place_])) {
      ++place_;
    } else if (text.substr(place_, 2) == "--") {
      place_ = std::min(text.find('\n', place_), text.size());
    } else {
      return;
    }
  }
}

std::size_t BsdlLexer::endOfWord(std::size_t place) const {
  const std::string_view text = source_.text();
  const std::size_t first = place;
  while (place < text.size() && (BsdlWords::isNameCharacter(text[place]) || text[place] == '.' ||
                                 (text[place] == '#' && isDigit(text[first])) || isExponentSign(text, first, place))) {
    ++place;
  }
  return place;
}

std::size_t BsdlLexer::endOfString(std::size_t place) {
  const std::string_view text = source_.text();
  const std::size_t first = place;
  for (++place; place < text.size() && text[place] != '\n'; ++place) {
    if (text[place] != '"') continue;
    if (text.substr(place, 2) != "\"\"") return place + 1;
    ++place;
  }
  source_.fail(first, "the string does not end on its line: '\"' is missing");
  return first;
}

void BsdlLexer::advance() {
  skipBlanks();
  const std::string_view text = source_.text();
  token_ = {BsdlToken::Kind::end, {}, place_};
  if (source_.failed() || place_ >= text.size()) return;
  const char character = text[place_];
  std::size_t end = place_ + 1;
  token_.kind = BsdlToken::Kind::symbol;
  if (BsdlWords::isNameCharacter(character)) {
    token_.kind = BsdlToken::Kind::word;
    end = endOfWord(place_);
  } else if (character == '"') {
    token_.kind = BsdlToken::Kind::string;
    end = endOfString(place_);
  } else if (character == '\'' && place_ + 2 < text.size() && text[place_ + 2] == '\'') {
    end = place_ + 3;
  } else if (const std::string_view pair = text.substr(place_, 2); pair == ":=" || pair == "=>") {
    end = place_ + 2;
  }
  if (source_.failed()) token_.kind = BsdlToken::Kind::end;
  token_.text = text.substr(place_, end - place_);
  place_ = end;
}
