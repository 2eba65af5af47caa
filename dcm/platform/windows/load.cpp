#include "dcm/platform/load.h"

#include <windows.h>

/// The system calls this when a process loads or unloads the DLL.
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
