// diff [ROUNDS]
// Compares two files of 100,000 blocks as `dcm diff` does, and measures it against what no
// comparison can do without: importing both with a report, a visit of all blocks and a map of their
// names. Prints the least time of each and the ratio; fails when it is above the limit.

#include "tools/commands/diff.h"
#include "benchmarks/data.h"
#include "benchmarks/temporary_folder.h"
#include "dcm/library/dcm.h"

#include <algorithm>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fstream>
#include <functional>
#include <iostream>
#include <limits>
#include <stdexcept>
#include <string>
#include <string_view>
#include <unordered_map>

namespace {

using namespace dcm::bench;

constexpr double kLimit = 1.2;
/// 100,800 blocks.
constexpr double kFactor = 3.5;
/// One block of so many is changed.
constexpr std::size_t kChangedOf = 100;

/// The processor's time, which other programs on the machine disturb least.
double SecondsOf(const std::function<void()>& work)
{
    const std::clock_t start = std::clock();
    work();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

void Write(const std::string& path, const Data& data)
{
    std::ofstream(path, std::ios::binary) << DcmText(data);
}

/// What no comparison can do without.
void ImportAndPair(const std::string& oldPath, const std::string& newPath)
{
    DCMConverter oldDocument;
    DCMConverter newDocument;
    dcm::Report report;
    if (FAILED(dcm::Import(oldDocument, dcm::FromUtf8(oldPath), report)) ||
        FAILED(dcm::Import(newDocument, dcm::FromUtf8(newPath), report)))
        throw std::runtime_error("cannot import the files");
    std::unordered_map<std::wstring_view, const void*> names;
    dcm::ForEach(oldDocument,
                 [&names](const auto& block) { names.emplace(block.GetName().View(), &block); });
    std::size_t paired = 0;
    dcm::ForEach(newDocument,
                 [&](const auto& block) { paired += names.count(block.GetName().View()); });
    if (paired < names.size())
        throw std::runtime_error("the files have different names");
}

} // namespace

int main(int argc, char** argv)
{
    const int rounds = argc > 1 ? std::atoi(argv[1]) : 5;
    const TemporaryFolder folder;
    const std::string oldPath = (folder.Path() / "old.dcm").string();
    const std::string newPath = (folder.Path() / "new.dcm").string();
    Data data = MakeData(Flavour::kShort, kFactor);
    Write(oldPath, data);
    for (std::size_t i = 0; i < data.blocks.size(); i += kChangedOf)
        if (!data.blocks[i].values.empty())
            data.blocks[i].values.front() += 1.0;
    Write(newPath, data);

    double least = std::numeric_limits<double>::max();
    double diff = least;
    // The differences themselves are of no interest.
    if (std::freopen("/dev/null", "w", stdout) == nullptr)
        return EXIT_FAILURE;
    for (int round = 0; round < rounds; ++round) {
        least = std::min(least, SecondsOf([&] { ImportAndPair(oldPath, newPath); }));
        diff = std::min(diff, SecondsOf([&] {
                            if (dcm::tools::Diff({oldPath, newPath, {}, {}, false, false}) != 1)
                                throw std::runtime_error("the files do not differ");
                        }));
    }
    std::cerr << data.blocks.size() << " blocks a side: imports, visit and map " << least
              << " s, diff " << diff << " s, ratio " << diff / least << " (limit " << kLimit
              << ")\n";
    return diff <= kLimit * least ? EXIT_SUCCESS : EXIT_FAILURE;
}
