#include "tools/commands/diff.h"

#include "tools/comparison.h"
#include "tools/input.h"
#include "tools/json_form.h"
#include "tools/number_text.h"
#include "tools/output.h"
#include "tools/parameter_text.h"
#include "tools/progress.h"
#include "tools/shown_text.h"
#include "tools/table.h"
#include "tools/trouble.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

/// The parameters of both files.
struct Sides
{
    std::vector<Parameter> oldParameters;
    std::vector<Parameter> newParameters;
};

/// How a kind of difference is told.
struct ChangeWord
{
    Change change;
    std::string_view word;
    Colour colour;
};

constexpr std::array kChangeWords = {
    ChangeWord{Change::kAdded, "added", Colour::kGreen},
    ChangeWord{Change::kRemoved, "removed", Colour::kRed},
    ChangeWord{Change::kChanged, "changed", Colour::kYellow},
};

const ChangeWord& WordOf(Change change)
{
    return *std::find_if(kChangeWords.begin(), kChangeWords.end(),
                         [change](const ChangeWord& word) { return word.change == change; });
}

/// The place of a value that differs, in the side that has it.
Coordinates PlaceOf(const Difference& difference, const ValueDifference& value, const Sides& sides)
{
    if (value.newIndex != kNoIndex)
        return CoordinatesOf(sides.newParameters[difference.newIndex], value.newIndex);
    return CoordinatesOf(sides.oldParameters[difference.oldIndex], value.oldIndex);
}

bool AreNumbers(const ValueDifference& value)
{
    return value.oldValue.vt == VT_R8 && value.newValue.vt == VT_R8;
}

double ChangeOf(const ValueDifference& value)
{
    return value.newValue.dblVal - value.oldValue.dblVal;
}

// ---- Text ---------------------------------------------------------------------------------------

std::string ChangeText(const ValueDifference& value)
{
    if (!AreNumbers(value))
        return "";
    const std::string text = ShortNumberText(ChangeOf(value));
    return text.starts_with('-') || text.starts_with('n') ? text : '+' + text;
}

std::string FieldLines(const Difference& difference)
{
    std::string lines;
    for (const FieldDifference& field : difference.fields) {
        lines += "    " + ToUtf8(KeywordOf(field.field)) + "  \"" + Shown(field.oldText.View()) +
                 "\" -> \"" + Shown(field.newText.View()) + "\"\n";
    }
    return lines;
}

/// One line for each axis point: the axis, its index, old and new point and the change.
std::string PointLines(std::string_view axis, const std::vector<ValueDifference>& points)
{
    Table table({Align::kLeft});
    for (const ValueDifference& point : points) {
        const std::size_t index = point.oldIndex == kNoIndex ? point.newIndex : point.oldIndex;
        table.Add({std::string(axis) + '[' + std::to_string(index) + ']', ValueText(point.oldValue),
                   "->", ValueText(point.newValue), ChangeText(point)});
    }
    return table.Text("    ");
}

/// One line for each value: its place, old and new value and the change.
std::string ValueLines(const Difference& difference, const Sides& sides)
{
    Table table({});
    for (const ValueDifference& value : difference.values) {
        const Coordinates place = PlaceOf(difference, value, sides);
        std::vector<std::string> cells;
        for (const CComVariant* point : {&place.x, &place.y}) {
            if (point->vt != VT_EMPTY)
                cells.push_back(ValueText(*point));
        }
        if (!cells.empty())
            cells.back() += ':';
        cells.insert(cells.end(), {ValueText(value.oldValue), "->", ValueText(value.newValue),
                                   ChangeText(value)});
        table.Add(std::move(cells));
    }
    return table.Text("    ");
}

/// What of a changed parameter differs, in a few words.
std::string CountsText(const Difference& difference)
{
    std::string text;
    const auto add = [&text](std::size_t count, std::string_view noun) {
        if (count > 0)
            text += (text.empty() ? "" : ", ") + Counted(count, noun);
    };
    add(difference.values.size(), "value");
    add(difference.x.size() + difference.y.size(), "axis point");
    add(difference.fields.size(), "text");
    return text;
}

std::string UnitOf(const Parameter& parameter)
{
    return parameter.unit.IsEmpty() ? "" : " [" + Shown(parameter.unit.View()) + "]";
}

std::string HeadLine(const Difference& difference, const Sides& sides, bool withCounts)
{
    const bool removed = difference.change == Change::kRemoved;
    const Parameter& parameter = removed ? sides.oldParameters[difference.oldIndex]
                                         : sides.newParameters[difference.newIndex];
    const ChangeWord& word = WordOf(difference.change);
    std::string line = Painted(word.word, word.colour) + ' ' +
                       Painted(TitleOf(parameter), Colour::kBold) + UnitOf(parameter);
    if (difference.change != Change::kChanged) {
        line += ": " + ValuesText(parameter);
    } else if (withCounts) {
        line += ": " + CountsText(difference);
    }
    return line + '\n';
}

std::string DifferenceText(const Difference& difference, const Sides& sides, bool summary)
{
    std::string text = HeadLine(difference, sides, summary);
    if (!summary) {
        text += FieldLines(difference) + PointLines("x", difference.x) +
                PointLines("y", difference.y) + ValueLines(difference, sides);
    }
    return text;
}

std::size_t CountOf(std::span<const Difference> differences, Change change)
{
    return static_cast<std::size_t>(
        std::count_if(differences.begin(), differences.end(),
                      [change](const Difference& one) { return one.change == change; }));
}

std::string TotalLine(std::span<const Difference> differences)
{
    std::string line;
    for (const ChangeWord& word : kChangeWords) {
        line += (line.empty() ? "" : ", ") + std::to_string(CountOf(differences, word.change)) +
                ' ' + std::string(word.word);
    }
    return line + '\n';
}

void PrintText(std::span<const Difference> differences, const Sides& sides, bool summary)
{
    for (const Difference& difference : differences)
        Print(DifferenceText(difference, sides, summary));
    if (!differences.empty())
        Print(TotalLine(differences));
}

// ---- JSON ---------------------------------------------------------------------------------------

/// An index, or null where the side has none.
Json JsonOfIndex(std::size_t index)
{
    return index == kNoIndex ? Json(nullptr) : Json(index);
}

Json JsonOfPoint(const ValueDifference& value)
{
    Json json = {{"oldIndex", JsonOfIndex(value.oldIndex)},
                 {"newIndex", JsonOfIndex(value.newIndex)},
                 {"old", JsonOf(value.oldValue)},
                 {"new", JsonOf(value.newValue)}};
    if (AreNumbers(value))
        json["difference"] = JsonOf(CComVariant(ChangeOf(value)));
    return json;
}

Json JsonOfPoints(const std::vector<ValueDifference>& points)
{
    Json json = Json::array();
    for (const ValueDifference& point : points)
        json.push_back(JsonOfPoint(point));
    return json;
}

Json JsonOfValues(const Difference& difference, const Sides& sides)
{
    Json json = Json::array();
    for (const ValueDifference& value : difference.values) {
        const Coordinates place = PlaceOf(difference, value, sides);
        Json one = JsonOfPoint(value);
        one["x"] = JsonOf(place.x);
        one["y"] = JsonOf(place.y);
        json.push_back(std::move(one));
    }
    return json;
}

Json JsonOfDifference(const Difference& difference, const Sides& sides)
{
    Json fields = Json::array();
    for (const FieldDifference& field : difference.fields) {
        fields.push_back({{"field", ToUtf8(KeywordOf(field.field))},
                          {"old", JsonOf(field.oldText)},
                          {"new", JsonOf(field.newText)}});
    }
    return {{"change", WordOf(difference.change).word},
            {"kind", ToUtf8(KeywordOf(difference.kind))},
            {"name", JsonOf(difference.name)},
            {"oldIndex", JsonOfIndex(difference.oldIndex)},
            {"newIndex", JsonOfIndex(difference.newIndex)},
            {"fields", std::move(fields)},
            {"x", JsonOfPoints(difference.x)},
            {"y", JsonOfPoints(difference.y)},
            {"values", JsonOfValues(difference, sides)}};
}

void PrintJson(std::span<const Difference> differences, const Sides& sides,
               const DiffOptions& options)
{
    Print(R"({"format": "dcm-diff", "version": 1, "old": )" + JsonText(options.oldFile) +
          ", \"new\": " + JsonText(options.newFile));
    for (const ChangeWord& word : kChangeWords) {
        Print(", \"" + std::string(word.word) +
              "\": " + std::to_string(CountOf(differences, word.change)));
    }
    if (!options.summary) {
        Print(",\n\"differences\": [");
        const char* separator = "\n";
        for (const Difference& difference : differences) {
            Print(separator + JsonText(JsonOfDifference(difference, sides)));
            separator = ",\n";
        }
        Print("\n]");
    }
    Print("}\n");
}

// -------------------------------------------------------------------------------------------------

/// No difference is never the result of loss.
int ExitCode(bool differ, const Input& oldInput, const Input& newInput)
{
    if (!oldInput.complete || !newInput.complete)
        return kTrouble;
    if (differ)
        return 1;
    return ErrorsOf(oldInput) + ErrorsOf(newInput) > 0 ? kTrouble : 0;
}

} // namespace

int Diff(const DiffOptions& options)
{
    const Comparison comparison = ComparisonOf(options.tolerances, options.ignored);
    RequireOneStandardInput({options.oldFile, options.newFile});
    Progress progress(2);
    Input oldInput = ReadInput(options.oldFile, progress);
    Input newInput = ReadInput(options.newFile, progress);
    const Sides sides = {ParametersOf(std::move(oldInput.document)),
                         ParametersOf(std::move(newInput.document))};
    const std::vector<Difference> differences =
        Differences(sides.oldParameters, sides.newParameters, comparison);
    if (options.json) {
        PrintJson(differences, sides, options);
    } else {
        PrintText(differences, sides, options.summary);
    }
    TellErrors(oldInput);
    TellErrors(newInput);
    return ExitCode(!differences.empty(), oldInput, newInput);
}

} // namespace dcm::tools
