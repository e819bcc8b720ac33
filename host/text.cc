#include "host/text.h"

#include <algorithm>
#include <cstdio>

#include "host/error.h"

namespace host::text {
namespace {

bool isContinuation(unsigned char c) { return (c & 0xC0) == 0x80; }

// Byte offset of character `index` (from 0), or s.size() past the end.
std::size_t offsetOf(std::string_view s, std::size_t index) {
  std::size_t count = 0;
  for (std::size_t i = 0; i < s.size(); ++i) {
    if (isContinuation(static_cast<unsigned char>(s[i]))) continue;
    if (count == index) return i;
    ++count;
  }
  return s.size();
}

// Length of the UTF-8 sequence that starts `s` at `at`, 0 when the bytes there are
// not one: a stray continuation byte, an overlong form, a surrogate, a code point
// beyond U+10FFFF, or a sequence cut short. Sets `code` to its code point.
std::size_t sequenceAt(std::string_view s, std::size_t at, char32_t& code) {
  auto byte = [&](std::size_t i) { return static_cast<unsigned char>(s[i]); };
  unsigned char lead = byte(at);
  if (lead < 0x80) {
    code = lead;
    return 1;
  }
  std::size_t size = lead >= 0xC2 && lead <= 0xDF   ? 2
                     : lead >= 0xE0 && lead <= 0xEF ? 3
                     : lead >= 0xF0 && lead <= 0xF4 ? 4
                                                    : 0;
  if (size == 0 || at + size > s.size()) return 0;
  code = lead & (0x7F >> size);
  for (std::size_t i = 1; i < size; ++i) {
    if (!isContinuation(byte(at + i))) return 0;
    code = (code << 6) | (byte(at + i) & 0x3F);
  }
  static constexpr char32_t kSmallest[] = {0, 0, 0x80, 0x800, 0x10000};
  if (code < kSmallest[size] || code > 0x10FFFF || (code >= 0xD800 && code <= 0xDFFF)) return 0;
  return size;
}

bool isControl(char32_t code) { return code < 0x20 || (code >= 0x7F && code <= 0x9F); }

}  // namespace

std::optional<std::string> flaw(std::string_view s) {
  std::size_t position = 1;
  for (std::size_t at = 0; at < s.size(); ++position) {
    char32_t code = 0;
    std::size_t size = sequenceAt(s, at, code);
    char shown[32];
    if (size == 0) {
      std::snprintf(shown, sizeof shown, "0x%02X", static_cast<unsigned>(static_cast<unsigned char>(s[at])));
      return "octet " + std::string(shown) + " hors UTF-8 en position " + std::to_string(position);
    }
    if (isControl(code)) {
      std::snprintf(shown, sizeof shown, "U+%04X", static_cast<unsigned>(code));
      return "caractère de contrôle " + std::string(shown) + " en position " + std::to_string(position);
    }
    at += size;
  }
  return std::nullopt;
}

void requireValid(std::string_view s, std::string_view what) {
  if (auto why = flaw(s)) throw HostError("texte refusé pour " + std::string(what) + " : " + *why);
}

std::size_t length(std::string_view s) {
  return std::count_if(s.begin(), s.end(), [](char c) { return !isContinuation(static_cast<unsigned char>(c)); });
}

std::string substring(std::string_view s, long from, long to) {
  if (from < 1) from = 1;
  if (to < from) return {};
  std::size_t begin = offsetOf(s, static_cast<std::size_t>(from - 1));
  std::size_t end = offsetOf(s, static_cast<std::size_t>(to));
  return std::string(s.substr(begin, end - begin));
}

std::size_t position(std::string_view s, std::string_view needle) {
  std::size_t found = s.find(needle);
  if (found == std::string_view::npos) return 0;
  return length(s.substr(0, found)) + 1;
}

std::string right(std::string_view s, long count) {
  long total = static_cast<long>(length(s));
  if (count <= 0) return {};
  if (count >= total) return std::string(s);
  return substring(s, total - count + 1, total);
}

std::string upper(std::string_view s) {
  std::string result(s);
  for (char& c : result)
    if (c >= 'a' && c <= 'z') c = static_cast<char>(c - 'a' + 'A');
  return result;
}

std::string trim(std::string_view s) {
  std::size_t begin = s.find_first_not_of(' ');
  if (begin == std::string_view::npos) return {};
  std::size_t end = s.find_last_not_of(' ');
  return std::string(s.substr(begin, end - begin + 1));
}

void replaceAll(std::string& text, std::string_view token, std::string_view value) {
  if (token.empty()) return;
  for (std::size_t at = text.find(token); at != std::string::npos; at = text.find(token, at + value.size()))
    text.replace(at, token.size(), value);
}

}  // namespace host::text
