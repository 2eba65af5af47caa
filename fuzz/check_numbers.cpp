// check_numbers [MILLIONS [SEED]]: writes and reads that many numbers and number texts of every
// kind and ends with 1 at the first that the standard library writes or reads in another way.

#include "fuzz/number_check.h"

#include <cstdio>
#include <cstdlib>

int main(int argc, char** argv)
{
    const long millions = argc > 1 ? std::atol(argv[1]) : 10;
    const unsigned long long seed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1;
    NumberSource source(seed);
    for (long count = millions * 1'000'000; count > 0; count -= 2) {
        for (const std::string& wrong : {WrongText(source.Number()), WrongNumber(source.Text())}) {
            if (!wrong.empty()) {
                std::fprintf(stderr, "check_numbers: %s\n", wrong.c_str());
                return 1;
            }
        }
    }
    std::printf("check_numbers: %ld million numbers, seed %llu: no difference\n", millions, seed);
    return 0;
}
