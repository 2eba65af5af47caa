#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"

#include <exception>

/// @file
/// Failures that are raised.

namespace dcm {

/// A failure that a result code names, raised where a call cannot return it.
class DCM_API ResultError : public std::exception
{
public:
    /// For `code`, which must be negative.
    explicit ResultError(HRESULT code) noexcept : m_code(code) {}
    /// The same failure.
    ResultError(const ResultError&) noexcept = default;
    ResultError& operator=(const ResultError&) noexcept = default;
    ~ResultError() override;

    /// The result code, always negative.
    HRESULT Code() const noexcept { return m_code; }
    const char* what() const noexcept override;

private:
    HRESULT m_code;
};

/// Raises `std::bad_alloc` for `E_OUTOFMEMORY`, otherwise a `ResultError` with `code`.
[[noreturn]] DCM_API void ThrowResult(HRESULT code);

} // namespace dcm
