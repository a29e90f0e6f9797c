#include "interfaces/portability/UT_STR.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace {

const char* textOf(const char* text) { return text == nullptr ? "" : text; }

/// Where a byte that is no UTF-8 goes in wide text: a range that no valid text uses.
constexpr wchar_t strayBase = 0xDC00;

struct Utf8Form {
  unsigned char lead;      ///< the lead byte's fixed bits
  unsigned char mask;      ///< which bits of the lead byte are fixed
  int following;           ///< continuation bytes
  std::uint32_t smallest;  ///< the smallest code point that may be written so
};
constexpr Utf8Form utf8Forms[] = {
    {0x00, 0x80, 0, 0}, {0xC0, 0xE0, 1, 0x80}, {0xE0, 0xF0, 2, 0x800}, {0xF0, 0xF8, 3, 0x10000}};

/// Decodes the character at `text`; its length in bytes, or 0 when it is no valid UTF-8.
int decode(const unsigned char* text, std::uint32_t& code) {
  for (const Utf8Form& form : utf8Forms) {
    if ((text[0] & form.mask) != form.lead) continue;
    code = text[0] & static_cast<unsigned char>(~form.mask);
    for (int i = 1; i <= form.following; ++i) {
      if ((text[i] & 0xC0) != 0x80) return 0;
      code = (code << 6) | (text[i] & 0x3FU);
    }
    const bool surrogate = code >= 0xD800 && code <= 0xDFFF;
    return code < form.smallest || code > 0x10FFFF || surrogate ? 0 : form.following + 1;
  }
  return 0;
}

void encode(std::uint32_t code, std::string& to) {
  if (code < 0x80) {
    to += static_cast<char>(code);
    return;
  }
  const int following = code < 0x800 ? 1 : code < 0x10000 ? 2 : 3;
  to += static_cast<char>(utf8Forms[following].lead | (code >> (6 * following)));
  for (int i = following - 1; i >= 0; --i) to += static_cast<char>(0x80 | ((code >> (6 * i)) & 0x3F));
}

}  // namespace

int UT_STR::Len(const char* text) { return static_cast<int>(std::strlen(textOf(text))); }

int UT_STR::Compare(const char* a, const char* b) { return std::strcmp(textOf(a), textOf(b)); }

int UT_STR::INCompare(const char* a, const char* b, int count) {
  a = textOf(a);
  b = textOf(b);
  for (int i = 0; i < count; ++i) {
    const int difference = Lower(a[i]) - Lower(b[i]);
    if (difference != 0 || a[i] == '\0') return difference;
  }
  return 0;
}

bool UT_STR::IMatch(const char* text, const char* pattern) {
  if (text == nullptr || pattern == nullptr) return false;
  // Backtracks to the last `*` only, which is enough and keeps the time below text times pattern.
  const char* star = nullptr;
  const char* resume = nullptr;
  while (*text != '\0') {
    if (*pattern == '*') {
      star = pattern++;
      resume = text;
    } else if (Lower(*text) == Lower(*pattern)) {
      ++text;
      ++pattern;
    } else if (star != nullptr) {
      pattern = star + 1;
      text = ++resume;
    } else {
      return false;
    }
  }
  while (*pattern == '*') ++pattern;
  return *pattern == '\0';
}

const char* UT_STR::FindString(const char* text, const char* part) { return std::strstr(textOf(text), textOf(part)); }

StringBase UT_STR::Dup(const char* text) { return StringBase(text); }

bool UT_STR::Copy(char* buffer, int size, const char* text) {
  const int length = Len(text);
  if (length >= size) {
    if (size > 0) buffer[0] = '\0';
    return false;
  }
  std::memcpy(buffer, textOf(text), static_cast<std::size_t>(length) + 1);
  return true;
}

std::int32_t UT_STR::AToL(const char* text) {
  constexpr std::int64_t smallest = std::numeric_limits<std::int32_t>::min();
  constexpr std::int64_t largest = std::numeric_limits<std::int32_t>::max();
  text = textOf(text);
  while (*text == ' ' || (*text >= '\t' && *text <= '\r')) ++text;
  const bool negative = *text == '-';
  if (*text == '-' || *text == '+') ++text;
  std::int64_t value = 0;
  for (; *text >= '0' && *text <= '9'; ++text) value = std::min(value * 10 + (*text - '0'), largest + 1);
  return static_cast<std::int32_t>(std::clamp(negative ? -value : value, smallest, largest));
}

std::wstring UT_STR::MbstrToWstr(const char* text) {
  std::wstring wide;
  text = textOf(text);
  wide.reserve(std::strlen(text));
  while (*text != '\0') {
    const auto* bytes = reinterpret_cast<const unsigned char*>(text);
    std::uint32_t code = 0;
    const int length = decode(bytes, code);
    wide += length == 0 ? static_cast<wchar_t>(strayBase + *bytes) : static_cast<wchar_t>(code);
    text += std::max(length, 1);
  }
  return wide;
}

std::string UT_STR::WstrToMbstr(const wchar_t* text) {
  std::string narrow;
  if (text == nullptr) return narrow;
  for (; *text != L'\0'; ++text) {
    if (*text > strayBase + 0x7F && *text <= strayBase + 0xFF)
      narrow += static_cast<char>(*text - strayBase);
    else
      encode(static_cast<std::uint32_t>(*text), narrow);
  }
  return narrow;
}

void UT_STR::WDelStrings(std::vector<std::wstring>& lines, int count) {
  lines.erase(lines.begin(), lines.begin() + std::min(count, static_cast<int>(lines.size())));
}
