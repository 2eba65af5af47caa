// A host that includes another library first and has chosen what it wants of the system's header.
#define WIN32_LEAN_AND_MEAN
#define NOMINMAX
#include "tests/other_library.h"

#include "dcm/library/dcm.h"

#include <gtest/gtest.h>

TEST(Macros, OfAHostStayAsTheyAre)
{
#if !defined(WIN32_LEAN_AND_MEAN) || !defined(NOMINMAX)
    ADD_FAILURE();
#endif
    EXPECT_EQ(CFile().Open(L"", CFile::modeRead), FALSE);
    AFX_EXTENSION_MODULE state;
    EXPECT_EQ(AfxInitExtensionModule(state, nullptr), TRUE);
    AfxTermExtensionModule(state);
}
