#pragma once

#include "dcm/library/dcm.h"

#include <span>
#include <string>
#include <string_view>
#include <vector>

/// @file
/// Which parameters the names and patterns of a command line mean.

namespace dcm::tools {

/// Whether the whole of a name fits a pattern, in which `*` is any text and `?` any character.
bool Matches(std::wstring_view name, std::wstring_view pattern);

/// Patterns of a command line.
class Patterns
{
public:
    /// Patterns in UTF-8.
    explicit Patterns(const std::vector<std::string>& patterns);

    bool IsEmpty() const { return m_patterns.empty(); }
    /// Whether a name fits any of them.
    bool Match(std::wstring_view name) const;
    /// Throws `Trouble` when one of them fits none of the parameters. `where` says where they are
    /// from. The message tells the nearest names.
    void RequireMatches(std::span<const Parameter> parameters, const std::string& where) const;

private:
    std::vector<CString> m_patterns;
};

} // namespace dcm::tools
