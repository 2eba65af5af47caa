#include "dcm/platform/load.h"

#include <windows.h>

/// Called by the system when a process loads the DLL and when it unloads it.
extern "C" BOOL WINAPI DllMain(HINSTANCE module, DWORD reason, void* /*reserved*/)
{
    switch (reason) {
    case DLL_PROCESS_ATTACH:
        return dcm::OnLibraryLoad(module) ? TRUE : FALSE;
    case DLL_PROCESS_DETACH:
        dcm::OnLibraryUnload();
        return TRUE;
    default:
        return TRUE;
    }
}
