// A host that defines the functions which the library calls when it is loaded and unloaded. The
// exit status is the number of the first check that fails, 0 for none.
#include "dcm/platform/module.h"

#include <dlfcn.h>

namespace {

int modules = 0;
int registrations = 0;

} // namespace

BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE&, void*) noexcept
{
    return ++modules;
}

void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept
{
    delete state.pLibrary;
    --modules;
}

CDynLinkLibrary::CDynLinkLibrary(AFX_EXTENSION_MODULE& state) noexcept
    : m_state(state), m_pPrevious(nullptr)
{
    ++registrations;
    state.pLibrary = this;
}

CDynLinkLibrary::~CDynLinkLibrary()
{
    --registrations;
}

int main()
{
    for (int i = 0; i < 2; ++i) {
        void* const library = dlopen(DCM_LIBRARY, RTLD_NOW | RTLD_LOCAL);
        if (library == nullptr || modules != 1 || registrations != 1)
            return 1;
        if (dlclose(library) != 0 || dlopen(DCM_LIBRARY, RTLD_NOW | RTLD_NOLOAD) != nullptr ||
            modules != 0 || registrations != 0)
            return 2;
    }
    return 0;
}
