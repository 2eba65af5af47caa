#include "dcm/platform/module.h"

namespace {

CDynLinkLibrary* lastRegistered = nullptr;

} // namespace

BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, void* module) noexcept
{
    if (state.bInitialized)
        return 0;
    state.bInitialized = 1;
    state.hModule = module;
    return 1;
}

void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept
{
    delete state.pLibrary;
    state = {};
}

CDynLinkLibrary::CDynLinkLibrary(AFX_EXTENSION_MODULE& state) noexcept
    : m_state(state), m_pPrevious(lastRegistered)
{
    lastRegistered = this;
    state.pLibrary = this;
}

CDynLinkLibrary::~CDynLinkLibrary()
{
    CDynLinkLibrary** link = &lastRegistered;
    while (*link != this)
        link = &(*link)->m_pPrevious;
    *link = m_pPrevious;
    m_state.pLibrary = nullptr;
}

CDynLinkLibrary* CDynLinkLibrary::Last() noexcept
{
    return lastRegistered;
}
