// Texts as the runtime counts them: UTF-8, where a "character" is a character, not a byte (the
// 4GL's "characters 1 to 2" of "été" is "ét"), and blanks are spaces and tabs. Plain functions
// on values: they own nothing and keep nothing.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quarvo::host {

// Characters of a UTF-8 text (bytes that do not continue a character).
size_t nombreCaracteres(std::string_view text);
// Characters `from` to `to` of `text`, 1-based and inclusive; shorter when the text is.
std::string caracteres(std::string_view text, size_t from, size_t to);
// The last `count` characters of `text` (all of it when it is shorter).
std::string derniersCaracteres(std::string_view text, size_t count);
// At most `count` characters of `text`, followed by "…" when some were left out.
std::string apercu(std::string_view text, size_t count);
// `text` without its leading and trailing spaces and tabs.
std::string_view sansBlancs(std::string_view text);

// Rows as an aligned table: every column as wide as its widest cell, columns two spaces apart,
// one line per row (the first row is usually the heading), no trailing blanks.
std::string tableauAligne(const std::vector<std::vector<std::string>>& rows);

}  // namespace quarvo::host
