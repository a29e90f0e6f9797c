#include "interfaces/portability/Port_MsgManDefault.h"

#include <cwchar>

#include "interfaces/portability/Port_MsgDispatcher.h"
#include "interfaces/portability/UT_STR.h"

namespace {

struct Console {
  std::FILE* output = stdout;
  std::FILE* errors = stderr;
};

Console& console() {
  static Console instance;
  return instance;
}

/// Splits a line at blanks so that no piece is wider than `width`, where the words allow it. The blank at
/// a wrap point goes; line ends in the text begin a new count.
std::vector<std::wstring> wrap(const std::wstring& text, std::size_t width) {
  std::vector<std::wstring> lines;
  std::size_t start = 0;
  std::size_t lastBlank = std::wstring::npos;
  std::size_t column = 0;
  for (std::size_t i = 0; i < text.size(); ++i, ++column) {
    if (text[i] == L'\n') {
      lines.push_back(text.substr(start, i + 1 - start));
      start = i + 1;
      column = std::wstring::npos;
      lastBlank = std::wstring::npos;
      continue;
    }
    if (text[i] == L' ') lastBlank = i;
    if (column < width || lastBlank == std::wstring::npos) continue;
    lines.push_back(text.substr(start, lastBlank - start));
    start = lastBlank + 1;
    column = i - start;
    lastBlank = std::wstring::npos;
  }
  if (start < text.size()) lines.push_back(text.substr(start));
  return lines;
}

}  // namespace

Port_MsgManDefault::Port_MsgManDefault(const char* name) : name_(name == nullptr ? "" : name) {}

Port_MsgManDefault::~Port_MsgManDefault() { Port_MsgDispatcher::forget(this); }

void Port_MsgManDefault::setClean(bool clean) { clean_ = clean; }
bool Port_MsgManDefault::getClean() const { return clean_; }
void Port_MsgManDefault::setAbortFlag(bool abort) { abort_ = abort; }
bool Port_MsgManDefault::getAbortFlag() const { return abort_; }
void Port_MsgManDefault::setMaxLineWidth(int width) { maxLineWidth_ = width; }
int Port_MsgManDefault::getMaxLineWidth() const { return maxLineWidth_; }

void Port_MsgManDefault::output(MsgType type, const wchar_t* line) {
  const bool isError = type == MsgType::error || type == MsgType::warning;
  // Both may be one terminal or one file: what came first must stand first.
  if (isError) std::fflush(console().output);
  const std::string text = UT_STR::WstrToMbstr(line);
  std::fwrite(text.data(), 1, text.size(), isError ? console().errors : console().output);
}

void Port_MsgManDefault::msgWrite(MsgType type, const wchar_t* text) {
  int count = 0;
  std::vector<std::wstring> lines = msgFormat(type, getClean(), getMaxLineWidth(), text, &count);
  for (int i = 0; i < count; ++i) {
    std::wstring& line = lines[static_cast<std::size_t>(i)];
    if (i + 1 < count && (line.empty() || line.back() != L'\n')) line += L'\n';
    output(type, line.c_str());
  }
  UT_STR::WDelStrings(lines, count);
  flush();
}

std::vector<std::wstring> Port_MsgManDefault::msgFormat(MsgType type, bool clean, int maxWidth, const wchar_t* text,
                                                        int* count) const {
  std::wstring shown = text;
  if (!clean && type == MsgType::error) shown.insert(0, L"ERROR:");
  if (!clean && type == MsgType::warning) shown.insert(0, L"WARNING:");
  std::vector<std::wstring> lines;
  if (maxWidth > 0)
    lines = wrap(shown, static_cast<std::size_t>(maxWidth));
  else
    lines.push_back(std::move(shown));
  *count = static_cast<int>(lines.size());
  return lines;
}

void Port_MsgManDefault::flush() {
  std::fflush(console().output);
  std::fflush(console().errors);
}

void Port_MsgManDefault::setConsole(std::FILE* output, std::FILE* errors) { console() = {output, errors}; }
