#include "dcm/elements/stuetzstellenverteilung.h"

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

#include <string_view>
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
    return dcm::BlockIo::Read(dcm::HostBlock(strBlock).Block(), *this);
}

HRESULT dcm::BlockIo::Read(const FileBlock& lines, DCMStuetzstellenverteilung& block)
{
    // Numbers and texts are told apart by the quotes alone, not by the keyword.
    const PointArray values{block.m_vecValues, block.m_vtValueType};
    const FileText& text = lines.Text();
    BlockReader reader(lines);
    std::string_view declared;
    BlockLine line;
    while (reader.Next(line)) {
        if (line.Is(keyword::kStuetzstellenverteilung)) {
            std::string_view rest = TrimWhite(line.rest);
            block.SetName(reader.NameWord(TakeWord(rest)));
            declared = rest;
            ReservePoints({{block.m_vecValues, ReadInteger(rest)}}, lines);
        } else if (ReadAttribute(line.keyword, TrimBlanksAndQuotes(line.rest), line.rest, reader,
                                 block)) {
            continue;
        } else if (line.Is(keyword::kEinheitX)) {
            block.m_strUnit = reader.Attribute(TrimBlanksAndQuotes(line.rest));
        } else if (line.Is(keyword::kStX) || line.Is(keyword::kStTxX)) {
            ReadPoints(line.rest, text, &values, &values, reader.Report());
        } else if (line.Is(keyword::kStTxY) || line.Is(keyword::kText)) {
            if (reader.Report() != nullptr)
                reader.Report()->Rejected();
            return E_FAIL;
        } else {
            reader.UnknownLine();
        }
    }
    if (reader.Report() != nullptr)
        reader.Report()->CompareCount(declared, block.m_vecValues.size(), L"points");
    return S_OK;
}

HRESULT DCMStuetzstellenverteilung::AddValues(CString& strRest)
{
    const dcm::PointArray values{m_vecValues, m_vtValueType};
    const auto text = dcm::FileText::OfHost(strRest);
    dcm::ReadPoints(text.Bytes(), text, &values, &values, nullptr);
    strRest.Empty();
    return S_OK;
}

HRESULT DCMStuetzstellenverteilung::Export(PravFile& file)
{
    auto block = dcm::FileTextBuilder::ForFile();
    dcm::BlockIo::Compose(*this, block);
    dcm::DropBlankUnit(m_strUnit);
    dcm::WriteText(block, file);
    return S_OK;
}

void dcm::BlockIo::Compose(const DCMStuetzstellenverteilung& block, FileTextBuilder& text)
{
    text.Append(keyword::kStuetzstellenverteilung).AppendAscii(" ").Append(block.GetName());
    AppendCount(text, block.m_vecValues.size());
    text.EndLine().Append(keyword::kSst).EndLine();
    ComposeAttributes(block, text);
    AppendUnitLine(text, keyword::kEinheitX, block.m_strUnit);
    PointLines(text, kAxisX).AddGroup(block.m_vecValues);
    AppendEnd(text);
}

CString DCMStuetzstellenverteilung::ExportValues(PravFile&) const
{
    auto lines = dcm::FileTextBuilder::ForHost();
    dcm::PointLines(lines, dcm::kAxisX).AddGroup(m_vecValues);
    return lines.Wide();
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
