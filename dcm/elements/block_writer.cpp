#include "dcm/elements/block_writer.h"

#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"

#include <algorithm>

namespace dcm {

namespace {

/// Tools find a block's first line and its marks by the indent of the other lines.
constexpr std::string_view kIndent = "    ";

/// What follows a number that shares its line with others.
constexpr std::string_view kNumberTrailer = "   ";

char* Put(std::string_view text, char* to)
{
    return std::copy(text.begin(), text.end(), to);
}

/// Puts a keyword, which is ASCII.
char* Put(std::wstring_view keyword, char* to)
{
    return std::transform(keyword.begin(), keyword.end(), to,
                          [](wchar_t c) { return static_cast<char>(c); });
}

} // namespace

void BeginLine(FileTextBuilder& block, std::wstring_view keyword)
{
    char* const to = block.Extend(kIndent.size() + keyword.size());
    block.EndExtend(Put(keyword, Put(kIndent, to)));
}

void AppendLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view value)
{
    BeginLine(block, keyword);
    block.AppendAscii(" ").Append(value).EndLine();
}

void AppendQuotedLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view value)
{
    BeginLine(block, keyword);
    block.AppendAscii(" \"").Append(value).AppendAscii("\"").EndLine();
}

void AppendUnitLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view unit)
{
    if (!unit.empty())
        AppendQuotedLine(block, keyword, unit == L" " ? std::wstring_view() : unit);
}

void DropBlankUnit(CString& unit)
{
    if (unit == L" ")
        unit.Empty();
}

void AppendSharedAxisLine(FileTextBuilder& block, std::wstring_view keyword, std::wstring_view name)
{
    if (!name.empty())
        block.Append(keyword).AppendAscii(" ").Append(name).EndLine();
}

void AppendEnd(FileTextBuilder& block)
{
    block.Append(keyword::kEnd).EndLine().EndLine();
}

void AppendQuotedText(FileTextBuilder& block, std::wstring_view text, const TextItemStyle& style)
{
    block.AppendAscii(" \"");
    for (;;) {
        const std::size_t end = text.find_first_of(style.replaced);
        block.Append(text.substr(0, end));
        if (end == text.npos)
            break;
        block.AppendAscii(".");
        text.remove_prefix(end + 1);
    }
    block.AppendAscii("\"").AppendAscii(style.trailer);
}

void ItemLines::AddNumber(std::wstring_view keyword, double number, int digits)
{
    BeginItem(keyword);
    char* const to = m_block.Extend(kNumberTextMax + kNumberTrailer.size());
    m_block.EndExtend(Put(kNumberTrailer, WriteNumber(number, digits, to)));
    EndItem();
}

void ItemLines::AddText(std::wstring_view keyword, std::wstring_view text,
                        const TextItemStyle& style)
{
    BeginItem(keyword);
    AppendQuotedText(m_block, text, style);
    EndItem();
}

void ItemLines::EndLine()
{
    if (m_items > 0)
        m_block.EndLine();
    m_items = 0;
}

void ItemLines::BeginItem(std::wstring_view keyword)
{
    if (m_items == 0)
        BeginLine(m_block, keyword);
}

void ItemLines::EndItem()
{
    if (++m_items == m_itemsPerLine)
        EndLine();
}

} // namespace dcm
