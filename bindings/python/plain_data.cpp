#include "bindings/python/plain_data.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>

namespace dcm::python {

namespace {

/// Up to two dimensions of an array.
struct Shape
{
    int dimensions;
    std::array<py::ssize_t, 2> lengths;
};

/// A new reference to a value as Python has it.
py::object Entry(const CComVariant& value)
{
    if (value.vt == VT_R8)
        return py::float_(value.dblVal);
    if (value.vt == VT_BSTR)
        return Text(CComVariant::TextOf(value));
    return py::none();
}

/// A new array, of the memory at `content` or, if that is null, of memory of its own without
/// content. pybind11's own constructors take several times as long, which counts for the many small
/// arrays of a file.
py::array NewArray(const py::dtype& type, const Shape& shape, void* content = nullptr)
{
    using Numpy = py::detail::npy_api;
    const Numpy& numpy = Numpy::get();
    const int flags = content == nullptr
                          ? 0
                          : Numpy::NPY_ARRAY_C_CONTIGUOUS_ | Numpy::NPY_ARRAY_ALIGNED_ |
                                Numpy::NPY_ARRAY_WRITEABLE_;
    PyObject* const array = numpy.PyArray_NewFromDescr_(
        numpy.PyArray_Type_, py::dtype(type).release().ptr(), shape.dimensions,
        shape.lengths.data(), nullptr, content, flags, nullptr);
    if (array == nullptr)
        throw py::error_already_set();
    return py::reinterpret_steal<py::array>(array);
}

py::array ObjectArray(const std::vector<CComVariant>& values, const Shape& shape)
{
    py::array array = NewArray(py::dtype("O"), shape);
    auto** const entries = static_cast<PyObject**>(array.mutable_data());
    for (std::size_t i = 0; i < values.size(); ++i) {
        PyObject* const old = entries[i];
        entries[i] = Entry(values[i]).release().ptr();
        Py_XDECREF(old);
    }
    return array;
}

/// Writes numbers to `entries`, not-a-number for entries without a value; false if there is a text.
bool CopyNumbers(const std::vector<CComVariant>& values, double* entries)
{
    for (const CComVariant& value : values) {
        if (value.vt == VT_BSTR)
            return false;
        *entries++ = value.vt == VT_R8 ? value.dblVal : std::numeric_limits<double>::quiet_NaN();
    }
    return true;
}

/// An array of numbers, or of objects if there is a text.
py::array Array(const std::vector<CComVariant>& values, const Shape& shape)
{
    py::array array = NewArray(py::dtype::of<double>(), shape);
    return CopyNumbers(values, static_cast<double*>(array.mutable_data()))
               ? array
               : ObjectArray(values, shape);
}

py::array Points(const Axis& axis)
{
    return Array(axis.points, {1, {static_cast<py::ssize_t>(axis.points.size()), 0}});
}

bool IsMap(Kind kind)
{
    return kind == Kind::kKennfeld || kind == Kind::kFestkennfeld || kind == Kind::kGruppenkennfeld;
}

/// Rows and columns if the parameter has them and its values fill them.
Shape ShapeOf(const Parameter& parameter)
{
    std::size_t rows = 0;
    std::size_t columns = 0;
    const bool isMap = IsMap(parameter.kind);
    if (isMap) {
        rows = parameter.y.points.size();
        columns = parameter.x.points.size();
    } else if (parameter.kind == Kind::kFestwerteblock && parameter.countX > 0 &&
               parameter.countY > 0) {
        rows = static_cast<std::size_t>(parameter.countY);
        columns = static_cast<std::size_t>(parameter.countX);
    }
    const std::size_t size = parameter.values.size();
    if ((isMap || rows > 0) && rows * columns == size)
        return {2, {static_cast<py::ssize_t>(rows), static_cast<py::ssize_t>(columns)}};
    return {1, {static_cast<py::ssize_t>(size), 0}};
}

CString TextOf(py::handle text)
{
    Py_ssize_t length = 0;
    wchar_t* const characters = PyUnicode_AsWideCharString(text.ptr(), &length);
    if (characters == nullptr)
        throw py::error_already_set();
    CString result(std::wstring_view(characters, static_cast<std::size_t>(length)));
    PyMem_Free(characters);
    return result;
}

CComVariant Value(py::handle entry)
{
    if (entry.is_none())
        return {};
    if (PyUnicode_Check(entry.ptr()))
        return CComVariant(TextOf(entry));
    return CComVariant(entry.cast<double>());
}

std::vector<CComVariant> Values(py::handle entries, bool keepsNan)
{
    std::vector<CComVariant> values;
    if (py::isinstance<py::list>(entries)) {
        for (const py::handle entry : entries)
            values.push_back(Value(entry));
        return values;
    }
    const auto array = py::cast<py::array_t<double, py::array::c_style>>(entries);
    const auto size = static_cast<std::size_t>(array.size());
    values.reserve(size);
    for (std::size_t i = 0; i < size; ++i) {
        const double number = array.data()[i];
        if (keepsNan || !std::isnan(number))
            values.emplace_back(number);
        else
            values.emplace_back();
    }
    return values;
}

py::object Index(std::size_t index)
{
    return index == kNoIndex ? py::object(py::none()) : py::object(py::int_(index));
}

py::list Changes(const std::vector<ValueDifference>& differences)
{
    py::list list;
    for (const ValueDifference& one : differences)
        list.append(py::make_tuple(Index(one.oldIndex), Index(one.newIndex), Entry(one.oldValue),
                                   Entry(one.newValue)));
    return list;
}

} // namespace

py::str Text(std::wstring_view text)
{
    PyObject* const result =
        PyUnicode_FromWideChar(text.data(), static_cast<Py_ssize_t>(text.size()));
    if (result == nullptr)
        throw py::error_already_set();
    return py::reinterpret_steal<py::str>(result);
}

py::array ValuesOf(const Parameter& parameter)
{
    const Shape shape = ShapeOf(parameter);
    return parameter.kind == Kind::kTextstring ? ObjectArray(parameter.values, shape)
                                               : Array(parameter.values, shape);
}

py::dict ArraysOf(const std::vector<Parameter>& parameters)
{
    std::size_t size = 0;
    for (const Parameter& parameter : parameters)
        size += parameter.values.size();
    const py::dtype number = py::dtype::of<double>();
    py::array numbers = NewArray(number, {1, {static_cast<py::ssize_t>(size), 0}});
    auto* place = static_cast<double*>(numbers.mutable_data());
    const auto valuesOf = [&](const Parameter& parameter) {
        const Shape shape = ShapeOf(parameter);
        if (parameter.kind == Kind::kTextstring || !CopyNumbers(parameter.values, place))
            return ObjectArray(parameter.values, shape);
        py::array view = NewArray(number, shape, place);
        place += parameter.values.size();
        if (py::detail::npy_api::get().PyArray_SetBaseObject_(view.ptr(),
                                                              numbers.inc_ref().ptr()) != 0)
            throw py::error_already_set();
        return view;
    };

    py::dict arrays;
    for (const Parameter& parameter : parameters) {
        const py::str name = Text(parameter.name);
        if (PyDict_SetDefault(arrays.ptr(), name.ptr(), valuesOf(parameter).ptr()) == nullptr)
            throw py::error_already_set();
    }
    return arrays;
}

py::tuple AttributesOf(const Parameter& parameter)
{
    return py::make_tuple(Text(parameter.langname), Text(parameter.displayname),
                          Text(parameter.function), Text(parameter.unit), parameter.countX,
                          parameter.countY, Text(parameter.x.unit), Text(parameter.x.distribution),
                          Points(parameter.x), Text(parameter.y.unit),
                          Text(parameter.y.distribution), Points(parameter.y));
}

Parameter FromPython(const py::tuple& tuple)
{
    Parameter parameter;
    std::size_t at = 0;
    const auto next = [&]() { return tuple[at++]; };
    parameter.kind = kKinds.at(next().cast<std::size_t>());
    parameter.name = TextOf(next());
    parameter.langname = TextOf(next());
    parameter.displayname = TextOf(next());
    parameter.function = TextOf(next());
    parameter.unit = TextOf(next());
    parameter.countX = next().cast<std::int32_t>();
    parameter.countY = next().cast<std::int32_t>();
    for (Axis* const axis : {&parameter.x, &parameter.y}) {
        axis->unit = TextOf(next());
        axis->distribution = TextOf(next());
        axis->points = Values(next(), false);
    }
    // A value block has a number at every place.
    parameter.values = Values(next(), parameter.kind == Kind::kFestwerteblock);
    parameter.columns =
        IsMap(parameter.kind) ? parameter.x.points.size()
        : parameter.kind == Kind::kFestwerteblock && parameter.countX > 0 && parameter.countY > 0
            ? static_cast<std::size_t>(parameter.countX)
            : parameter.values.size();
    return parameter;
}

py::tuple ToPython(const Report& report)
{
    py::list findings;
    for (const Finding& finding : report.Findings())
        findings.append(py::make_tuple(static_cast<int>(finding.severity), finding.id, finding.line,
                                       Text(finding.block), Text(finding.message)));
    return py::make_tuple(std::move(findings), report.Count(Severity::kNote),
                          report.Count(Severity::kWarning), report.Count(Severity::kError),
                          report.Incomplete());
}

py::list ToPython(const std::vector<Difference>& differences)
{
    py::list list;
    for (const Difference& one : differences) {
        py::list fields;
        for (const FieldDifference& field : one.fields)
            fields.append(py::make_tuple(Text(KeywordOf(field.field)), Text(field.oldText),
                                         Text(field.newText)));
        list.append(py::make_tuple(static_cast<int>(one.change), static_cast<int>(one.kind),
                                   Text(one.name), Index(one.oldIndex), Index(one.newIndex),
                                   std::move(fields), Changes(one.x), Changes(one.y),
                                   Changes(one.values)));
    }
    return list;
}

} // namespace dcm::python
