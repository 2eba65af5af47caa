#include "tools/commands/show.h"

#include "dcm/library/dcm.h"
#include "tools/input.h"
#include "tools/json_form.h"
#include "tools/names.h"
#include "tools/output.h"
#include "tools/parameter_text.h"
#include "tools/progress.h"
#include "tools/shown_text.h"
#include "tools/table.h"
#include "tools/trouble.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

constexpr std::string_view kIndent = "    ";
/// Values of a list on one line.
constexpr std::size_t kValuesInLine = 8;

/// Columns of a terminal that the values take at most in a table of all parameters.
constexpr std::size_t kWidestValues = 32;

/// A text line of a parameter by its keyword.
using Attribute = std::pair<std::string, std::string>;

/// The texts that a parameter has, each with the keyword of its line.
std::vector<Attribute> AttributesOf(const Parameter& parameter)
{
    std::vector<Attribute> attributes;
    const auto add = [&attributes](Field field, const CString& text) {
        if (!text.IsEmpty())
            attributes.emplace_back(ToUtf8(KeywordOf(field)), Shown(text.View()));
    };
    add(Field::kLangname, parameter.langname);
    add(Field::kDisplayname, parameter.displayname);
    add(Field::kFunction, parameter.function);
    add(Field::kUnitX, parameter.x.unit);
    add(Field::kUnitY, parameter.y.unit);
    add(Field::kUnit, parameter.unit);
    add(Field::kDistributionX, parameter.x.distribution);
    add(Field::kDistributionY, parameter.y.distribution);
    return attributes;
}

std::string CommentText(const CString& comment)
{
    std::string text;
    std::string_view rest;
    const std::string utf8 = ToUtf8(comment.View());
    for (rest = utf8; !rest.empty();) {
        const std::size_t end = std::min(rest.find('\n'), rest.size());
        text += "* " + Shown(rest.substr(0, end)) + '\n';
        rest.remove_prefix(std::min(end + 1, rest.size()));
    }
    return text;
}

// ---- One line a parameter -----------------------------------------------------------------------

std::string IndexTable(const std::vector<Parameter>& parameters)
{
    Table table(
        {Align::kLeft, Align::kLeft, Align::kRight, Align::kLeft, Align::kLeft, Align::kLeft});
    table.Add({"KIND", "NAME", "SIZE", "VALUES", "UNIT", "LANGNAME"});
    for (const Parameter& parameter : parameters) {
        const bool isDistribution = parameter.kind == Kind::kStuetzstellenverteilung;
        table.Add({ToUtf8(KeywordOf(parameter.kind)), Shown(parameter.name.View()),
                   SizeText(parameter), Shortened(ValuesText(parameter), kWidestValues),
                   Shown((isDistribution ? parameter.x.unit : parameter.unit).View()),
                   Shown(parameter.langname.View())});
    }
    return table.Text();
}

// ---- A parameter whole --------------------------------------------------------------------------

/// Values, a fixed number on each line.
Table ListOf(const std::vector<CComVariant>& values, std::size_t columns)
{
    Table table({});
    for (std::size_t i = 0; i < values.size(); i += columns) {
        std::vector<std::string> cells;
        for (std::size_t j = i; j < std::min(i + columns, values.size()); ++j)
            cells.push_back(ValueText(values[j]));
        table.Add(std::move(cells));
    }
    return table;
}

/// One line for each point of a curve: the point and its value.
Table CurveOf(const Parameter& parameter)
{
    Table table({});
    table.Add({"x", "value"});
    const std::size_t count = std::max(parameter.x.points.size(), parameter.values.size());
    const auto text = [](const std::vector<CComVariant>& list, std::size_t index) {
        return index < list.size() ? ValueText(list[index]) : std::string("-");
    };
    for (std::size_t i = 0; i < count; ++i)
        table.Add({text(parameter.x.points, i), text(parameter.values, i)});
    return table;
}

/// The points of x as the first line, and one line for each point of y.
Table GridOf(const Parameter& parameter)
{
    const std::size_t columns = parameter.columns;
    const std::size_t rows =
        std::max(parameter.y.points.size(), (parameter.values.size() + columns - 1) / columns);
    Table table({});
    std::vector<std::string> head = {"y \\ x"};
    for (const CComVariant& point : parameter.x.points)
        head.push_back(ValueText(point));
    table.Add(std::move(head));
    for (std::size_t row = 0; row < rows; ++row) {
        const auto& points = parameter.y.points;
        std::vector<std::string> cells = {row < points.size() ? ValueText(points[row]) : "-"};
        const std::size_t end = std::min((row + 1) * columns, parameter.values.size());
        for (std::size_t i = row * columns; i < end; ++i)
            cells.push_back(ValueText(parameter.values[i]));
        table.Add(std::move(cells));
    }
    return table;
}

Table ContentOf(const Parameter& parameter)
{
    switch (parameter.kind) {
    case Kind::kStuetzstellenverteilung:
        return ListOf(parameter.x.points, kValuesInLine);
    case Kind::kKennlinie:
    case Kind::kFestkennlinie:
    case Kind::kGruppenkennlinie:
        return CurveOf(parameter);
    case Kind::kKennfeld:
    case Kind::kFestkennfeld:
    case Kind::kGruppenkennfeld:
        if (parameter.columns != 0)
            return GridOf(parameter);
        break;
    default:
        if (parameter.columns != 0 && parameter.columns < parameter.values.size())
            return ListOf(parameter.values, parameter.columns);
        break;
    }
    return ListOf(parameter.values, kValuesInLine);
}

std::string WholeText(const Parameter& parameter)
{
    Table attributes({Align::kLeft, Align::kLeft});
    for (const auto& [keyword, text] : AttributesOf(parameter))
        attributes.Add({keyword, text});
    return Painted(TitleOf(parameter), Colour::kBold) + ", " + SizeText(parameter) + '\n' +
           attributes.Text(kIndent) + ContentOf(parameter).Text(kIndent);
}

// ---- One line a value ---------------------------------------------------------------------------

std::string PlaceText(const Coordinates& place)
{
    if (place.x.vt == VT_EMPTY && place.y.vt == VT_EMPTY)
        return "";
    if (place.y.vt == VT_EMPTY)
        return " (" + ValueText(place.x) + ")";
    return " (" + ValueText(place.x) + ", " + ValueText(place.y) + ")";
}

std::string LinesText(const Parameter& parameter)
{
    const std::string title = TitleOf(parameter);
    std::string text;
    for (const auto& [keyword, attribute] : AttributesOf(parameter))
        text.append(title).append(": ").append(keyword).append(" = ").append(attribute) += '\n';
    const bool isDistribution = parameter.kind == Kind::kStuetzstellenverteilung;
    const auto& values = isDistribution ? parameter.x.points : parameter.values;
    for (std::size_t i = 0; i < values.size(); ++i) {
        text +=
            title + PlaceText(CoordinatesOf(parameter, i)) + " = " + ValueText(values[i]) + '\n';
    }
    return values.empty() ? text + title + " = -\n" : text;
}

// -------------------------------------------------------------------------------------------------

std::string TextOf(const CString& comment, const std::vector<Parameter>& parameters,
                   const ShowOptions& options)
{
    if (options.json)
        return JsonText(comment, parameters);
    std::string text;
    if (options.names.empty())
        text = CommentText(comment);
    if (!options.lines && !options.all && options.names.empty())
        return text + (text.empty() ? "" : "\n") + IndexTable(parameters);
    for (const Parameter& parameter : parameters) {
        if (!options.lines && !text.empty())
            text += '\n';
        text += options.lines ? LinesText(parameter) : WholeText(parameter);
    }
    return text;
}

} // namespace

int Show(const ShowOptions& options)
{
    Progress progress(1);
    Input input = ReadInput(options.file, progress);
    const CString comment = input.document.GetComment();
    std::vector<Parameter> parameters = ParametersOf(std::move(input.document));
    const Patterns patterns(options.names);
    if (!patterns.IsEmpty()) {
        patterns.RequireMatches(parameters, Shown(input.label));
        std::erase_if(parameters, [&patterns](const Parameter& parameter) {
            return !patterns.Match(parameter.name.View());
        });
    }
    Print(TextOf(comment, parameters, options));
    TellErrors(input);
    return input.complete ? 0 : kTrouble;
}

} // namespace dcm::tools
