#include "tools/json_form.h"

#include "tools/number_text.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

constexpr const char* kFormat = "dcm-parameters";
constexpr int kVersion = 1;
constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

constexpr std::uint32_t kFirstBeyondBmp = 0x10000;
constexpr std::uint32_t kFirstHigh = 0xD800;
constexpr std::uint32_t kFirstLow = 0xDC00;
constexpr std::uint32_t kAfterLow = 0xE000;
/// Characters of 16 bits make pairs of surrogates; then a pair is one number, as in a file that was
/// written where characters have 32 bits.
constexpr bool kHasPairs = sizeof(wchar_t) == 2;

/// The numbers of the characters.
std::vector<std::uint32_t> CharactersOf(std::wstring_view text)
{
    std::vector<std::uint32_t> characters;
    for (const wchar_t character : text) {
        const auto number =
            static_cast<std::uint32_t>(static_cast<std::make_unsigned_t<wchar_t>>(character));
        if (kHasPairs && number >= kFirstLow && number < kAfterLow && !characters.empty() &&
            characters.back() >= kFirstHigh && characters.back() < kFirstLow) {
            characters.back() =
                kFirstBeyondBmp + ((characters.back() - kFirstHigh) << 10U) + (number - kFirstLow);
        } else {
            characters.push_back(number);
        }
    }
    return characters;
}

// ---- Writing ----------------------------------------------------------------------------------

Json JsonOfAxis(const Axis& axis)
{
    Json points = Json::array();
    for (const CComVariant& point : axis.points)
        points.push_back(JsonOf(point));
    return {{"unit", JsonOf(axis.unit)},
            {"distribution", JsonOf(axis.distribution)},
            {"points", std::move(points)}};
}

bool HasAxis(const Axis& axis)
{
    return !axis.points.empty() || !axis.unit.IsEmpty() || !axis.distribution.IsEmpty();
}

// ---- Reading ----------------------------------------------------------------------------------

/// A value of the document with its place, for messages.
struct Place
{
    const Json& json;
    std::string name;

    [[noreturn]] void Expect(const std::string& what) const
    {
        throw Trouble((name.empty() ? "the document" : name) + ": " + what + " is expected");
    }
    Place At(const char* member) const
    {
        return {json.at(member), name.empty() ? member : name + "." + member};
    }
    Place At(std::size_t index) const
    {
        return {json.at(index), name + "[" + std::to_string(index) + "]"};
    }
    bool Has(const char* member) const { return json.contains(member); }
};

/// A misspelt member would be lost without a word.
void RequireMembers(const Place& place, std::initializer_list<std::string_view> known)
{
    if (!place.json.is_object())
        place.Expect("an object");
    for (const auto& [name, member] : place.json.items()) {
        if (std::find(known.begin(), known.end(), name) == known.end()) {
            throw Trouble((place.name.empty() ? "the document" : place.name) +
                          ": unknown member \"" + Shown(std::string_view(name)) + "\"");
        }
    }
}

std::int64_t IntegerOf(const Place& place, std::int64_t least, std::int64_t most)
{
    const auto wanted = [least, most] {
        return "a whole number from " + std::to_string(least) + " to " + std::to_string(most);
    };
    if (!place.json.is_number_integer())
        place.Expect(wanted());
    if (place.json.is_number_unsigned() &&
        place.json.get<std::uint64_t>() > static_cast<std::uint64_t>(most))
        place.Expect(wanted());
    const auto number = place.json.get<std::int64_t>();
    if (number < least || number > most)
        place.Expect(wanted());
    return number;
}

void AppendCharacter(std::wstring& text, std::uint32_t character)
{
    if (!kHasPairs || character < kFirstBeyondBmp) {
        text += static_cast<wchar_t>(character);
        return;
    }
    character -= kFirstBeyondBmp;
    text += static_cast<wchar_t>(kFirstHigh + (character >> 10U));
    text += static_cast<wchar_t>(kFirstLow + (character & 0x3FFU));
}

CString TextOfCharacters(const Place& place)
{
    constexpr std::int64_t kMost = kHasPairs ? 0x10FFFF : std::numeric_limits<std::uint32_t>::max();
    if (!place.json.is_array())
        place.Expect("an array");
    std::wstring text;
    for (std::size_t i = 0; i < place.json.size(); ++i)
        AppendCharacter(text, static_cast<std::uint32_t>(IntegerOf(place.At(i), 0, kMost)));
    return {std::wstring_view(text)};
}

CString TextOf(const Place& place)
{
    if (place.json.is_string())
        return FromUtf8(place.json.get_ref<const std::string&>());
    if (!place.json.is_object() || !place.Has("characters"))
        place.Expect("a text");
    RequireMembers(place, {"characters"});
    return TextOfCharacters(place.At("characters"));
}

/// The text of a member, empty when it is missing.
CString TextOf(const Place& place, const char* member)
{
    return place.Has(member) ? TextOf(place.At(member)) : CString();
}

CComVariant VariantOfObject(const Place& place)
{
    RequireMembers(place, {"number", "characters"});
    if (place.Has("characters"))
        return {TextOf(place)};
    std::optional<double> number;
    if (place.Has("number") && place.json.at("number").is_string())
        number = NumberOf(place.json.at("number").get_ref<const std::string&>());
    if (!number)
        place.Expect("a number or a text");
    return {*number};
}

CComVariant VariantOf(const Place& place)
{
    if (place.json.is_null())
        return {};
    if (place.json.is_number())
        return {place.json.get<double>()};
    if (place.json.is_string())
        return {TextOf(place)};
    if (!place.json.is_object())
        place.Expect("a number or a text");
    return VariantOfObject(place);
}

std::vector<CComVariant> VariantsOf(const Place& place, const char* member)
{
    std::vector<CComVariant> variants;
    if (!place.Has(member))
        return variants;
    const Place array = place.At(member);
    if (!array.json.is_array())
        array.Expect("an array");
    variants.reserve(array.json.size());
    for (std::size_t i = 0; i < array.json.size(); ++i)
        variants.push_back(VariantOf(array.At(i)));
    return variants;
}

Axis AxisOf(const Place& place, const char* member)
{
    if (!place.Has(member))
        return {};
    const Place axis = place.At(member);
    RequireMembers(axis, {"unit", "distribution", "points"});
    return {TextOf(axis, "unit"), TextOf(axis, "distribution"), VariantsOf(axis, "points")};
}

Kind KindAt(const Place& place)
{
    if (!place.Has("kind"))
        place.Expect("a member \"kind\"");
    const auto kind = KindOf(TextOf(place.At("kind")).View());
    if (!kind)
        place.At("kind").Expect("the keyword of a kind");
    return *kind;
}

std::int32_t CountOf(const Place& place, const char* member)
{
    using Limits = std::numeric_limits<std::int32_t>;
    return place.Has(member) ? static_cast<std::int32_t>(
                                   IntegerOf(place.At(member), Limits::min(), Limits::max()))
                             : 0;
}

std::size_t ColumnsOf(const Place& place, std::size_t otherwise)
{
    constexpr std::int64_t kMost = std::numeric_limits<std::int32_t>::max();
    return place.Has("columns") ? static_cast<std::size_t>(IntegerOf(place.At("columns"), 0, kMost))
                                : otherwise;
}

Parameter ParameterOf(const Place& place)
{
    RequireMembers(place, {"kind", "name", "langname", "displayname", "function", "x", "y", "unit",
                           "columns", "countX", "countY", "values"});
    Parameter parameter;
    parameter.kind = KindAt(place);
    if (!place.Has("name"))
        place.Expect("a member \"name\"");
    parameter.name = TextOf(place, "name");
    parameter.langname = TextOf(place, "langname");
    parameter.displayname = TextOf(place, "displayname");
    parameter.function = TextOf(place, "function");
    parameter.x = AxisOf(place, "x");
    parameter.y = AxisOf(place, "y");
    parameter.unit = TextOf(place, "unit");
    parameter.values = VariantsOf(place, "values");
    parameter.columns = ColumnsOf(place, parameter.values.size());
    parameter.countX = CountOf(place, "countX");
    parameter.countY = CountOf(place, "countY");
    return parameter;
}

void RequireFormat(const Place& document)
{
    RequireMembers(document, {"format", "version", "comment", "parameters"});
    if (!document.Has("format") || document.json.at("format") != kFormat)
        document.Expect(R"("format": ")" + std::string(kFormat) + '"');
    if (!document.Has("version") || document.json.at("version") != kVersion)
        document.Expect(R"("version": )" + std::to_string(kVersion));
    if (!document.Has("parameters") || !document.json.at("parameters").is_array())
        document.Expect("an array \"parameters\"");
}

JsonDocument DocumentOf(const Json& json)
{
    const Place document{json, ""};
    RequireFormat(document);
    JsonDocument result;
    result.comment = TextOf(document, "comment");
    const Place parameters = document.At("parameters");
    for (std::size_t i = 0; i < parameters.json.size(); ++i)
        result.parameters.push_back(ParameterOf(parameters.At(i)));
    return result;
}

/// "LINE:COLUMN" of a byte, both from 1.
std::string LineAndColumn(std::string_view text, std::size_t byte)
{
    const std::string_view before = text.substr(0, byte);
    const auto lines = std::count(before.begin(), before.end(), '\n');
    const std::size_t lineStart = before.rfind('\n') + 1;
    return std::to_string(lines + 1) + ':' + std::to_string(Width(before.substr(lineStart)) + 1);
}

/// What the reader of JSON says, without its own number and place.
std::string WordsOf(std::string_view words)
{
    for (const std::string_view before : {"] ", "column ", ": "}) {
        const std::size_t at = words.find(before);
        if (at != words.npos)
            words.remove_prefix(at + before.size());
    }
    return Shown(words);
}

Json Parse(std::string_view text, const std::string& label)
{
    const std::size_t mark = text.starts_with(kByteOrderMark) ? kByteOrderMark.size() : 0;
    text.remove_prefix(mark);
    try {
        return Json::parse(text);
    } catch (const Json::parse_error& error) {
        const std::size_t byte = error.byte == 0 ? 0 : error.byte - 1;
        throw Trouble(Shown(label) + ':' + LineAndColumn(text, byte) +
                      ": not JSON: " + WordsOf(error.what()));
    } catch (const Json::out_of_range& error) {
        throw Trouble(Shown(label) + ": not JSON: " + WordsOf(error.what()));
    }
}

} // namespace

Json JsonOf(const CString& text)
{
    std::string utf8 = ToUtf8(text.View());
    if (FromUtf8(utf8) == text)
        return utf8;
    return {{"characters", CharactersOf(text.View())}};
}

Json JsonOf(const VARIANT& value)
{
    switch (value.vt) {
    case VT_BSTR:
        return JsonOf(CString(CComVariant::TextOf(value)));
    case VT_R8:
        if (std::isfinite(value.dblVal))
            return value.dblVal;
        return {{"number", NumberText(value.dblVal)}};
    default:
        return nullptr;
    }
}

Json JsonOf(const Parameter& parameter)
{
    Json json = {{"kind", ToUtf8(KeywordOf(parameter.kind))}, {"name", JsonOf(parameter.name)}};
    const auto addText = [&json](const char* member, const CString& text) {
        if (!text.IsEmpty())
            json[member] = JsonOf(text);
    };
    addText("langname", parameter.langname);
    addText("displayname", parameter.displayname);
    addText("function", parameter.function);
    if (HasAxis(parameter.x))
        json["x"] = JsonOfAxis(parameter.x);
    if (HasAxis(parameter.y))
        json["y"] = JsonOfAxis(parameter.y);
    addText("unit", parameter.unit);
    json["columns"] = parameter.columns;
    if (parameter.countX != 0)
        json["countX"] = parameter.countX;
    if (parameter.countY != 0)
        json["countY"] = parameter.countY;
    Json& values = json["values"] = Json::array();
    for (const CComVariant& value : parameter.values)
        values.push_back(JsonOf(value));
    return json;
}

std::string JsonText(const Json& json)
{
    return json.dump();
}

std::string JsonText(const CString& comment, std::span<const Parameter> parameters)
{
    std::string text = R"({"format": ")" + std::string(kFormat) + R"(", "version": )" +
                       std::to_string(kVersion) + ",\n\"comment\": " + JsonText(JsonOf(comment)) +
                       ",\n\"parameters\": [";
    const char* separator = "\n";
    for (const Parameter& parameter : parameters) {
        text += separator + JsonText(JsonOf(parameter));
        separator = ",\n";
    }
    return text += "\n]}\n";
}

JsonDocument ReadJson(std::string_view text, const std::string& label)
{
    const Json json = Parse(text, label);
    try {
        return DocumentOf(json);
    } catch (const Trouble& trouble) {
        throw Trouble(Shown(label) + ": " + trouble.what());
    }
}

} // namespace dcm::tools
