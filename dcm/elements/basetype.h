#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"

class PravFile;

namespace dcm {
struct BlockIo;
} // namespace dcm

/// What every named block has: its name and three describing texts. Any text may be stored; it is
/// written as it is, so a line feed or double quote in it does not come back from a file.
class DCM_API DCMBaseType
{
public:
    /// Four empty texts.
    DCMBaseType();
    /// The four texts of the other block; one that was moved from has no defined content.
    DCMBaseType(const DCMBaseType&) = default;
    DCMBaseType(DCMBaseType&&) noexcept = default;
    DCMBaseType& operator=(const DCMBaseType&) = default;
    DCMBaseType& operator=(DCMBaseType&&) noexcept = default;
    virtual ~DCMBaseType();

    /// The name on the block's first line. The reference stays valid as long as the block and may
    /// be written through; so with the other texts.
    CString& GetName() { return m_strName; }
    const CString& GetName() const { return m_strName; }
    /// The text of the LANGNAME line without its double quotes.
    CString& GetLangname() { return m_strLangname; }
    const CString& GetLangname() const { return m_strLangname; }
    /// The text of the DISPLAYNAME line without its double quotes; empty when there is none.
    CString& GetDisplayname() { return m_strDisplayname; }
    const CString& GetDisplayname() const { return m_strDisplayname; }
    /// The text of the FUNKTION line; empty when there is none.
    CString& GetFunction() { return m_strFunction; }
    const CString& GetFunction() const { return m_strFunction; }

    /// Stores a copy of the text, unchecked.
    void SetName(const CString& strName) { m_strName = strName; }
    void SetLangname(const CString& strLangname) { m_strLangname = strLangname; }
    void SetDisplayname(const CString& strDisplayname) { m_strDisplayname = strDisplayname; }
    void SetFunction(const CString& strFunction) { m_strFunction = strFunction; }

protected:
    /// The line of one text with its line feed. LANGNAME always has a line, the other two when
    /// they are not empty. The file is not written to.
    CString ExportLangname(PravFile& file) const;
    CString ExportDisplayname(PravFile& file) const;
    CString ExportFunktion(PravFile& file) const;

private:
    friend struct dcm::BlockIo;

    CString m_strName;
    CString m_strLangname;
    CString m_strDisplayname;
    CString m_strFunction;
};
