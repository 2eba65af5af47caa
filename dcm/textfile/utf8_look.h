#pragma once

#include <cstddef>
#include <string_view>

namespace dcm {

/// What bytes look like when they are taken for UTF-8.
struct Utf8Look
{
    /// The first byte of the first character of several bytes, and the first byte that is no part
    /// of a character; `npos` for none.
    std::size_t firstWide = std::string_view::npos;
    std::size_t firstBad = std::string_view::npos;
};

/// Looks at `bytes` up to the first that is no part of a character.
Utf8Look LookAsUtf8(std::string_view bytes);

} // namespace dcm
