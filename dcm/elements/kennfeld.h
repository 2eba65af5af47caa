#pragma once

#include "dcm/elements/basetype.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <cstdint>
#include <vector>

/// One KENNFELD: a map of values over the points of two axes, each of the three with a unit.
///
/// The values are in row order: first the row of the first Y axis point, with one value for each X
/// axis point, then that of the second. The value at X index i and Y index j has the index
/// j * (number of X axis points) + i.
///
/// Each array has one type: the tag of its first item. From the first item of another tag on, the
/// type and each further item are `VT_ERROR` without a value; such items keep their place but are
/// not written.
class DCM_API DCMKennfeld : public DCMBaseType
{
public:
    /// Empty texts, no points, axis lengths 0.
    DCMKennfeld();
    /// Copies include the keyword and have texts of their own. A map that was moved from has no
    /// defined content.
    DCMKennfeld(const DCMKennfeld&) = default;
    DCMKennfeld(DCMKennfeld&&) noexcept = default;
    /// As construction does. The map is as it was when memory runs out.
    DCMKennfeld& operator=(const DCMKennfeld& other);
    DCMKennfeld& operator=(DCMKennfeld&&) noexcept = default;
    ~DCMKennfeld() override;

    /// Reads one block from its lines, each ended by one line feed, and appends to the points
    /// already held, values in the order of their lines. Unknown lines and items of the wrong kind
    /// are skipped; a number that cannot be read becomes 0. The first line is a name and two
    /// counts; a single count is that of the Y axis, and without any the name is empty. Returns 0.
    HRESULT Init(const CString& strBlock);

    /// Writes the block in one piece: the X axis, then each Y axis point with its row, five items
    /// a line; only numbers (`VT_R8`) and texts are written, and only one value for each pair of
    /// axis points. Nothing at all is written when the values are too few for the axes. The counts
    /// on the first line are the axis lengths where greater than 0, otherwise the numbers of axis
    /// points. Line ends, tabs and backspaces in texts become full stops. A unit of one blank is
    /// written as an empty one and is empty afterwards. Returns 0; a failed write is thrown as
    /// `CFileException`.
    HRESULT Export(PravFile& file);

    /// Appends a copy of one value or axis point: `VT_R8`, `VT_R4` and `VT_BSTR` keep their value.
    /// Returns 0.
    HRESULT AddValue(VARIANT value);
    HRESULT AddAxisX(VARIANT value);
    HRESULT AddAxisY(VARIANT value);
    /// Replaces the content of the array by copies, in order; texts are the array's own and go
    /// with it. Returns 0.
    HRESULT GetAxis_X(std::vector<CComVariant>& axis) const;
    HRESULT GetAxis_Y(std::vector<CComVariant>& axis) const;
    HRESULT GetValues(std::vector<CComVariant>& values) const;
    /// The common tag of the items; 0 while there is none, `VT_ERROR` when they differ.
    VARTYPE GetAxis_XType() const { return m_vtAxisXType; }
    VARTYPE GetAxis_YType() const { return m_vtAxisYType; }
    VARTYPE GetValueType() const { return m_vtValueType; }

    /// The counts on the first line. They are not compared with the points.
    std::int32_t GetAxisLenghtX() const { return m_nAxisLengthX; }
    std::int32_t GetAxisLenghtY() const { return m_nAxisLengthY; }
    /// Any number is stored; one of 0 or less leaves the count to the points of the axis.
    void SetAxisLenghtX(std::int32_t nLength) { m_nAxisLengthX = nLength; }
    void SetAxisLenghtY(std::int32_t nLength) { m_nAxisLengthY = nLength; }

    /// Texts of EINHEIT_X, EINHEIT_Y and EINHEIT_W as they are in the file, not interpreted; may
    /// be empty. The references stay valid as long as the block and may be written through.
    CString& GetUnit_X() { return m_strUnitX; }
    const CString& GetUnit_X() const { return m_strUnitX; }
    CString& GetUnit_Y() { return m_strUnitY; }
    const CString& GetUnit_Y() const { return m_strUnitY; }
    CString& GetUnit_W() { return m_strUnitW; }
    const CString& GetUnit_W() const { return m_strUnitW; }
    /// Stores a copy of the unit, unchecked; empty for none.
    void SetUnit_X(const CString& strUnit) { m_strUnitX = strUnit; }
    void SetUnit_Y(const CString& strUnit) { m_strUnitY = strUnit; }
    void SetUnit_W(const CString& strUnit) { m_strUnitW = strUnit; }

    /// The distributions that the written block names on its *SSTX and *SSTY lines; no line where
    /// empty. What was read is not written unless it is set here.
    void SetSharedXAxisUniqueName(const CString& strName) { m_strSharedXAxisUniqueName = strName; }
    void SetSharedYAxisUniqueName(const CString& strName) { m_strSharedYAxisUniqueName = strName; }
    /// The distributions that the block read from a file names; empty where it names none.
    CString GetStuetzstellenverteilungX() const { return m_strStuetzstellenverteilungX; }
    CString GetStuetzstellenverteilungY() const { return m_strStuetzstellenverteilungY; }

    /// Does nothing; the map keeps its orientation.
    void RotateMap();

protected:
    /// Reads what follows the keyword of one line of points or values and appends it. Returns 0.
    HRESULT AddValues(const CString& strRest, const CString& strKeyword);
    /// The lines of points and values; empty when the values are too few for the axes. The file is
    /// not written to.
    CString ExportValues(PravFile& file) const;

private:
    friend struct dcm::BlockIo;

    CString m_strUnitX;
    CString m_strUnitY;
    CString m_strUnitW;

protected:
    /// The first word of the block, of ASCII.
    CString m_strKeyword;

private:
    CString m_strSharedXAxisUniqueName;
    CString m_strSharedYAxisUniqueName;
    std::vector<CComVariant> m_vecAxisX;
    std::vector<CComVariant> m_vecAxisY;
    std::vector<CComVariant> m_vecValues;
    VARTYPE m_vtValueType = VT_EMPTY;
    VARTYPE m_vtAxisXType = VT_EMPTY;
    VARTYPE m_vtAxisYType = VT_EMPTY;
    std::int32_t m_nAxisLengthX = 0;
    std::int32_t m_nAxisLengthY = 0;
    CString m_strStuetzstellenverteilungX;
    CString m_strStuetzstellenverteilungY;
};

/// One FESTKENNFELD: the same under another keyword.
class DCM_API DCMFestkennfeld : public DCMKennfeld
{
public:
    /// Empty texts, no points.
    DCMFestkennfeld();
    /// As for `DCMKennfeld`.
    DCMFestkennfeld(const DCMFestkennfeld&) = default;
    DCMFestkennfeld(DCMFestkennfeld&&) noexcept = default;
    DCMFestkennfeld& operator=(const DCMFestkennfeld&) = default;
    DCMFestkennfeld& operator=(DCMFestkennfeld&&) noexcept = default;
    ~DCMFestkennfeld() override;
};

/// One GRUPPENKENNFELD: a map over the axes of distributions.
class DCM_API DCMGruppenkennfeld : public DCMKennfeld
{
public:
    /// Empty texts, no points.
    DCMGruppenkennfeld();
    /// As for `DCMKennfeld`.
    DCMGruppenkennfeld(const DCMGruppenkennfeld&) = default;
    DCMGruppenkennfeld(DCMGruppenkennfeld&&) noexcept = default;
    DCMGruppenkennfeld& operator=(const DCMGruppenkennfeld&) = default;
    DCMGruppenkennfeld& operator=(DCMGruppenkennfeld&&) noexcept = default;
    ~DCMGruppenkennfeld() override;
};
