#include "benchmarks/contestant.h"

#include <fmt/format.h>

namespace dcm::bench {
namespace {

const TakesPart kNumberText("text/fmt", [](const Stage& stage) {
    return TimedNumberTexts<char>(
        stage, [](double number, char* to) { return fmt::format_to(to, "{:.17g}", number); });
});

} // namespace
} // namespace dcm::bench
