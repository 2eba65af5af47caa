// Imports texts that are made to be slow to read, at one size and at eight times that size. Fails
// when time or memory grow faster than the text.

#include "benchmarks/contestant.h"
#include "benchmarks/memory.h"
#include "benchmarks/temporary_folder.h"

#include <malloc.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iomanip>
#include <iostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace {

using namespace dcm::bench;

/// The most that the time at eight times the size may be, as a multiple.
constexpr double kGrowthLimit = 12;

/// The most memory that an import may need for each byte of the file, in addition to its blocks.
constexpr double kMemoryLimit = 12;

/// The smaller size: large enough that both get their memory from the system.
constexpr std::size_t kBytes = 4U << 20U;

/// `before`, then `unit` repeated up to the size, then `after`.
struct HostileText
{
    std::string_view name;
    std::string_view before;
    std::string_view unit;
    std::string_view after;
};

constexpr HostileText kTexts[] = {
    {"a line of quotes", "FESTWERTEBLOCK A 1\n  TEXT ", "\"", "\nEND\n\n"},
    {"quotes on a value line", "FESTWERTEBLOCK A 1\n  WERT 1 ", "\"", "\nEND\n\n"},
    {"quotes in a map", "KENNFELD A 1 1\n  TEXT ", "\"", "\nEND\n\n"},
    {"backslash and quote pairs", "FESTWERTEBLOCK A 1\n  TEXT \"a", "\\\"", "\nEND\n\n"},
    {"blanks in a value block", "FESTWERTEBLOCK A 1\n  WERT 1", " ", "2\nEND\n\n"},
    {"blanks in a curve", "KENNLINIE A 1\n  ST/X 1", " ", "2\nEND\n\n"},
    {"a line of blanks", "FESTWERT A\n", " ", "\nEND\n\n"},
    {"a line of numbers", "KENNLINIE A 1\n  ST/X", " 1", "\nEND\n\n"},
    {"numbers in a value block", "FESTWERTEBLOCK A 1\n  WERT", " 1", "\nEND\n\n"},
    {"a line of quoted texts", "KENNLINIE A 1\n  ST_TX/X", " \"a\"", "\nEND\n\n"},
    {"texts in a value block", "FESTWERTEBLOCK A 1\n  TEXT", " \"a\"", "\nEND\n\n"},
    {"tiny blocks", "", "FESTWERT A\n\n", ""},
    {"a comment of marks", "", "* ", "\n\n"},
    {"empty lines", "", "\n", ""},
    {"a line of carriage returns", "FESTWERT A", "\r", "\nEND\n\n"},
    {"carriage returns in a line", "FESTWERT A", "\r", "a\nEND\n\n"},
    {"a number of many digits", "FESTWERT A\n  WERT ", "7", "\nEND\n\n"},
    {"a number of many zeros", "FESTWERT A\n  WERT 0.", "0", "1\nEND\n\n"},
    {"a count of many digits", "KENNLINIE A ", "7", "\nEND\n\n"},
    {"attribute lines in one block", "FESTWERT A\n", "  LANGNAME \"a\"\n", "END\n\n"},
    {"lines of one block", "KENNFELD A 1 1\n", "  WERT 1\n", "END\n\n"},
    {"one long line", "", "a", ""},
};

std::size_t Excess(std::size_t value, std::size_t base)
{
    return value > base ? value - base : 0;
}

/// A hostile text in a file, and the time and memory of its import.
class Trial
{
public:
    Trial(const HostileText& text, std::size_t bytes, std::filesystem::path path)
        : m_path(std::move(path))
    {
        std::ofstream file(m_path, std::ios::binary);
        file << text.before;
        for (std::size_t size = 0; size < bytes; size += text.unit.size())
            file << text.unit;
        file << text.after;
    }

    std::size_t FileSize() const { return std::filesystem::file_size(m_path); }

    struct Memory
    {
        /// In addition to what the process used before.
        std::size_t peak;
        /// The part of it that the blocks use.
        std::size_t held;
    };
    Memory MeasureMemory() const
    {
        malloc_trim(0);
        ForgetPeakMemory();
        const std::size_t before = CurrentMemory();
        DCMConverter document;
        Import(document);
        const std::size_t peak = Excess(PeakMemory(), before);
        malloc_trim(0);
        return {peak, Excess(CurrentMemory(), before)};
    }

    struct Times
    {
        double reading = 0;
        double writing = 0;
    };
    Times MeasureTimes() const
    {
        Times times;
        DCMConverter document;
        Timed(times.reading, [&] { Import(document); });
        const CString output((m_path.string() + ".out").c_str());
        Timed(times.writing, [&] { document.Export(output); });
        return times;
    }

private:
    void Import(DCMConverter& document) const
    {
        if (document.Import(CString(m_path.c_str())) != S_OK)
            throw std::runtime_error("import failed");
    }

    std::filesystem::path m_path;
};

double Median(std::vector<double> values)
{
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::ranges::nth_element(values, middle);
    return *middle;
}

struct Verdict
{
    double growth;
    double memory;
};

/// Sets whether the process keeps freed memory, or returns large pieces to the system, as is the
/// default.
void KeepFreedMemory(bool keep)
{
    mallopt(M_MMAP_THRESHOLD, keep ? 1 << 30 : 1 << 17);
    mallopt(M_TRIM_THRESHOLD, keep ? 1 << 30 : 1 << 17);
}

Verdict Judge(const HostileText& text, const std::filesystem::path& folder)
{
    const Trial small(text, kBytes, folder / "small");
    const Trial large(text, 8 * kBytes, folder / "large");
    KeepFreedMemory(false);
    const Trial::Memory memory = large.MeasureMemory();

    // Otherwise the time of the larger size would include that for getting memory from the system.
    KeepFreedMemory(true);
    large.MeasureTimes();
    std::vector<double> importGrowth;
    std::vector<double> exportGrowth;
    double spent = 0;
    while (importGrowth.size() < 3 || (importGrowth.size() < 25 && spent < 1)) {
        const Trial::Times one = small.MeasureTimes();
        const Trial::Times eight = large.MeasureTimes();
        importGrowth.push_back(eight.reading / one.reading);
        exportGrowth.push_back(eight.writing / one.writing);
        spent += eight.reading + eight.writing;
    }
    const Verdict verdict = {std::max(Median(importGrowth), Median(exportGrowth)),
                             static_cast<double>(Excess(memory.peak, memory.held)) /
                                 static_cast<double>(large.FileSize())};
    std::cerr << std::setw(30) << text.name << ": time of import x " << Median(importGrowth)
              << ", of export x " << Median(exportGrowth) << "; " << verdict.memory
              << " bytes a byte beside " << memory.held / large.FileSize() << " held\n";
    return verdict;
}

} // namespace

int main()
{
    const TemporaryFolder folder;
    Verdict worst{};
    std::cerr << std::fixed << std::setprecision(1);
    for (const HostileText& text : kTexts) {
        const Verdict verdict = Judge(text, folder.Path());
        worst.growth = std::max(worst.growth, verdict.growth);
        worst.memory = std::max(worst.memory, verdict.memory);
    }
    std::cout << "{\"growth\": " << worst.growth << ", \"memory\": " << worst.memory << "}\n";
    return worst.growth < kGrowthLimit && worst.memory < kMemoryLimit ? EXIT_SUCCESS : EXIT_FAILURE;
}
