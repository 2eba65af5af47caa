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

/// What is measured against each other, in one program and run.
namespace dcm::bench {

/// What a contestant works on, and where it leaves its results.
struct Stage
{
    Data data;
    /// The same with its texts in code page 1252.
    Data narrowData;
    /// The same as a document.
    DCMConverter document;
    /// Some of the numbers, few enough to stay in the processor's cache with their texts, and a
    /// line of these texts with three blanks between them.
    std::vector<double> someNumbers;
    std::string someTexts;
    std::filesystem::path dcmFile;
    std::filesystem::path jsonFile;
    std::filesystem::path outputFile;
};

/// The time of one timed part, and what it came to.
struct Outcome
{
    double seconds = 0;
    /// Of the numbers read; of a contestant that writes, 0.
    std::uint64_t checksum = 0;
};

/// One way to do one thing.
struct Contestant
{
    /// What is done and by what, such as "import/dcm".
    std::string name;
    /// Does it once. What it made is released outside the timed part.
    std::function<Outcome(const Stage&)> run;
};

/// All contestants, in no special order.
std::vector<Contestant>& Contestants();

/// A contestant that takes part by being defined.
struct TakesPart
{
    TakesPart(std::string name, std::function<Outcome(const Stage&)> run)
    {
        Contestants().push_back({std::move(name), std::move(run)});
    }
};

/// Calls `work` and adds the time that the processor spent on it to `seconds`. None of it waits for
/// anything, and other programs on the same processor do not count.
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

/// How often the routines for some numbers run, to have had as many as the data have.
inline std::size_t Repetitions(const Stage& stage)
{
    return stage.data.numbers / stage.someNumbers.size();
}

/// Times `write`, which writes a number at a place in memory and returns the text's end.
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

/// What a reader other than the library makes: the numbers of each block.
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
