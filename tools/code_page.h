#pragma once

#include <string>

namespace dcm::tools {

/// The code page of files unless another is asked for; the same on every system.
inline constexpr const char* kDefaultCodePage = "1252";

/// Makes the calling thread read and write files in the code page named: "utf-8", "iso-8859-1",
/// "windows-1252", or the number of any page that the system knows. Throws `Trouble` for another.
void ChooseCodePage(const std::string& name);

} // namespace dcm::tools
