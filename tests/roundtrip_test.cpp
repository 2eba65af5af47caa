#include "tests/allocations.h"
#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

/// A document made of copies of another's blocks, added kind by kind.
DCMConverter Rebuilt(const DCMConverter& document)
{
    DCMConverter copy;
    const auto addAll = [&copy](const auto& blocks, auto add) {
        for (const auto& block : blocks)
            EXPECT_EQ((copy.*add)(block), S_OK);
    };
    addAll(document.GetTextstring(), &DCMConverter::AddTextstring);
    addAll(document.GetGruppenkennfeld(), &DCMConverter::AddGruppenkennfeld);
    addAll(document.GetFestkennfeld(), &DCMConverter::AddFestkennfeld);
    addAll(document.GetKennfeld(), &DCMConverter::AddKennfeld);
    addAll(document.GetGruppenkennlinie(), &DCMConverter::AddGruppenkennlinie);
    addAll(document.GetFestkennlinie(), &DCMConverter::AddFestkennlinie);
    addAll(document.GetKennlinie(), &DCMConverter::AddKennlinie);
    addAll(document.GetStuetzstellenverteilung(), &DCMConverter::AddStuetzstellenverteilung);
    addAll(document.GetFestwerteblock(), &DCMConverter::AddFestwerteblock);
    addAll(document.GetFestwerte(), &DCMConverter::AddFestwert);
    return copy;
}

const CString kAllKinds(DCM_TEST_DATA "/all_kinds.dcm");

} // namespace

TEST(RoundTrip, BringsEveryKindBack)
{
    const std::string written = ReadBytes(CString(DCM_TEST_DATA "/all_kinds_written.dcm"));
    DCMConverter document;
    ASSERT_EQ(document.Import(kAllKinds), S_OK);
    EXPECT_EQ(document.GetComment(), L"Kalibrierdaten Pr\u00FCfstand 7\nerstellt von Hand\n*\n");
    EXPECT_EQ(ExportBytes(document), written);
    DCMConverter again;
    EXPECT_EQ(ImportBytes(again, written), S_OK);
    EXPECT_EQ(ExportBytes(again), written);
    EXPECT_EQ(document.GetGruppenkennfeld().front().GetStuetzstellenverteilungX(), L"Drehzahl");
    EXPECT_EQ(again.GetGruppenkennfeld().front().GetStuetzstellenverteilungX(), L"");

    DCMConverter assigned;
    assigned.SetHeader(L"replaced");
    assigned = document;
    assigned = *&assigned;
    const DCMConverter copy(assigned);
    assigned = DCMConverter();
    EXPECT_EQ(ExportBytes(copy), written);
    EXPECT_EQ(copy.GetComment(), document.GetComment());
    EXPECT_EQ(ExportBytes(Rebuilt(document)), written);
    EXPECT_NE(ExportBytes(assigned), written);
    EXPECT_EQ(document.GetKennfeld().size() - again.GetKennfeld().size(), 1U)
        << "the map of too few values is not written";
}

TEST(RoundTrip, SurvivesAFileCutAtEveryByte)
{
    const Folder folder;
    const CString cut = folder / L"cut.dcm", closed = folder / L"closed.dcm";
    const std::string whole = ReadBytes(kAllKinds);
    ASSERT_GT(whole.size(), 2000U);
    WriteBytes(cut, whole);
    std::size_t blocks = 2;
    for (std::size_t size = whole.size(); size > 0;) {
        --size;
        std::filesystem::resize_file(PathOf(cut), size);
        DCMConverter document;
        ASSERT_EQ(document.Import(cut), S_OK) << size;
        ASSERT_LE(document.GetFestwerte().size(), blocks) << size;
        blocks = document.GetFestwerte().size();
        // With an empty line the cut block is read too: only a WERT line without a value ends it.
        const std::string rest = whole.substr(0, size);
        WriteBytes(closed, rest + "\n\n");
        const bool readable = document.Import(closed) == S_OK;
        ASSERT_TRUE(readable || rest.ends_with("WERT ")) << size;
    }
    EXPECT_EQ(blocks, 0U);
}

TEST(RoundTrip, LeavesNoMemoryBehind)
{
    const long before = LiveAllocations();
    {
        DCMFestkennfeld map;
        map.Init(L"FESTKENNFELD F 1 2\nST_TX/X \"a\"\nST_TX/Y \"c\" \"d\"\nTEXT \"e\" \"f\"\n");
        DCMTextstring text;
        text.Init(L"TEXTSTRING T\nTEXT \"a\"\n");
        DCMConverter document;
        for (int i = 0; i < 1000; ++i) {
            document.AddFestkennfeld(map);
            document.AddTextstring(text);
        }
        std::vector<CComVariant> points{L"released by the call"};
        for (DCMFestkennfeld& block : document.GetFestkennfeld()) {
            block.GetValues(points);
            block.GetAxis_Y(points);
            EXPECT_EQ(ShowAll(points), "'c' 'd'");
            block = map;
        }
        // Texts of variants are the system's on Windows, and not counted.
        EXPECT_GT(LiveAllocations(), before + 4000);
    }
    EXPECT_EQ(LiveAllocations(), before);
}
