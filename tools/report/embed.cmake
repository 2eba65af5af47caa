# cmake -D OUT=header -D FOLDER=folder -D SCRIPTS="a.js b.js" -P embed.cmake
# Makes a header of the parts of a page that are the same for every file, and of the policy that
# lets the browser run the page's own script and no other.
separate_arguments(SCRIPTS)
file(READ ${FOLDER}/style.css style)
file(READ ${FOLDER}/index.html index)
set(script "")
foreach(name ${SCRIPTS})
    file(READ ${FOLDER}/${name} part)
    string(APPEND script "${part}\n")
endforeach()

# The policy names the script by its SHA-256 in base64: four digits for three bytes, one "=" for
# the byte that 32 lack of 33.
set(digits ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/)
string(SHA256 hash "${script}")
string(APPEND hash 00)
set(base64 "")
foreach(place RANGE 0 63 6)
    string(SUBSTRING ${hash} ${place} 6 bytes)
    foreach(shift 18 12 6 0)
        math(EXPR digit "0x${bytes} >> ${shift} & 63")
        string(SUBSTRING ${digits} ${digit} 1 letter)
        string(APPEND base64 ${letter})
    endforeach()
endforeach()
string(REGEX REPLACE "A$" "=" base64 ${base64})

file(WRITE ${OUT} "#pragma once

#include <string_view>

namespace dcm::tools::page {

inline constexpr std::string_view kStyle = R\"~(${style})~\";
inline constexpr std::string_view kIndex = R\"~(${index})~\";
inline constexpr std::string_view kScript = R\"~(${script})~\";
inline constexpr std::string_view kPolicy =
    \"default-src 'none'; style-src 'unsafe-inline'; script-src 'sha256-${base64}'\";

} // namespace dcm::tools::page
")
