// UTF-8 text measured in characters, as the screens count them.
#pragma once

#include <optional>
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
// Replaces every occurrence of `token` in `text` by `value` (a value holding the
// token is not replaced again).
void replaceAll(std::string& text, std::string_view token, std::string_view value);

// A text the books can keep is valid UTF-8 without control characters (C0, DEL,
// C1): a carriage return in a label splits a line of every export, and bytes that
// are not UTF-8 make the whole file unreadable to other tools. flaw() says why `s`
// is not one ("caractère de contrôle U+000D en position 5"), nothing when it is.
std::optional<std::string> flaw(std::string_view s);
// Throws HostError "texte refusé pour WHAT : ..." when `s` has a flaw.
void requireValid(std::string_view s, std::string_view what);

}  // namespace host::text
