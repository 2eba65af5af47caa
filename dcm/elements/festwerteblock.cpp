#include "dcm/elements/festwerteblock.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/exception.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <utility>

namespace {

constexpr dcm::TextItemStyle kBlockText = {L"\n\r", L"   "};

/// Where the quote that ends the text at the start of `rest` stands: one with a blank or nothing
/// behind it, that neither begins the text nor follows a backslash. Any other belongs to the text.
std::size_t FindClosingQuote(std::wstring_view rest)
{
    std::size_t at = rest.find(L'"');
    while (at != rest.npos) {
        const bool last = at + 1 == rest.size();
        if (at > 0 && rest[at - 1] != L'\\' && (last || rest[at + 1] == L' '))
            return at;
        at = rest.find(L'"', at + 1);
    }
    return rest.npos;
}

/// Whether `rest`, which follows a pair of quotes, goes on with blanks and an opening quote, so
/// that the pair is an empty text.
bool AnotherTextFollows(std::wstring_view rest)
{
    const std::size_t next = rest.find_first_not_of(L' ');
    return next != 0 && next != rest.npos && rest[next] == L'"' && next + 1 < rest.size() &&
           rest[next + 1] != L' ';
}

} // namespace

DCMFestwerteblock::DCMFestwerteblock() = default;

DCMFestwerteblock& DCMFestwerteblock::operator=(const DCMFestwerteblock& other)
{
    DCMFestwerteblock copy(other);
    return *this = std::move(copy);
}

DCMFestwerteblock::~DCMFestwerteblock() = default;

HRESULT DCMFestwerteblock::Init(const CString& strBlock)
{
    dcm::BlockLines lines(strBlock);
    dcm::BlockLine line;
    while (lines.Next(line)) {
        // White space first, then blanks and quotes, for every line of the block.
        const std::wstring_view rest = dcm::TrimBlanksAndQuotes(dcm::TrimWhite(line.rest));
        if (line.Is(dcm::keyword::kFestwerteblock))
            ReadFirstLine(rest);
        else if (ReadAttribute(line.keyword, rest, rest))
            continue;
        else if (line.Is(dcm::keyword::kEinheitW))
            m_strUnit = rest;
        else if (line.Is(dcm::keyword::kWert))
            AddValues(rest);
        else if (line.Is(dcm::keyword::kText))
            AddTexts(rest);
    }
    return S_OK;
}

/// The name and, for rows, "X @ Y" behind it. The count of a list is not needed.
void DCMFestwerteblock::ReadFirstLine(std::wstring_view rest)
{
    SetName(dcm::TakeName(rest));
    const std::size_t at = rest.find(L'@');
    if (at == rest.npos || at == 0)
        return;
    // A blank stands on either side of the "@".
    m_nXValueCount = dcm::ReadInteger(rest.substr(0, at - 1));
    m_nYValueCount = dcm::ReadInteger(rest.size() > at + 2 ? rest.substr(at + 2) : L"");
}

HRESULT DCMFestwerteblock::AddValues(std::wstring_view rest)
{
    if (rest.empty())
        dcm::ThrowResult(E_INVALIDARG);
    bool more = true;
    while (more) {
        double number = 0;
        more = dcm::TakeNumber(rest, number);
        m_vecDoubleValues.push_back(number);
    }
    return S_OK;
}

/// A line of texts. Without quotes around all of it, the whole line is one text.
HRESULT DCMFestwerteblock::AddTexts(std::wstring_view rest)
{
    rest = dcm::TrimWhite(rest);
    if (rest.starts_with(L'"') && rest.ends_with(L'"'))
        return AddStringValues(rest);
    CString quoted(L"\"");
    quoted.Append(rest).Append(L"\"");
    return AddStringValues(quoted);
}

HRESULT DCMFestwerteblock::AddStringValues(std::wstring_view rest)
{
    while (!rest.empty()) {
        const std::size_t quotes = std::min(rest.find_first_not_of(L'"'), rest.size());
        rest.remove_prefix(quotes);
        if (rest.empty())
            break;
        if (quotes > 1 && AnotherTextFollows(rest)) {
            m_listStringValues.emplace_back();
        } else {
            const std::size_t end = FindClosingQuote(rest);
            if (end == rest.npos) {
                // Nothing closes the text: it runs to the end, but for a final quote.
                m_listStringValues.emplace_back(
                    rest.substr(0, rest.size() - (rest.ends_with(L'"') ? 1 : 0)));
                break;
            }
            m_listStringValues.emplace_back(rest.substr(0, end));
            rest.remove_prefix(end + 1);
        }
        rest.remove_prefix(std::min(rest.find_first_not_of(L' '), rest.size()));
    }
    return S_OK;
}

HRESULT DCMFestwerteblock::Export(PravFile& file)
{
    CString block;
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnit);
    file.WriteText(block);
    return S_OK;
}

void DCMFestwerteblock::ComposeBlock(CString& block) const
{
    block.Append(dcm::keyword::kFestwerteblock).Append(L" ").Append(GetName());
    if (m_nYValueCount == 0) {
        const bool numbers = !m_vecDoubleValues.empty();
        dcm::AppendCount(block, numbers ? m_vecDoubleValues.size() : m_listStringValues.size());
    } else {
        dcm::AppendCount(block, m_nXValueCount);
        block.Append(L" @");
        dcm::AppendCount(block, m_nYValueCount);
    }
    block.Append(L"\n");
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitW, m_strUnit);
    ExportValues(block);
    dcm::AppendEnd(block);
}

void DCMFestwerteblock::ExportValues(CString& block) const
{
    if (m_nXValueCount > 0 && m_nYValueCount > 0)
        ExportValues2D(block);
    else
        AppendItems(block, dcm::kItemsPerLine, dcm::kFullDigits);
}

/// A row a line, whatever the number of rows.
void DCMFestwerteblock::ExportValues2D(CString& block) const
{
    AppendItems(block, m_nXValueCount, dcm::kShortDigits);
}

void DCMFestwerteblock::AppendItems(CString& block, int itemsPerLine, int digits) const
{
    dcm::ItemLines lines(block, itemsPerLine);
    if (!m_vecDoubleValues.empty()) {
        for (const double number : m_vecDoubleValues)
            lines.AddNumber(dcm::keyword::kWert, number, digits);
    } else {
        for (const CString& text : m_listStringValues)
            lines.AddText(dcm::keyword::kText, text, kBlockText);
    }
    lines.EndLine();
}

void DCMFestwerteblock::AddValue(double dValue)
{
    m_vecDoubleValues.push_back(dValue);
}

void DCMFestwerteblock::AddValue(const CString& strValue)
{
    m_listStringValues.push_back(strValue);
}
