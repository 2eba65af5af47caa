#include "dcm/elements/kennlinie.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/points.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <utility>

DCMKennlinie::DCMKennlinie() : m_strKeyword(dcm::keyword::kKennlinie)
{}

DCMKennlinie& DCMKennlinie::operator=(const DCMKennlinie& other)
{
    DCMKennlinie copy(other);
    return *this = std::move(copy);
}

DCMKennlinie::~DCMKennlinie() = default;

HRESULT DCMKennlinie::Init(const CString& strBlock)
{
    return ReadBlock(dcm::HostBlock(strBlock).Block());
}

HRESULT DCMKennlinie::ReadBlock(const dcm::FileBlock& block)
{
    const dcm::PointTarget targets[] = {
        {dcm::kAxisX, {m_vecAxis, m_vtAxisType}},
        {dcm::kValues, {m_vecValues, m_vtValueType}},
    };
    dcm::PointReader points(targets);
    dcm::BlockLines lines(block);
    dcm::BlockLine line;
    while (lines.Next(line)) {
        // Most lines of a file are lines of points.
        if (points.Read(line))
            continue;
        if (line.Is(m_strKeyword))
            ReadFirstLine(dcm::TrimWhite(line.rest), block);
        else if (ReadAttribute(line.keyword, dcm::TrimBlanksAndQuotes(line.rest), line.rest))
            continue;
        else if (line.Is(dcm::keyword::kEinheitX))
            m_strUnitX = dcm::TrimBlanksAndQuotes(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kEinheitW))
            m_strUnitW = dcm::TrimBlanksAndQuotes(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kStTxY))
            return E_FAIL;
        else if (line.Is(dcm::keyword::kSstX))
            m_strStuetzstellenverteilung = dcm::TrimBlanks(line.rest).SharedWide();
    }
    return S_OK;
}

/// The name and the count behind it; a line of one word is the count.
void DCMKennlinie::ReadFirstLine(dcm::FileTextView rest, const dcm::FileBlock& block)
{
    SetName(dcm::TakeName(rest).Wide());
    m_nAxisLengthX = dcm::ReadInteger(rest.bytes);
    dcm::ReservePoints({{m_vecAxis, m_nAxisLengthX}, {m_vecValues, m_nAxisLengthX}}, block);
}

HRESULT DCMKennlinie::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnitX);
    dcm::DropBlankUnit(m_strUnitW);
    file.WriteText(block);
    return S_OK;
}

void DCMKennlinie::ComposeBlock(dcm::FileTextBuilder& block) const
{
    block.Append(m_strKeyword).Append(L" ").Append(GetName());
    if (m_nAxisLengthX > 0)
        dcm::AppendCount(block, m_nAxisLengthX);
    else
        dcm::AppendCount(block, m_vecValues.size());
    block.EndLine();
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitX, m_strUnitX);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitW, m_strUnitW);
    dcm::AppendSharedAxisLine(block, dcm::keyword::kSstX, m_strSharedAxisUniqueName);
    ExportValues(block);
    dcm::AppendEnd(block);
}

void DCMKennlinie::ExportValues(dcm::FileTextBuilder& block) const
{
    dcm::PointLines(block, dcm::kAxisX).AddGroup(m_vecAxis);
    dcm::PointLines(block, dcm::kValues).AddGroup(m_vecValues);
}

HRESULT DCMKennlinie::AddValue(VARIANT value)
{
    dcm::AppendPoint({m_vecValues, m_vtValueType}, value);
    return S_OK;
}

HRESULT DCMKennlinie::AddAxis(VARIANT value)
{
    dcm::AppendPoint({m_vecAxis, m_vtAxisType}, value);
    return S_OK;
}

HRESULT DCMKennlinie::GetAxis(std::vector<CComVariant>& axis) const
{
    dcm::CopyPoints(m_vecAxis, axis);
    return S_OK;
}

HRESULT DCMKennlinie::GetValues(std::vector<CComVariant>& values) const
{
    dcm::CopyPoints(m_vecValues, values);
    return S_OK;
}

void DCMKennlinie::AddValue(double dValue, const CString& strKeyword)
{
    if (strKeyword == dcm::keyword::kStX)
        m_listAxis.push_back(dValue);
    else if (strKeyword == dcm::keyword::kWert)
        m_listValues.push_back(dValue);
}

DCMFestkennlinie::DCMFestkennlinie()
{
    m_strKeyword = CString(dcm::keyword::kFestkennlinie);
}

DCMFestkennlinie::~DCMFestkennlinie() = default;

DCMGruppenkennlinie::DCMGruppenkennlinie()
{
    m_strKeyword = CString(dcm::keyword::kGruppenkennlinie);
}

DCMGruppenkennlinie::~DCMGruppenkennlinie() = default;
