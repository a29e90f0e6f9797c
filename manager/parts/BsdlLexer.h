#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

#include "manager/support/Result.h"

/// A file that is being read, and the first failure to read it. Readers go on with harmless values after a failure;
/// their loops ask `failed`.
class BsdlSource {
 public:
  BsdlSource(std::string_view name, std::string_view text) : name_(name), text_(text) {}

  std::string_view text() const { return text_; }
  /// Notes the failure at a byte of the text, unless there was one before.
  void fail(std::size_t offset, std::string_view message);
  bool failed() const { return failure_.has_value(); }
  const Failure& failure() const { return *failure_; }

 private:
  std::string_view name_;
  std::string_view text_;
  std::optional<Failure> failure_;
};

/// A token of VHDL.
struct BsdlToken {
  enum class Kind {
    word,    ///< a name, a keyword, a number: letters, digits, '_', '.', and '#' of a number with a base
    string,  ///< with its quotes
    symbol,  ///< one character, or a character literal with its quotes
    end,
  };
  Kind kind = Kind::end;
  std::string_view text;
  std::size_t offset = 0;  ///< in the file
};

/// Splits a file into tokens; comments and white space go. After a failure of the source there are no more tokens.
class BsdlLexer {
 public:
  explicit BsdlLexer(BsdlSource& source) : source_(source) { advance(); }

  BsdlSource& source() { return source_; }
  const BsdlToken& peek() const { return token_; }
  BsdlToken next();
  bool atEnd() const { return source_.failed() || token_.kind == BsdlToken::Kind::end; }

  /// Words compare in any letter case.
  bool at(std::string_view wordOrSymbol) const;
  bool accept(std::string_view wordOrSymbol);
  /// A failure when something else follows.
  void expect(std::string_view wordOrSymbol);
  /// The name that follows; `what` tells what it is of in the failure.
  std::string_view expectName(std::string_view what);
  /// Skips a statement with its ';'.
  void skipStatement();
  void fail(const BsdlToken& token, std::string_view message) { source_.fail(token.offset, message); }

 private:
  void advance();
  void skipBlanks();
  std::size_t endOfWord(std::size_t place) const;
  std::size_t endOfString(std::size_t place);

  BsdlSource& source_;
  std::size_t place_ = 0;
  BsdlToken token_;
};

namespace BsdlWords {

bool same(std::string_view left, std::string_view right);
std::string upper(std::string_view text);
std::string lower(std::string_view text);
bool isNameCharacter(char character);

/// A whole number, decimal or with a base (16#FF#), with '_' between digits; empty for anything else, and for one that
/// exceeds `most`.
std::optional<std::size_t> count(std::string_view word, std::size_t most);
/// A number with or without fraction and exponent, from 0 to `most`.
std::optional<double> real(std::string_view word, double most);
/// "end of the file", "a string", or the token in quotes.
std::string describe(const BsdlToken& token);

}  // namespace BsdlWords
