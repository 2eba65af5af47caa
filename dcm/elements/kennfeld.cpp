#include "dcm/elements/kennfeld.h"

#include "dcm/elements/block_lines.h"
#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/points.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <span>
#include <utility>

DCMKennfeld::DCMKennfeld() : m_strKeyword(dcm::keyword::kKennfeld)
{}

DCMKennfeld& DCMKennfeld::operator=(const DCMKennfeld& other)
{
    DCMKennfeld copy(other);
    return *this = std::move(copy);
}

DCMKennfeld::~DCMKennfeld() = default;

HRESULT DCMKennfeld::Init(const CString& strBlock)
{
    return ReadBlock(dcm::HostBlock(strBlock).Block());
}

HRESULT DCMKennfeld::ReadBlock(const dcm::FileBlock& block)
{
    const auto targets = PointTargets();
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
        else if (line.Is(dcm::keyword::kEinheitY))
            m_strUnitY = dcm::TrimBlanksAndQuotes(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kEinheitW))
            m_strUnitW = dcm::TrimBlanksAndQuotes(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kSstX))
            m_strStuetzstellenverteilungX = dcm::TrimBlanks(line.rest).SharedWide();
        else if (line.Is(dcm::keyword::kSstY))
            m_strStuetzstellenverteilungY = dcm::TrimBlanks(line.rest).SharedWide();
    }
    return S_OK;
}

/// The name, the count of the X axis and that of the Y axis. Where a word is missing, it is the
/// one in front.
void DCMKennfeld::ReadFirstLine(dcm::FileTextView rest, const dcm::FileBlock& block)
{
    SetName(dcm::TakeName(rest).Wide());
    m_nAxisLengthX = dcm::ReadInteger(dcm::TakeName(rest).bytes);
    m_nAxisLengthY = dcm::ReadInteger(rest.bytes);
    const std::int64_t values = std::int64_t{m_nAxisLengthX} * m_nAxisLengthY;
    dcm::ReservePoints(
        {{m_vecAxisX, m_nAxisLengthX}, {m_vecAxisY, m_nAxisLengthY}, {m_vecValues, values}}, block);
}

HRESULT DCMKennfeld::AddValues(std::wstring_view rest, std::wstring_view keyword)
{
    const dcm::FileText word = dcm::FileTextOfHost(keyword);
    const dcm::FileText text = dcm::FileTextOfHost(rest);
    const auto targets = PointTargets();
    dcm::PointReader(targets).Read({word.Bytes(), text.View()});
    return S_OK;
}

std::array<dcm::PointTarget, 3> DCMKennfeld::PointTargets()
{
    return {{{dcm::kValues, {m_vecValues, m_vtValueType}},
             {dcm::kAxisX, {m_vecAxisX, m_vtAxisXType}},
             {dcm::kAxisY, {m_vecAxisY, m_vtAxisYType}}}};
}

HRESULT DCMKennfeld::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    ComposeBlock(block);
    dcm::DropBlankUnit(m_strUnitX);
    dcm::DropBlankUnit(m_strUnitY);
    dcm::DropBlankUnit(m_strUnitW);
    file.WriteText(block);
    return S_OK;
}

void DCMKennfeld::ComposeBlock(dcm::FileTextBuilder& block) const
{
    block.Append(m_strKeyword).Append(L" ").Append(GetName());
    const auto appendCount = [&](std::int32_t axisLength, std::size_t points) {
        if (axisLength > 0)
            dcm::AppendCount(block, axisLength);
        else
            dcm::AppendCount(block, points);
    };
    appendCount(m_nAxisLengthX, m_vecAxisX.size());
    appendCount(m_nAxisLengthY, m_vecAxisY.size());
    block.EndLine();
    AppendAttributes(block);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitX, m_strUnitX);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitY, m_strUnitY);
    dcm::AppendUnitLine(block, dcm::keyword::kEinheitW, m_strUnitW);
    dcm::AppendSharedAxisLine(block, dcm::keyword::kSstX, m_strSharedXAxisUniqueName);
    dcm::AppendSharedAxisLine(block, dcm::keyword::kSstY, m_strSharedYAxisUniqueName);
    const std::size_t head = block.Size();
    AppendValues(block);
    if (block.Size() == head) {
        // Without lines of points or values nothing at all is written.
        block.Clear();
        return;
    }
    dcm::AppendEnd(block);
}

CString DCMKennfeld::ExportValues(PravFile&) const
{
    auto lines = dcm::FileTextBuilder::ForHost();
    AppendValues(lines);
    return lines.Wide();
}

void DCMKennfeld::AppendValues(dcm::FileTextBuilder& block) const
{
    const std::size_t width = m_vecAxisX.size();
    if (width * m_vecAxisY.size() > m_vecValues.size())
        return;
    dcm::PointLines(block, dcm::kAxisX).AddGroup(m_vecAxisX);
    dcm::PointLines axisY(block, dcm::kAxisY);
    dcm::PointLines values(block, dcm::kValues);
    std::span<const CComVariant> left(m_vecValues);
    for (const CComVariant& point : m_vecAxisY) {
        axisY.AddGroup({&point, 1});
        values.AddGroup(left.first(width));
        left = left.subspan(width);
    }
}

HRESULT DCMKennfeld::AddValue(VARIANT value)
{
    dcm::AppendPoint({m_vecValues, m_vtValueType}, value);
    return S_OK;
}

HRESULT DCMKennfeld::AddAxisX(VARIANT value)
{
    dcm::AppendPoint({m_vecAxisX, m_vtAxisXType}, value);
    return S_OK;
}

HRESULT DCMKennfeld::AddAxisY(VARIANT value)
{
    dcm::AppendPoint({m_vecAxisY, m_vtAxisYType}, value);
    return S_OK;
}

HRESULT DCMKennfeld::GetAxis_X(std::vector<CComVariant>& axis) const
{
    dcm::CopyPoints(m_vecAxisX, axis);
    return S_OK;
}

HRESULT DCMKennfeld::GetAxis_Y(std::vector<CComVariant>& axis) const
{
    dcm::CopyPoints(m_vecAxisY, axis);
    return S_OK;
}

HRESULT DCMKennfeld::GetValues(std::vector<CComVariant>& values) const
{
    dcm::CopyPoints(m_vecValues, values);
    return S_OK;
}

void DCMKennfeld::RotateMap()
{}

DCMFestkennfeld::DCMFestkennfeld()
{
    m_strKeyword = CString(dcm::keyword::kFestkennfeld);
}

DCMFestkennfeld::~DCMFestkennfeld() = default;

DCMGruppenkennfeld::DCMGruppenkennfeld()
{
    m_strKeyword = CString(dcm::keyword::kGruppenkennfeld);
}

DCMGruppenkennfeld::~DCMGruppenkennfeld() = default;
