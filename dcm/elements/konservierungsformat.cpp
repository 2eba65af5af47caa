#include "dcm/elements/konservierungsformat.h"

#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/pravfile.h"

#include <string_view>

DCMKonservierungsFormat::DCMKonservierungsFormat() = default;

DCMKonservierungsFormat::~DCMKonservierungsFormat() = default;

HRESULT DCMKonservierungsFormat::Init(const CString& strBlock)
{
    const auto block = dcm::FileText::OfHost(strBlock);
    const std::string_view text = block.Bytes();
    const std::size_t blank = text.find(' ');
    if (blank == text.npos)
        return S_OK;
    if (dcm::EqualsNoCase(text.substr(0, blank), dcm::keyword::kKonservierungFormat))
        m_dValue = dcm::ReadDecimal(dcm::TrimBlanksAndQuotes(text.substr(blank + 1)));
    return S_OK;
}

HRESULT DCMKonservierungsFormat::Export(PravFile& file) const
{
    CString line(dcm::keyword::kKonservierungFormat);
    line += L" 2.0\n\n";
    file.WriteText(line);
    return S_OK;
}
