#include "dcm/elements/kennfeld.h"

#include "dcm/elements/block_io.h"
#include "dcm/elements/block_reader.h"
#include "dcm/elements/block_report.h"
#include "dcm/elements/block_writer.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/elements/points.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile.h"

#include <array>
#include <cstddef>
#include <span>
#include <string_view>
#include <utility>

namespace {

std::array<dcm::PointTarget, 3>
TargetsOf(const dcm::PointArray& axisX, const dcm::PointArray& axisY, const dcm::PointArray& values)
{
    return {{{dcm::kValues, values}, {dcm::kAxisX, axisX}, {dcm::kAxisY, axisY}}};
}

/// Compares the numbers of points of both axes and of values.
void ReportGrid(dcm::BlockReport& report, std::size_t x, std::size_t y, std::size_t values)
{
    const std::size_t wanted = x * y;
    if (values < wanted) {
        report.AddToBlock(dcm::FindingKind::kIncompleteMap,
                          {L"The map has ", values, L" values where its axes ask for ", wanted,
                           L"; it will not be written."});
    } else if (values > wanted) {
        report.AddToBlock(dcm::FindingKind::kSurplusValues,
                          {L"The map has ", values, L" values where its axes ask for ", wanted,
                           L"; the others will not be written."});
    }
    if (x == 0 && y == 0) {
        report.AddToBlock(dcm::FindingKind::kEmptyMap,
                          {L"The map has no axis points; it will not be written."});
    }
    if (const std::int64_t line = report.Rows().FirstMoved(x)) {
        report.Add(dcm::FindingKind::kRowDiffers, dcm::SeverityOf(dcm::FindingKind::kRowDiffers),
                   line,
                   {L"The row does not have one value for each of ", x,
                    L" points of X, so that values move to another row."});
    }
}

/// Appends the X axis, then each Y axis point with its row; nothing when there are too few values.
void AppendPointLines(dcm::FileTextBuilder& block, const std::vector<CComVariant>& axisX,
                      const std::vector<CComVariant>& axisY, const std::vector<CComVariant>& values)
{
    const std::size_t width = axisX.size();
    if (width * axisY.size() > values.size())
        return;
    dcm::PointLines(block, dcm::kAxisX).AddGroup(axisX);
    dcm::PointLines pointLines(block, dcm::kAxisY);
    dcm::PointLines rowLines(block, dcm::kValues);
    std::span<const CComVariant> left(values);
    for (const CComVariant& point : axisY) {
        pointLines.AddGroup({&point, 1});
        rowLines.AddGroup(left.first(width));
        left = left.subspan(width);
    }
}

} // namespace

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
    return dcm::BlockIo::Read(dcm::HostBlock(strBlock).Block(), *this);
}

HRESULT dcm::BlockIo::Read(const FileBlock& lines, DCMKennfeld& block)
{
    const auto targets =
        TargetsOf({block.m_vecAxisX, block.m_vtAxisXType}, {block.m_vecAxisY, block.m_vtAxisYType},
                  {block.m_vecValues, block.m_vtValueType});
    const FileText& text = lines.Text();
    BlockReader reader(lines);
    BlockReport* const report = reader.Report();
    PointReader points(targets, text, report);
    std::string_view declaredX, declaredY;
    BlockLine line;
    while (reader.Next(line)) {
        // Most lines of a file are lines of points.
        if (points.Read(line)) {
            if (report != nullptr)
                report->AfterPoints(block.m_vecAxisY.size(), block.m_vecValues.size());
            continue;
        }
        if (line.Is(block.m_strKeyword)) {
            // The name and two counts. Where a word is missing, it is the first one.
            std::string_view rest = TrimWhite(line.rest);
            block.SetName(reader.NameWord(TakeWord(rest)));
            declaredX = TakeWord(rest);
            declaredY = rest;
            block.m_nAxisLengthX = ReadInteger(declaredX);
            block.m_nAxisLengthY = ReadInteger(declaredY);
            const std::int64_t values = std::int64_t{block.m_nAxisLengthX} * block.m_nAxisLengthY;
            ReservePoints({{block.m_vecAxisX, block.m_nAxisLengthX},
                           {block.m_vecAxisY, block.m_nAxisLengthY},
                           {block.m_vecValues, values}},
                          lines);
        } else if (ReadAttribute(line.keyword, TrimBlanksAndQuotes(line.rest), line.rest, reader,
                                 block)) {
            continue;
        } else if (line.Is(keyword::kEinheitX)) {
            block.m_strUnitX = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kEinheitY)) {
            block.m_strUnitY = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kEinheitW)) {
            block.m_strUnitW = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kSstX)) {
            block.m_strStuetzstellenverteilungX = reader.Reference(TrimBlanks(line.rest));
        } else if (line.Is(keyword::kSstY)) {
            block.m_strStuetzstellenverteilungY = reader.Reference(TrimBlanks(line.rest));
        } else {
            reader.UnknownLine();
        }
    }
    if (report != nullptr) {
        const std::size_t x = block.m_vecAxisX.size(), y = block.m_vecAxisY.size();
        if (report->Count(declaredX, block.m_nAxisLengthX) && (x > 0 || !report->HasReferenceX()))
            report->CompareCount(block.m_nAxisLengthX, x, L"points of X");
        if (report->Count(declaredY, block.m_nAxisLengthY) && (y > 0 || !report->HasReferenceY()))
            report->CompareCount(block.m_nAxisLengthY, y, L"points of Y");
        ReportGrid(*report, x, y, block.m_vecValues.size());
    }
    return S_OK;
}

HRESULT DCMKennfeld::AddValues(const CString& strRest, const CString& strKeyword)
{
    const auto targets = TargetsOf({m_vecAxisX, m_vtAxisXType}, {m_vecAxisY, m_vtAxisYType},
                                   {m_vecValues, m_vtValueType});
    const auto keyword = dcm::FileText::OfHost(strKeyword);
    const auto text = dcm::FileText::OfHost(strRest);
    dcm::PointReader(targets, text, nullptr).Read({keyword.Bytes(), text.Bytes()});
    return S_OK;
}

HRESULT DCMKennfeld::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    dcm::BlockIo::Compose(*this, block);
    dcm::DropBlankUnit(m_strUnitX);
    dcm::DropBlankUnit(m_strUnitY);
    dcm::DropBlankUnit(m_strUnitW);
    dcm::WriteText(block, file);
    return S_OK;
}

void dcm::BlockIo::Compose(const DCMKennfeld& block, FileTextBuilder& text)
{
    const std::size_t start = text.Size();
    text.Append(block.m_strKeyword).AppendAscii(" ").Append(block.GetName());
    const auto appendCount = [&](std::int32_t axisLength, std::size_t points) {
        if (axisLength > 0) {
            AppendCount(text, axisLength);
        } else {
            AppendCount(text, points);
        }
    };
    appendCount(block.m_nAxisLengthX, block.m_vecAxisX.size());
    appendCount(block.m_nAxisLengthY, block.m_vecAxisY.size());
    text.EndLine();
    ComposeAttributes(block, text);
    AppendUnitLine(text, keyword::kEinheitX, block.m_strUnitX);
    AppendUnitLine(text, keyword::kEinheitY, block.m_strUnitY);
    AppendUnitLine(text, keyword::kEinheitW, block.m_strUnitW);
    AppendSharedAxisLine(text, keyword::kSstX, block.m_strSharedXAxisUniqueName);
    AppendSharedAxisLine(text, keyword::kSstY, block.m_strSharedYAxisUniqueName);
    const std::size_t head = text.Size();
    AppendPointLines(text, block.m_vecAxisX, block.m_vecAxisY, block.m_vecValues);
    if (text.Size() == head) {
        // Without lines of points or values nothing at all is written.
        text.Truncate(start);
        return;
    }
    AppendEnd(text);
}

CString DCMKennfeld::ExportValues(PravFile&) const
{
    auto lines = dcm::FileTextBuilder::ForHost();
    AppendPointLines(lines, m_vecAxisX, m_vecAxisY, m_vecValues);
    return lines.Wide();
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
