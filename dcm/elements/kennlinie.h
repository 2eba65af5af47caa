#pragma once

#include "dcm/elements/basetype.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <cstdint>
#include <list>
#include <vector>

/// One KENNLINIE: a curve of axis points and the values over them, each with a unit.
///
/// The arrays of variants are what files are read into and written from. Apart from them a host
/// may keep lists of plain numbers in the curve; they are not part of any file.
///
/// Each array has one type: the tag of its first item. From the first item of another tag on, the
/// type and each further item are `VT_ERROR` without a value; such items count but are not
/// written.
class DCM_API DCMKennlinie : public DCMBaseType
{
public:
    /// Empty texts, no points, axis length 0.
    DCMKennlinie();
    /// Copies include the keyword and have texts of their own. A curve that was moved from has
    /// no defined content.
    DCMKennlinie(const DCMKennlinie&) = default;
    DCMKennlinie(DCMKennlinie&&) noexcept = default;
    /// As construction does. The curve is as it was when memory runs out.
    DCMKennlinie& operator=(const DCMKennlinie& other);
    DCMKennlinie& operator=(DCMKennlinie&&) noexcept = default;
    ~DCMKennlinie() override;

    /// Reads one block from its lines, each ended by one line feed, and appends to the points
    /// already held. Unknown lines and items of the wrong kind are skipped; a number that cannot
    /// be read becomes 0; a first line without a count gives an empty name. Returns 0, or `E_FAIL`
    /// at a line of Y axis points as texts, which keeps what was read before it.
    HRESULT Init(const CString& strBlock);

    /// Writes the block in one piece, five items a line, axis points first; only numbers (`VT_R8`)
    /// and texts are written. The count on the first line is the axis length if greater than 0,
    /// otherwise the number of values. Line ends, tabs and backspaces in texts become full stops.
    /// A unit of one blank is written as an empty one and is empty afterwards. Returns 0; a failed
    /// write is thrown as `CFileException`.
    HRESULT Export(PravFile& file);

    /// Appends a copy of one value or axis point: `VT_R8`, `VT_R4` and `VT_BSTR` keep their value.
    /// Returns 0.
    HRESULT AddValue(VARIANT value);
    HRESULT AddAxis(VARIANT value);
    /// Replaces the content of the array by copies, in order; texts are the array's own and go
    /// with it. Returns 0.
    HRESULT GetAxis(std::vector<CComVariant>& axis) const;
    HRESULT GetValues(std::vector<CComVariant>& values) const;
    /// The common tag of the items; 0 while there is none, `VT_ERROR` when they differ.
    VARTYPE GetAxisType() const { return m_vtAxisType; }
    VARTYPE GetValueType() const { return m_vtValueType; }

    /// Appends a number to the host's own lists: "ST/X" to that of the axis, "WERT" to that of the
    /// values, in just this spelling; any other keyword does nothing.
    void AddValue(double dValue, const CString& strKeyword);
    /// Copies of the host's own lists.
    std::list<double> GetAxis() const { return m_listAxis; }
    std::list<double> GetValues() const { return m_listValues; }

    /// The count on the first line. It is not compared with the points.
    std::int32_t GetAxisLenghtX() const { return m_nAxisLengthX; }
    /// Any number is stored; one of 0 or less leaves the count to the values.
    void SetAxisLenghtX(std::int32_t nLength) { m_nAxisLengthX = nLength; }

    /// Texts of EINHEIT_X and EINHEIT_W as they are in the file, not interpreted; may be empty.
    /// The references stay valid as long as the block and may be written through.
    CString& GetUnit_X() { return m_strUnitX; }
    const CString& GetUnit_X() const { return m_strUnitX; }
    CString& GetUnit_W() { return m_strUnitW; }
    const CString& GetUnit_W() const { return m_strUnitW; }
    /// Stores a copy of the unit, unchecked; empty for none.
    void SetUnit_X(const CString& strUnit) { m_strUnitX = strUnit; }
    void SetUnit_W(const CString& strUnit) { m_strUnitW = strUnit; }

    /// The distribution that the written block names on its *SSTX line; no line when empty. What
    /// was read is not written unless it is set here.
    void SetSharedAxisUniqueName(const CString& strName) { m_strSharedAxisUniqueName = strName; }
    /// The distribution that the block read from a file names; empty when it names none.
    CString GetStuetzstellenverteilung() const { return m_strStuetzstellenverteilung; }

private:
    friend struct dcm::BlockIo;

    /// Reads what follows the keyword of one line of points or values and appends it. `strRest` is
    /// empty afterwards. Returns 0.
    HRESULT AddValues(CString& strRest, const CString& strKeyword);
    /// The lines of points and values. The file is not written to.
    CString ExportValues(PravFile& file) const;

    CString m_strUnitX;
    CString m_strUnitW;

protected:
    /// The first word of the block, of ASCII.
    CString m_strKeyword;

private:
    CString m_strSharedAxisUniqueName;
    std::list<double> m_listAxis;
    std::list<double> m_listValues;
    std::vector<CComVariant> m_vecAxis;
    std::vector<CComVariant> m_vecValues;
    VARTYPE m_vtValueType = VT_EMPTY;
    VARTYPE m_vtAxisType = VT_EMPTY;
    std::int32_t m_nAxisLengthX = 0;
    CString m_strStuetzstellenverteilung;
};

/// One FESTKENNLINIE: the same under another keyword.
class DCM_API DCMFestkennlinie : public DCMKennlinie
{
public:
    /// Empty texts, no points.
    DCMFestkennlinie();
    /// As for `DCMKennlinie`.
    DCMFestkennlinie(const DCMFestkennlinie&) = default;
    DCMFestkennlinie(DCMFestkennlinie&&) noexcept = default;
    DCMFestkennlinie& operator=(const DCMFestkennlinie&) = default;
    DCMFestkennlinie& operator=(DCMFestkennlinie&&) noexcept = default;
    ~DCMFestkennlinie() override;
};

/// One GRUPPENKENNLINIE: a curve over the axis of a distribution.
class DCM_API DCMGruppenkennlinie : public DCMKennlinie
{
public:
    /// Empty texts, no points.
    DCMGruppenkennlinie();
    /// As for `DCMKennlinie`.
    DCMGruppenkennlinie(const DCMGruppenkennlinie&) = default;
    DCMGruppenkennlinie(DCMGruppenkennlinie&&) noexcept = default;
    DCMGruppenkennlinie& operator=(const DCMGruppenkennlinie&) = default;
    DCMGruppenkennlinie& operator=(DCMGruppenkennlinie&&) noexcept = default;
    ~DCMGruppenkennlinie() override;
};
