#include "dcm/elements/festwert.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <string_view>

namespace {

/// A text on its own line has nothing behind its closing quote.
constexpr dcm::TextItemStyle kSingleText = {L"\n\r", L""};

/// The number that a value stands for; 0.0 when it stands for none.
double NumberOf(const VARIANT& value)
{
    switch (value.vt) {
    case VT_R8:
        return value.dblVal;
    case VT_R4:
        return static_cast<double>(value.fltVal);
    case VT_BOOL:
        return value.boolVal != VARIANT_FALSE ? 1.0 : 0.0;
    case VT_I1:
        return static_cast<signed char>(value.cVal);
    case VT_UI1:
        return value.bVal;
    case VT_I2:
        return value.iVal;
    case VT_UI2:
        return value.uiVal;
    case VT_I4:
    case VT_INT:
        return value.lVal;
    case VT_UI4:
    case VT_UINT:
        return value.ulVal;
    case VT_I8:
        return static_cast<double>(value.llVal);
    case VT_UI8:
        return static_cast<double>(value.ullVal);
    default:
        return 0.0;
    }
}

void AppendValueLine(dcm::FileTextBuilder& block, const VARIANT& value)
{
    if (value.vt == VT_BSTR) {
        dcm::BeginLine(block, dcm::keyword::kText);
        dcm::AppendQuotedText(block, CComVariant::TextOf(value), kSingleText);
    } else {
        dcm::BeginLine(block, dcm::keyword::kWert);
        char* const to = block.Extend(dcm::kNumberTextMax);
        block.EndExtend(dcm::WriteNumber(NumberOf(value), dcm::kFullDigits, to));
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
