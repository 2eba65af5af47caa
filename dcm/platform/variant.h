#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <concepts>
#include <string_view>
#include <type_traits>

/// A variant that owns its content: a text is copied with it and released with it.
class DCM_API CComVariant : public VARIANT
{
public:
    /// No value, `VT_EMPTY`.
    CComVariant() noexcept : VARIANT{} {}
    /// A number, `VT_R8`.
    CComVariant(double value) noexcept : VARIANT{}
    {
        vt = VT_R8;
        dblVal = value;
    }
    /// A number of single precision, `VT_R4`.
    CComVariant(float value) noexcept : VARIANT{}
    {
        vt = VT_R4;
        fltVal = value;
    }
    /// `VT_BOOL` for a bool, otherwise the integer tag of the argument's size and sign.
    template <std::integral Integer>
    requires(!std::same_as<Integer, wchar_t> && !std::same_as<Integer, char>)
        CComVariant(Integer value)
    noexcept : VARIANT{}
    {
        if constexpr (std::same_as<Integer, bool>) {
            vt = VT_BOOL;
            boolVal = value ? VARIANT_TRUE : VARIANT_FALSE;
        } else if constexpr (std::is_signed_v<Integer>) {
            vt = sizeof(value) == 1   ? VT_I1
                 : sizeof(value) == 2 ? VT_I2
                 : sizeof(value) == 4 ? VT_I4
                                      : VT_I8;
            llVal = value;
        } else {
            vt = sizeof(value) == 1   ? VT_UI1
                 : sizeof(value) == 2 ? VT_UI2
                 : sizeof(value) == 4 ? VT_UI4
                                      : VT_UI8;
            ullVal = value;
        }
    }
    /// A text, `VT_BSTR`, copied from a zero-terminated one; null gives an absent text.
    CComVariant(const wchar_t* text);
    /// A text, `VT_BSTR`; an empty one is present and empty.
    CComVariant(const CString& text) : CComVariant(text.View()) {}
    CComVariant(std::wstring_view text) : VARIANT{} { SetText(text); }
    /// A copy of any variant, which owns its content. A failure to copy is raised.
    CComVariant(const VARIANT& other) : VARIANT(other)
    {
        if (!IsPlain(other.vt))
            OwnCopy();
    }
    CComVariant(const CComVariant& other) : CComVariant(static_cast<const VARIANT&>(other)) {}
    /// Takes the content over and leaves no value behind.
    CComVariant(CComVariant&& other) noexcept : VARIANT(other) { other.vt = VT_EMPTY; }

    /// Releases the content, then copies. When the copy fails the variant is left with the tag
    /// `VT_ERROR` and the failure code, and the failure is raised.
    CComVariant& operator=(const VARIANT& other);
    CComVariant& operator=(const CComVariant& other)
    {
        return *this = static_cast<const VARIANT&>(other);
    }
    CComVariant& operator=(CComVariant&& other) noexcept;
    ~CComVariant()
    {
        if (!IsPlain(vt))
            VariantClear(this);
    }

    /// Releases the content, then copies the text. A failure is met as in an assignment.
    void SetText(std::wstring_view text);
    /// Hands the content over to the caller, who has to release it, and leaves no value.
    VARIANT Detach() noexcept;
    /// Releases the content and leaves no value.
    HRESULT Clear() noexcept { return VariantClear(this); }

    /// The text of a `VT_BSTR` variant up to its first zero; empty for an absent one. The variant
    /// must be tagged `VT_BSTR`.
    static std::wstring_view TextOf(const VARIANT& variant) noexcept;

private:
    /// Tags whose whole content is in the variant itself.
    static constexpr bool IsPlain(VARTYPE tag) { return tag <= VT_DATE; }
    void OwnCopy();
    void Fail(HRESULT code);
};
