#include "fuzz/kinds.h"
#include "tests/allocations.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <functional>
#include <new>

using namespace test;

namespace {

/// A document of all kinds, as it is written.
const std::string& AllKinds()
{
    static const std::string bytes = ReadBytes(CString(DCM_ALL_KINDS));
    return bytes;
}

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

const Folder& Files()
{
    static const Folder folder;
    return folder;
}

/// What the document writes, into one file again and again: folders take their time.
std::string Bytes(const DCMConverter& document)
{
    const CString path = Files() / L"check.dcm";
    return document.Export(path) == S_OK ? ReadBytes(path) : "failed";
}

/// Runs an operation again and again, each time with the next of its allocations failing, until it
/// needs no more. A failure is raised and leaves the target as it was, or is the result and leaves
/// whole blocks; nothing leaks.
void FailEach(const char* name, bool raises, const std::function<void(State&)>& operation)
{
    SCOPED_TRACE(name);
    const std::string empty = Bytes(DCMConverter());
    DCMConverter loaded;
    ASSERT_EQ(ImportBytes(loaded, AllKinds()), S_OK);
    WriteBytes(Files() / L"in.dcm", AllKinds());
    bool failed = true;
    for (long number = 1; failed && !testing::Test::HasFailure(); ++number) {
        SCOPED_TRACE(number);
        const long before = LiveAllocations();
        bool raised = false;
        {
            State state;
            state.source = loaded;
            FailAllocation(number);
            try {
                operation(state);
            } catch (const std::bad_alloc&) {
                raised = true;
            }
            failed = AllocationHasFailed();
            FailAllocation(0);
            EXPECT_EQ(raised, failed && raises);
            EXPECT_EQ(state.result, failed && !raises ? E_UNEXPECTED : S_OK);
            EXPECT_EQ(Bytes(state.source), AllKinds());
            const std::string target = Bytes(state.target);
            EXPECT_TRUE(AllKinds().starts_with(ReadBytes(Files() / L"out.dcm")));
            if (failed) {
                EXPECT_TRUE(raises ? target == empty : AllKinds().starts_with(target));
                EXPECT_TRUE(target.ends_with("\r\n\r\n"));
                EXPECT_EQ(Show(state.text) + " " + Show(state.value) + " " + ShowAll(state.points),
                          "'before' 'before' 1 'before'");
            }
        }
        EXPECT_EQ(LiveAllocations(), before);
        EXPECT_LT(number, 5000);
    }
}

} // namespace

TEST(Allocation, FailureIsTheResultOfImportAndExport)
{
    // Made before any allocation fails.
    static const CString in = Files() / L"in.dcm", out = Files() / L"out.dcm";
    static const CString missing = Files() / L"missing.dcm";
    // The second page is one that the system converts.
    for (const unsigned page : {1252U, 28605U}) {
        ASSERT_TRUE(dcm::SetThreadCodePage(page));
        FailEach("import", false, [](State& s) { s.result = s.target.Import(in); });
        FailEach("import of a missing file", false, [](State& s) {
            EXPECT_EQ(s.target.Import(missing), E_UNEXPECTED);
            s.result = AllocationHasFailed() ? E_UNEXPECTED : S_OK;
        });
        FailEach("export", false, [](State& s) { s.result = s.source.Export(out); });
    }
    ASSERT_TRUE(dcm::SetThreadCodePage(1252));
}

TEST(Allocation, FailureIsRaisedByTheCallsOfABlock)
{
    ForEachKind([](const char*, auto get, auto add) {
        FailEach("a block", true, [=](State& s) {
            auto blocks = (s.source.*get)();
            auto block(blocks.front());
            block = blocks.back();
            for (int pass = 0; pass < 2; ++pass)
                block.Init(CString(
                    L"KENNFELD n 1 1\nKENNLINIE n 1\nSTUETZSTELLENVERTEILUNG n 1\nFESTWERT n\n"
                    L"LANGNAME \"l\"\nEINHEIT_W \"w\"\nWERT 1 2\nST/X 1\nST/Y 1\nST_TX/X \"a\"\n"
                    L"TEXT \"a\" \"b\"\n"));
            PravFile file(Files() / L"block.dcm", kCreate);
            block.Export(file);
            for (auto& next : blocks)
                next.Export(file);
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
             DCMFestwert block(s.source.GetFestwerte().front());
             try {
                 block.SetValue(s.value);
             } catch (const std::bad_alloc&) {
                 EXPECT_EQ(block.GetValueType(), VT_ERROR);
                 throw;
             }
         }},
        {"points out", [](State& s) { s.source.GetFestkennfeld().front().GetValues(s.points); }},
        {"texts in",
         [](State& s) {
             DCMKennfeld block;
             block.AddAxisX(s.value);
             block.AddAxisY(CComVariant(L"text"));
             block.AddValue(s.value);
             DCMStuetzstellenverteilung().AddValue(s.value);
             DCMFestwerteblock().AddValue(L"text");
             DCMFestwerteblock().AddValue(1.0);
         }},
        {"texts", [](State& s) {
             CString text(s.text);
             text += L" and more";
             text += text;
             text = CString("narrow") + text + L"wide";
         }}};
    for (const auto& [name, operation] : cases)
        FailEach(name, true, operation);
}
