// instructions WHAT FILE
// Does one thing with the numbers of a file under valgrind's callgrind, which counts the
// instructions of that alone. Prints the number of numbers, to divide by.

#include "benchmarks/plain.h"
#include "benchmarks/temporary_folder.h"
#include "dcm/elements/number.h"
#include "dcm/library/dcm.h"
#include "dcm/platform/word.h"

#include <valgrind/callgrind.h>

#include <array>
#include <cstdlib>
#include <iostream>
#include <string_view>
#include <vector>

namespace {

using namespace dcm::bench;

/// Counts the instructions of `work`. Counting is switched on only for this, because it is slow.
template <class Work>
void Counted(Work work)
{
    CALLGRIND_START_INSTRUMENTATION;
    CALLGRIND_TOGGLE_COLLECT;
    work();
    CALLGRIND_TOGGLE_COLLECT;
    CALLGRIND_STOP_INSTRUMENTATION;
}

void WriteNumbers(const std::vector<double>& numbers)
{
    std::array<char, dcm::kNumberTextMax> text;
    Counted([&] {
        for (const double number : numbers)
            dcm::WriteNumber(number, 17, text.data());
    });
}

void ReadTokens(const std::vector<double>& numbers)
{
    std::string line;
    for (const double number : numbers) {
        std::array<char, dcm::kNumberTextMax> text;
        line.append(line.empty() ? 0 : 2, L' ');
        line.append(text.data(), dcm::WriteNumber(number, 17, text.data()));
    }
    const std::size_t size = line.size();
    line.append(dcm::kReadAhead, ' ');
    std::vector<double> values;
    values.reserve(numbers.size());
    Counted([&] { dcm::ReadNumbers({line.data(), size}, nullptr, values); });
}

int Main(std::string_view what, const char* path)
{
    std::vector<double> numbers;
    for (const std::vector<double>& block : ReadFloor(path))
        numbers.insert(numbers.end(), block.begin(), block.end());
    const CString file(path);
    DCMConverter document;
    if (what == "import") {
        Counted([&] { document.Import(file); });
    } else if (what == "report") {
        dcm::Report report;
        Counted([&] { dcm::Import(document, file, report); });
    } else if (what == "export") {
        document.Import(file);
        const TemporaryFolder folder;
        const CString output((folder.Path() / "out.dcm").c_str());
        Counted([&] { document.Export(output); });
    } else if (what == "text") {
        WriteNumbers(numbers);
    } else if (what == "token") {
        ReadTokens(numbers);
    } else if (what == "floor") {
        BlockNumbers blocks;
        Counted([&] { blocks = ReadFloor(path); });
    } else {
        return EXIT_FAILURE;
    }
    std::cout << numbers.size() << '\n';
    return EXIT_SUCCESS;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc == 3)
        return Main(argv[1], argv[2]);
    std::cerr << "usage: instructions import|export|text|token|floor FILE\n";
    return EXIT_FAILURE;
}
