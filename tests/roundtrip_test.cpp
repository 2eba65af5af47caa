#include "tests/support.h"

#include <gtest/gtest.h>

#include <thread>

using namespace test;

// Tests that run at the same time share this file. An import opens it exclusively, so they copy it.
static const CString kAllKinds(DCM_TEST_DATA "/all_kinds.dcm");

TEST(RoundTrip, BringsEveryKindBack)
{
    const std::string written = ReadBytes(CString(DCM_TEST_DATA "/all_kinds_written.dcm"));
    DCMConverter document, again;
    ASSERT_EQ(ImportBytes(document, ReadBytes(kAllKinds)), S_OK);
    EXPECT_EQ(document.GetComment(), L"Kalibrierdaten Pr\u00FCfstand 7\nerstellt von Hand\n*\n");
    EXPECT_EQ(ExportBytes(document), written);
    EXPECT_EQ(ImportBytes(again, written), S_OK);
    EXPECT_EQ(ExportBytes(again), written);
    again = document;
    const DCMConverter copy(again);
    again = DCMConverter();
    EXPECT_EQ(copy.GetComment(), document.GetComment());
    ForEachKind([&](const char*, auto get, auto add) {
        for (const auto& block : (copy.*get)())
            EXPECT_EQ((again.*add)(block), S_OK);
    });
    EXPECT_EQ(ExportBytes(again), written);
}

TEST(RoundTrip, SurvivesAFileCutAtEveryByte)
{
    const Folder folder;
    const CString cut = folder / L"cut.dcm", closed = folder / L"closed.dcm";
    std::string rest = ReadBytes(kAllKinds);
    WriteBytes(cut, rest);
    std::size_t blocks = 2;
    while (!rest.empty()) {
        rest.pop_back();
        std::filesystem::resize_file(PathOf(cut), rest.size());
        DCMConverter document;
        ASSERT_EQ(document.Import(cut), S_OK) << rest;
        ASSERT_LE(document.GetFestwerte().size(), blocks) << rest;
        blocks = document.GetFestwerte().size();
        // With an empty line added the cut block is read too. Only a WERT line without a value
        // fails.
        const bool readable = ImportBytes(document, rest + "\n\n", closed) == S_OK;
        ASSERT_TRUE(readable || rest.ends_with("WERT ")) << rest;
    }
    EXPECT_EQ(blocks, 0U);
}

TEST(Threads, UseDocumentsOfTheirOwn)
{
    DCMConverter shared;
    ASSERT_EQ(ImportBytes(shared, ReadBytes(kAllKinds)), S_OK);
    const auto work = [&](unsigned codePage) {
        ASSERT_TRUE(dcm::SetThreadCodePage(codePage));
        for (int pass = 0; pass < 20; ++pass) {
            // Copies of a document share their texts. Each thread changes its own copy.
            DCMConverter document(shared);
            DCMFestwert block = shared.GetFestwerte().front();
            block.GetName() += L"_changed";
            document.AddFestwert(block);
            const std::string exported = ExportBytes(document);
            DCMConverter back;
            EXPECT_EQ(ImportBytes(back, exported), S_OK);
            EXPECT_EQ(back.GetFestwerte().back().GetName(), block.GetName());
            EXPECT_EQ(ExportBytes(back), exported);
        }
    };
    std::thread threads[] = {std::thread(work, 1252U), std::thread(work, 65001U),
                             std::thread(work, 28591U)};
    for (std::thread& thread : threads)
        thread.join();
}
