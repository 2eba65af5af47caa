#pragma once

#include "dcm/elements/points.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <list>
#include <vector>

/// The fields of blocks that their members hand out as copies or not at all: references to them,
/// for code that moves them out of a block or into it. `BlockIo::FieldsOf` returns them.
namespace dcm {

struct ValueFields
{
    const CString& keyword;
    CComVariant& value;
};

struct ListFields
{
    std::vector<double>& numbers;
    std::list<CString>& texts;
};

struct DistributionFields
{
    PointArray points;
};

struct AxisFields
{
    PointArray points;
    /// The names of the distribution: the one that was read, and the one that is written.
    CString& read;
    CString& written;
};

struct CurveFields
{
    const CString& keyword;
    AxisFields x;
    PointArray values;
};

struct MapFields
{
    const CString& keyword;
    AxisFields x;
    AxisFields y;
    PointArray values;
};

} // namespace dcm
