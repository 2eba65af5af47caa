#pragma once

#include "dcm/elements/basetype.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <vector>

/// One STUETZSTELLENVERTEILUNG: a named list of axis points that curves and maps share by naming
/// it.
///
/// The points have one type: the tag of the first. From the first point of another tag on, the
/// type and each further point are `VT_ERROR` without a value; such points count but are not
/// written.
class DCM_API DCMStuetzstellenverteilung : public DCMBaseType
{
public:
    /// Empty texts, no points.
    DCMStuetzstellenverteilung();
    /// Each copy has texts of its own. A distribution that was moved from has no defined content.
    DCMStuetzstellenverteilung(const DCMStuetzstellenverteilung&) = default;
    DCMStuetzstellenverteilung(DCMStuetzstellenverteilung&&) noexcept = default;
    /// As construction does. The distribution is as it was when memory runs out.
    DCMStuetzstellenverteilung& operator=(const DCMStuetzstellenverteilung& other);
    DCMStuetzstellenverteilung& operator=(DCMStuetzstellenverteilung&&) noexcept = default;
    ~DCMStuetzstellenverteilung() override;

    /// Reads one block from its lines, each ended by one line feed, and appends to the points
    /// already held. Unknown lines are skipped; a number that cannot be read becomes 0; a first
    /// line without a count gives an empty name. Returns 0, or `E_FAIL` at a line of values or Y
    /// axis points as texts, which keeps what was read before it.
    HRESULT Init(const CString& strBlock);

    /// Writes the block in one piece, five points a line; only numbers (`VT_R8`) and texts are
    /// written. Line ends, tabs and backspaces in texts become full stops. A unit of one blank is
    /// written as an empty one and is empty afterwards. Returns 0; a failed write is thrown as
    /// `CFileException`.
    HRESULT Export(PravFile& file);

    /// Appends a copy of one point: `VT_R8`, `VT_R4` and `VT_BSTR` keep their value. Returns 0.
    HRESULT AddValue(CComVariant value);
    /// Replaces the content of the array by copies of the points, in order; texts are the array's
    /// own and go with it. Returns 0.
    HRESULT GetValues(std::vector<CComVariant>& values) const;
    /// The common tag of the points; 0 while there is none, `VT_ERROR` when they differ.
    VARTYPE GetValueType() const { return m_vtValueType; }

    /// Text of EINHEIT_X as it is in the file, not interpreted; may be empty. The reference
    /// stays valid as long as the block and may be written through.
    CString& GetUnit() { return m_strUnit; }
    const CString& GetUnit() const { return m_strUnit; }
    /// Stores a copy of the unit, unchecked; empty for none.
    void SetUnit(const CString& strUnit) { m_strUnit = strUnit; }

private:
    friend struct dcm::BlockIo;

    /// Reads the numbers or quoted texts of one line and appends them. `strRest` is empty
    /// afterwards. Returns 0.
    HRESULT AddValues(CString& strRest);
    /// The lines of points. The file is not written to.
    CString ExportValues(PravFile& file) const;

    CString m_strUnit;
    std::vector<CComVariant> m_vecValues;
    VARTYPE m_vtValueType = VT_EMPTY;
};
