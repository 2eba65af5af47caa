// make_data short|full FACTOR FILE
// Writes the generated data as a file in DCM format and prints how many numbers it holds.

#include "benchmarks/data.h"

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <string>

int main(int argc, char** argv)
{
    using namespace dcm::bench;
    if (argc != 4) {
        std::cerr << "usage: make_data short|full FACTOR FILE\n";
        return EXIT_FAILURE;
    }
    const Data data = MakeData(FlavourNamed(argv[1]), std::stod(argv[2]));
    std::ofstream file(argv[3], std::ios::binary);
    file << DcmText(data);
    std::cout << data.numbers << '\n';
    return file.good() ? EXIT_SUCCESS : EXIT_FAILURE;
}
