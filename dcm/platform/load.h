#pragma once

/// What `platform/` calls when the system loads and unloads the library; defined in `library/`.
namespace dcm {

/// The library has been loaded as `module`, the system's handle, which may be null. Returns false
/// when the library cannot be used.
bool OnLibraryLoad(void* module) noexcept;

/// The library will be unloaded next.
void OnLibraryUnload() noexcept;

} // namespace dcm
