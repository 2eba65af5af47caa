#pragma once

/// The system's calls at load and unload of the library. `platform/` makes them, the library
/// defines them.
namespace dcm {

/// The library has been loaded as `module` (the system's handle, may be null). False refuses it.
bool OnLibraryLoad(void* module) noexcept;

/// The library is about to be unloaded.
void OnLibraryUnload() noexcept;

} // namespace dcm
