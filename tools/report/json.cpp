#include "tools/report/json.h"

#include "dcm/library/dcm.h"

#include <array>
#include <charconv>
#include <cmath>

namespace dcm::tools {

void AppendJsonText(std::string& json, std::wstring_view text)
{
    constexpr std::string_view kHexDigits = "0123456789abcdef";
    json += '"';
    for (const char c : dcm::ToUtf8(text)) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x20 || c == '<' || c == 0x7F) { // "<" could end the script element
            json += "\\u00";
            json += kHexDigits[byte >> 4];
            json += kHexDigits[byte & 15];
        } else {
            if (c == '"' || c == '\\')
                json += '\\';
            json += c;
        }
    }
    json += '"';
}

void AppendJsonNumber(std::string& json, double number)
{
    if (std::isnan(number)) {
        json += "false";
    } else if (std::isinf(number)) {
        json += number > 0 ? "1e999" : "-1e999";
    } else {
        std::array<char, 32> digits;
        auto* const end = std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr;
        json.append(digits.data(), end);
    }
}

void AppendJsonValue(std::string& json, const CComVariant& value)
{
    if (value.vt == VT_R8) {
        AppendJsonNumber(json, value.dblVal);
    } else if (value.vt == VT_BSTR) {
        AppendJsonText(json, CComVariant::TextOf(value));
    } else {
        json += "null";
    }
}

} // namespace dcm::tools
