#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

class PravFile;

/// The text at the top of an exported file.
class DCM_API DCMHeader
{
public:
    /// An empty text.
    DCMHeader();
    /// The text of the other header.
    DCMHeader(const DCMHeader&) = default;
    DCMHeader(DCMHeader&&) noexcept = default;
    DCMHeader& operator=(const DCMHeader&) = default;
    DCMHeader& operator=(DCMHeader&&) noexcept = default;
    virtual ~DCMHeader();

    /// Replaces the text. Comment lines must begin with "* ". Returns 0.
    HRESULT SetText(const CString& strText);

    /// Writes the text and two line ends, also for an empty text. Returns 0; a failed write is
    /// thrown as `CFileException`.
    HRESULT Export(PravFile& file) const;

private:
    CString m_strText;
};
