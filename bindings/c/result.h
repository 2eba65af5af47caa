#pragma once

#include "bindings/c/dcm_c.h"
#include "dcm/library/dcm.h"

#include <cstddef>
#include <new>
#include <stdexcept>
#include <string_view>

/// @file
/// How functions of the C interface take texts, give them back and fail.

namespace dcm::c {

/// Keeps the words for dcm_last_error(), as many as fit, and returns the code.
dcm_result Fail(dcm_result code, std::string_view words) noexcept;

dcm_result FailForNull() noexcept;
dcm_result FailForIndex() noexcept;
dcm_result FailForConstant() noexcept;

/// Does the work, which returns a result. What it throws becomes the result.
template <class Work>
dcm_result Try(Work&& work) noexcept
{
    try {
        return work();
    } catch (const std::bad_alloc&) {
        return Fail(DCM_ERROR_MEMORY, "Memory ran out.");
    } catch (const std::length_error&) {
        return Fail(DCM_ERROR_MEMORY, "Memory cannot hold so much.");
    } catch (...) {
        return Fail(DCM_ERROR_INTERNAL, "The library failed.");
    }
}

/// Whether a text of a host can be taken. The result tells why not.
dcm_result CheckText(const char* text, std::size_t length) noexcept;
/// The wide form of a text that has been checked.
CString TextFrom(const char* text, std::size_t length);

/// Gives a text to the host, in UTF-8.
dcm_result GiveText(std::wstring_view text, char* buffer, std::size_t size, std::size_t* length);
dcm_result GiveUtf8(std::string_view text, char* buffer, std::size_t size,
                    std::size_t* length) noexcept;

} // namespace dcm::c
