#include "benchmarks/contestant.h"

#include <simdjson.h>

namespace dcm::bench {
namespace {

BlockNumbers Read(const std::filesystem::path& path)
{
    simdjson::dom::parser parser;
    BlockNumbers blocks;
    for (const simdjson::dom::element block : parser.load(path.string()).get_array()) {
        std::vector<double> numbers;
        for (const char* const key : {"x", "y", "values"}) {
            for (const simdjson::dom::element number : block[key].get_array())
                numbers.push_back(number.get_double());
        }
        blocks.push_back(std::move(numbers));
    }
    return blocks;
}

const TakesPart kRead("import/simdjson", [](const Stage& stage) {
    return TimedRead([&] { return Read(stage.jsonFile); });
});

} // namespace
} // namespace dcm::bench
