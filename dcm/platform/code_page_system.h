#pragma once

#include <string>
#include <string_view>

/// Code pages that only the system knows, by their Windows identifier.
namespace dcm::system {

/// The code page that a thread has before it chooses one.
unsigned DefaultCodePage();

/// Whether the system converts the code page both ways.
bool KnowsCodePage(unsigned identifier);

/// Text of the code page as UTF-8; bytes that are not a character become U+FFFD.
std::string CodePageToUtf8(unsigned identifier, std::string_view bytes);

/// Text in UTF-8 in the code page; a character that the page lacks becomes `?`.
std::string Utf8ToCodePage(unsigned identifier, std::string_view utf8);

} // namespace dcm::system
