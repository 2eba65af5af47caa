#include "dcm/elements/stuetzstellenverteilung.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/points.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <utility>

DCMStuetzstellenverteilung::DCMStuetzstellenverteilung() = default;

DCMStuetzstellenverteilung&
DCMStuetzstellenverteilung::operator=(const DCMStuetzstellenverteilung& other)
{
    DCMStuetzstellenverteilung copy(other);
    return *this = std::move(copy);
}

DCMStuetzstellenverteilung::~DCMStuetzstellenverteilung() = default;

HRESULT DCMStuetzstellenverteilung::Init(const CString& strBlock)
{
    return ReadBlock(dcm::HostBlock(strBlock).Block());
}

HRESULT DCMStuetzstellenverteilung::ReadBlock(const dcm::FileBlock& block)
{
    dcm::BlockLines lines(block);
    dcm::BlockLine line;
    while (lines.Next(line)) {
        if (line.Is(dcm::keyword::kStuetzstellenverteilung))
            ReadFirstLine(dcm::TrimWhite(line.rest), block);
        else if (ReadAttribute(line.keyword, dcm::TrimBlanksAndQuotes(line.rest), line.rest))
            continue;
        else if (line.Is(dcm::keyword::kEinheitX))
            m_strUnit = dcm::TrimBlanksAndQuotes(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kStX) || line.Is(dcm::keyword::kStTxX))
            AddValues(line.rest);
        else if (line.Is(dcm::keyword::kStTxY) || line.Is(dcm::keyword::kText))
            return E_FAIL;
    }
    return S_OK;
}

/// The name. The count behind it says how much room to make.
void DCMStuetzstellenverteilung::ReadFirstLine(dcm::FileTextView rest, const dcm::FileBlock& block)
{
    SetName(dcm::TakeName(rest).Wide());
    dcm::ReservePoints({{m_vecValues, dcm::ReadInteger(rest.bytes)}}, block);
}

/// Numbers and texts are told apart by the quotes alone.
HRESULT DCMStuetzstellenverteilung::AddValues(dcm::FileTextView rest)
{
    const dcm::PointArray values{m_vecValues, m_vtValueType};
    dcm::ReadPoints(rest, &values, &values);
    return S_OK;
}

HRESULT DCMStuetzstellenverteilung::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnit);
    file.WriteText(block);
    return S_OK;
}

void DCMStuetzstellenverteilung::ComposeBlock(dcm::FileTextBuilder& block) const
{
    block.Append(dcm::keyword::kStuetzstellenverteilung).Append(L" ").Append(GetName());
    dcm::AppendCount(block, m_vecValues.size());
    block.EndLine().Append(dcm::keyword::kSst).EndLine();
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitX, m_strUnit);
    ExportValues(block);
    dcm::AppendEnd(block);
}

void DCMStuetzstellenverteilung::ExportValues(dcm::FileTextBuilder& block) const
{
    dcm::PointLines(block, dcm::kAxisX).AddGroup(m_vecValues);
}

HRESULT DCMStuetzstellenverteilung::AddValue(CComVariant value)
{
    dcm::AppendPoint({m_vecValues, m_vtValueType}, std::move(value));
    return S_OK;
}

HRESULT DCMStuetzstellenverteilung::GetValues(std::vector<CComVariant>& values) const
{
    dcm::CopyPoints(m_vecValues, values);
    return S_OK;
}
