// import_once dcm|report|floor FILE
// Reads a file once, with a report or without, in a new process that uses the shared library.
// Prints the time in seconds and the peak memory of the process in bytes.

#include "benchmarks/memory.h"
#include "benchmarks/plain.h"
#include "dcm/library/dcm.h"

#include <cstdlib>
#include <iostream>
#include <string_view>

int main(int argc, char** argv)
{
    using namespace dcm::bench;
    if (argc != 3) {
        std::cerr << "usage: import_once dcm|report|floor FILE\n";
        return EXIT_FAILURE;
    }
    double seconds = 0;
    if (argv[1] == std::string_view("floor")) {
        const BlockNumbers blocks = Timed(seconds, [&] { return ReadFloor(argv[2]); });
    } else if (argv[1] == std::string_view("report")) {
        DCMConverter document;
        dcm::Report report;
        const CString path(argv[2]);
        if (Timed(seconds, [&] { return dcm::Import(document, path, report); }) != S_OK)
            return EXIT_FAILURE;
    } else {
        DCMConverter document;
        if (Timed(seconds, [&] { return document.Import(CString(argv[2])); }) != S_OK)
            return EXIT_FAILURE;
    }
    std::cout << "{\"seconds\": " << seconds << ", \"peak\": " << PeakMemory() << "}\n";
}
