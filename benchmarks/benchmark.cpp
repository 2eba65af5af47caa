// Measures the library against what its work costs at least, and against what a host would use
// instead. The contestants take turns, so that whatever else the machine does hits all of them.

#include "benchmarks/contestant.h"
#include "benchmarks/temporary_folder.h"

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <memory>
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

void SetUp(Stage& stage, const std::filesystem::path& folder, Flavour flavour, double factor)
{
    stage.data = MakeData(flavour, factor);
    stage.narrowData = In1252(stage.data);
    const std::string name = "factor-" + std::to_string(factor);
    stage.dcmFile = folder / (name + ".dcm");
    stage.jsonFile = folder / (name + ".json");
    stage.outputFile = folder / (name + ".out");
    WriteFile(stage.dcmFile, DcmText(stage.data));
    WriteFile(stage.jsonFile, JsonText(stage.data));
    if (stage.document.Import(CString(stage.dcmFile.c_str())) != S_OK)
        throw std::runtime_error("import failed");
}

/// A contestant that does something else than the others is worth nothing: all who read have to
/// get the numbers of the data, and those who write what the library writes have to write the same
/// file.
void Check(const Stage& stage, const Contestant& contestant)
{
    static std::string exported;
    const Outcome outcome = contestant.run(stage);
    if (contestant.name.starts_with("import/") && outcome.checksum != stage.data.checksum)
        throw std::runtime_error(contestant.name + " reads other numbers");
    if (contestant.name == "export/dcm" || contestant.name == "export/floor" ||
        contestant.name == "export/snprintf") {
        std::string text = FileText(stage.outputFile);
        if (exported.empty())
            exported = std::move(text);
        else if (text != exported)
            throw std::runtime_error(contestant.name + " writes another file");
    }
}

/// Collects the times of one round after the other.
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

void Register(const Stage& stage, const Contestant& contestant, const std::string& name)
{
    Check(stage, contestant);
    benchmark::RegisterBenchmark(name.c_str(),
                                 [&stage, &contestant](benchmark::State& state) {
                                     for ([[maybe_unused]] auto _ : state) {
                                         // Each starts with memory fresh from the system.
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

    const TemporaryFolder folder;
    std::vector<std::unique_ptr<Stage>> stages;
    const auto addStage = [&](double size) -> const Stage& {
        stages.push_back(std::make_unique<Stage>());
        SetUp(*stages.back(), folder.Path(), flavour, size);
        return *stages.back();
    };
    const Stage& stage = addStage(factor);
    std::cerr << stage.data.numbers << " numbers in " << stage.data.blocks.size() << " blocks, "
              << std::filesystem::file_size(stage.dcmFile) << " bytes\n";
    for (const Contestant& contestant : Contestants())
        Register(stage, contestant, contestant.name);
    if (!growth.empty()) {
        const Stage& large = addStage(factor * std::stod(growth));
        for (const Contestant& contestant : Contestants()) {
            if (contestant.name.ends_with("/dcm"))
                Register(large, contestant, contestant.name + "-large");
        }
    }
    Collector collector;
    for (int round = 0; round < rounds; ++round)
        benchmark::RunSpecifiedBenchmarks(&collector);
    collector.Print(std::cout);
    return EXIT_SUCCESS;
}

} // namespace

std::vector<Contestant>& Contestants()
{
    static std::vector<Contestant> contestants;
    return contestants;
}

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
