#pragma once

#include "dcm/elements/basetype.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <type_traits>

/// One FESTWERT: a named single value, a number or a text, with its unit.
class DCM_API DCMFestwert : public DCMBaseType
{
public:
    /// Empty texts and no value.
    DCMFestwert();
    /// Copies include the keyword: a copy of a TEXTSTRING writes a TEXTSTRING. A block that was
    /// moved from has no defined content. Throws when the text of the value cannot be copied.
    DCMFestwert(const DCMFestwert&) = default;
    DCMFestwert(DCMFestwert&&) noexcept = default;
    /// As construction does. When the text of the value cannot be copied, the value becomes
    /// `VT_ERROR` with the failure code, and the failure is thrown.
    DCMFestwert& operator=(const DCMFestwert&) = default;
    DCMFestwert& operator=(DCMFestwert&&) noexcept = default;
    ~DCMFestwert() override;

    /// Reads one block from its lines, each ended by one line feed. A line sets what it names,
    /// the rest stays; unknown lines are skipped. A WERT that is no number reads as 0; the TEXT
    /// "true" is the number 1, "false" the number 0. Returns 0.
    HRESULT Init(const CString& strBlock);

    /// Writes the block in one piece. A text gives a TEXT line; its line ends become full stops.
    /// Any other value gives a WERT line with its number: that of an integer or a float, 1.0 or 0.0
    /// of a truth value, days of a date, units of a currency; 0.0 of a value without a number.
    /// A unit of one blank is written as an empty one and is empty afterwards. Returns 0; a failed
    /// write is thrown as `CFileException`.
    HRESULT Export(PravFile& file);

    /// Replaces the content of `pValue`, an initialised variant, by a copy of the value; the caller
    /// releases it. Returns 0, `E_POINTER` for null, or the code of a failure to clear `pValue`,
    /// which is then left alone.
    HRESULT GetValue(VARIANT* pValue) const;
    /// Stores a copy of the value; every tag is allowed. Returns 0, or `E_POINTER` for null. When a
    /// text cannot be copied the value becomes `VT_ERROR`, and the failure is thrown.
    HRESULT SetValue(const VARIANT& value) { return SetValue(&value); }
    HRESULT SetValue(const VARIANT* pValue);
    /// Stores a number or truth value; returns 0. A literal zero is a number, `nullptr` is not.
    template <class Number>
    HRESULT SetValue(Number value) requires std::is_arithmetic_v<Number>
    {
        return SetValue(CComVariant(value));
    }
    /// The tag of the value: `VT_EMPTY` without one, `VT_R8` for a number, `VT_BSTR` for a text.
    VARTYPE GetValueType() const { return m_value.vt; }

    /// Text of EINHEIT_W as it is in the file, not interpreted; may be empty. The reference
    /// stays valid as long as the block and may be written through.
    CString& GetUnit() { return m_strUnit; }
    const CString& GetUnit() const { return m_strUnit; }
    /// Stores a copy of the unit, unchecked; empty for none.
    void SetUnit(const CString& strUnit) { m_strUnit = strUnit; }

protected:
    /// The first word of the block, of ASCII.
    CString m_strKeyword;

private:
    friend struct dcm::BlockIo;

    CString m_strUnit;
    CComVariant m_value;
};

/// One TEXTSTRING: the same under another keyword.
class DCM_API DCMTextstring : public DCMFestwert
{
public:
    /// Empty texts and no value.
    DCMTextstring();
    /// As for `DCMFestwert`.
    DCMTextstring(const DCMTextstring&) = default;
    DCMTextstring(DCMTextstring&&) noexcept = default;
    DCMTextstring& operator=(const DCMTextstring&) = default;
    DCMTextstring& operator=(DCMTextstring&&) noexcept = default;
    ~DCMTextstring() override;
};
