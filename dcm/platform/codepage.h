#pragma once

#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"

#include <string>
#include <string_view>

/// @file
/// Characters of files: the thread's code page, and text in UTF-8.

namespace dcm {

/// Chooses the ANSI code page of the calling thread by its Windows identifier: 1252 (with which a
/// thread starts on Linux), 28591 for ISO-8859-1, 65001 for UTF-8, or any other that the system
/// can convert. Returns false, and changes nothing, when the identifier is unknown.
DCM_API bool SetThreadCodePage(unsigned identifier);
/// The code page of the calling thread, for a host that sets another one for a while.
DCM_API unsigned ThreadCodePage();

/// `text` in UTF-8, and the wide form of a text in UTF-8; what is not a character becomes U+FFFD.
DCM_API std::string ToUtf8(std::wstring_view text);
DCM_API CString FromUtf8(std::string_view text);

} // namespace dcm
