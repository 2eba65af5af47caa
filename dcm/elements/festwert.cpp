#include "dcm/elements/festwert.h"

#include "dcm/elements/block_io.h"
#include "dcm/elements/block_reader.h"
#include "dcm/elements/block_report.h"
#include "dcm/elements/block_writer.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/variant_number.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile.h"

#include <string_view>

namespace {

/// A text on a line of its own has nothing after its closing quote.
constexpr dcm::TextItemStyle kSingleText = {L"\n\r", ""};

void AppendValueLine(dcm::FileTextBuilder& block, const VARIANT& value)
{
    if (value.vt == VT_BSTR) {
        dcm::BeginLine(block, dcm::keyword::kText);
        dcm::AppendQuotedText(block, CComVariant::TextOf(value), kSingleText);
    } else {
        dcm::BeginLine(block, dcm::keyword::kWert);
        const double number = dcm::NumberOf(value).value_or(0.0);
        char* const to = block.Extend(dcm::kNumberTextMax);
        block.EndExtend(dcm::WriteNumber(number, dcm::kFullDigits, to));
    }
    block.EndLine();
}

/// Stores the text of a TEXT line. The words "true" and "false", in these letters only, are
/// numbers.
void ReadValueText(std::string_view part, const dcm::FileText& text, dcm::BlockReport* report,
                   CComVariant& value)
{
    const bool isTrue = part == "true";
    if (isTrue || part == "false") {
        if (report != nullptr)
            report->TruthWord();
        value = isTrue ? 1.0 : 0.0;
        return;
    }
    part = dcm::TrimQuotes(dcm::TrimWhite(part));
    if (report != nullptr)
        report->SingleText(part);
    try {
        value.SetText(text.Wide(part));
    } catch (...) {
        // The wide text or the value's copy of it: whichever has no memory, the value says so.
        VariantClear(&value);
        value.vt = VT_ERROR;
        value.scode = E_OUTOFMEMORY;
        throw;
    }
}

double ReadValueNumber(std::string_view token, dcm::BlockReport* report)
{
    const double value = dcm::ReadNumber(token);
    if (report != nullptr)
        report->SingleNumber(token, value);
    return value;
}

} // namespace

DCMFestwert::DCMFestwert() : m_strKeyword(dcm::keyword::kFestwert)
{}

DCMFestwert::~DCMFestwert() = default;

HRESULT DCMFestwert::Init(const CString& strBlock)
{
    return dcm::BlockIo::Read(dcm::HostBlock(strBlock).Block(), *this);
}

HRESULT dcm::BlockIo::Read(const FileBlock& lines, DCMFestwert& block)
{
    const FileText& text = lines.Text();
    BlockReader reader(lines);
    BlockLine line;
    while (reader.Next(line)) {
        const std::string_view value = TrimQuotes(TrimWhite(line.rest));
        const std::string_view rest = TrimBlanks(value);
        if (line.Is(block.m_strKeyword)) {
            block.SetName(reader.Name(rest));
        } else if (ReadAttribute(line.keyword, rest, rest, reader, block)) {
            continue;
        } else if (line.Is(keyword::kEinheitW)) {
            block.m_strUnit = reader.Attribute(rest);
        } else if (line.Is(keyword::kWert)) {
            block.m_value = ReadValueNumber(rest, reader.Report());
        } else if (line.Is(keyword::kText)) {
            ReadValueText(value, text, reader.Report(), block.m_value);
        } else {
            reader.UnknownLine();
        }
    }
    if (reader.Report() != nullptr && block.m_value.vt == VT_EMPTY) {
        reader.Report()->AddToBlock(FindingKind::kNoValue,
                                    {L"The block has no value; it is written with 0.0."});
    }
    return S_OK;
}

HRESULT DCMFestwert::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    dcm::BlockIo::Compose(*this, block);
    dcm::DropBlankUnit(m_strUnit);
    dcm::WriteText(block, file);
    return S_OK;
}

void dcm::BlockIo::Compose(const DCMFestwert& block, FileTextBuilder& text)
{
    text.Append(block.m_strKeyword).AppendAscii(" ").Append(block.GetName()).EndLine();
    ComposeAttributes(block, text);
    AppendUnitLine(text, keyword::kEinheitW, block.m_strUnit);
    AppendValueLine(text, block.m_value);
    AppendEnd(text);
}

HRESULT DCMFestwert::GetValue(VARIANT* pValue) const
{
    if (pValue == nullptr)
        return E_POINTER;
    CComVariant copy(m_value);
    const HRESULT cleared = VariantClear(pValue);
    if (FAILED(cleared))
        return cleared;
    *pValue = copy.Detach();
    return S_OK;
}

HRESULT DCMFestwert::SetValue(const VARIANT* pValue)
{
    if (pValue == nullptr)
        return E_POINTER;
    m_value = *pValue;
    return S_OK;
}

DCMTextstring::DCMTextstring()
{
    m_strKeyword = CString(dcm::keyword::kTextstring);
}

DCMTextstring::~DCMTextstring() = default;
