#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/platform/encoding.h"

#include <optional>
#include <string>
#include <string_view>

/// Text in the code page of the calling thread.
namespace dcm {

/// The encoding of the thread's code page where that is built in; none for a page that only the
/// system converts.
std::optional<Encoding> ThreadEncoding();

/// Text in the thread's code page as UTF-8, and the reverse. Bytes that are not a character become
/// U+FFFD; a character that the page lacks becomes `?`.
std::string ThreadCodePageToUtf8(std::string_view bytes);
std::string Utf8ToThreadCodePage(std::string_view utf8);

/// The wide form of text in the thread's code page.
CString Widen(std::string_view bytes);

} // namespace dcm
