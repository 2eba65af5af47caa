#include "bindings/c/handles.h"
#include "bindings/c/result.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

using namespace dcm::c;

static_assert(DCM_TEXTSTRING == static_cast<int>(dcm::Kind::kTextstring));
static_assert(DCM_KENNFELD == static_cast<int>(dcm::Kind::kKennfeld));
static_assert(DCM_NOTE == static_cast<int>(dcm::Severity::kNote));
static_assert(DCM_WARNING == static_cast<int>(dcm::Severity::kWarning));
static_assert(DCM_ERROR == static_cast<int>(dcm::Severity::kError));

namespace {

using Parameters = std::vector<std::unique_ptr<dcm_parameter>>;

/// The result of an import or export that failed.
dcm_result FailForFile(const dcm::Report& report)
{
    if (report.Count("out-of-memory") > 0 || (report.Incomplete() && report.Findings().empty()))
        return Fail(DCM_ERROR_MEMORY, "Memory ran out.");
    for (const dcm::Finding& finding : report.Findings()) {
        if (finding.severity == dcm::Severity::kError)
            return Fail(DCM_ERROR_FILE, dcm::ToUtf8(finding.message));
    }
    return Fail(DCM_ERROR_FILE, "The file cannot be read or written.");
}

dcm_result Open(dcm_document& document, const CString& path)
{
    DCMConverter file;
    dcm::Report report;
    const HRESULT result = dcm::Import(file, path, report);
    if (FAILED(result)) {
        document.report = std::move(report);
        return FailForFile(document.report);
    }
    CString comment = file.GetComment();
    CString header = dcm::HeaderOfComment(comment);
    std::vector<dcm::Parameter> contents = dcm::ParametersOf(std::move(file));
    Parameters parameters;
    parameters.reserve(contents.size());
    std::uint64_t number = 0;
    for (dcm::Parameter& content : contents) {
        parameters.push_back(std::make_unique<dcm_parameter>(
            dcm_parameter{std::move(content), &document, ++number}));
    }
    document.names.reset();
    document.parameters = std::move(parameters);
    document.nextNumber = number + 1;
    document.comment = std::move(comment);
    document.header = std::move(header);
    document.report = std::move(report);
    return DCM_OK;
}

dcm_result Save(dcm_document& document, const CString& path)
{
    DCMConverter file;
    file.SetHeader(document.header);
    for (const auto& parameter : document.parameters)
        dcm::Add(file, parameter->content);
    return SUCCEEDED(dcm::Save(file, path, document.report)) ? DCM_OK
                                                             : FailForFile(document.report);
}

/// Makes the index of names if there is none.
NameIndex& NamesOf(dcm_document& document)
{
    if (!document.names) {
        NameIndex names;
        for (const auto& parameter : document.parameters)
            names.insert(parameter.get());
        document.names = std::move(names);
    }
    return *document.names;
}

dcm_parameter* Append(dcm_document& document, dcm::Parameter&& content)
{
    auto parameter = std::make_unique<dcm_parameter>(
        dcm_parameter{std::move(content), &document, document.nextNumber});
    dcm_parameter* const handle = parameter.get();
    // After this the end of the list needs no memory.
    if (document.parameters.size() == document.parameters.capacity())
        document.parameters.reserve(document.parameters.size() * 2 + 1);
    if (document.names)
        document.names->insert(handle);
    document.parameters.push_back(std::move(parameter));
    ++document.nextNumber;
    return handle;
}

/// The place of a parameter in its document.
Parameters::iterator PlaceOf(dcm_document& document, const dcm_parameter& parameter)
{
    return std::lower_bound(document.parameters.begin(), document.parameters.end(),
                            parameter.number,
                            [](const auto& p, auto number) { return p->number < number; });
}

} // namespace

dcm_result dcm_document_new(dcm_document** document)
{
    if (document == nullptr)
        return FailForNull();
    *document = nullptr;
    return Try([&]() -> dcm_result {
        *document = std::make_unique<dcm_document>().release();
        return DCM_OK;
    });
}

dcm_result dcm_document_free(dcm_document* document)
{
    const std::unique_ptr<dcm_document> owned(document);
    return DCM_OK;
}

dcm_result dcm_document_open(dcm_document* document, const char* path)
{
    if (document == nullptr || path == nullptr)
        return FailForNull();
    return Try([&]() -> dcm_result { return Open(*document, dcm::FromUtf8(path)); });
}

dcm_result dcm_document_open_wide(dcm_document* document, const wchar_t* path)
{
    if (document == nullptr || path == nullptr)
        return FailForNull();
    return Try([&]() -> dcm_result { return Open(*document, path); });
}

dcm_result dcm_document_save(dcm_document* document, const char* path)
{
    if (document == nullptr || path == nullptr)
        return FailForNull();
    return Try([&]() -> dcm_result { return Save(*document, dcm::FromUtf8(path)); });
}

dcm_result dcm_document_save_wide(dcm_document* document, const wchar_t* path)
{
    if (document == nullptr || path == nullptr)
        return FailForNull();
    return Try([&]() -> dcm_result { return Save(*document, path); });
}

dcm_result dcm_document_get_text(const dcm_document* document, int32_t field, char* buffer,
                                 size_t size, size_t* length)
{
    if (document == nullptr)
        return FailForNull();
    if (field != DCM_COMMENT && field != DCM_HEADER)
        return FailForConstant();
    return Try([&]() -> dcm_result {
        return GiveText(field == DCM_COMMENT ? document->comment : document->header, buffer, size,
                        length);
    });
}

dcm_result dcm_document_set_text(dcm_document* document, int32_t field, const char* text,
                                 size_t length)
{
    if (document == nullptr)
        return FailForNull();
    if (field != DCM_COMMENT && field != DCM_HEADER)
        return FailForConstant();
    if (const dcm_result refused = CheckText(text, length))
        return refused;
    return Try([&]() -> dcm_result {
        CString taken = TextFrom(text, length);
        if (field == DCM_COMMENT) {
            document->header = dcm::HeaderOfComment(taken);
            document->comment = std::move(taken);
        } else {
            document->header = std::move(taken);
        }
        return DCM_OK;
    });
}

dcm_result dcm_document_finding_count(const dcm_document* document, size_t* count)
{
    if (document == nullptr || count == nullptr)
        return FailForNull();
    *count = document->report.Findings().size();
    return DCM_OK;
}

dcm_result dcm_document_severity_count(const dcm_document* document, int32_t severity,
                                       size_t* count)
{
    if (document == nullptr || count == nullptr)
        return FailForNull();
    if (severity < DCM_NOTE || severity > DCM_ERROR)
        return FailForConstant();
    *count = document->report.Count(static_cast<dcm::Severity>(severity));
    return DCM_OK;
}

dcm_result dcm_document_finding(const dcm_document* document, size_t index, int32_t* severity,
                                int64_t* line)
{
    if (document == nullptr || severity == nullptr || line == nullptr)
        return FailForNull();
    const std::vector<dcm::Finding>& findings = document->report.Findings();
    if (index >= findings.size())
        return FailForIndex();
    *severity = static_cast<int32_t>(findings[index].severity);
    *line = findings[index].line;
    return DCM_OK;
}

dcm_result dcm_document_finding_text(const dcm_document* document, size_t index, int32_t field,
                                     char* buffer, size_t size, size_t* length)
{
    if (document == nullptr)
        return FailForNull();
    const std::vector<dcm::Finding>& findings = document->report.Findings();
    if (index >= findings.size())
        return FailForIndex();
    const dcm::Finding& finding = findings[index];
    return Try([&]() -> dcm_result {
        switch (field) {
        case DCM_FINDING_ID:
            return GiveUtf8(finding.id, buffer, size, length);
        case DCM_FINDING_BLOCK:
            return GiveText(finding.block, buffer, size, length);
        case DCM_FINDING_MESSAGE:
            return GiveText(finding.message, buffer, size, length);
        default:
            return FailForConstant();
        }
    });
}

dcm_result dcm_document_parameter_count(const dcm_document* document, size_t* count)
{
    if (document == nullptr || count == nullptr)
        return FailForNull();
    *count = document->parameters.size();
    return DCM_OK;
}

dcm_result dcm_document_parameter(const dcm_document* document, size_t index,
                                  dcm_parameter** parameter)
{
    if (document == nullptr || parameter == nullptr)
        return FailForNull();
    *parameter = nullptr;
    if (index >= document->parameters.size())
        return FailForIndex();
    *parameter = document->parameters[index].get();
    return DCM_OK;
}

dcm_result dcm_document_find(dcm_document* document, const char* name, size_t length,
                             const dcm_parameter* after, dcm_parameter** parameter)
{
    if (document == nullptr || parameter == nullptr)
        return FailForNull();
    *parameter = nullptr;
    if (const dcm_result refused = CheckText(name, length))
        return refused;
    if (after != nullptr && after->document != document)
        return Fail(DCM_ERROR_ARGUMENT, "The parameter belongs to another document.");
    return Try([&]() -> dcm_result {
        const CString wanted = TextFrom(name, length);
        if (after != nullptr && after->content.name != wanted)
            return Fail(DCM_ERROR_ARGUMENT, "The parameter has another name.");
        const NameIndex& names = NamesOf(*document);
        const auto found =
            names.upper_bound(NameKey(wanted.View(), after == nullptr ? 0 : after->number));
        if (found == names.end() || (*found)->content.name != wanted)
            return Fail(DCM_ERROR_NOT_FOUND, "There is no parameter of this name.");
        *parameter = *found;
        return DCM_OK;
    });
}

dcm_result dcm_document_add(dcm_document* document, int32_t kind, const char* name, size_t length,
                            dcm_parameter** parameter)
{
    if (document == nullptr || parameter == nullptr)
        return FailForNull();
    *parameter = nullptr;
    if (kind < DCM_FESTWERT || kind > DCM_TEXTSTRING)
        return FailForConstant();
    if (const dcm_result refused = CheckText(name, length))
        return refused;
    return Try([&]() -> dcm_result {
        dcm::Parameter content;
        content.kind = static_cast<dcm::Kind>(kind);
        content.name = TextFrom(name, length);
        *parameter = Append(*document, std::move(content));
        return DCM_OK;
    });
}

dcm_result dcm_document_add_copy(dcm_document* document, const dcm_parameter* source,
                                 dcm_parameter** parameter)
{
    if (document == nullptr || source == nullptr || parameter == nullptr)
        return FailForNull();
    *parameter = nullptr;
    return Try([&]() -> dcm_result {
        *parameter = Append(*document, dcm::Parameter(source->content));
        return DCM_OK;
    });
}

dcm_result dcm_document_remove(dcm_document* document, dcm_parameter* parameter)
{
    if (document == nullptr || parameter == nullptr)
        return FailForNull();
    if (parameter->document != document)
        return Fail(DCM_ERROR_ARGUMENT, "The parameter belongs to another document.");
    if (document->names)
        document->names->erase(parameter);
    document->parameters.erase(PlaceOf(*document, *parameter));
    return DCM_OK;
}
