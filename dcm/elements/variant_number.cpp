#include "dcm/elements/variant_number.h"

namespace dcm {

namespace {

/// A currency is an integer; this many are one unit.
constexpr double kCurrencyUnit = 10'000.0;

} // namespace

std::optional<double> NumberOf(const VARIANT& value) noexcept
{
    switch (value.vt) {
    case VT_R8:
        return value.dblVal;
    case VT_R4:
        return static_cast<double>(value.fltVal);
    case VT_BOOL:
        return value.boolVal != VARIANT_FALSE ? 1.0 : 0.0;
    case VT_I1:
        return static_cast<signed char>(value.cVal);
    case VT_UI1:
        return value.bVal;
    case VT_I2:
        return value.iVal;
    case VT_UI2:
        return value.uiVal;
    case VT_I4:
    case VT_INT:
        return value.lVal;
    case VT_UI4:
    case VT_UINT:
        return value.ulVal;
    case VT_I8:
        return static_cast<double>(value.llVal);
    case VT_UI8:
        return static_cast<double>(value.ullVal);
    case VT_DATE:
        return value.date;
    case VT_CY:
        return static_cast<double>(value.cyVal.int64) / kCurrencyUnit;
    default:
        return std::nullopt;
    }
}

} // namespace dcm
