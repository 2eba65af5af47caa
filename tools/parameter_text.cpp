#include "tools/parameter_text.h"

#include "tools/number_text.h"
#include "tools/shown_text.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <vector>

namespace dcm::tools {

namespace {

bool IsMap(Kind kind)
{
    return kind == Kind::kKennfeld || kind == Kind::kFestkennfeld || kind == Kind::kGruppenkennfeld;
}

bool IsCurve(Kind kind)
{
    return kind == Kind::kKennlinie || kind == Kind::kFestkennlinie ||
           kind == Kind::kGruppenkennlinie;
}

/// The content that a reader looks for: points of a distribution, values of any other kind.
const std::vector<CComVariant>& ContentOf(const Parameter& parameter)
{
    return parameter.kind == Kind::kStuetzstellenverteilung ? parameter.x.points : parameter.values;
}

CComVariant PointAt(const Axis& axis, std::size_t index)
{
    return index < axis.points.size() ? axis.points[index] : CComVariant();
}

CComVariant Index(std::size_t index)
{
    return {static_cast<double>(index)};
}

} // namespace

std::string ValueText(const VARIANT& value)
{
    if (value.vt == VT_BSTR)
        return '"' + Shown(CComVariant::TextOf(value)) + '"';
    return value.vt == VT_R8 ? NumberText(value.dblVal) : "-";
}

std::string TitleOf(const Parameter& parameter)
{
    return ToUtf8(KeywordOf(parameter.kind)) + ' ' + Shown(parameter.name.View());
}

std::string SizeText(const Parameter& parameter)
{
    if (IsMap(parameter.kind)) {
        return std::to_string(parameter.x.points.size()) + " x " +
               std::to_string(parameter.y.points.size());
    }
    const std::size_t count = ContentOf(parameter).size();
    if (parameter.columns != 0 && parameter.columns < count) {
        return std::to_string(parameter.columns) + " x " +
               std::to_string((count + parameter.columns - 1) / parameter.columns);
    }
    return std::to_string(count);
}

std::string ValuesText(const Parameter& parameter)
{
    const auto& content = ContentOf(parameter);
    if (content.empty())
        return "-";
    if (content.size() == 1)
        return ValueText(content.front());
    const bool numbers = std::all_of(content.begin(), content.end(),
                                     [](const CComVariant& value) { return value.vt == VT_R8; });
    if (!numbers)
        return ValueText(content.front()) + " ...";
    const auto [least, greatest] = std::minmax_element(
        content.begin(), content.end(),
        [](const CComVariant& a, const CComVariant& b) { return a.dblVal < b.dblVal; });
    return NumberText(least->dblVal) + " .. " + NumberText(greatest->dblVal);
}

Coordinates CoordinatesOf(const Parameter& parameter, std::size_t index)
{
    if (IsCurve(parameter.kind))
        return {PointAt(parameter.x, index), {}};
    const std::size_t columns = std::max<std::size_t>(parameter.columns, 1);
    if (IsMap(parameter.kind))
        return {PointAt(parameter.x, index % columns), PointAt(parameter.y, index / columns)};
    if (parameter.kind != Kind::kFestwerteblock)
        return {};
    if (columns < parameter.values.size())
        return {Index(index % columns), Index(index / columns)};
    return {Index(index), {}};
}

} // namespace dcm::tools
