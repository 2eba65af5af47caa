#pragma once

#include <cstddef>
#include <string>
#include <string_view>

/// @file
/// Texts of a file as a person reads them on a terminal.

namespace dcm::tools {

/// The text in UTF-8. Control characters, which a terminal could take for commands, become "\x1b"
/// with their number.
std::string Shown(std::wstring_view text);

/// The same for a text that is UTF-8 already, such as a path.
std::string Shown(std::string_view text);
inline std::string Shown(const std::string& text)
{
    return Shown(std::string_view(text));
}

/// How many columns a text in UTF-8 takes on a terminal: none for combining characters, two for
/// the wide ones of East Asia.
std::size_t Width(std::string_view text);

/// The text, or its beginning and "..." where it takes more columns than these.
std::string Shortened(const std::string& text, std::size_t columns);

/// "1 block", "2 blocks".
std::string Counted(std::size_t count, std::string_view noun);

} // namespace dcm::tools
