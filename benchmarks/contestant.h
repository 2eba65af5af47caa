#pragma once

#include "benchmarks/data.h"
#include "dcm/converter/dcmconverter.h"

#include <benchmark/benchmark.h>

#include <cstddef>
#include <cstdint>
#include <ctime>
#include <filesystem>
#include <functional>
#include <string>
#include <utility>
#include <vector>

/// The things that are compared, in one program and one run.
namespace dcm::bench {

/// The input of a contestant, and the place for its output.
struct Stage
{
    Data data;
    /// The same with its texts in code page 1252.
    Data narrowData;
    /// The same as a document.
    DCMConverter document;
    /// Some of the numbers, so few that they stay in the processor's cache with their texts, and a
    /// line of these texts, separated by three blanks.
    std::vector<double> someNumbers;
    std::string someTexts;
    std::filesystem::path dcmFile;
    std::filesystem::path jsonFile;
    std::filesystem::path outputFile;
};

/// The time of one timed part, and its result.
struct Outcome
{
    double seconds = 0;
    /// Of the numbers read; 0 for a contestant that writes.
    std::uint64_t checksum = 0;
};

/// One way to do one thing.
struct Contestant
{
    /// What is done and what does it, such as "import/dcm".
    std::string name;
    /// Does it once. The results are released after the timed part.
    std::function<Outcome(const Stage&)> run;
};

/// All contestants, in no special order.
std::vector<Contestant>& Contestants();

/// Adds a contestant when it is constructed.
struct TakesPart
{
    TakesPart(std::string name, std::function<Outcome(const Stage&)> run)
    {
        Contestants().push_back({std::move(name), std::move(run)});
    }
};

/// Calls `work` and adds its processor time to `seconds`. Nothing here waits, and other programs on
/// the same processor do not count.
template <class Work>
auto Timed(double& seconds, Work work)
{
    struct Clock
    {
        double& seconds;
        std::clock_t start = std::clock();
        ~Clock() { seconds += static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC; }
    };
    const Clock clock{seconds};
    return work();
}

/// How often the routines for single numbers run, so that they process as many numbers as the data
/// have.
inline std::size_t Repetitions(const Stage& stage)
{
    return stage.data.numbers / stage.someNumbers.size();
}

/// Times `write`, which writes the text of a number to memory and returns its end.
template <class Character, class Write>
Outcome TimedNumberTexts(const Stage& stage, Write write)
{
    Outcome outcome;
    std::vector<Character> text(stage.someNumbers.size() * 40);
    Timed(outcome.seconds, [&] {
        for (std::size_t i = Repetitions(stage); i > 0; --i) {
            Character* to = text.data();
            for (const double number : stage.someNumbers)
                to = write(number, to);
            benchmark::DoNotOptimize(to);
            benchmark::ClobberMemory();
        }
    });
    return outcome;
}

/// The result of a reader other than the library: the numbers of each block.
using BlockNumbers = std::vector<std::vector<double>>;

/// Times a reader that returns BlockNumbers.
template <class Read>
Outcome TimedRead(Read read)
{
    Outcome outcome;
    const BlockNumbers blocks = Timed(outcome.seconds, read);
    Checksum checksum;
    for (const std::vector<double>& numbers : blocks)
        checksum.Add(numbers);
    outcome.checksum = checksum.Value();
    return outcome;
}

} // namespace dcm::bench
