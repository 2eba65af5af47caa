#include "bindings/c/result.h"

#include <algorithm>
#include <array>
#include <limits>
#include <string>

namespace dcm::c {

namespace {

/// The words take no memory of their own, so that they are there when it has run out.
thread_local std::array<char, 512> lastError{};

} // namespace

dcm_result Fail(dcm_result code, std::string_view words) noexcept
{
    std::size_t length = std::min(words.size(), lastError.size() - 1);
    // A character of several bytes is kept whole.
    while (length < words.size() && length > 0 &&
           (static_cast<unsigned char>(words[length]) & 0xC0U) == 0x80U)
        --length;
    std::copy_n(words.begin(), length, lastError.begin());
    lastError.at(length) = '\0';
    return code;
}

dcm_result FailForNull() noexcept
{
    return Fail(DCM_ERROR_ARGUMENT, "A pointer is null.");
}

dcm_result FailForIndex() noexcept
{
    return Fail(DCM_ERROR_INDEX, "The index is outside the list.");
}

dcm_result FailForConstant() noexcept
{
    return Fail(DCM_ERROR_ARGUMENT, "The number of a kind, field, array or severity is unknown.");
}

dcm_result CheckText(const char* text, std::size_t length) noexcept
{
    if (text == nullptr && length != 0)
        return FailForNull();
    if (length != DCM_TERMINATED &&
        length > static_cast<std::size_t>(std::numeric_limits<int>::max()))
        return Fail(DCM_ERROR_ARGUMENT, "The text is too long.");
    return DCM_OK;
}

CString TextFrom(const char* text, std::size_t length)
{
    if (length == DCM_TERMINATED)
        return FromUtf8(text);
    return length == 0 ? CString() : FromUtf8({text, length});
}

dcm_result GiveText(std::wstring_view text, char* buffer, std::size_t size, std::size_t* length)
{
    return GiveUtf8(ToUtf8(text), buffer, size, length);
}

dcm_result GiveUtf8(std::string_view text, char* buffer, std::size_t size,
                    std::size_t* length) noexcept
{
    if (length == nullptr || (buffer == nullptr && size != 0))
        return FailForNull();
    *length = text.size();
    if (size <= text.size())
        return Fail(DCM_ERROR_SIZE, "The buffer is too small for the text and a zero.");
    std::copy(text.begin(), text.end(), buffer);
    buffer[text.size()] = '\0';
    return DCM_OK;
}

} // namespace dcm::c

const char* dcm_last_error()
{
    return dcm::c::lastError.data();
}

dcm_result dcm_version(const char** version)
{
    if (version == nullptr)
        return dcm::c::FailForNull();
    *version = dcm::LibraryVersion();
    return DCM_OK;
}

dcm_result dcm_set_code_page(uint32_t identifier)
{
    return dcm::c::Try([&]() -> dcm_result {
        return dcm::SetThreadCodePage(identifier)
                   ? DCM_OK
                   : dcm::c::Fail(DCM_ERROR_ARGUMENT, "The system has no such code page.");
    });
}

dcm_result dcm_kind_keyword(int32_t kind, char* buffer, size_t size, size_t* length)
{
    if (kind < DCM_FESTWERT || kind > DCM_TEXTSTRING)
        return dcm::c::FailForConstant();
    return dcm::c::Try([&]() -> dcm_result {
        return dcm::c::GiveText(dcm::KeywordOf(static_cast<dcm::Kind>(kind)), buffer, size, length);
    });
}
