// Each allocation in the library's calls fails once.
#include "tests/allocations.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <new>
#include <span>
#include <vector>

using namespace test;

namespace {

/// What an operation works on. The texts are long enough to need memory of their own.
struct State
{
    DCMConverter source;
    DCMConverter target;
    HRESULT result = S_OK;
    CComVariant value{L"before"};
    std::vector<CComVariant> points{1.0, L"before"};
    CString text{L"before"};
};

/// Repeats an operation; each time the next of its allocations fails, until none is left to fail.
/// With `raises` a failure is thrown and leaves the target unchanged. Otherwise it is the result,
/// and the target has whole blocks. Nothing leaks.
void FailEach(const char* name, bool raises, const std::function<void(State&)>& operation)
{
    SCOPED_TRACE(name);
    const Folder folder;
    const CString path = folder / L"check.dcm";
    const std::string all = ReadBytes(CString(DCM_ALL_KINDS));
    const std::string empty = ExportBytes(DCMConverter());
    DCMConverter loaded;
    ASSERT_EQ(ImportBytes(loaded, all), S_OK);
    bool failed = true;
    for (long number = 1; failed && !testing::Test::HasFailure(); ++number) {
        SCOPED_TRACE(number);
        const long before = live;
        bool raised = false;
        {
            State state;
            state.source = loaded;
            untilFailure = number;
            try {
                operation(state);
            } catch (const std::bad_alloc&) {
                raised = true;
            }
            failed = untilFailure <= 0;
            untilFailure = 0;
            EXPECT_EQ(raised, failed && raises);
            EXPECT_EQ(state.result, failed && !raises ? E_UNEXPECTED : S_OK);
            EXPECT_EQ(ExportBytes(state.source, path), all);
            if (failed) {
                const std::string target = ExportBytes(state.target, path);
                EXPECT_TRUE(raises ? target == empty : all.starts_with(target));
                EXPECT_TRUE(target.ends_with("\r\n\r\n"));
                EXPECT_EQ(Show(state.text) + " " + Show(state.value) + " " + ShowAll(state.points),
                          "'before' 'before' 1 'before'");
            }
        }
        if (!LibraryLeaks()) {
            EXPECT_EQ(live, before);
        }
    }
}

} // namespace

TEST(Allocation, FailureIsTheResultOfImportAndExport)
{
    // Made before any allocation fails.
    static const Folder folder;
    static const CString in = folder / L"in", out = folder / L"out";
    WriteBytes(in, ReadBytes(CString(DCM_ALL_KINDS)));
    // The second page is one that the system converts.
    for (const unsigned page : {1252U, 28605U}) {
        if (!ChoosePage(page))
            continue;
        FailEach("import", false, [](State& s) { s.result = s.target.Import(in); });
        FailEach("export", false, [](State& s) { s.result = s.source.Export(out); });
    }
    ASSERT_TRUE(dcm::SetThreadCodePage(1252));
}

TEST(Allocation, FailureOfAReportLeavesTheWorkAsItIs)
{
    const Folder folder;
    const CString in = folder / L"in", out = folder / L"out", plain = folder / L"plain",
                  none = folder / L"none";
    WriteBytes(in, ReadBytes(CString(DCM_ALL_KINDS)) +
                       "FESTWERT A\n VAR a=b\n WERT 720,5\nEND\n\n"
                       "KENNLINIE A 1\n*SSTX B\n ST/X 1\n WERT 1\nEND\n\n");
    DCMConverter all;
    dcm::Report unhindered;
    ASSERT_EQ(dcm::Import(all, in, unhindered), S_OK);
    const std::string content = ExportBytes(all, plain);
    bool failed = true, told = false;
    for (long number = 1; failed; ++number) {
        SCOPED_TRACE(number);
        DCMConverter document;
        dcm::Report report;
        untilFailure = number;
        const HRESULT result = dcm::Import(document, in, report);
        failed = untilFailure <= 0;
        untilFailure = 0;
        if (result == S_OK) {
            EXPECT_EQ(ExportBytes(document, plain), content);
        }
        // Sorting can do without the memory that it asks for.
        const bool whole = result == S_OK && !report.Incomplete();
        EXPECT_TRUE(failed || whole);
        EXPECT_TRUE(!whole || report.Count() == unhindered.Count());
        EXPECT_GT(report.Count(dcm::Severity::kError), 0U);
        told = told || report.Count("out-of-memory") == 1;
    }
    EXPECT_TRUE(told);
    ASSERT_EQ(dcm::Export(all, out, unhindered), S_OK);
    failed = true;
    for (long number = 1; failed; ++number) {
        SCOPED_TRACE(number);
        dcm::Report report;
        untilFailure = number;
        const HRESULT result = dcm::Export(all, out, report);
        failed = untilFailure <= 0;
        untilFailure = 0;
        if (result == S_OK) {
            EXPECT_EQ(ReadBytes(out), content);
        }
        const bool whole = result == S_OK && !report.Incomplete();
        EXPECT_TRUE(failed || whole);
        EXPECT_TRUE(!whole || report.Count() == unhindered.Count());
    }
    failed = true;
    for (long number = 1; failed; ++number) {
        DCMConverter document;
        dcm::Report report;
        untilFailure = number;
        EXPECT_EQ(dcm::Import(document, none, report), E_UNEXPECTED);
        failed = untilFailure <= 0;
        untilFailure = 0;
        EXPECT_EQ(report.Count(dcm::Severity::kError), 1U);
    }
}

TEST(Allocation, FailureIsRaisedByTheCallsOfABlock)
{
    static const Folder folder;
    static const CString path = folder / L"block";
    ForEachKind([](const char* keyword, auto get, auto add) {
        FailEach(keyword, true, [=](State& s) {
            auto blocks = (s.source.*get)();
            auto block(blocks.front());
            block = blocks.back();
            for (int pass = 0; pass < 2; ++pass) {
                block.Init(CString(
                    L"KENNFELD n 1 1\nKENNLINIE n 1\nSTUETZSTELLENVERTEILUNG n 1\nFESTWERT n\n"
                    L"LANGNAME \"l\"\nEINHEIT_W \"w\"\nWERT 1 2\nST/X 1\nST/Y 1\nST_TX/X \"a\"\n"
                    L"TEXT \"a\" \"b\"\n"));
            }
            PravFile file(path, kCreate);
            block.Export(file);
            (s.target.*add)(blocks.back());
        });
    });
}

TEST(Allocation, FailureIsRaisedByTheOtherCalls)
{
    const std::pair<const char*, void (*)(State&)> cases[] = {
        {"copy", [](State& s) { const DCMConverter copy(s.source); }},
        {"assignment", [](State& s) { s.target = s.source; }},
        {"header", [](State& s) { s.target.SetHeader(L"header"); }},
        {"value out", [](State& s) { s.source.GetFestwerte().back().GetValue(&s.value); }},
        {"value in",
         [](State& s) {
             DCMFestwert block;
             try {
                 block.Init(L"FESTWERT n\nTEXT \"text\"\n");
                 block.SetValue(s.value);
             } catch (const std::bad_alloc&) {
                 // Once the name is read, only storing a text can fail.
                 EXPECT_EQ(block.GetValueType(), block.GetName().IsEmpty() ? VT_EMPTY : VT_ERROR);
                 throw;
             }
         }},
        {"points out", [](State& s) { s.source.GetFestkennfeld().front().GetValues(s.points); }},
        {"texts in",
         [](State& s) {
             DCMKennfeld block;
             block.AddAxisX(s.value);
             block.AddAxisY(s.value);
             block.AddValue(s.value);
             DCMStuetzstellenverteilung().AddValue(s.value);
             DCMFestwerteblock().AddValue(s.text + L" and more");
         }},
    };
    for (const auto& [name, operation] : cases)
        FailEach(name, true, operation);
}

TEST(Allocation, FailureIsRaisedByTheCallsForParameters)
{
    static std::vector<dcm::Parameter> parameters;
    DCMConverter document;
    ASSERT_EQ(ImportBytes(document, ReadBytes(CString(DCM_ALL_KINDS))), S_OK);
    parameters = dcm::ParametersOf(document);
    // One of each kind, the last, which has the most content.
    for (const dcm::Kind kind : dcm::kKinds) {
        const auto last = std::find_if(parameters.rbegin(), parameters.rend(),
                                       [&](const auto& p) { return p.kind == kind; });
        ASSERT_NE(last, parameters.rend());
        FailEach(dcm::ToUtf8(dcm::KeywordOf(kind)).c_str(), true,
                 [&](State& s) { dcm::Add(s.target, *last); });
        FailEach("by moving", true, [&](State& s) { dcm::Add(s.target, dcm::Parameter(*last)); });
    }
    FailEach("parameters", true, [](State& s) { dcm::ParametersOf(s.source); });
    FailEach("parameters by moving", true,
             [](State& s) { dcm::ParametersOf(DCMConverter(s.source)); });
    // Two that are removed, and others that have the content of another one.
    static std::vector<dcm::Parameter> others(parameters.begin() + 2, parameters.end());
    for (std::size_t i = 0; i + 1 < others.size(); ++i) {
        others[i].x = parameters[i].x;
        others[i].values = parameters[i].values;
        others[i].function = parameters[i].function;
    }
    FailEach("differences", true, [](State&) { dcm::Differences(parameters, others); });
    FailEach("additions", true, [](State&) { dcm::Differences({}, others); });
    FailEach("comment", true, [](State&) { dcm::HeaderOfComment(L"a long comment\n* of lines"); });
    parameters.clear();
    others.clear();
}

TEST(Allocation, IsNotForPointsThatABlockCannotHold)
{
    const auto wantedFor = [](const std::string& counts) {
        const std::string text = " a " + counts + "\n LANGNAME " + std::string(999, 'a') + "\n";
        const std::size_t before = wanted;
        DCMKennfeld().Init(dcm::FromUtf8("KENNFELD" + text));
        DCMKennlinie().Init(dcm::FromUtf8("KENNLINIE" + text));
        DCMStuetzstellenverteilung().Init(dcm::FromUtf8("STUETZSTELLENVERTEILUNG" + text));
        return wanted - before;
    };
    EXPECT_EQ(wantedFor("99999999"), wantedFor("00000000"));
    EXPECT_EQ(wantedFor("999 999"), wantedFor("000 000"));
}
