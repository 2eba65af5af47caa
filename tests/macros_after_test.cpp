// A host that includes another library last.
#include "dcm/library/dcm.h"

// Where no header defines the names, the library's own stay.
static_assert(FALSE == 0 && TRUE == 1);
#undef FALSE
#undef TRUE
#include "tests/other_library.h"

#include <gtest/gtest.h>

TEST(Macros, MayComeAfterTheLibrary)
{
    EXPECT_EQ(CFile().Open(L"", CFile::modeRead), FALSE);
}
