// Each allocation in the calls of the C interface fails once.
#include "bindings/c/dcm_c.h"
#include "tests/allocations.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <functional>
#include <string>
#include <utility>

using namespace test;

namespace {

/// A document with the file's content, and its last parameter.
std::pair<dcm_document*, dcm_parameter*> Opened(const std::string& path)
{
    dcm_document* document = nullptr;
    dcm_parameter* last = nullptr;
    std::size_t count = 0;
    EXPECT_EQ(dcm_document_new(&document), DCM_OK);
    EXPECT_EQ(dcm_document_open(document, path.c_str()), DCM_OK);
    EXPECT_EQ(dcm_document_parameter_count(document, &count), DCM_OK);
    EXPECT_EQ(dcm_document_parameter(document, count - 1, &last), DCM_OK);
    return {document, last};
}

std::string Saved(dcm_document* document, const CString& path)
{
    EXPECT_EQ(dcm_document_save_wide(document, path), DCM_OK);
    return ReadBytes(path);
}

} // namespace

TEST(CInterface, FailureOfAnAllocationIsTheResult)
{
    const Folder folder;
    const CString copy = folder / L"copy.dcm";
    const std::string in = dcm::ToUtf8(folder / L"in.dcm"), out = dcm::ToUtf8(folder / L"out.dcm");
    WriteBytes(folder / L"in.dcm", "* a comment that is long\n\n"
                                   "FESTWERT Value\n WERT 720,5\nEND\n\n"
                                   "KENNFELD Map 1 1\n LANGNAME \"a long name that is long\"\n"
                                   " ST/X 1\n ST/Y 2\n WERT 3\nEND\n\n"
                                   "TEXTSTRING A_name_that_is_long\n"
                                   " TEXT \"a text that is long\"\nEND\n\n");
    constexpr const char* name = "A_name_that_is_long";
    constexpr const char* text = "a text that needs memory of its own";
    char buffer[256];
    size_t length = 0;
    const double numbers[] = {1.0};
    const struct
    {
        const char* what;
        std::function<dcm_result(dcm_document*, dcm_parameter*)> call;
        /// Whether the document is another one afterwards.
        bool changes;
        bool reports = false;
    } cases[] = {
        {"new",
         [](dcm_document*, dcm_parameter*) {
             dcm_document* document = nullptr;
             const dcm_result result = dcm_document_new(&document);
             EXPECT_EQ(result == DCM_OK, document != nullptr);
             dcm_document_free(document);
             return result;
         },
         false},
        {"open", [&](auto* d, auto*) { return dcm_document_open(d, in.c_str()); }, false, true},
        {"save", [&](auto* d, auto*) { return dcm_document_save(d, out.c_str()); }, false, true},
        {"comment",
         [&](auto* d, auto*) {
             return dcm_document_set_text(d, DCM_COMMENT, text, DCM_TERMINATED);
         },
         true},
        {"comment out",
         [&](auto* d, auto*) {
             return dcm_document_get_text(d, DCM_COMMENT, buffer, sizeof buffer, &length);
         },
         false},
        {"finding",
         [&](auto* d, auto*) {
             return dcm_document_finding_text(d, 0, DCM_FINDING_MESSAGE, buffer, sizeof buffer,
                                              &length);
         },
         false},
        {"find",
         [&](auto* d, auto*) {
             dcm_parameter* found = nullptr;
             return dcm_document_find(d, name, DCM_TERMINATED, nullptr, &found);
         },
         false},
        {"add",
         [&](auto* d, auto*) {
             dcm_parameter* added = nullptr;
             return dcm_document_add(d, DCM_FESTWERT, text, DCM_TERMINATED, &added);
         },
         true},
        {"copy",
         [&](auto* d, auto* p) {
             dcm_parameter* added = nullptr;
             return dcm_document_add_copy(d, p, &added);
         },
         true},
        {"rename",
         [&](auto*, auto* p) { return dcm_parameter_set_text(p, DCM_NAME, text, DCM_TERMINATED); },
         true},
        {"numbers",
         [&](auto*, auto* p) { return dcm_parameter_set_numbers(p, DCM_VALUES, numbers, 1); },
         true},
        {"text",
         [&](auto*, auto* p) {
             return dcm_parameter_set_element_text(p, DCM_VALUES, 0, text, DCM_TERMINATED);
         },
         true},
    };
    dcm_document* const unchanged = Opened(in).first;
    const std::string content = Saved(unchanged, copy);
    dcm_document_free(unchanged);
    // With and without an index of names, which a search makes and other calls keep up to date.
    for (const bool indexed : {false, true}) {
        for (const auto& c : cases) {
            bool failed = true;
            for (long number = 1; failed && !HasFailure(); ++number) {
                SCOPED_TRACE(testing::Message() << c.what << " " << number);
                const long before = live;
                const auto [document, parameter] = Opened(in);
                if (indexed) {
                    dcm_parameter* found = nullptr;
                    dcm_document_find(document, name, DCM_TERMINATED, nullptr, &found);
                    EXPECT_EQ(found, parameter);
                }
                untilFailure = number;
                const dcm_result result = c.call(document, parameter);
                failed = untilFailure <= 0;
                untilFailure = 0;
                // A report can do without memory for some of its findings.
                if (result != DCM_OK || (failed && !c.reports)) {
                    EXPECT_EQ(result, DCM_ERROR_MEMORY);
                }
                EXPECT_EQ(Saved(document, copy) == content, result != DCM_OK || !c.changes);
                dcm_document_free(document);
                if (!LibraryLeaks()) {
                    EXPECT_EQ(live, before);
                }
            }
        }
    }
}
