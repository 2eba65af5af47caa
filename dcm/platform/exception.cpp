#include "dcm/platform/exception.h"

#include <new>

namespace dcm {

ResultError::~ResultError() = default;

const char* ResultError::what() const noexcept
{
    switch (m_code) {
    case E_INVALIDARG:
        return "invalid argument";
    case DISP_E_BADVARTYPE:
        return "variant of an unknown type";
    default:
        return "operation failed";
    }
}

void ThrowResult(HRESULT code)
{
    if (code == E_OUTOFMEMORY)
        throw std::bad_alloc();
    throw ResultError(code);
}

} // namespace dcm
