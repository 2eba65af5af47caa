#include "fuzz/kinds.h"
#include "tests/support.h"

#include <gtest/gtest.h>

using namespace test;

namespace {

const CString kAllKinds(DCM_TEST_DATA "/all_kinds.dcm");

} // namespace

TEST(RoundTrip, BringsEveryKindBack)
{
    const std::string written = ReadBytes(CString(DCM_TEST_DATA "/all_kinds_written.dcm"));
    DCMConverter document, again;
    ASSERT_EQ(document.Import(kAllKinds), S_OK);
    EXPECT_EQ(document.GetComment(), L"Kalibrierdaten Pr\u00FCfstand 7\nerstellt von Hand\n*\n");
    EXPECT_EQ(ExportBytes(document), written);
    EXPECT_EQ(ImportBytes(again, written), S_OK);
    EXPECT_EQ(ExportBytes(again), written);
    EXPECT_EQ(document.GetKennfeld().size() - again.GetKennfeld().size(), 1U)
        << "the map of too few values is not written";

    again = document;
    const DCMConverter copy(again);
    again = DCMConverter();
    EXPECT_EQ(ExportBytes(copy), written);
    EXPECT_EQ(copy.GetComment(), document.GetComment());
}

TEST(RoundTrip, KeepsACopyOfEachBlockApart)
{
    DCMConverter document, rebuilt;
    ASSERT_EQ(document.Import(kAllKinds), S_OK);
    ForEachKind([&](const char*, auto get, auto add) {
        for (auto block : (document.*get)()) {
            EXPECT_EQ((rebuilt.*add)(block), S_OK);
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
    EXPECT_EQ(ExportBytes(rebuilt), ExportBytes(document));
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
        const bool readable = ImportBytes(document, rest + "\n\n", closed) == S_OK;
        ASSERT_TRUE(readable || rest.ends_with("WERT ")) << size;
    }
    EXPECT_EQ(blocks, 0U);
}
