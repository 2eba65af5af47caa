#pragma once

#include "dcm/platform/cstring.h"
#include "dcm/platform/encoding.h"

#include <array>
#include <string_view>

namespace dcm {

/// Decodes the texts of one file so that equal texts share their memory: files repeat units and
/// distribution names many times. It remembers the short texts that it has met last.
class SharedTexts
{
public:
    /// The wide form of `bytes`, which must stay valid as long as this object.
    CString Get(std::string_view bytes, Encoding encoding);

private:
    struct Entry
    {
        std::string_view bytes;
        CString wide;
    };

    std::array<Entry, 256> m_entries;
};

} // namespace dcm
