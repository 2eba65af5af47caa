// A host that is the class library itself: the calls that the library makes when it is loaded and
// unloaded arrive here.
#include "dcm/platform/module.h"

#include <cstdio>
#include <dlfcn.h>

namespace {

AFX_EXTENSION_MODULE* loaded = nullptr;
int registrations = 0;
int failures = 0;

void Expect(bool condition, const char* what)
{
    if (!condition) {
        std::printf("not so: %s\n", what);
        ++failures;
    }
}

} // namespace

BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, void*) noexcept
{
    loaded = &state;
    return TRUE;
}

void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept
{
    Expect(loaded == &state, "the library ends the registration that it began");
    delete state.pLibrary;
    state = {};
    loaded = nullptr;
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
        if (library == nullptr) {
            std::printf("%s\n", dlerror());
            return 1;
        }
        Expect(loaded != nullptr && registrations == 1, "loading registers the library");
        Expect(dlclose(library) == 0, "the library is closed");
        Expect(loaded == nullptr && registrations == 0, "unloading ends the registration");
        Expect(dlopen(DCM_LIBRARY, RTLD_NOW | RTLD_NOLOAD) == nullptr, "the library is gone");
    }
    return failures == 0 ? 0 : 1;
}
