#include "dcm/elements/festwert.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/variant_number.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <string_view>

namespace {

/// A text on its own line has nothing behind its closing quote.
constexpr dcm::TextItemStyle kSingleText = {L"\n\r", L""};

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

} // namespace

DCMFestwert::DCMFestwert() : m_strKeyword(dcm::keyword::kFestwert)
{}

DCMFestwert::~DCMFestwert() = default;

HRESULT DCMFestwert::Init(const CString& strBlock)
{
    return ReadBlock(dcm::HostBlock(strBlock).Block());
}

HRESULT DCMFestwert::ReadBlock(const dcm::FileBlock& block)
{
    dcm::BlockLines lines(block);
    dcm::BlockLine line;
    while (lines.Next(line)) {
        const dcm::FileTextView text = dcm::TrimQuotes(dcm::TrimWhite(line.rest));
        const dcm::FileTextView rest = dcm::TrimBlanks(text);
        if (line.Is(m_strKeyword))
            SetName(rest.Wide());
        else if (ReadAttribute(line.keyword, rest, rest))
            continue;
        else if (line.Is(dcm::keyword::kEinheitW))
            m_strUnit = rest.SharedWide();
        else if (line.Is(dcm::keyword::kWert))
            m_value = dcm::ReadNumber(rest.bytes);
        else if (line.Is(dcm::keyword::kText))
            ReadText(text);
    }
    return S_OK;
}

/// Truth words are numbers; in these letters only.
void DCMFestwert::ReadText(dcm::FileTextView text)
{
    if (text.bytes == "true")
        m_value = 1.0;
    else if (text.bytes == "false")
        m_value = 0.0;
    else
        SetText(dcm::TrimQuotes(dcm::TrimWhite(text)));
}

/// Whichever memory is missing, the value says so.
void DCMFestwert::SetText(dcm::FileTextView text)
{
    try {
        m_value.SetText(text.Wide());
    } catch (...) {
        VariantClear(&m_value);
        m_value.vt = VT_ERROR;
        m_value.scode = E_OUTOFMEMORY;
        throw;
    }
}

HRESULT DCMFestwert::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnit);
    file.WriteText(block);
    return S_OK;
}

void DCMFestwert::ComposeBlock(dcm::FileTextBuilder& block) const
{
    block.Append(m_strKeyword).Append(L" ").Append(GetName()).EndLine();
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitW, m_strUnit);
    AppendValueLine(block, m_value);
    dcm::AppendEnd(block);
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
