#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "manager/parts/BsdlLexer.h"

/// A text that stands in a file as string literals joined by '&'; knows where each character comes from.
class BsdlText {
 public:
  /// Adds a literal with its quotes; two quotes inside stand for one.
  void add(const BsdlToken& literal);
  std::string_view text() const { return text_; }
  /// Where in the file a character stands; the end of the text is behind the last character.
  std::size_t fileOffset(std::size_t place) const;

 private:
  struct Piece {
    std::size_t place;
    std::size_t fileOffset;
  };
  std::string text_;
  std::vector<Piece> pieces_;  ///< by place
};

/// Splits a joined text into words (names, numbers, opcodes) and symbols of one character, white space between
/// them. Failures go to the file's source, with the place in the right literal; after one there is nothing more.
class BsdlTextCursor {
 public:
  struct Token {
    std::string_view text;  ///< empty at the end
    std::size_t place = 0;
  };

  BsdlTextCursor(BsdlSource& source, const BsdlText& text) : source_(source), text_(text) { advance(); }

  bool failed() const { return source_.failed(); }
  bool atEnd() const { return failed() || token_.text.empty(); }
  const Token& peek() const { return token_; }
  Token next();

  bool at(std::string_view wordOrSymbol) const;
  bool accept(std::string_view wordOrSymbol);
  void expect(std::string_view wordOrSymbol);
  /// Whether the token is a word; a number is one, too.
  bool atWord() const;
  bool atNumber() const;
  /// The word that follows; empty with a failure that names `what` when none does.
  Token expectWord(std::string_view what);
  /// The whole number from `least` to `most` that follows; `least` with a failure when none does.
  std::size_t expectCount(std::string_view what, std::size_t least, std::size_t most);
  double expectReal(std::string_view what, double most);
  /// The token that stands so many behind the next one; empty at the end.
  std::string_view ahead(int tokens) const;

  void fail(const Token& token, std::string_view message) { source_.fail(text_.fileOffset(token.place), message); }
  /// "expected WHAT, found ..." at the next token.
  void failExpected(std::string_view what);
  std::size_t fileOffset(const Token& token) const { return text_.fileOffset(token.place); }

 private:
  Token scan(std::size_t& place) const;
  void advance() { token_ = scan(place_); }

  BsdlSource& source_;
  const BsdlText& text_;
  std::size_t place_ = 0;
  Token token_;
};
