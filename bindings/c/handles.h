#pragma once

#include "bindings/c/dcm_c.h"
#include "dcm/library/dcm.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string_view>
#include <utility>
#include <vector>

/// @file
/// What the handles of the C interface are.

/// A parameter in the document that owns it.
struct dcm_parameter
{
    dcm::Parameter content;
    dcm_document* document = nullptr;
    /// Grows from each parameter of the document to the next.
    std::uint64_t number = 0;
};

namespace dcm::c {

/// A name, and the number of the parameter that has it.
using NameKey = std::pair<std::wstring_view, std::uint64_t>;

inline NameKey KeyOf(const dcm_parameter* parameter)
{
    return {parameter->content.name.View(), parameter->number};
}

/// By name; equal names in the order of the document.
struct ByName
{
    using is_transparent = void;

    bool operator()(const dcm_parameter* a, const dcm_parameter* b) const
    {
        return KeyOf(a) < KeyOf(b);
    }
    bool operator()(const NameKey& a, const dcm_parameter* b) const { return a < KeyOf(b); }
    bool operator()(const dcm_parameter* a, const NameKey& b) const { return KeyOf(a) < b; }
};

using NameIndex = std::set<dcm_parameter*, ByName>;

} // namespace dcm::c

struct dcm_document
{
    /// Handles to them stay valid when others are added or removed.
    std::vector<std::unique_ptr<dcm_parameter>> parameters;
    /// Made by the first search for a name and kept up to date from then on.
    std::optional<dcm::c::NameIndex> names;
    CString comment;
    CString header;
    dcm::Report report;
    std::uint64_t nextNumber = 1;
};
