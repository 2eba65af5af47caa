#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"

#include <exception>

/// @file
/// Failures that are thrown.

namespace dcm {

/// A failure with a result code, thrown by calls that cannot return the code.
class DCM_API ResultError : public std::exception
{
public:
    /// `code` must be negative.
    explicit ResultError(HRESULT code) noexcept : m_code(code) {}
    /// The same failure.
    ResultError(const ResultError&) noexcept = default;
    ResultError& operator=(const ResultError&) noexcept = default;
    ~ResultError() override;

    /// The result code, always negative.
    HRESULT Code() const noexcept { return m_code; }
    /// The failure in words.
    const char* what() const noexcept override;

private:
    HRESULT m_code;
};

/// Throws `std::bad_alloc` for `E_OUTOFMEMORY`, otherwise a `ResultError` with `code`, which must
/// be negative.
[[noreturn]] DCM_API void ThrowResult(HRESULT code);

} // namespace dcm
