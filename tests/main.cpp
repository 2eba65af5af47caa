#include <cstdlib>
#include <locale>

#include <gtest/gtest.h>

int main(int argc, char** argv)
{
    testing::InitGoogleTest(&argc, argv);
    // Sets the locale as a host may do. A missing locale ends the run: otherwise the tests would
    // pass without a decimal comma.
    if (const char* name = std::getenv("DCM_TEST_LOCALE"))
        std::locale::global(std::locale(name));
    return RUN_ALL_TESTS();
}
