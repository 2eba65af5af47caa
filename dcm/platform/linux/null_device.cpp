#include "dcm/platform/null_device.h"

namespace dcm::system {

constexpr std::wstring_view kNullDevice = L"/dev/null";

} // namespace dcm::system
