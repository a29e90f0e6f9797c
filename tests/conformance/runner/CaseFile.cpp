#include "tests/conformance/runner/CaseFile.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <fstream>
#include <iterator>

#include "tests/conformance/runner/CheckLines.h"
#include "tests/conformance/runner/SetupLines.h"

namespace conformance {
namespace {

constexpr std::string_view blanks = " \t";

/// Reads cases line by line: up to `expect` set-up lines, after it events and checks.
class CaseFileReader {
 public:
  explicit CaseFileReader(std::string file) : file_(std::move(file)) {}

  void readLine(std::string_view line, int number);
  std::vector<Case> finish();

 private:
  void beginCase(LineCursor& cursor);
  void endCase();
  void readMarked(std::string_view line, LineCursor& cursor);
  void readWord(const std::string& word, LineCursor& cursor);

  std::string file_;
  std::vector<Case> cases_;
  SetupLines setup_;
  CheckLines checks_;
  bool expecting_ = false;
};

bool isMarked(std::string_view line) { return line[0] == '>' || line[0] == '<' || line[0] == '|'; }

void CaseFileReader::readLine(std::string_view line, int number) {
  const std::size_t begin = line.find_first_not_of(blanks);
  if (begin == std::string_view::npos || line[begin] == '#') return;
  line.remove_prefix(begin);
  const Place place{file_, number};
  if (isMarked(line)) {
    LineCursor cursor(line.substr(1), place);
    readMarked(line, cursor);
    return;
  }
  const std::size_t end = std::min(line.find_first_of(blanks), line.size());
  LineCursor cursor(line.substr(end), place);
  readWord(std::string(line.substr(0, end)), cursor);
}

void CaseFileReader::readMarked(std::string_view line, LineCursor& cursor) {
  if (cases_.empty()) cursor.fail("expected 'case' first");
  Case& current = cases_.back();
  if (line == "|\\" && expecting_) {
    checks_.openEnd(current, cursor);
    return;
  }
  if (line.size() > 1 && line[1] != ' ') cursor.fail(std::string("a blank must follow '") + line[0] + "'");
  std::string content(line.substr(std::min<std::size_t>(line.size(), 2)));
  if (line[0] == '|' && expecting_)
    checks_.addFileLine(current, std::move(content), cursor);
  else if (line[0] != '|' && !expecting_)
    setup_.addRunLine(line[0], std::move(content));
  else
    cursor.fail(std::string("a '") + line[0] + "' line cannot stand here");
}

void CaseFileReader::readWord(const std::string& word, LineCursor& cursor) {
  if (word == "case") {
    beginCase(cursor);
    return;
  }
  if (cases_.empty()) cursor.fail("expected 'case' first");
  if (expecting_) {
    checks_.readLine(word, cases_.back(), cursor);
  } else if (word == "expect") {
    cursor.requireEnd();
    setup_.finish(cases_.back());
    expecting_ = true;
  } else {
    setup_.readLine(word, cases_.back(), cursor);
  }
}

void CaseFileReader::beginCase(LineCursor& cursor) {
  endCase();
  Case& next = cases_.emplace_back();
  next.title = cursor.text();
  cursor.requireEnd();
  next.file = file_;
  next.line = cursor.place().line;
  setup_ = SetupLines();
  checks_ = CheckLines();
  expecting_ = false;
}

void CaseFileReader::endCase() {
  if (cases_.empty() || expecting_) return;
  LineCursor("", {file_, cases_.back().line}).fail("the case has no 'expect'");
}

std::vector<Case> CaseFileReader::finish() {
  endCase();
  return std::move(cases_);
}

}  // namespace

std::vector<Case> parseCases(const std::string& file, std::string_view text) {
  CaseFileReader reader(file);
  for (int number = 1; !text.empty(); ++number) {
    const std::size_t end = text.find('\n');
    reader.readLine(text.substr(0, end), number);
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
  }
  return reader.finish();
}

std::vector<Case> readCaseFile(const std::string& path) {
  std::ifstream stream(path, std::ios::binary);
  if (!stream) throw CaseError(path + ":0: cannot be opened: " + std::strerror(errno));
  std::string text;
  try {
    text.assign(std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>());
  } catch (const std::ios_base::failure&) {  // a directory, for one
    throw CaseError(path + ":0: cannot be read");
  }
  return parseCases(path, text);
}

}  // namespace conformance
