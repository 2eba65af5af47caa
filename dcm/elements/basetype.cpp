#include "dcm/elements/basetype.h"

#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/platform/text.h"

DCMBaseType::DCMBaseType() = default;

DCMBaseType::~DCMBaseType() = default;

CString DCMBaseType::ExportLangname(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendLangname(line);
    return line.Wide();
}

CString DCMBaseType::ExportDisplayname(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendDisplayname(line);
    return line.Wide();
}

CString DCMBaseType::ExportFunktion(PravFile&) const
{
    auto line = dcm::FileTextBuilder::ForHost();
    AppendFunktion(line);
    return line.Wide();
}

void DCMBaseType::AppendAttributes(dcm::FileTextBuilder& block) const
{
    AppendLangname(block);
    AppendDisplayname(block);
    AppendFunktion(block);
}

bool DCMBaseType::ReadAttribute(std::string_view keyword, dcm::FileTextView value,
                                dcm::FileTextView function)
{
    if (dcm::EqualsNoCase(keyword, dcm::keyword::kLangname))
        m_strLangname = value.SharedWide();
    else if (dcm::EqualsNoCase(keyword, dcm::keyword::kDisplayname))
        m_strDisplayname = value.SharedWide();
    else if (dcm::EqualsNoCase(keyword, dcm::keyword::kFunktion))
        m_strFunction = function.SharedWide();
    else
        return false;
    return true;
}

void DCMBaseType::AppendLangname(dcm::FileTextBuilder& block) const
{
    dcm::AppendQuotedLine(block, dcm::keyword::kLangname, m_strLangname);
}

void DCMBaseType::AppendDisplayname(dcm::FileTextBuilder& block) const
{
    if (!m_strDisplayname.IsEmpty())
        dcm::AppendQuotedLine(block, dcm::keyword::kDisplayname, m_strDisplayname);
}

void DCMBaseType::AppendFunktion(dcm::FileTextBuilder& block) const
{
    if (!m_strFunction.IsEmpty())
        dcm::AppendLine(block, dcm::keyword::kFunktion, m_strFunction);
}
