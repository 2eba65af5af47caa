#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cstring.h"

#include <concepts>
#include <string_view>
#include <type_traits>

/// A variant that owns its content: copying it copies its text, destroying it releases the text.
class DCM_API CComVariant : public VARIANT
{
public:
    /// No value, `VT_EMPTY`.
    constexpr CComVariant() noexcept : VARIANT{} {}
    /// A number, `VT_R8`.
    constexpr CComVariant(double value) noexcept : VARIANT{}
    {
        vt = VT_R8;
        dblVal = value;
    }
    /// A number of single precision, `VT_R4`.
    constexpr CComVariant(float value) noexcept : VARIANT{}
    {
        vt = VT_R4;
        fltVal = value;
    }
    /// `VT_BOOL` for a bool, otherwise the integer tag of the argument's size and sign. The member
    /// of that tag holds the value.
    template <std::integral Integer>
    requires(!std::same_as<Integer, wchar_t> &&
             !std::same_as<Integer, char>) constexpr CComVariant(Integer value) noexcept
        : VARIANT{}
    {
        if constexpr (std::same_as<Integer, bool>) {
            vt = VT_BOOL;
            boolVal = value ? VARIANT_TRUE : VARIANT_FALSE;
        } else if constexpr (std::is_signed_v<Integer>) {
            if constexpr (sizeof(value) == 1) {
                vt = VT_I1;
                cVal = value;
            } else if constexpr (sizeof(value) == 2) {
                vt = VT_I2;
                iVal = value;
            } else if constexpr (sizeof(value) == 4) {
                vt = VT_I4;
                lVal = value;
            } else {
                vt = VT_I8;
                llVal = value;
            }
        } else {
            if constexpr (sizeof(value) == 1) {
                vt = VT_UI1;
                bVal = value;
            } else if constexpr (sizeof(value) == 2) {
                vt = VT_UI2;
                uiVal = value;
            } else if constexpr (sizeof(value) == 4) {
                vt = VT_UI4;
                ulVal = value;
            } else {
                vt = VT_UI8;
                ullVal = value;
            }
        }
    }
    /// A copy of a zero-terminated text, `VT_BSTR`; null gives an absent text. Like the others that
    /// copy a text, throws `std::bad_alloc` when memory runs out.
    CComVariant(const wchar_t* text);
    /// A copy of a text, `VT_BSTR`, zeros in it included; an empty text is present and empty.
    CComVariant(const CString& text) : CComVariant(text.View()) {}
    CComVariant(std::wstring_view text) : VARIANT{} { SetText(text); }
    /// A copy of any variant, with a text of its own. Throws `std::bad_alloc` when memory runs out
    /// and `dcm::ResultError` for a tag that the system does not know.
    CComVariant(const VARIANT& other) : VARIANT(other)
    {
        if (!IsPlain(other.vt))
            OwnCopy();
    }
    CComVariant(const CComVariant& other) : CComVariant(static_cast<const VARIANT&>(other)) {}
    /// Takes the content; the other has no value afterwards.
    CComVariant(CComVariant&& other) noexcept : VARIANT(other) { other.vt = VT_EMPTY; }

    /// Releases the content, then copies. When the copy fails, throws as the constructor does; the
    /// variant then has the tag `VT_ERROR` and the result code.
    CComVariant& operator=(const VARIANT& other);
    CComVariant& operator=(const CComVariant& other)
    {
        return *this = static_cast<const VARIANT&>(other);
    }
    CComVariant& operator=(CComVariant&& other) noexcept;
    constexpr ~CComVariant()
    {
        if (!IsPlain(vt))
            VariantClear(this);
    }

    /// Releases the content, then copies the text. Fails as an assignment does.
    void SetText(std::wstring_view text);
    /// Returns the content and leaves no value. Callers must release it with `VariantClear`.
    VARIANT Detach() noexcept;
    /// Releases the content and leaves no value. Returns 0, or `DISP_E_BADVARTYPE` for a tag that
    /// the system does not know, which is then left alone.
    HRESULT Clear() noexcept { return VariantClear(this); }

    /// The text of a `VT_BSTR` variant up to its first zero; empty for an absent one. The variant
    /// must be tagged `VT_BSTR`.
    static std::wstring_view TextOf(const VARIANT& variant) noexcept;

private:
    /// Tags whose whole content is in the variant itself.
    static constexpr bool IsPlain(VARTYPE tag)
    {
        return tag <= VT_DATE || (tag >= VT_I1 && tag <= VT_UINT) || tag == VT_BOOL;
    }
    void OwnCopy();
    void Fail(HRESULT code);
};
