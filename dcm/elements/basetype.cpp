#include "dcm/elements/basetype.h"

#include "dcm/elements/block_text.h"
#include "dcm/elements/keywords.h"
#include "dcm/platform/text.h"

DCMBaseType::DCMBaseType() = default;

DCMBaseType::~DCMBaseType() = default;

CString DCMBaseType::ExportLangname(PravFile&) const
{
    CString line;
    AppendLangname(line);
    return line;
}

CString DCMBaseType::ExportDisplayname(PravFile&) const
{
    CString line;
    AppendDisplayname(line);
    return line;
}

CString DCMBaseType::ExportFunktion(PravFile&) const
{
    CString line;
    AppendFunktion(line);
    return line;
}

void DCMBaseType::AppendAttributes(CString& block) const
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

void DCMBaseType::AppendLangname(CString& block) const
{
    dcm::AppendQuotedLine(block, dcm::keyword::kLangname, m_strLangname);
}

void DCMBaseType::AppendDisplayname(CString& block) const
{
    if (!m_strDisplayname.IsEmpty())
        dcm::AppendQuotedLine(block, dcm::keyword::kDisplayname, m_strDisplayname);
}

void DCMBaseType::AppendFunktion(CString& block) const
{
    if (!m_strFunction.IsEmpty())
        dcm::AppendLine(block, dcm::keyword::kFunktion, m_strFunction);
}
