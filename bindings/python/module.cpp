// The compiled part of the Python module: files to plain data and back. The classes that users see
// are written in Python, over what is here.

#include "bindings/python/plain_data.h"
#include "dcm/library/dcm.h"

#include <pybind11/pybind11.h>

#include <cerrno>
#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace dcm::python {

namespace {

/// Chooses a code page for the calling thread while it lives.
class CodePage
{
public:
    explicit CodePage(unsigned identifier) : m_old(ThreadCodePage())
    {
        if (!SetThreadCodePage(identifier))
            throw py::key_error("code page " + std::to_string(identifier));
    }
    CodePage(const CodePage&) = delete;
    CodePage& operator=(const CodePage&) = delete;
    ~CodePage() { SetThreadCodePage(m_old); }

private:
    unsigned m_old;
};

/// The content of a file. It is not changed after it has been read.
struct Document
{
    std::vector<Parameter> parameters;
    CString comment;

    const Parameter& At(std::size_t index) const
    {
        if (index >= parameters.size())
            throw py::index_error();
        return parameters[index];
    }
};

/// A parameter as the Python classes hand it over: in full, or where it is in a document.
Parameter Given(py::handle item)
{
    const auto tuple = py::cast<py::tuple>(item);
    if (tuple.size() == 2)
        return tuple[0].cast<const Document&>().At(tuple[1].cast<std::size_t>());
    return FromPython(tuple);
}

std::vector<Parameter> GivenAll(const py::list& items)
{
    std::vector<Parameter> parameters;
    parameters.reserve(items.size());
    for (const py::handle item : items)
        parameters.push_back(Given(item));
    return parameters;
}

/// The system's number of the error by which the file failed; 0 when it did not.
int ErrorNumber(const Report& report)
{
    if (report.Cause() == CFileException::none)
        return 0;
    if (report.SystemError() != 0)
        return static_cast<int>(report.SystemError());
    // The library's own refusals.
    switch (report.Cause()) {
    case CFileException::sharingViolation:
        return EWOULDBLOCK;
    case CFileException::fileTooLarge:
        return EFBIG;
    case CFileException::accessDenied:
        return EACCES;
    default:
        return EIO;
    }
}

py::tuple Read(const std::string& path, unsigned codePage)
{
    auto document = std::make_unique<Document>();
    Report report;
    HRESULT result = S_OK;
    {
        const CodePage chosen(codePage);
        const py::gil_scoped_release release;
        DCMConverter file;
        result = Import(file, FromUtf8(path), report);
        document->comment = file.GetComment();
        document->parameters = ParametersOf(std::move(file));
    }
    return py::make_tuple(SUCCEEDED(result), ErrorNumber(report), std::move(document),
                          ToPython(report));
}

py::tuple Write(const std::string& path, unsigned codePage, const std::wstring& comment,
                const py::list& items, bool toNullDevice)
{
    std::vector<Parameter> parameters = GivenAll(items);
    Report report;
    HRESULT result = S_OK;
    {
        const CodePage chosen(codePage);
        const py::gil_scoped_release release;
        DCMConverter file;
        file.SetHeader(HeaderOfComment(CString(comment)));
        for (Parameter& parameter : parameters)
            Add(file, std::move(parameter));
        result =
            toNullDevice ? Export(file, NullDevice(), report) : Save(file, FromUtf8(path), report);
    }
    return py::make_tuple(SUCCEEDED(result), ErrorNumber(report), ToPython(report));
}

py::list Diff(const py::list& oldItems, const py::list& newItems, double absolute, double relative,
              bool ignoreTexts, bool ignoreUnits, bool ignoreAxes)
{
    const std::vector<Parameter> oldParameters = GivenAll(oldItems);
    const std::vector<Parameter> newParameters = GivenAll(newItems);
    std::vector<Difference> differences;
    {
        const py::gil_scoped_release release;
        differences = Differences(oldParameters, newParameters,
                                  {absolute, relative, ignoreTexts, ignoreUnits, ignoreAxes});
    }
    return ToPython(differences);
}

py::tuple Kinds()
{
    py::tuple keywords(kKinds.size());
    for (std::size_t i = 0; i < kKinds.size(); ++i)
        keywords[i] = Text(KeywordOf(kKinds[i]));
    return keywords;
}

} // namespace

// NOLINTNEXTLINE: the macro is pybind11's.
PYBIND11_MODULE(_dcm, m)
{
    m.attr("KINDS") = Kinds();
    m.attr("VERSION") = LibraryVersion();
    py::class_<Document>(m, "Document")
        .def_property_readonly("comment",
                               [](const Document& document) { return Text(document.comment); })
        .def("__len__", [](const Document& document) { return document.parameters.size(); })
        .def("name", [](const Document& document,
                        std::size_t index) { return Text(document.At(index).name); })
        .def("kinds",
             [](const Document& document) {
                 std::string kinds;
                 for (const Parameter& parameter : document.parameters)
                     kinds += static_cast<char>(parameter.kind);
                 return py::bytes(kinds);
             })
        .def("arrays", [](const Document& document) { return ArraysOf(document.parameters); })
        .def("values", [](const Document& document,
                          std::size_t index) { return ValuesOf(document.At(index)); })
        .def("attributes", [](const Document& document, std::size_t index) {
            return AttributesOf(document.At(index));
        });
    m.def("read", &Read, py::arg("path"), py::arg("code_page"));
    m.def("write", &Write, py::arg("path"), py::arg("code_page"), py::arg("comment"),
          py::arg("parameters"), py::arg("to_null_device"));
    m.def("diff", &Diff, py::arg("old"), py::arg("new"), py::arg("absolute"), py::arg("relative"),
          py::arg("ignore_texts"), py::arg("ignore_units"), py::arg("ignore_axes"));
}

} // namespace dcm::python
