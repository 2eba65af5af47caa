#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/automation.h"

/// @file
/// Registration of libraries that are loaded into the process.

class CDynLinkLibrary;

/// The state of one extension module, a library that registers itself while it is loaded.
struct AFX_EXTENSION_MODULE
{
    /// TRUE while the module is loaded.
    BOOL bInitialized = FALSE;
    /// The system's handle of the library; may be null.
    void* hModule = nullptr;
    /// The registration, owned by the state; null while there is none.
    CDynLinkLibrary* pLibrary = nullptr;
};

/// Marks the module as loaded. FALSE when it is already.
DCM_API BOOL AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, void* module) noexcept;

/// Ends the registration of the module, if any, and marks it as no longer loaded.
DCM_API void AfxTermExtensionModule(AFX_EXTENSION_MODULE& state) noexcept;

/// The registration of one module: it stands in the list of registered modules while it lives.
/// Make it with `new`; `AfxTermExtensionModule` deletes it. Modules are loaded and unloaded one at
/// a time, so the list is not guarded.
class DCM_API CDynLinkLibrary
{
public:
    /// Enters the module, whose state must outlive this object.
    explicit CDynLinkLibrary(AFX_EXTENSION_MODULE& state) noexcept;
    /// A registration is not copied.
    CDynLinkLibrary(const CDynLinkLibrary&) = delete;
    CDynLinkLibrary& operator=(const CDynLinkLibrary&) = delete;
    ~CDynLinkLibrary();

    /// The state of the registered module.
    const AFX_EXTENSION_MODULE& Module() const noexcept { return m_state; }
    /// The last registered module, and the one registered before this; null at the end.
    static CDynLinkLibrary* Last() noexcept;
    CDynLinkLibrary* Previous() const noexcept { return m_pPrevious; }

private:
    AFX_EXTENSION_MODULE& m_state;
    CDynLinkLibrary* m_pPrevious;
};
