// A host that is the class library itself: the calls that the library makes when it is loaded and
// unloaded arrive here. It ends with the number of the first promise not kept, 0 for none.
#include "dcm/platform/module.h"

#include <dlfcn.h>

namespace {

AFX_EXTENSION_MODULE* loaded = nullptr;
int registrations = 0;

} // namespace

BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, void*) noexcept
{
    loaded = &state;
    return TRUE;
}

void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept
{
    delete state.pLibrary;
    loaded = loaded == &state ? nullptr : loaded;
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
        if (library == nullptr || loaded == nullptr || registrations != 1)
            return 1;
        if (dlclose(library) != 0 || dlopen(DCM_LIBRARY, RTLD_NOW | RTLD_NOLOAD) != nullptr)
            return 2;
        if (loaded != nullptr || registrations != 0)
            return 3;
    }
    return 0;
}
