#include "dcm/elements/basetype.h"

#include "dcm/elements/block_io.h"
#include "dcm/elements/block_reader.h"
#include "dcm/elements/block_writer.h"
#include "dcm/elements/keywords.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"

namespace {

void AppendLangname(dcm::FileTextBuilder& block, const CString& text)
{
    dcm::AppendQuotedLine(block, dcm::keyword::kLangname, text);
}

void AppendDisplayname(dcm::FileTextBuilder& block, const CString& text)
{
    if (!text.IsEmpty())
        dcm::AppendQuotedLine(block, dcm::keyword::kDisplayname, text);
}

void AppendFunktion(dcm::FileTextBuilder& block, const CString& text)
{
    if (!text.IsEmpty())
        dcm::AppendLine(block, dcm::keyword::kFunktion, text);
}

} // namespace

DCMBaseType::DCMBaseType() = default;

DCMBaseType::~DCMBaseType() = default;

CString DCMBaseType::ExportLangname(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendLangname(line, m_strLangname);
    return line.Wide();
}

CString DCMBaseType::ExportDisplayname(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendDisplayname(line, m_strDisplayname);
    return line.Wide();
}

CString DCMBaseType::ExportFunktion(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendFunktion(line, m_strFunction);
    return line.Wide();
}

bool dcm::BlockIo::ReadAttribute(std::string_view keyword, std::string_view value,
                                 std::string_view function, const BlockReader& reader,
                                 DCMBaseType& block)
{
    if (EqualsNoCase(keyword, keyword::kLangname)) {
        block.m_strLangname = reader.Attribute(value);
    } else if (EqualsNoCase(keyword, keyword::kDisplayname)) {
        block.m_strDisplayname = reader.Attribute(value);
    } else if (EqualsNoCase(keyword, keyword::kFunktion)) {
        block.m_strFunction = reader.Attribute(function);
    } else {
        return false;
    }
    return true;
}

void dcm::BlockIo::ComposeAttributes(const DCMBaseType& block, FileTextBuilder& text)
{
    AppendLangname(text, block.m_strLangname);
    AppendDisplayname(text, block.m_strDisplayname);
    AppendFunktion(text, block.m_strFunction);
}
