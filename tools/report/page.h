#pragma once

#include "dcm/library/dcm.h"

#include <ostream>
#include <span>

/// A page of HTML to look at files with: an index with search, the findings of the import, tables
/// of single values, curves as plots, maps as coloured tables and as lines. The page brings all it
/// needs along and loads nothing.
namespace dcm::tools {

/// What a page shows of a file.
struct PageFile
{
    /// The name that the page calls the file by.
    CString title;
    /// Text at the top; may be empty.
    CString comment;
    std::span<const Parameter> parameters;
    /// Of the import; may be null.
    const Report* report = nullptr;
};

/// Writes the page of one file. Failures are left in the state of `out`.
void WritePage(std::ostream& out, const PageFile& file);

/// Writes the page of two files: all blocks of both, and what the differences say. `differences`
/// must be those of the parameters of `file` and `other`, in this order.
void WritePage(std::ostream& out, const PageFile& file, const PageFile& other,
               std::span<const Difference> differences);

} // namespace dcm::tools
