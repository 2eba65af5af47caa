#include "dcm/elements/festwerteblock.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/exception.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <array>
#include <string>
#include <utility>

namespace {

constexpr dcm::TextItemStyle kBlockText = {L"\n\r", L"   "};

bool IsQuoted(std::string_view text)
{
    return text.starts_with('"') && text.ends_with('"');
}

/// Where the quote that ends the text at the start of `rest` stands: one with a blank or nothing
/// behind it, that neither begins the text nor follows a backslash. Any other belongs to the text.
std::size_t FindClosingQuote(std::string_view rest)
{
    std::size_t at = rest.find('"');
    while (at != rest.npos) {
        const bool last = at + 1 == rest.size();
        if (at > 0 && rest[at - 1] != '\\' && (last || rest[at + 1] == ' '))
            return at;
        at = rest.find('"', at + 1);
    }
    return rest.npos;
}

/// Whether `rest`, which follows a pair of quotes, goes on with blanks and an opening quote, so
/// that the pair is an empty text.
bool AnotherTextFollows(std::string_view rest)
{
    const std::size_t next = rest.find_first_not_of(' ');
    return next != 0 && next != rest.npos && rest[next] == '"' && next + 1 < rest.size() &&
           rest[next + 1] != ' ';
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
    return ReadBlock(dcm::HostBlock(strBlock).Block());
}

HRESULT DCMFestwerteblock::ReadBlock(const dcm::FileBlock& block)
{
    dcm::BlockLines lines(block);
    dcm::BlockLine line;
    while (lines.Next(line)) {
        // White space first, then blanks and quotes, for every line of the block.
        const dcm::FileTextView rest = dcm::TrimBlanksAndQuotes(dcm::TrimWhite(line.rest));
        if (line.Is(dcm::keyword::kFestwerteblock))
            ReadFirstLine(rest);
        else if (ReadAttribute(line.keyword, rest, rest))
            continue;
        else if (line.Is(dcm::keyword::kEinheitW))
            m_strUnit = rest.SharedWide();
        else if (line.Is(dcm::keyword::kWert))
            AddValues(rest);
        else if (line.Is(dcm::keyword::kText))
            AddTexts(rest);
    }
    return S_OK;
}

/// The name and, for rows, "X @ Y" behind it. The count of a list is not needed.
void DCMFestwerteblock::ReadFirstLine(dcm::FileTextView rest)
{
    SetName(dcm::TakeName(rest).Wide());
    const std::string_view counts = rest.bytes;
    const std::size_t at = counts.find('@');
    if (at == counts.npos || at == 0)
        return;
    // A blank, or another character, stands on either side of the "@".
    m_nXValueCount = dcm::ReadInteger(counts.substr(0, at - 1));
    rest.bytes = counts.substr(at + 1);
    if (!rest.bytes.empty())
        rest.DropFirst();
    m_nYValueCount = dcm::ReadInteger(rest.bytes);
}

HRESULT DCMFestwerteblock::AddValues(dcm::FileTextView rest)
{
    if (rest.bytes.empty())
        dcm::ThrowResult(E_INVALIDARG);
    dcm::NumberReader numbers(rest.bytes);
    std::array<double, dcm::kNumbersAtOnce> values;
    std::size_t count = values.size();
    while (count == values.size()) {
        count = numbers.Next(values);
        m_vecDoubleValues.insert(m_vecDoubleValues.end(), values.begin(), values.begin() + count);
    }
    return S_OK;
}

/// A line of texts. Without quotes around all of it, the whole line is one text.
HRESULT DCMFestwerteblock::AddTexts(dcm::FileTextView rest)
{
    rest = dcm::TrimWhite(rest);
    if (IsQuoted(rest.bytes))
        return AddStringValues(rest);
    const std::string quoted = '"' + std::string(rest.bytes) + '"';
    return AddStringValues({quoted, rest.file});
}

HRESULT DCMFestwerteblock::AddStringValues(dcm::FileTextView line)
{
    std::string_view rest = line.bytes;
    const auto add = [&](std::string_view text) {
        m_listStringValues.push_back(dcm::FileTextView{text, line.file}.Wide());
    };
    while (!rest.empty()) {
        const std::size_t quotes = std::min(rest.find_first_not_of('"'), rest.size());
        rest.remove_prefix(quotes);
        if (rest.empty())
            break;
        if (quotes > 1 && AnotherTextFollows(rest)) {
            add({});
        } else {
            const std::size_t end = FindClosingQuote(rest);
            if (end == rest.npos) {
                // Nothing closes the text: it runs to the end, but for a final quote.
                add(rest.substr(0, rest.size() - (rest.ends_with('"') ? 1 : 0)));
                break;
            }
            add(rest.substr(0, end));
            rest.remove_prefix(end + 1);
        }
        rest.remove_prefix(std::min(rest.find_first_not_of(' '), rest.size()));
    }
    return S_OK;
}

HRESULT DCMFestwerteblock::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnit);
    file.WriteText(block);
    return S_OK;
}

void DCMFestwerteblock::ComposeBlock(dcm::FileTextBuilder& block) const
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
    block.EndLine();
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitW, m_strUnit);
    ExportValues(block);
    dcm::AppendEnd(block);
}

void DCMFestwerteblock::ExportValues(dcm::FileTextBuilder& block) const
{
    if (m_nXValueCount > 0 && m_nYValueCount > 0)
        ExportValues2D(block);
    else
        AppendItems(block, dcm::kItemsPerLine, dcm::kFullDigits);
}

/// A row a line, whatever the number of rows.
void DCMFestwerteblock::ExportValues2D(dcm::FileTextBuilder& block) const
{
    AppendItems(block, m_nXValueCount, dcm::kShortDigits);
}

void DCMFestwerteblock::AppendItems(dcm::FileTextBuilder& block, int itemsPerLine, int digits) const
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
