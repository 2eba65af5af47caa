#include "dcm/platform/load.h"

namespace {

[[gnu::constructor]] void Load()
{
    dcm::OnLibraryLoad(nullptr);
}

[[gnu::destructor]] void Unload()
{
    dcm::OnLibraryUnload();
}

} // namespace
