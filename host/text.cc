#include "host/text.h"

#include <algorithm>

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

}  // namespace

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

}  // namespace host::text
