#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/textfile/file_text_builder.h"

#include <concepts>
#include <string>
#include <string_view>

/// Composing the text of one block, line by line.
namespace dcm {

/// Appends the indent and the keyword.
void BeginLine(FileTextBuilder& block, std::wstring_view keyword);

/// Appends an indented line: keyword, blank, value.
void AppendLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view value);

/// Appends an indented line: keyword, blank, value in double quotes. Nothing is escaped.
void AppendQuotedLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view value);

/// Appends the line of a unit: none for an empty unit; the line of an empty unit for a unit of one
/// blank.
void AppendUnitLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view unit);

/// Makes a unit of one blank empty, as export does after its line is written.
void DropBlankUnit(CString& unit);

/// Appends the not indented line that names a shared distribution; none for an empty name.
void AppendSharedAxisLine(FileTextBuilder& block, std::wstring_view keyword,
                          std::wstring_view name);

/// Appends " " and the decimal number.
template <std::integral Count>
void AppendCount(FileTextBuilder& block, Count count)
{
    block.AppendAscii(" ").AppendAscii(std::to_string(count));
}

/// Appends "END" and the empty line without which a reader drops the block.
void AppendEnd(FileTextBuilder& block);

/// How a text is written among others on a line.
struct TextItemStyle
{
    /// Characters that would break the line; each is written as a full stop.
    std::wstring_view replaced;
    /// What follows the closing quote.
    std::string_view trailer;
};

/// Appends a blank and the text in double quotes. Nothing is escaped.
void AppendQuotedText(FileTextBuilder& block, std::wstring_view text, const TextItemStyle& style);

/// Composes lines of values: as many items to a line as fit, under the keyword of the first.
class ItemLines
{
public:
    ItemLines(FileTextBuilder& block, int itemsPerLine)
        : m_block(block), m_itemsPerLine(itemsPerLine)
    {}

    void AddNumber(std::wstring_view keyword, double number, int digits);
    void AddText(std::wstring_view keyword, std::wstring_view text, const TextItemStyle& style);
    /// Ends a line that is not full; what follows begins a new one.
    void EndLine();

private:
    void BeginItem(std::wstring_view keyword);
    void EndItem();

    FileTextBuilder& m_block;
    int m_itemsPerLine;
    int m_items = 0;
};

/// Items on a line of points or values, but for the rows of a two-dimensional value block.
inline constexpr int kItemsPerLine = 5;

} // namespace dcm
