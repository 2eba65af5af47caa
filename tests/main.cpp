#include <cstdlib>
#include <locale>

#include <gtest/gtest.h>

int main(int argc, char** argv)
{
    testing::InitGoogleTest(&argc, argv);
    // Does what a host with a locale of its own does. A locale that is missing ends the run: the
    // tests would otherwise pass without having met a decimal comma.
    if (const char* name = std::getenv("DCM_TEST_LOCALE"))
        std::locale::global(std::locale(name));
    return RUN_ALL_TESTS();
}
