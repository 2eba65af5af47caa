#pragma once

#include "dcm/library/dcm.h"

#include <pybind11/numpy.h>
#include <pybind11/pybind11.h>

#include <string_view>
#include <vector>

/// The library's content as tuples, lists and numpy arrays, and back. All of it needs the
/// interpreter's lock.
namespace dcm::python {

namespace py = pybind11;

py::str Text(std::wstring_view text);

/// The values as an array of numbers or, where there are texts, of objects. Two dimensions for maps
/// and rows that are filled, otherwise one.
py::array ValuesOf(const Parameter& parameter);

/// `ValuesOf` all by name, of equal names the first. The arrays of numbers lie in one block of
/// memory, as an allocation for each would take a third of the time.
py::dict ArraysOf(const std::vector<Parameter>& parameters);

/// Langname, displayname, function, unit, countX, countY, and for x and y each unit, distribution
/// and points.
py::tuple AttributesOf(const Parameter& parameter);

/// The reverse: kind, name, what `AttributesOf` gives, values. Points and values are an array of
/// numbers, where not-a-number is an entry without a value, or a list of numbers, texts and None.
Parameter FromPython(const py::tuple& tuple);

/// Each finding as severity, id, line, block and message; then the counts of notes, warnings and
/// errors, and whether findings are missing.
py::tuple ToPython(const Report& report);

/// Each difference as change, kind, name, the two indices, and the lists of fields, x, y and
/// values. An index is None on the side that lacks it.
py::list ToPython(const std::vector<Difference>& differences);

} // namespace dcm::python
