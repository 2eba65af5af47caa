#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"

/// @file
/// Registration of libraries that are loaded into the process.

class CDynLinkLibrary;

/// The state of an extension module, a library that is registered while it is loaded.
struct AFX_EXTENSION_MODULE
{
    /// 1 while the module is loaded, otherwise 0.
    BOOL bInitialized = 0;
    /// The system's handle of the library; may be null.
    void* hModule = nullptr;
    /// The registration, owned by the state; null while there is none.
    CDynLinkLibrary* pLibrary = nullptr;
};

/// Marks the module as loaded and returns 1; returns 0 when it is loaded already.
DCM_API BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, void* module) noexcept;

/// Ends the registration of the module, if any, and marks it as no longer loaded.
DCM_API void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept;

/// The registration of one module, which is in the list of registered modules as long as this
/// object exists. Make it with `new`; `AfxTermExtensionModule` deletes it. Callers must load and
/// unload modules one at a time: the list has no lock.
class DCM_API CDynLinkLibrary
{
public:
    /// Adds the module to the list. `state` must outlive this object.
    explicit CDynLinkLibrary(AFX_EXTENSION_MODULE& state) noexcept;
    /// A registration cannot be copied.
    CDynLinkLibrary(const CDynLinkLibrary&) = delete;
    CDynLinkLibrary& operator=(const CDynLinkLibrary&) = delete;
    /// Removes the module from the list.
    ~CDynLinkLibrary();

    /// The state of the registered module.
    const AFX_EXTENSION_MODULE& Module() const noexcept { return m_state; }
    /// The module that was registered last; null when none is registered.
    static CDynLinkLibrary* Last() noexcept;
    /// The module that was registered before this one; null for the first.
    CDynLinkLibrary* Previous() const noexcept { return m_pPrevious; }

private:
    AFX_EXTENSION_MODULE& m_state;
    CDynLinkLibrary* m_pPrevious;
};
