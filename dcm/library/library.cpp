#include "dcm/platform/load.h"
#include "dcm/platform/module.h"

#include <new>

namespace dcm {

namespace {

AFX_EXTENSION_MODULE libraryModule;

} // namespace

bool OnLibraryLoad(void* module) noexcept
{
    if (!AfxInitExtensionModule(libraryModule, module))
        return false;
    if (new (std::nothrow) CDynLinkLibrary(libraryModule) != nullptr)
        return true;
    AfxTermExtensionModule(libraryModule);
    return false;
}

void OnLibraryUnload() noexcept
{
    AfxTermExtensionModule(libraryModule);
}

} // namespace dcm
