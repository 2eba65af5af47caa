#include "dcm/platform/null_device.h"

namespace dcm::system {

constexpr std::wstring_view kNullDevice = L"NUL";

} // namespace dcm::system
