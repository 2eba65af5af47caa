#include "dcm/elements/kennlinie.h"

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
#include <string_view>
#include <utility>

namespace {

std::array<dcm::PointTarget, 2> TargetsOf(std::vector<CComVariant>& axis, VARTYPE& axisType,
                                          std::vector<CComVariant>& values, VARTYPE& valueType)
{
    return {{{dcm::kAxisX, {axis, axisType}}, {dcm::kValues, {values, valueType}}}};
}

/// Compares the count of the first line, `declared`, the points and the values. A curve may have
/// the points of a distribution and none of its own.
void ReportShape(dcm::BlockReport& report, std::string_view declared, std::int32_t count,
                 std::size_t points, std::size_t values)
{
    const std::size_t expected = points == 0 && report.HasReferenceX() ? values : points;
    if (report.Count(declared, count) && count != static_cast<std::int64_t>(expected))
        report.CountDiffers(count, expected, L"points");
    if (expected != values) {
        report.AddToBlock(dcm::FindingKind::kAxisAndValuesDiffer,
                          {L"The curve has ", points, L" axis points and ", values, L" values."});
    }
}

void AppendPointLines(dcm::FileTextBuilder& block, const std::vector<CComVariant>& axis,
                      const std::vector<CComVariant>& values)
{
    dcm::PointLines(block, dcm::kAxisX).AddGroup(axis);
    dcm::PointLines(block, dcm::kValues).AddGroup(values);
}

} // namespace

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
    return dcm::BlockIo::Read(dcm::HostBlock(strBlock).Block(), *this);
}

HRESULT dcm::BlockIo::Read(const FileBlock& lines, DCMKennlinie& block)
{
    const auto targets =
        TargetsOf(block.m_vecAxis, block.m_vtAxisType, block.m_vecValues, block.m_vtValueType);
    const FileText& text = lines.Text();
    BlockReader reader(lines);
    PointReader points(targets, text, reader.Report());
    std::string_view declared;
    BlockLine line;
    while (reader.Next(line)) {
        // Most lines of a file are lines of points.
        if (points.Read(line))
            continue;
        if (line.Is(block.m_strKeyword)) {
            // The name and the count; a line of one word is the count.
            std::string_view rest = TrimWhite(line.rest);
            block.SetName(reader.NameWord(TakeWord(rest)));
            declared = rest;
            block.m_nAxisLengthX = ReadInteger(rest);
            ReservePoints({{block.m_vecAxis, block.m_nAxisLengthX},
                           {block.m_vecValues, block.m_nAxisLengthX}},
                          lines);
        } else if (ReadAttribute(line.keyword, TrimBlanksAndQuotes(line.rest), line.rest, reader,
                                 block)) {
            continue;
        } else if (line.Is(keyword::kEinheitX)) {
            block.m_strUnitX = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kEinheitW)) {
            block.m_strUnitW = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kStTxY)) {
            if (reader.Report() != nullptr)
                reader.Report()->Rejected();
            return E_FAIL;
        } else if (line.Is(keyword::kSstX)) {
            block.m_strStuetzstellenverteilung = reader.Reference(TrimBlanks(line.rest));
        } else {
            reader.UnknownLine();
        }
    }
    if (reader.Report() != nullptr) {
        ReportShape(*reader.Report(), declared, block.m_nAxisLengthX, block.m_vecAxis.size(),
                    block.m_vecValues.size());
    }
    return S_OK;
}

HRESULT DCMKennlinie::AddValues(CString& strRest, const CString& strKeyword)
{
    const auto targets = TargetsOf(m_vecAxis, m_vtAxisType, m_vecValues, m_vtValueType);
    const auto keyword = dcm::FileText::OfHost(strKeyword);
    const auto text = dcm::FileText::OfHost(strRest);
    dcm::PointReader(targets, text, nullptr).Read({keyword.Bytes(), text.Bytes()});
    strRest.Empty();
    return S_OK;
}

HRESULT DCMKennlinie::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    dcm::BlockIo::Compose(*this, block);
    dcm::DropBlankUnit(m_strUnitX);
    dcm::DropBlankUnit(m_strUnitW);
    dcm::WriteText(block, file);
    return S_OK;
}

void dcm::BlockIo::Compose(const DCMKennlinie& block, FileTextBuilder& text)
{
    text.Append(block.m_strKeyword).AppendAscii(" ").Append(block.GetName());
    if (block.m_nAxisLengthX > 0) {
        AppendCount(text, block.m_nAxisLengthX);
    } else {
        AppendCount(text, block.m_vecValues.size());
    }
    text.EndLine();
    ComposeAttributes(block, text);
    AppendUnitLine(text, keyword::kEinheitX, block.m_strUnitX);
    AppendUnitLine(text, keyword::kEinheitW, block.m_strUnitW);
    AppendSharedAxisLine(text, keyword::kSstX, block.m_strSharedAxisUniqueName);
    AppendPointLines(text, block.m_vecAxis, block.m_vecValues);
    AppendEnd(text);
}

CString DCMKennlinie::ExportValues(PravFile&) const
{
    auto lines = dcm::FileTextBuilder::ForHost();
    AppendPointLines(lines, m_vecAxis, m_vecValues);
    return lines.Wide();
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
    if (strKeyword == dcm::keyword::kStX) {
        m_listAxis.push_back(dValue);
    } else if (strKeyword == dcm::keyword::kWert) {
        m_listValues.push_back(dValue);
    }
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
