#include "tools/report/model.h"

#include <algorithm>

namespace dcm::tools {
namespace {

constexpr struct
{
    Kind kind;
    Look look;
} kOrder[] = {
    {Kind::kFestwert, Look::kRow},        {Kind::kTextstring, Look::kRow},
    {Kind::kFestwerteblock, Look::kList}, {Kind::kKennlinie, Look::kCurve},
    {Kind::kFestkennlinie, Look::kCurve}, {Kind::kGruppenkennlinie, Look::kCurve},
    {Kind::kKennfeld, Look::kMap},        {Kind::kFestkennfeld, Look::kMap},
    {Kind::kGruppenkennfeld, Look::kMap}, {Kind::kStuetzstellenverteilung, Look::kList},
};

Look LookOf(Kind kind)
{
    return std::find_if(std::begin(kOrder), std::end(kOrder),
                        [&](const auto& row) { return row.kind == kind; })
        ->look;
}

} // namespace

std::vector<PageKind> PageKindsOf(std::span<const Parameter> parameters,
                                  std::span<const Parameter> others,
                                  std::span<const Difference> differences)
{
    std::vector<const Difference*> differenceOf(parameters.size());
    for (const Difference& difference : differences) {
        if (difference.oldIndex != kNoIndex)
            differenceOf[difference.oldIndex] = &difference;
    }

    std::vector<PageKind> kinds;
    for (const auto& [kind, look] : kOrder)
        kinds.push_back({kind, look, {}});
    const auto blocksOf = [&](Kind kind) -> std::vector<PageBlock>& {
        return std::find_if(kinds.begin(), kinds.end(),
                            [&](const PageKind& k) { return k.kind == kind; })
            ->blocks;
    };
    for (std::size_t i = 0; i < parameters.size(); ++i) {
        const Difference* difference = differenceOf[i];
        const bool inBoth = difference != nullptr && difference->change == Change::kChanged;
        blocksOf(parameters[i].kind)
            .push_back(
                {&parameters[i], inBoth ? &others[difference->newIndex] : nullptr, difference});
    }
    for (const Difference& difference : differences) {
        if (difference.change == Change::kAdded) {
            blocksOf(difference.kind)
                .push_back({&others[difference.newIndex], nullptr, &difference});
        }
    }
    std::erase_if(kinds, [](const PageKind& kind) { return kind.blocks.empty(); });
    return kinds;
}

const std::vector<CComVariant>& ShownValues(const Parameter& parameter)
{
    return parameter.kind == Kind::kStuetzstellenverteilung ? parameter.x.points : parameter.values;
}

const CString& ShownUnit(const Parameter& parameter)
{
    return parameter.kind == Kind::kStuetzstellenverteilung ? parameter.x.unit : parameter.unit;
}

Shape ShapeOf(const Parameter& parameter)
{
    const std::size_t count = ShownValues(parameter).size();
    if (LookOf(parameter.kind) == Look::kCurve)
        return {0, std::max(count, parameter.x.points.size())};
    const bool isGrid =
        LookOf(parameter.kind) == Look::kMap ||
        (parameter.kind == Kind::kFestwerteblock && parameter.countX > 0 && parameter.countY > 0);
    // A declared count may be far above the number of values.
    const std::size_t columns =
        isGrid ? std::min(parameter.columns, std::max(count, parameter.x.points.size())) : 0;
    if (columns == 0)
        return {0, count};
    return {columns, std::max((count + columns - 1) / columns, parameter.y.points.size())};
}

} // namespace dcm::tools
