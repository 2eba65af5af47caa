#include "dcm/elements/block_text.h"

#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"

#include <algorithm>

namespace dcm {

namespace {

/// Tools tell a block's first line and its marks from the rest by this indent.
constexpr std::wstring_view kIndent = L"    ";

/// What follows a number that shares its line with others.
constexpr std::wstring_view kNumberTrailer = L"   ";

constexpr std::wstring_view kBlank = L" ";
constexpr std::wstring_view kLineEnd = L"\n";
constexpr std::wstring_view kOpeningQuote = L" \"";
constexpr std::wstring_view kClosingQuote = L"\"\n";

wchar_t* Put(std::wstring_view text, wchar_t* to)
{
    return std::copy(text.begin(), text.end(), to);
}

} // namespace

void BeginLine(CString& block, std::wstring_view keyword)
{
    wchar_t* const to = block.Extend(kIndent.size() + keyword.size());
    block.EndExtend(Put(keyword, Put(kIndent, to)));
}

void AppendLine(CString& block, std::wstring_view keyword, std::wstring_view value)
{
    BeginLine(block, keyword);
    block.Append(kBlank).Append(value).Append(kLineEnd);
}

void AppendQuotedLine(CString& block, std::wstring_view keyword, std::wstring_view value)
{
    BeginLine(block, keyword);
    block.Append(kOpeningQuote).Append(value).Append(kClosingQuote);
}

void AppendUnitLine(CString& block, std::wstring_view keyword, std::wstring_view unit)
{
    if (!unit.empty())
        AppendQuotedLine(block, keyword, unit == L" " ? std::wstring_view() : unit);
}

void DropBlankUnit(CString& unit)
{
    if (unit == L" ")
        unit.Empty();
}

void AppendSharedAxisLine(CString& block, std::wstring_view keyword, std::wstring_view name)
{
    if (!name.empty())
        block.Append(keyword).Append(L" ").Append(name).Append(L"\n");
}

void AppendEnd(CString& block)
{
    block.Append(keyword::kEnd).Append(L"\n\n");
}

void AppendQuotedText(CString& block, std::wstring_view text, const TextItemStyle& style)
{
    wchar_t* to = block.Extend(text.size() + style.trailer.size() + 3);
    to = Put(L" \"", to);
    to = std::transform(text.begin(), text.end(), to, [&](wchar_t c) {
        return style.replaced.find(c) == style.replaced.npos ? c : L'.';
    });
    *to++ = L'"';
    block.EndExtend(Put(style.trailer, to));
}

void ItemLines::AddNumber(std::wstring_view keyword, double number, int digits)
{
    BeginItem(keyword);
    wchar_t* const to = m_block.Extend(kNumberTextMax + kNumberTrailer.size());
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
        m_block.Append(kLineEnd);
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
