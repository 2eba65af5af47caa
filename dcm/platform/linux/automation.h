#pragma once

#include "dcm/library/export.h"

#include <cstdint>

/// @file
/// Result codes, variants and their texts, named as on Windows and with the same meaning.

/// Types of arguments and results, named as on Windows.
using BOOL = int;
using UINT = unsigned int;
using LONG = std::int32_t;
using ULONGLONG = unsigned long long;
using VARTYPE = unsigned short;
using VARIANT_BOOL = short;
/// Days since 30 December 1899; the fraction is the time of day.
using DATE = double;
/// An amount of money in units of 1/10000.
struct CY
{
    /// The amount times 10000.
    std::int64_t int64;
};

// A header that comes before this one may have the names as macros.
#ifndef FALSE
/// The `BOOL` 0, for hosts; nothing in these headers uses it.
inline constexpr BOOL FALSE = 0;
#endif
#ifndef TRUE
/// The `BOOL` 1. Any other number than 0 is true as well.
inline constexpr BOOL TRUE = 1;
#endif
/// The values of `VARIANT_BOOL`.
inline constexpr VARIANT_BOOL VARIANT_FALSE = 0;
inline constexpr VARIANT_BOOL VARIANT_TRUE = -1;

/// The outcome of a call: negative for a failure, 0 (`S_OK`) for success.
using HRESULT = std::int32_t;

/// The call did what it promises.
inline constexpr HRESULT S_OK = 0;
/// An import or export that ended early.
inline constexpr HRESULT E_UNEXPECTED = static_cast<HRESULT>(0x8000FFFFU);
/// A null pointer was given.
inline constexpr HRESULT E_POINTER = static_cast<HRESULT>(0x80004003U);
/// A block that its kind does not allow.
inline constexpr HRESULT E_FAIL = static_cast<HRESULT>(0x80004005U);
/// Memory ran out.
inline constexpr HRESULT E_OUTOFMEMORY = static_cast<HRESULT>(0x8007000EU);
/// A position outside a text.
inline constexpr HRESULT E_INVALIDARG = static_cast<HRESULT>(0x80070057U);
/// A tag that no variant may have.
inline constexpr HRESULT DISP_E_BADVARTYPE = static_cast<HRESULT>(0x80020008U);

/// Whether a result code means success.
constexpr bool SUCCEEDED(HRESULT result)
{
    return result >= 0;
}
/// Whether a result code means a failure.
constexpr bool FAILED(HRESULT result)
{
    return result < 0;
}

/// The text of a variant: zero-terminated wide characters after a length of four bytes. Allocate it
/// with `SysAllocString` or `SysAllocStringLen`, release it with `SysFreeString`. A null pointer is
/// an absent text.
using BSTR = wchar_t*;

/// Type tags of a variant. `VT_BYREF` marks a pointer to a value that the variant does not own.
enum VARENUM : VARTYPE
{
    VT_EMPTY = 0,
    VT_NULL = 1,
    VT_I2 = 2,
    VT_I4 = 3,
    VT_R4 = 4,
    VT_R8 = 5,
    VT_CY = 6,
    VT_DATE = 7,
    VT_BSTR = 8,
    VT_ERROR = 10,
    VT_BOOL = 11,
    VT_VARIANT = 12,
    VT_I1 = 16,
    VT_UI1 = 17,
    VT_UI2 = 18,
    VT_UI4 = 19,
    VT_I8 = 20,
    VT_UI8 = 21,
    VT_INT = 22,
    VT_UINT = 23,
    VT_BYREF = 0x4000,
};

/// A value with its type tag. A plain structure: it releases nothing by itself.
struct VARIANT
{
    /// One of `VARENUM`; it says which member of the union holds the value.
    VARTYPE vt;
    /// Not used.
    std::uint16_t wReserved1;
    std::uint16_t wReserved2;
    std::uint16_t wReserved3;
    /// The value; each member belongs to one tag or a few.
    union
    {
        double dblVal;
        float fltVal;
        signed char cVal;
        unsigned char bVal;
        std::int16_t iVal;
        std::uint16_t uiVal;
        std::int32_t lVal;
        std::uint32_t ulVal;
        std::int64_t llVal;
        std::uint64_t ullVal;
        std::int32_t intVal;
        std::uint32_t uintVal;
        VARIANT_BOOL boolVal;
        CY cyVal;
        DATE date;
        std::int32_t scode;
        BSTR bstrVal;
        void* byref;
    };
};
static_assert(sizeof(VARIANT) == 16);

/// Makes `variant` empty without looking at what it held.
DCM_API void VariantInit(VARIANT* variant) noexcept;

/// Releases the content of `variant` and makes it empty. Returns 0, or `DISP_E_BADVARTYPE` for a
/// tag that is none of the above; the variant is then left alone.
DCM_API HRESULT VariantClear(VARIANT* variant) noexcept;

/// Clears `target` and copies `source` into it, with a text of its own. Returns 0,
/// `DISP_E_BADVARTYPE` for a tag of either that is none of the above (the target is left alone), or
/// `E_OUTOFMEMORY` (the target is empty).
DCM_API HRESULT VariantCopy(VARIANT* target, const VARIANT* source) noexcept;

/// A new copy of a zero-terminated text; null when `text` is null or memory runs out.
DCM_API BSTR SysAllocString(const wchar_t* text) noexcept;

/// A new text of `length` characters: a copy of those at `text`, or not set when `text` is null.
/// Returns null when memory runs out.
DCM_API BSTR SysAllocStringLen(const wchar_t* text, UINT length) noexcept;

/// Releases a text; does nothing for null.
DCM_API void SysFreeString(BSTR text) noexcept;

/// The length of a text in characters, 0 for null.
DCM_API UINT SysStringLen(const wchar_t* text) noexcept;
