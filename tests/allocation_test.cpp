#include "dcm/platform/exception.h"
#include "tests/allocations.h"
#include "tests/support.h"

#include <gtest/gtest.h>

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

template <class Block>
void ReadTwice(const std::list<Block>& blocks)
{
    Block block(blocks.front());
    const CString text(L"KENNFELD n 1 1\nKENNLINIE n 1\nSTUETZSTELLENVERTEILUNG n 1\n"
                       L"FESTWERT n\nLANGNAME \"l\"\nEINHEIT_W \"w\"\nWERT 1 2\nST/X 1\nST/Y 1\n"
                       L"ST_TX/X \"a\"\nTEXT \"a\" \"b\"\n");
    for (int pass = 0; pass < 2; ++pass)
        block.Init(text);
}

template <class Block>
void WriteBlock(const std::list<Block>& blocks)
{
    PravFile file(Files() / L"block.dcm", CFile::modeCreate | CFile::modeWrite);
    Block block(blocks.front());
    block.Export(file);
}

/// What a failure may leave in the target document.
enum class Target
{
    kAsBefore,
    kWholeBlocks
};

/// Runs an operation again and again, each time with the next of its allocations failing, until it
/// needs no more. A failure is raised, or is the result; nothing leaks.
void FailEach(const char* name, bool raises, Target left, void (*operation)(State&))
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
            if (failed && left == Target::kAsBefore) {
                EXPECT_EQ(target, empty);
            }
            if (failed) {
                EXPECT_TRUE(left == Target::kAsBefore || AllKinds().starts_with(target));
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
    static const CString in = Files() / L"in.dcm";
    static const CString out = Files() / L"out.dcm";
    static const CString missing = Files() / L"missing.dcm";
    FailEach("import", false, Target::kWholeBlocks,
             [](State& s) { s.result = s.target.Import(in); });
    FailEach("import of a missing file", false, Target::kAsBefore, [](State& s) {
        EXPECT_EQ(s.target.Import(missing), E_UNEXPECTED);
        s.result = AllocationHasFailed() ? E_UNEXPECTED : S_OK;
    });
    FailEach("export", false, Target::kAsBefore, [](State& s) { s.result = s.source.Export(out); });
    ASSERT_TRUE(dcm::SetThreadCodePage(28605));
    FailEach("import in a page of the system", false, Target::kWholeBlocks,
             [](State& s) { s.result = s.target.Import(in); });
    FailEach("export in a page of the system", false, Target::kAsBefore,
             [](State& s) { s.result = s.source.Export(out); });
    ASSERT_TRUE(dcm::SetThreadCodePage(1252));
}

TEST(Allocation, FailureIsRaisedByTheOtherCalls)
{
    const struct
    {
        const char* name;
        void (*operation)(State&);
    } cases[] = {
        {"copy", [](State& s) { const DCMConverter copy(s.source); }},
        {"assignment", [](State& s) { s.target = s.source; }},
        {"header", [](State& s) { s.target.SetHeader(L"header"); }},
        {"fixed value", [](State& s) { s.target.AddFestwert(s.source.GetFestwerte().back()); }},
        {"text string", [](State& s) { s.target.AddTextstring(s.source.GetTextstring().front()); }},
        {"value block",
         [](State& s) {
             DCMFestwerteblock block;
             block = *++s.source.GetFestwerteblock().begin();
             s.target.AddFestwerteblock(block);
         }},
        {"distribution",
         [](State& s) {
             DCMStuetzstellenverteilung block;
             block = s.source.GetStuetzstellenverteilung().back();
             s.target.AddStuetzstellenverteilung(block);
         }},
        {"curve", [](State& s) { s.target.AddKennlinie(s.source.GetKennlinie().front()); }},
        {"fixed curve",
         [](State& s) { s.target.AddFestkennlinie(s.source.GetFestkennlinie().front()); }},
        {"group curve",
         [](State& s) {
             DCMGruppenkennlinie block;
             block = s.source.GetGruppenkennlinie().front();
             s.target.AddGruppenkennlinie(block);
         }},
        {"map", [](State& s) { s.target.AddKennfeld(s.source.GetKennfeld().front()); }},
        {"fixed map",
         [](State& s) {
             DCMFestkennfeld block;
             block = s.source.GetFestkennfeld().front();
             s.target.AddFestkennfeld(block);
         }},
        {"group map",
         [](State& s) { s.target.AddGruppenkennfeld(s.source.GetGruppenkennfeld().front()); }},
        {"reading a fixed value", [](State& s) { ReadTwice(s.source.GetFestwerte()); }},
        {"reading a value block", [](State& s) { ReadTwice(s.source.GetFestwerteblock()); }},
        {"reading a distribution",
         [](State& s) { ReadTwice(s.source.GetStuetzstellenverteilung()); }},
        {"reading a curve", [](State& s) { ReadTwice(s.source.GetKennlinie()); }},
        {"reading a map", [](State& s) { ReadTwice(s.source.GetKennfeld()); }},
        {"writing a text", [](State& s) { WriteBlock(s.source.GetTextstring()); }},
        {"writing a value block", [](State& s) { WriteBlock(s.source.GetFestwerteblock()); }},
        {"writing a distribution",
         [](State& s) { WriteBlock(s.source.GetStuetzstellenverteilung()); }},
        {"writing a curve", [](State& s) { WriteBlock(s.source.GetKennlinie()); }},
        {"writing a map", [](State& s) { WriteBlock(s.source.GetKennfeld()); }},
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
             block.AddValue(s.value);
             DCMStuetzstellenverteilung distribution;
             distribution.AddValue(s.value);
             DCMFestwerteblock values;
             values.AddValue(L"text");
             values.AddValue(1.0);
         }},
        {"texts",
         [](State& s) {
             CString text(s.text);
             text += L" and more";
             text += text;
             text = CString("narrow") + text + L"wide";
         }},
    };
    for (const auto& c : cases)
        FailEach(c.name, true, Target::kAsBefore, c.operation);
}
