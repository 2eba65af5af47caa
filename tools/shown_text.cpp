#include "tools/shown_text.h"

#include "dcm/library/dcm.h"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string>
#include <string_view>

namespace dcm::tools {

namespace {

struct Range
{
    std::uint32_t first;
    std::uint32_t last;
};

constexpr Range kCombining[] = {
    {0x0300, 0x036F}, {0x1AB0, 0x1AFF}, {0x1DC0, 0x1DFF}, {0x200B, 0x200F},
    {0x20D0, 0x20FF}, {0xFE00, 0xFE0F}, {0xFE20, 0xFE2F},
};

constexpr Range kWide[] = {
    {0x1100, 0x115F},   {0x2E80, 0x303E},   {0x3041, 0xA4CF},   {0xAC00, 0xD7A3},
    {0xF900, 0xFAFF},   {0xFE30, 0xFE4F},   {0xFF00, 0xFF60},   {0xFFE0, 0xFFE6},
    {0x1F300, 0x1F64F}, {0x1F900, 0x1F9FF}, {0x20000, 0x3FFFD},
};

template <std::size_t N>
bool IsIn(std::uint32_t character, const Range (&ranges)[N])
{
    return std::any_of(std::begin(ranges), std::end(ranges), [character](const Range& range) {
        return character >= range.first && character <= range.last;
    });
}

/// Takes the first character off a text in UTF-8.
std::uint32_t TakeCharacter(std::string_view& text)
{
    const auto byte = [&text](std::size_t at) { return static_cast<unsigned char>(text[at]); };
    const std::uint32_t first = byte(0);
    const std::size_t length = first < 0x80 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
    std::uint32_t character = length == 1 ? first : first & (0xFFU >> (length + 1));
    std::size_t taken = 1;
    for (; taken < length && taken < text.size() && (byte(taken) & 0xC0U) == 0x80; ++taken)
        character = character << 6U | (byte(taken) & 0x3FU);
    text.remove_prefix(taken);
    return character;
}

bool IsControl(std::uint32_t character)
{
    return character < 0x20 || (character >= 0x7F && character < 0xA0);
}

void AppendNumber(std::string& to, std::uint32_t character)
{
    char digits[8];
    auto* const end = std::to_chars(digits, std::end(digits), character, 16).ptr;
    to += "\\x";
    if (end - digits == 1)
        to += '0';
    to.append(digits, end);
}

} // namespace

std::string Shown(std::wstring_view text)
{
    return Shown(std::string_view(ToUtf8(text)));
}

std::string Shown(std::string_view text)
{
    std::string shown;
    shown.reserve(text.size());
    while (!text.empty()) {
        const std::string_view before = text;
        const std::uint32_t character = TakeCharacter(text);
        if (IsControl(character)) {
            AppendNumber(shown, character);
        } else {
            shown += before.substr(0, before.size() - text.size());
        }
    }
    return shown;
}

std::size_t Width(std::string_view text)
{
    std::size_t width = 0;
    while (!text.empty()) {
        const std::uint32_t character = TakeCharacter(text);
        if (IsIn(character, kWide)) {
            width += 2;
        } else if (!IsIn(character, kCombining)) {
            ++width;
        }
    }
    return width;
}

std::string Shortened(const std::string& text, std::size_t columns)
{
    constexpr std::string_view kMore = "...";
    if (Width(text) <= columns)
        return text;
    std::size_t end = 0;
    for (std::string_view rest = text; !rest.empty(); end = text.size() - rest.size()) {
        TakeCharacter(rest);
        const std::size_t next = text.size() - rest.size();
        if (Width(std::string_view(text).substr(0, next)) + kMore.size() > columns)
            break;
    }
    return text.substr(0, end) + std::string(kMore);
}

std::string Counted(std::size_t count, std::string_view noun)
{
    return std::to_string(count) + ' ' + std::string(noun) + (count == 1 ? "" : "s");
}

} // namespace dcm::tools
