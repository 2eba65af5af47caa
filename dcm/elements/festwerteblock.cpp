#include "dcm/elements/festwerteblock.h"

#include "dcm/elements/block_io.h"
#include "dcm/elements/block_reader.h"
#include "dcm/elements/block_report.h"
#include "dcm/elements/block_writer.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/exception.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <string_view>
#include <utility>

namespace {

constexpr dcm::TextItemStyle kBlockText = {L"\n\r", "   "};

bool IsQuoted(std::string_view text)
{
    return text.starts_with('"') && text.ends_with('"');
}

/// The position of the quote that ends the text at the start of `rest`: one that a blank or nothing
/// follows, and that neither begins the text nor follows a backslash. Any other is part of the
/// text.
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

/// Reads a line of numbers, of which there must be one.
void ReadNumberLine(std::string_view rest, dcm::BlockReport* report, std::vector<double>& numbers)
{
    if (rest.empty())
        dcm::ThrowResult(E_INVALIDARG);
    dcm::ReadNumbers(rest, report, numbers);
}

/// Reads a list of quoted texts.
void ReadTexts(std::string_view rest, const dcm::FileText& text, dcm::BlockReport* report,
               std::list<CString>& texts)
{
    const auto add = [&](std::string_view part) {
        if (report != nullptr)
            report->KeptText(part);
        texts.push_back(text.Wide(part));
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
                // No quote closes the text: it runs to the end, without a final quote.
                add(rest.substr(0, rest.size() - (rest.ends_with('"') ? 1 : 0)));
                break;
            }
            add(rest.substr(0, end));
            rest.remove_prefix(end + 1);
        }
        rest.remove_prefix(std::min(rest.find_first_not_of(' '), rest.size()));
    }
}

/// Reads the texts of a line. Without quotes around all of it, the whole line is one text.
void ReadTextLine(std::string_view rest, const dcm::FileText& text, dcm::BlockReport* report,
                  std::list<CString>& texts)
{
    if (report != nullptr)
        report->BeginTexts();
    if (IsQuoted(rest)) {
        ReadTexts(rest, text, report, texts);
    } else {
        const std::string quoted = '"' + std::string(rest) + '"';
        ReadTexts(quoted, text, report, texts);
    }
    if (report != nullptr)
        report->EndTexts();
}

/// Reads "X @ Y". The count of a list is not needed.
void ReadCounts(std::string_view counts, const dcm::FileText& text, std::int32_t& x,
                std::int32_t& y)
{
    const std::size_t at = counts.find('@');
    if (at == counts.npos || at == 0)
        return;
    // One character, a blank as a rule, is on either side of the "@".
    x = dcm::ReadInteger(counts.substr(0, at - 1));
    const std::string_view rest = counts.substr(at + 1);
    y = rest.empty() ? 0 : dcm::ReadInteger(text.WithoutFirstCharacter(rest));
}

/// Compares the counts of the first line, `declared`, with what was read of them and with the
/// values.
void ReportValues(dcm::BlockReport& report, std::string_view declared,
                  const DCMFestwerteblock& block, std::size_t numbers, std::size_t texts)
{
    const std::size_t values = numbers > 0 ? numbers : texts;
    if (numbers > 0 && texts > 0) {
        report.AddToBlock(
            dcm::FindingKind::kNumbersAndTexts,
            {L"The block has numbers and texts; its ", texts, L" texts will not be written."});
    }
    const std::size_t at = declared.find('@');
    if (at == declared.npos) {
        report.CompareCount(declared, values, L"values");
        return;
    }
    const std::int64_t x = block.GetXValueCount(), y = block.GetYValueCount();
    const bool read = report.Count(dcm::TrimWhite(declared.substr(0, at)), x) &&
                      report.Count(dcm::TrimWhite(declared.substr(at + 1)), y);
    if (read && (x * y != static_cast<std::int64_t>(values) || (x == 0) != (y == 0))) {
        report.AddToBlock(
            dcm::FindingKind::kCountDiffers,
            {L"The first line declares ", x, L" @ ", y, L" values, but there are ", values, L"."});
    }
}

/// Appends the lines of values: the numbers, or the texts where there are none.
void AppendItems(dcm::FileTextBuilder& block, const std::vector<double>& numbers,
                 const std::list<CString>& texts, int itemsPerLine, int digits)
{
    dcm::ItemLines lines(block, itemsPerLine);
    for (const double number : numbers)
        lines.AddNumber(dcm::keyword::kWert, number, digits);
    if (numbers.empty()) {
        for (const CString& text : texts)
            lines.AddText(dcm::keyword::kText, text, kBlockText);
    }
    lines.EndLine();
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
    return dcm::BlockIo::Read(dcm::HostBlock(strBlock).Block(), *this);
}

HRESULT dcm::BlockIo::Read(const FileBlock& lines, DCMFestwerteblock& block)
{
    const FileText& text = lines.Text();
    BlockReader reader(lines);
    BlockReport* const report = reader.Report();
    std::string_view declared;
    BlockLine line;
    while (reader.Next(line)) {
        // White space first, then blanks and quotes, for every line of the block.
        const std::string_view rest = TrimBlanksAndQuotes(TrimWhite(line.rest));
        if (line.Is(keyword::kFestwerteblock)) {
            std::string_view counts = rest;
            block.SetName(reader.NameWord(TakeWord(counts)));
            ReadCounts(counts, text, block.m_nXValueCount, block.m_nYValueCount);
            // With quotes that are not part of a count, so that they are reported.
            declared = TrimWhite(line.rest);
            TakeWord(declared);
        } else if (ReadAttribute(line.keyword, rest, rest, reader, block)) {
            continue;
        } else if (line.Is(keyword::kEinheitW)) {
            block.m_strUnit = reader.Attribute(rest);
        } else if (line.Is(keyword::kWert)) {
            if (report != nullptr)
                report->Numbers(rest);
            ReadNumberLine(rest, report, block.m_vecDoubleValues);
        } else if (line.Is(keyword::kText)) {
            ReadTextLine(TrimWhite(rest), text, report, block.m_listStringValues);
        } else {
            reader.UnknownLine();
        }
    }
    if (report != nullptr) {
        ReportValues(*report, declared, block, block.m_vecDoubleValues.size(),
                     block.m_listStringValues.size());
    }
    return S_OK;
}

HRESULT DCMFestwerteblock::AddValues(CString& strRest)
{
    const auto text = dcm::FileText::OfHost(strRest);
    if (IsQuoted(text.Bytes())) {
        ReadTexts(text.Bytes(), text, nullptr, m_listStringValues);
    } else {
        ReadNumberLine(text.Bytes(), nullptr, m_vecDoubleValues);
    }
    strRest.Empty();
    return S_OK;
}

HRESULT DCMFestwerteblock::AddStringValues(CString& strRest)
{
    const auto text = dcm::FileText::OfHost(strRest);
    if (text.Bytes().starts_with('"'))
        ReadTexts(text.Bytes(), text, nullptr, m_listStringValues);
    strRest.Empty();
    return S_OK;
}

HRESULT DCMFestwerteblock::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    dcm::BlockIo::Compose(*this, block);
    dcm::DropBlankUnit(m_strUnit);
    dcm::WriteText(block, file);
    return S_OK;
}

void dcm::BlockIo::Compose(const DCMFestwerteblock& block, FileTextBuilder& text)
{
    text.Append(keyword::kFestwerteblock).AppendAscii(" ").Append(block.GetName());
    if (block.m_nYValueCount == 0) {
        const bool numbers = !block.m_vecDoubleValues.empty();
        AppendCount(text,
                    numbers ? block.m_vecDoubleValues.size() : block.m_listStringValues.size());
    } else {
        AppendCount(text, block.m_nXValueCount);
        text.AppendAscii(" @");
        AppendCount(text, block.m_nYValueCount);
    }
    text.EndLine();
    ComposeAttributes(block, text);
    AppendUnitLine(text, keyword::kEinheitW, block.m_strUnit);
    if (block.m_nXValueCount > 0 && block.m_nYValueCount > 0) {
        AppendItems(text, block.m_vecDoubleValues, block.m_listStringValues, block.m_nXValueCount,
                    kShortDigits);
    } else {
        AppendItems(text, block.m_vecDoubleValues, block.m_listStringValues, kItemsPerLine,
                    kFullDigits);
    }
    AppendEnd(text);
}

CString DCMFestwerteblock::ExportValues(PravFile&) const
{
    if (m_nXValueCount > 0 && m_nYValueCount > 0)
        return ExportValues2D();
    auto lines = dcm::FileTextBuilder::ForHost();
    AppendItems(lines, m_vecDoubleValues, m_listStringValues, dcm::kItemsPerLine, dcm::kFullDigits);
    return lines.Wide();
}

/// A row a line, whatever the number of rows.
CString DCMFestwerteblock::ExportValues2D() const
{
    auto lines = dcm::FileTextBuilder::ForHost();
    AppendItems(lines, m_vecDoubleValues, m_listStringValues, m_nXValueCount, dcm::kShortDigits);
    return lines.Wide();
}

void DCMFestwerteblock::AddValue(double dValue)
{
    m_vecDoubleValues.push_back(dValue);
}

void DCMFestwerteblock::AddValue(const CString& strValue)
{
    m_listStringValues.push_back(strValue);
}
