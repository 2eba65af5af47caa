#include "dcm/library/version.h"

#define DCM_TEXT_OF(number) #number
#define DCM_VERSION_TEXT(major, minor, patch)                                                      \
    DCM_TEXT_OF(major) "." DCM_TEXT_OF(minor) "." DCM_TEXT_OF(patch)

namespace dcm {

const char* LibraryVersion() noexcept
{
    return DCM_VERSION_TEXT(DCM_VERSION_MAJOR, DCM_VERSION_MINOR, DCM_VERSION_PATCH);
}

} // namespace dcm
