#pragma once

#include "dcm/platform/cstring.h"

#include <cstdint>
#include <string_view>

namespace dcm {

/// How much a finding matters.
enum class Severity : unsigned char
{
    /// Something that the library does not keep or that may be meant so; no data are lost.
    kNote,
    /// Data are doubtful, or altered so that their meaning may change.
    kWarning,
    /// Data are lost, or the work ended before its end.
    kError,
};

/// One thing that an import or export met.
struct Finding
{
    /// How bad it is.
    Severity severity;
    /// What kind of finding it is, such as "unfinished-block"; the same in all later versions. It
    /// refers to a constant of the library. docs/findings.md describes each.
    std::string_view id;
    /// The line in the file, from 1; 0 when the finding concerns no line of a file that is read.
    std::int64_t line;
    /// Keyword and name, such as "KENNFELD IgnMap"; empty outside of a block.
    CString block;
    /// One English sentence with the facts. It holds at most 200 characters of any text of the
    /// file.
    CString message;
};

} // namespace dcm
