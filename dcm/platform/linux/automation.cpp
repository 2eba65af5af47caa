#include "dcm/platform/automation.h"

#include <cwchar>
#include <limits>
#include <new>

namespace {

using LengthPrefix = std::uint32_t;

bool IsKnownTag(VARTYPE tag)
{
    const VARTYPE base = tag & static_cast<VARTYPE>(~VT_BYREF);
    const bool byReference = (tag & VT_BYREF) != 0;
    if (base == VT_VARIANT)
        return byReference;
    return base <= VT_BSTR || base == VT_ERROR || base == VT_BOOL ||
           (base >= VT_I1 && base <= VT_UINT);
}

} // namespace

void VariantInit(VARIANT* variant) noexcept
{
    *variant = {};
}

HRESULT VariantClear(VARIANT* variant) noexcept
{
    if (!IsKnownTag(variant->vt))
        return DISP_E_BADVARTYPE;
    if (variant->vt == VT_BSTR)
        SysFreeString(variant->bstrVal);
    VariantInit(variant);
    return S_OK;
}

HRESULT VariantCopy(VARIANT* target, const VARIANT* source) noexcept
{
    if (target == source)
        return S_OK;
    if (!IsKnownTag(source->vt))
        return DISP_E_BADVARTYPE;
    const HRESULT cleared = VariantClear(target);
    if (FAILED(cleared))
        return cleared;
    VARIANT copy = *source;
    if (source->vt == VT_BSTR && source->bstrVal != nullptr) {
        copy.bstrVal = SysAllocStringLen(source->bstrVal, SysStringLen(source->bstrVal));
        if (copy.bstrVal == nullptr)
            return E_OUTOFMEMORY;
    }
    *target = copy;
    return S_OK;
}

BSTR SysAllocString(const wchar_t* text) noexcept
{
    if (text == nullptr)
        return nullptr;
    const std::size_t length = std::wcslen(text);
    if (length > std::numeric_limits<UINT>::max())
        return nullptr;
    return SysAllocStringLen(text, static_cast<UINT>(length));
}

BSTR SysAllocStringLen(const wchar_t* text, UINT length) noexcept
{
    const std::size_t bytes = std::size_t{length} * sizeof(wchar_t);
    if (bytes > std::numeric_limits<LengthPrefix>::max())
        return nullptr;
    void* const memory =
        ::operator new(sizeof(LengthPrefix) + bytes + sizeof(wchar_t), std::nothrow);
    if (memory == nullptr)
        return nullptr;
    auto* const prefix = static_cast<LengthPrefix*>(memory);
    *prefix = static_cast<LengthPrefix>(bytes);
    auto* const copy = reinterpret_cast<wchar_t*>(prefix + 1);
    if (text != nullptr)
        std::wmemcpy(copy, text, length);
    copy[length] = L'\0';
    return copy;
}

void SysFreeString(BSTR text) noexcept
{
    if (text != nullptr)
        ::operator delete(reinterpret_cast<LengthPrefix*>(text) - 1);
}

UINT SysStringLen(const wchar_t* text) noexcept
{
    if (text == nullptr)
        return 0;
    const LengthPrefix bytes = *(reinterpret_cast<const LengthPrefix*>(text) - 1);
    return static_cast<UINT>(bytes / sizeof(wchar_t));
}
