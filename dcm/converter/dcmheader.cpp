#include "dcm/converter/dcmheader.h"

#include "dcm/textfile/pravfile.h"

DCMHeader::DCMHeader() = default;

DCMHeader::~DCMHeader() = default;

HRESULT DCMHeader::SetText(const CString& strText)
{
    m_strText = strText;
    return S_OK;
}

HRESULT DCMHeader::Export(PravFile& file) const
{
    file.WriteText(m_strText + L"\n\n");
    return S_OK;
}
