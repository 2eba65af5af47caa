#pragma once

#include "dcm/library/dcm.h"

#include <cstddef>
#include <span>
#include <vector>

namespace dcm::tools {

/// How a kind of blocks is shown.
enum class Look
{
    kRow,   ///< One row of a table for each block.
    kList,  ///< A list of values, or a map without axis points.
    kCurve, ///< A plot and a table.
    kMap,   ///< A coloured table and lines.
};

/// One block of the page.
struct PageBlock
{
    /// The parameter; never null. In a comparison that of the first file, if it has one.
    const Parameter* parameter;
    /// That of the second file if both have it and it differs, otherwise null.
    const Parameter* other = nullptr;
    /// What differs; null for a block that is the same, and without a comparison.
    const Difference* difference = nullptr;
};

/// The blocks of one kind, in the order of the page.
struct PageKind
{
    Kind kind;
    Look look;
    std::vector<PageBlock> blocks;
};

/// The blocks by kind, kinds without any left out: single values first, distributions last. With
/// differences, which must belong to the two lists, the blocks that only the second list has come
/// after the others of their kind. The result refers to the arguments.
std::vector<PageKind> PageKindsOf(std::span<const Parameter> parameters,
                                  std::span<const Parameter> others = {},
                                  std::span<const Difference> differences = {});

/// What the page shows as values: the points of a distribution, the values of any other kind.
const std::vector<CComVariant>& ShownValues(const Parameter& parameter);
/// The unit of these.
const CString& ShownUnit(const Parameter& parameter);

/// How many values a block has: `rows` when they are a plain list or a curve, which have 0 columns.
struct Shape
{
    std::size_t columns;
    std::size_t rows;
};
/// Rows that are not full count, and so do rows that have an axis point and no values.
Shape ShapeOf(const Parameter& parameter);

} // namespace dcm::tools
