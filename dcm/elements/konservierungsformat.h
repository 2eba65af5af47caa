#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

class PravFile;

/// The line that declares the version of the format.
class DCM_API DCMKonservierungsFormat
{
public:
    /// Version 0.0.
    DCMKonservierungsFormat();
    /// The version of the other object.
    DCMKonservierungsFormat(const DCMKonservierungsFormat&) = default;
    DCMKonservierungsFormat& operator=(const DCMKonservierungsFormat&) = default;
    virtual ~DCMKonservierungsFormat();

    /// Reads the version after the keyword, with or without double quotes; a word that is not
    /// a number gives 0.0, any other text changes nothing. Returns 0.
    HRESULT Init(const CString& strBlock);

    /// The version in memory; any number may be stored.
    void SetValue(double dValue) { m_dValue = dValue; }
    double GetValue() const { return m_dValue; }

    /// Writes the line and an empty one. The version written is always 2.0, not the value in
    /// memory.
    /// Returns 0; a failed write is thrown as `CFileException`.
    HRESULT Export(PravFile& file) const;

private:
    double m_dValue = 0.0;
};
