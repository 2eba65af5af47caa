#include "dcm/platform/variant.h"

#include "dcm/platform/exception.h"

#include <cstddef>
#include <cstring>
#include <limits>

CComVariant::CComVariant(const wchar_t* text) : VARIANT{}
{
    vt = VT_BSTR;
    bstrVal = SysAllocString(text);
    if (text != nullptr && bstrVal == nullptr)
        dcm::ThrowResult(E_OUTOFMEMORY);
}

CComVariant& CComVariant::operator=(const VARIANT& other)
{
    if (static_cast<const VARIANT*>(this) == &other)
        return *this;
    VariantClear(this);
    static_cast<VARIANT&>(*this) = other;
    if (!IsPlain(vt))
        OwnCopy();
    return *this;
}

CComVariant& CComVariant::operator=(CComVariant&& other) noexcept
{
    if (this != &other) {
        VariantClear(this);
        static_cast<VARIANT&>(*this) = other;
        other.vt = VT_EMPTY;
    }
    return *this;
}

std::wstring_view CComVariant::TextOf(const VARIANT& variant) noexcept
{
    return variant.bstrVal == nullptr ? std::wstring_view() : std::wstring_view(variant.bstrVal);
}

void CComVariant::SetText(std::wstring_view text)
{
    BSTR copy = nullptr;
    if (text.size() <= std::numeric_limits<UINT>::max())
        copy = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
    VariantClear(this);
    if (copy == nullptr)
        Fail(E_OUTOFMEMORY);
    VariantInit(this);
    vt = VT_BSTR;
    bstrVal = copy;
}

VARIANT CComVariant::Detach() noexcept
{
    const VARIANT content = *this;
    VariantInit(this);
    return content;
}

void CComVariant::OwnCopy()
{
    // An absent text and a point without a value have nothing to copy.
    constexpr std::size_t head = offsetof(VARIANT, llVal);
    const VARIANT nothing = {};
    if (std::memcmp(&llVal, &nothing.llVal, sizeof(VARIANT) - head) == 0)
        return;
    // Not constant, because the system's function takes a pointer to a source that is not.
    VARIANT other = *this;
    VariantInit(this);
    const HRESULT result = VariantCopy(this, &other);
    if (FAILED(result))
        Fail(result);
}

void CComVariant::Fail(HRESULT code)
{
    VariantInit(this);
    vt = VT_ERROR;
    scode = code;
    dcm::ThrowResult(code);
}
