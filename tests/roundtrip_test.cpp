#include "fuzz/kinds.h"
#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

/// A document made of copies of another's blocks, added kind by kind.
DCMConverter Rebuilt(const DCMConverter& document)
{
    DCMConverter copy;
    ForEachKind([&](const char*, auto get, auto add) {
        for (const auto& block : (document.*get)())
            EXPECT_EQ((copy.*add)(block), S_OK);
    });
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
    const DCMConverter copy(assigned);
    assigned = DCMConverter();
    EXPECT_EQ(ExportBytes(copy), written);
    EXPECT_EQ(copy.GetComment(), document.GetComment());
    EXPECT_EQ(ExportBytes(Rebuilt(document)), written);
    EXPECT_EQ(document.GetKennfeld().size() - again.GetKennfeld().size(), 1U)
        << "the map of too few values is not written";
}

TEST(RoundTrip, KeepsACopyOfEachBlockApart)
{
    DCMConverter document;
    ASSERT_EQ(document.Import(kAllKinds), S_OK);
    ForEachKind([&](const char*, auto get, auto) {
        for (auto block : (document.*get)()) {
            decltype(block) copy(block), assigned;
            assigned = block;
            assigned = *&assigned;
            const std::string written = Written(block);
            block.Init(L"DISPLAYNAME changed\nWERT 1\n");
            EXPECT_NE(Written(block), written);
            EXPECT_EQ(Written(copy), written);
            EXPECT_EQ(Written(assigned), written);
        }
    });
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
