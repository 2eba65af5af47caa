#pragma once

#include <string>
#include <string_view>

class CComVariant;

/// JSON for a script element of a page. Composed here piece by piece, since a large file has
/// millions of values.
namespace dcm::tools {

/// Appends a text with its quotes. Nothing in it ends the script element.
void AppendJsonText(std::string& json, std::wstring_view text);
/// Appends the shortest digits that read back as the same number. An infinity is a number out of
/// range, which JavaScript reads as infinity; a not-a-number is `false`.
void AppendJsonNumber(std::string& json, double number);
/// Appends a value of a parameter: a number, a text, or `null` for none.
void AppendJsonValue(std::string& json, const CComVariant& value);

} // namespace dcm::tools
