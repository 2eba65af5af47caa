#pragma once

#include "dcm/elements/basetype.h"
#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <cstdint>
#include <list>
#include <vector>

/// One FESTWERTEBLOCK: a named list of values, or rows of equal length, with one unit. It holds
/// numbers and texts apart; only the numbers are written when there are any.
class DCM_API DCMFestwerteblock : public DCMBaseType
{
public:
    /// Empty texts, no values, both counts 0.
    DCMFestwerteblock();
    /// All of the other block; one that was moved from has no defined content.
    DCMFestwerteblock(const DCMFestwerteblock&) = default;
    DCMFestwerteblock(DCMFestwerteblock&&) noexcept = default;
    /// As construction does. The block is as it was when memory runs out.
    DCMFestwerteblock& operator=(const DCMFestwerteblock& other);
    DCMFestwerteblock& operator=(DCMFestwerteblock&&) noexcept = default;
    ~DCMFestwerteblock() override;

    /// Reads one block from its lines, each ended by one line feed, and appends to the values
    /// already held. Unknown lines are skipped; a number that cannot be read becomes 0. Counts
    /// are read from "X @ Y" only and not compared with the values. Returns 0; a WERT line without
    /// a value throws `E_INVALIDARG`; what was read before it stays.
    HRESULT Init(const CString& strBlock);

    /// Writes the block in one piece: five values a line, or one row a line when both counts are
    /// greater than 0, then with 15 significant digits. Line ends in texts become full stops. A
    /// unit of one blank is written as an empty one and is empty afterwards. Returns 0; a failed
    /// write is thrown as `CFileException`.
    HRESULT Export(PravFile& file);

    /// Appends a number, or a text; the counts stay. A host that builds rows appends them one
    /// after the other and sets both counts.
    void AddValue(double dValue);
    void AddValue(const CString& strValue);
    /// Values row after row: GetYValueCount() rows of GetXValueCount() values; one list when
    /// either count is 0. A copy; changing it leaves the block as is.
    std::list<double> GetDoubleValues() const
    {
        return {m_vecDoubleValues.begin(), m_vecDoubleValues.end()};
    }
    /// The same for the texts: what TEXT lines hold, in order.
    std::list<CString> GetStringValues() const { return m_listStringValues; }

    /// Text of EINHEIT_W as it is in the file, not interpreted; may be empty. The reference
    /// stays valid as long as the block and may be written through.
    CString& GetUnit() { return m_strUnit; }
    const CString& GetUnit() const { return m_strUnit; }
    /// Stores a copy of the unit, unchecked; empty for none.
    void SetUnit(const CString& strUnit) { m_strUnit = strUnit; }

    /// Values in a row and number of rows; 0 for a one-dimensional block.
    std::int32_t GetXValueCount() const { return m_nXValueCount; }
    std::int32_t GetYValueCount() const { return m_nYValueCount; }
    /// Any number is stored; one of 0 or less makes the block one-dimensional.
    void SetXValueCount(std::int32_t nCount) { m_nXValueCount = nCount; }
    void SetYValueCount(std::int32_t nCount) { m_nYValueCount = nCount; }

private:
    friend struct dcm::BlockIo;

    /// Reads the numbers or quoted texts of one line and appends them. `strRest` is empty
    /// afterwards. Returns 0; throws `E_INVALIDARG` for an empty text.
    HRESULT AddValues(CString& strRest);
    /// The same for a text that begins with a double quote; any other has no values.
    HRESULT AddStringValues(CString& strRest);
    /// The lines of values. The file is not written to.
    CString ExportValues(PravFile& file) const;
    /// The lines of values, one row a line.
    CString ExportValues2D() const;

    CString m_strUnit;
    /// Lists in the interface; an array here, since a list takes four times the memory.
    std::vector<double> m_vecDoubleValues;
    std::list<CString> m_listStringValues;
    std::int32_t m_nXValueCount = 0;
    std::int32_t m_nYValueCount = 0;
};
