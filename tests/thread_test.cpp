#include "tests/support.h"

#include <gtest/gtest.h>

#include <thread>

using namespace test;

TEST(Threads, UseDocumentsOfTheirOwn)
{
    const std::string bytes = ReadBytes(CString(DCM_ALL_KINDS));
    DCMConverter shared;
    ASSERT_EQ(ImportBytes(shared, bytes), S_OK);
    const auto work = [&](unsigned codePage) {
        ASSERT_TRUE(dcm::SetThreadCodePage(codePage));
        for (int pass = 0; pass < 20; ++pass) {
            // Copies of one document share their texts, which each thread changes for itself.
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
    {
        const std::jthread threads[] = {std::jthread(work, 1252U), std::jthread(work, 65001U),
                                        std::jthread(work, 28591U), std::jthread(work, 1252U)};
    }
    EXPECT_EQ(ExportBytes(shared), bytes);
}
