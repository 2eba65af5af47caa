#pragma once

#include "dcm/library/export.h"
#include "dcm/library/parameter.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <cstddef>
#include <span>
#include <string_view>
#include <vector>

/// @file
/// What two lists of parameters differ in.

namespace dcm {

/// How parameters are compared. As it is made, numbers are the same only bit by bit: 0.0 and -0.0
/// differ, a not-a-number is the same as one with the same bits. Tolerances hold for values and
/// axis points; an infinity or not-a-number is never within one.
struct Comparison
{
    /// Numbers are the same when |new - old| is at most this. 0 for none.
    double absolute = 0.0;
    /// Numbers are the same when |new - old| is at most this part of the larger magnitude: 0.001
    /// for 0.1 %. 0 for none. One of both tolerances is enough.
    double relative = 0.0;
    /// Leaves out LANGNAME, DISPLAYNAME and FUNKTION.
    bool ignoreTexts = false;
    /// Leaves out the units of axes and values.
    bool ignoreUnits = false;
    /// Leaves out axis points, distribution names and declared counts. Values are then compared by
    /// their index.
    bool ignoreAxes = false;
};

/// What a parameter has one of.
enum class Field
{
    kLangname,
    kDisplayname,
    kFunction,
    kUnit,
    kUnitX,
    kUnitY,
    kDistributionX,
    kDistributionY,
    /// Counts as the first line of the block has them, where they differ and the numbers of
    /// points (for curves, of values) do not account for it: those of a FESTWERTEBLOCK in rows, or
    /// counts that disagree with the points.
    kCountX,
    kCountY,
};

/// The keyword under which a file holds the field, such as L"LANGNAME" or L"*SSTX"; L"X" and L"Y"
/// for counts.
DCM_API std::wstring_view KeywordOf(Field field) noexcept;

/// A field with another content.
struct FieldDifference
{
    /// Which field it is.
    Field field;
    /// Counts are decimal numbers here.
    CString oldText;
    CString newText;
};

/// The index of what only the other side has.
inline constexpr std::size_t kNoIndex = static_cast<std::size_t>(-1);

/// A point or a value that differs. What one side lacks has there the index `kNoIndex` and an empty
/// variant.
struct ValueDifference
{
    /// Indices into `Axis::points` or `Parameter::values`. For values over a changed axis the two
    /// indices may differ: they are those of the same axis points.
    std::size_t oldIndex;
    std::size_t newIndex;
    CComVariant oldValue;
    CComVariant newValue;
};

/// What kind of difference there is between two lists.
enum class Change
{
    /// Only the new list has the parameter.
    kAdded,
    /// Only the old list has it.
    kRemoved,
    /// Both have it, and it differs.
    kChanged,
};

/// One parameter that is not the same in both lists.
struct Difference
{
    /// What kind of difference it is.
    Change change = Change::kChanged;
    /// Kind and name of the parameter, the same on both sides.
    Kind kind = Kind::kFestwert;
    CString name;
    /// Where the parameter is in the two lists; `kNoIndex` where it is not.
    std::size_t oldIndex = kNoIndex;
    std::size_t newIndex = kNoIndex;
    /// For a changed parameter: all that differs, in the order of the fields, points and values.
    std::vector<FieldDifference> fields;
    /// Points of the axes. Where points were added or removed these alone are listed, the removed
    /// ones first. Points that have changed in their places, or their order, are compared one by
    /// one.
    std::vector<ValueDifference> x;
    std::vector<ValueDifference> y;
    std::vector<ValueDifference> values;
};

/// Compares two lists of parameters, paired by kind and name; names that are there several times
/// are paired in their order. The result is in the order of the kinds, within a kind in the order
/// of the old list, with added parameters last in the order of the new one. Values over an axis
/// that has changed are compared at equal points (a point that is there several times in the order
/// of its places); values at points that only one side has are listed as values that the other
/// lacks. A FESTWERTEBLOCK in rows is compared row by row when the length of its rows has changed.
/// Values are listed in the old order, those that the old side lacks last. Takes time in proportion
/// to the content of both lists. Throws only when memory runs out.
DCM_API std::vector<Difference> Differences(std::span<const Parameter> oldParameters,
                                            std::span<const Parameter> newParameters,
                                            const Comparison& comparison = {});

} // namespace dcm
