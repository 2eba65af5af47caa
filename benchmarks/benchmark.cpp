// Compares the library with the least time that its work needs, and with what a host would use
// instead. The contestants take turns, so that other work of the machine affects all of them.

#include "benchmarks/contestant.h"
#include "benchmarks/temporary_folder.h"

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>
#include <limits>
#include <map>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace dcm::bench {
namespace {

void WriteFile(const std::filesystem::path& path, const std::string& text)
{
    std::ofstream file(path, std::ios::binary);
    if (!file.write(text.data(), static_cast<std::streamsize>(text.size())))
        throw std::runtime_error("cannot write " + path.string());
}

std::string FileText(const std::filesystem::path& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// Fills a stage for the library alone, or for all contestants.
void SetUp(Stage& stage, const std::filesystem::path& folder, Flavour flavour, double factor,
           bool forAll)
{
    stage.data = MakeData(flavour, factor);
    const std::string name = "factor-" + std::to_string(factor);
    stage.dcmFile = folder / (name + ".dcm");
    stage.jsonFile = folder / (name + ".json");
    stage.outputFile = folder / (name + ".out");
    WriteFile(stage.dcmFile, DcmText(stage.data));
    if (stage.document.Import(CString(stage.dcmFile.c_str())) != S_OK)
        throw std::runtime_error("import failed");
    if (!forAll)
        return;
    stage.narrowData = In1252(stage.data);
    WriteFile(stage.jsonFile, JsonText(stage.data));
    for (const Block& block : stage.data.blocks) {
        for (const double number : block.values) {
            constexpr std::size_t enough = 4096;
            if (stage.someNumbers.size() < enough && block.values.size() > 1)
                stage.someNumbers.push_back(number);
        }
    }
    for (const double number : stage.someNumbers) {
        stage.someTexts.append(stage.someTexts.empty() ? 0 : 3, ' ');
        AppendNumber(stage.someTexts, number, flavour);
    }
}

/// Checks that all contestants do the same: all readers must get the numbers of the data, and all
/// writers of the library's format must write the same file.
void Check(const Stage& stage, const Contestant& contestant, std::string& exported)
{
    const Outcome outcome = contestant.run(stage);
    if (contestant.name.starts_with("import/") && outcome.checksum != stage.data.checksum)
        throw std::runtime_error(contestant.name + " reads other numbers");
    if (contestant.name == "export/dcm" || contestant.name.starts_with("export/floor") ||
        contestant.name == "export/snprintf") {
        std::string text = FileText(stage.outputFile);
        if (exported.empty()) {
            exported = std::move(text);
        } else if (text != exported) {
            throw std::runtime_error(contestant.name + " writes another file");
        }
    }
}

/// Collects the times of all rounds.
class Collector : public benchmark::BenchmarkReporter
{
public:
    bool ReportContext(const Context&) override { return true; }

    void ReportRuns(const std::vector<Run>& runs) override
    {
        for (const Run& run : runs) {
            m_times[run.run_name.function_name].push_back(run.GetAdjustedRealTime() /
                                                          run.counters.at("numbers"));
        }
    }

    /// Prints for each contestant its times of all rounds, in nanoseconds a number, as JSON.
    void Print(std::ostream& out) const
    {
        out << '{';
        const char* separator = "\n";
        for (const auto& [name, times] : m_times) {
            out << separator << "  \"" << name << "\": [";
            separator = "";
            for (const double time : times) {
                out << separator << time;
                separator = ", ";
            }
            out << ']';
            separator = ",\n";
        }
        out << "\n}\n";
    }

private:
    std::map<std::string, std::vector<double>> m_times;
};

/// Where a contestant gets its memory from.
enum class Heap
{
    /// From the system, as in a process that does the work once.
    kCold,
    /// From what those before it have released, as in a process that does it again and again.
    kWarm,
};

void Register(const Stage& stage, const Contestant& contestant, const std::string& name, Heap heap)
{
    benchmark::RegisterBenchmark(name.c_str(),
                                 [&stage, &contestant, heap](benchmark::State& state) {
                                     for ([[maybe_unused]] auto _ : state) {
                                         if (heap == Heap::kCold)
                                             malloc_trim(0);
                                         state.SetIterationTime(contestant.run(stage).seconds);
                                     }
                                     state.counters["numbers"] =
                                         static_cast<double>(stage.data.numbers);
                                 })
        ->UseManualTime()
        ->Iterations(1)
        ->Unit(benchmark::kNanosecond);
}

/// The value of the argument that begins with `name` and an equals sign.
std::string Argument(int argc, char** argv, std::string_view name, std::string_view otherwise)
{
    for (int i = 1; i < argc; ++i) {
        const std::string_view argument = argv[i];
        if (argument.starts_with(name) && argument.substr(name.size()).starts_with('='))
            return std::string(argument.substr(name.size() + 1));
    }
    return std::string(otherwise);
}

int Main(int argc, char** argv)
{
    benchmark::Initialize(&argc, argv);
    const Flavour flavour = FlavourNamed(Argument(argc, argv, "--flavour", "full"));
    const double factor = std::stod(Argument(argc, argv, "--factor", "1"));
    const int rounds = std::stoi(Argument(argc, argv, "--rounds", "15"));
    const std::string growth = Argument(argc, argv, "--growth", "");
    const Heap heap = Argument(argc, argv, "--heap", "cold") == "warm" ? Heap::kWarm : Heap::kCold;
    if (heap == Heap::kWarm) {
        // Nothing is returned to the system.
        mallopt(M_MMAP_MAX, 0);
        mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
    }

    const TemporaryFolder folder;
    Stage stage;
    SetUp(stage, folder.Path(), flavour, factor, true);
    std::string exported;
    for (const Contestant& contestant : Contestants()) {
        if (heap == Heap::kWarm && !contestant.name.starts_with("import/"))
            continue;
        Check(stage, contestant, exported);
        Register(stage, contestant, contestant.name, heap);
    }
    Stage large;
    if (!growth.empty()) {
        SetUp(large, folder.Path(), flavour, factor * std::stod(growth), false);
        for (const Contestant& contestant : Contestants()) {
            if (contestant.name == "import/dcm" || contestant.name == "export/dcm")
                Register(large, contestant, contestant.name + "-large", heap);
        }
    }
    Collector collector;
    for (int round = 0; round < rounds; ++round)
        benchmark::RunSpecifiedBenchmarks(&collector);
    collector.Print(std::cout);
    return EXIT_SUCCESS;
}

} // namespace

} // namespace dcm::bench

int main(int argc, char** argv)
{
    try {
        return dcm::bench::Main(argc, argv);
    } catch (const std::exception& error) {
        std::cerr << argv[0] << ": " << error.what() << '\n';
        return EXIT_FAILURE;
    }
}
