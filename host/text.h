// UTF-8 text measured in characters, as the screens count them.
#pragma once

#include <string>
#include <string_view>

namespace host::text {

// What a piece number and a piece label hold while the piece's number is not drawn
// yet; the number replaces it once drawn.
inline constexpr const char* kPiecePlaceholder = "[PIECE]";

// Number of characters (code points) in `s`.
std::size_t length(std::string_view s);
// Characters `from` to `to`, counted from 1, both included; clipped to the text.
std::string substring(std::string_view s, long from, long to);
// Position (from 1) of the first occurrence of `needle` in characters, 0 when absent.
std::size_t position(std::string_view s, std::string_view needle);
// The last `count` characters.
std::string right(std::string_view s, long count);
// Upper case for ASCII letters; other characters are left as they are.
std::string upper(std::string_view s);
// Leading and trailing blanks removed.
std::string trim(std::string_view s);

}  // namespace host::text
