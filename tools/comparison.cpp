#include "tools/comparison.h"

#include "tools/number_text.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <cmath>
#include <string>
#include <string_view>
#include <vector>

namespace dcm::tools {

namespace {

constexpr double kPercent = 0.01;

double ToleranceOf(std::string_view digits, std::string_view whole)
{
    const auto number = NumberOf(digits);
    if (!number || !std::isfinite(*number) || std::signbit(*number))
        throw Trouble("the tolerance " + Shown(whole) + " is no number such as 1e-6 or 0.1%");
    return *number;
}

} // namespace

Comparison ComparisonOf(const std::vector<std::string>& tolerances,
                        const std::vector<std::string>& ignored)
{
    Comparison comparison;
    for (const std::string_view text : tolerances) {
        if (text.ends_with('%')) {
            comparison.relative = ToleranceOf(text.substr(0, text.size() - 1), text) * kPercent;
        } else {
            comparison.absolute = ToleranceOf(text, text);
        }
    }
    const auto isIgnored = [&ignored](std::string_view what) {
        return std::find(ignored.begin(), ignored.end(), what) != ignored.end();
    };
    comparison.ignoreTexts = isIgnored("texts");
    comparison.ignoreUnits = isIgnored("units");
    comparison.ignoreAxes = isIgnored("axes");
    return comparison;
}

} // namespace dcm::tools
