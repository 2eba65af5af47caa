#include "fuzz/file_content.h"

#include <algorithm>
#include <bit>
#include <cctype>
#include <cstdlib>
#include <limits>
#include <set>

namespace fuzz {

namespace {

constexpr std::string_view kWhite = " \t\n\v\f\r";

std::string_view Strip(std::string_view text, std::string_view characters)
{
    const std::size_t first = text.find_first_not_of(characters);
    if (first == text.npos)
        return {};
    return text.substr(first, text.find_last_not_of(characters) - first + 1);
}

std::string Upper(std::string_view word)
{
    std::string upper(word);
    std::transform(upper.begin(), upper.end(), upper.begin(),
                   [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 32) : c; });
    return upper;
}

std::vector<std::string> Words(std::string_view text)
{
    std::vector<std::string> words;
    while (!(text = Strip(text, kWhite)).empty()) {
        const std::size_t end = std::min(text.find_first_of(kWhite), text.size());
        words.emplace_back(text.substr(0, end));
        text.remove_prefix(end);
    }
    return words;
}

/// The double nearest to a token; the process runs in the locale "C".
Item NumberItem(const std::string& token)
{
    const std::string word = Upper(token);
    double value = std::strtod(token.c_str(), nullptr);
    if (word == "1.#INF" || word == "-1.#INF") {
        value = std::numeric_limits<double>::infinity();
        value = word[0] == '-' ? -value : value;
    }
    return {true, std::bit_cast<std::uint64_t>(value), {}};
}

/// The quoted texts of a line: each begins after a quote and ends before the next one. In a value
/// block, where quotes may be inside, a blank or the end of the line follows that.
std::vector<Item> TextItems(std::string_view rest, bool quotesInside)
{
    std::vector<Item> items;
    while (!(rest = Strip(rest, kWhite)).empty()) {
        rest.remove_prefix(1);
        std::size_t end = rest.find('"');
        while (quotesInside && end < rest.size() && end + 1 < rest.size() &&
               kWhite.find(rest[end + 1]) == kWhite.npos)
            end = rest.find('"', end + 1);
        items.push_back({false, 0, std::string(rest.substr(0, end))});
        rest.remove_prefix(std::min(end, rest.size() - 1) + 1);
    }
    return items;
}

/// The items of a line: texts when it begins with a quote, otherwise numbers.
void AppendItems(std::vector<Item>& items, std::string_view rest, bool quotesInside = false)
{
    rest = Strip(rest, kWhite);
    if (rest.starts_with('"')) {
        const auto texts = TextItems(rest, quotesInside);
        items.insert(items.end(), texts.begin(), texts.end());
        return;
    }
    for (const std::string& word : Words(rest))
        items.push_back(NumberItem(word));
}

const std::set<std::string> kKinds = {"FESTWERT",  "FESTWERTEBLOCK", "STUETZSTELLENVERTEILUNG",
                                      "KENNLINIE", "FESTKENNLINIE",  "GRUPPENKENNLINIE",
                                      "KENNFELD",  "FESTKENNFELD",   "GRUPPENKENNFELD",
                                      "TEXTSTRING"};

const std::set<std::string> kTexts = {"LANGNAME",  "DISPLAYNAME", "FUNKTION", "EINHEIT_W",
                                      "EINHEIT_X", "EINHEIT_Y",   "*SSTX",    "*SSTY"};

/// The value of a single value block: the whole rest of its line. An empty number says nothing.
void SetSingleValue(Content& block, const std::string& keyword, std::string_view rest)
{
    rest = Strip(rest, kWhite);
    if (keyword == "WERT" && rest.empty())
        return;
    block.values.clear();
    if (keyword == "WERT") {
        block.values.push_back(NumberItem(std::string(rest)));
    } else {
        block.values.push_back({false, 0, std::string(Strip(rest, "\""))});
    }
}

/// Whether a line of points says nothing to a kind that has no such axis: an empty text equals
/// none.
bool SaysNothing(const Content& block, const std::string& keyword, std::string_view rest)
{
    const bool y = keyword == "ST/Y" || keyword == "ST_TX/Y";
    const bool x = keyword == "ST/X" || keyword == "ST_TX/X";
    const bool hasY = block.head[0].ends_with("KENNFELD");
    const bool hasX = hasY || block.head[0].ends_with("KENNLINIE") || block.head[0][0] == 'S';
    return Strip(rest, " \t\v\f\r\"").empty() && ((x && !hasX) || (y && !hasY));
}

void AddLine(Content& block, const std::string& keyword, std::string_view rest)
{
    if (SaysNothing(block, keyword, rest))
        return;
    const bool single = block.head[0] == "FESTWERT" || block.head[0] == "TEXTSTRING";
    if (kTexts.contains(keyword)) {
        const std::string_view text = Strip(rest, " \t\v\f\r\"");
        if (!text.empty())
            block.texts[keyword] = text;
    } else if (keyword == "ST/X" || keyword == "ST_TX/X") {
        AppendItems(block.x, rest);
    } else if (keyword == "ST/Y" || keyword == "ST_TX/Y") {
        AppendItems(block.y, rest);
        block.rows.resize(block.y.size(), block.values.size());
    } else if (keyword == "WERT" || keyword == "TEXT") {
        const std::string_view said = Strip(rest, kWhite);
        const bool list = block.head[0] == "FESTWERTEBLOCK";
        if (single) {
            SetSingleValue(block, keyword, rest);
        } else if (list && keyword == "TEXT" && !said.empty() && !said.starts_with('"')) {
            // Without quotes the whole rest of the line is one text.
            block.values.push_back({false, 0, std::string(said)});
        } else {
            AppendItems(block.values, rest, list);
        }
    }
}

/// The first line's words: the name of a single value may hold blanks.
std::vector<std::string> HeadOf(const std::string& keyword, std::string_view rest)
{
    if (keyword == "FESTWERT" || keyword == "TEXTSTRING")
        return {keyword, std::string(Strip(rest, " \t\v\f\r\""))};
    std::vector<std::string> head = Words(rest);
    // The second count need not be apart from the sign.
    if (head.size() == 3 && head[2].size() > 1 && head[2][0] == '@') {
        head.push_back(head[2].substr(1));
        head[2] = "@";
    }
    // Counts are decimal numbers, in whatever form.
    for (std::size_t i = 1; i < head.size(); ++i)
        head[i] = head[i] == "@" ? head[i] : std::to_string(std::atoi(head[i].c_str()));
    // No rows of nothing are no values, like the count 0.
    if (head.size() == 4 && head[1] == "0" && head[2] == "@" && head[3] == "0")
        head.resize(2);
    head.insert(head.begin(), keyword);
    return head;
}

/// Whether several points of the Y axis come before the values of the first of them.
bool ListsItsAxis(const Content& block)
{
    return !block.values.empty() &&
           std::adjacent_find(block.rows.begin(), block.rows.end()) != block.rows.end();
}

/// A single value without a number is written as 0.
bool HaveTheSameValues(const Content& said, const Content& kept)
{
    const std::vector<Item> zero = {{true, 0, {}}};
    return said.values == kept.values || (said.values.empty() && kept.values == zero);
}

} // namespace

bool SayTheSame(const Content& said, const Content& kept)
{
    return said.head == kept.head && said.texts == kept.texts && said.x == kept.x &&
           said.y == kept.y && HaveTheSameValues(said, kept) &&
           (said.rows == kept.rows || ListsItsAxis(said) || ListsItsAxis(kept));
}

bool SayTheSame(const FileContent& said, const FileContent& kept)
{
    const auto same = [](const auto& a, const auto& b) {
        return a.first == b.first &&
               std::equal(a.second.begin(), a.second.end(), b.second.begin(), b.second.end(),
                          [](const Content& x, const Content& y) { return SayTheSame(x, y); });
    };
    return std::equal(said.begin(), said.end(), kept.begin(), kept.end(), same);
}

FileContent ContentOf(std::string_view file)
{
    FileContent kinds;
    Content* block = nullptr;
    while (!file.empty()) {
        const std::size_t end = std::min(file.find('\n'), file.size());
        const std::string_view line = Strip(file.substr(0, end), kWhite);
        file.remove_prefix(std::min(end + 1, file.size()));
        const std::size_t size = std::min(line.find_first_of(kWhite), line.size());
        const std::string keyword = Upper(line.substr(0, size));
        const std::string_view rest = line.substr(size);
        if (kKinds.contains(keyword)) {
            auto& list = kinds[keyword];
            list.push_back({HeadOf(keyword, rest), {}, {}, {}, {}, {}});
            block = &list.back();
        } else if (keyword == "END") {
            block = nullptr;
        } else if (block != nullptr) {
            AddLine(*block, keyword, rest);
        }
    }
    return kinds;
}

std::string Describe(const FileContent& content)
{
    std::string text;
    const auto items = [&](const char* name, const std::vector<Item>& list) {
        text += std::string("  ") + name + ':';
        for (const Item& item : list)
            text += item.isNumber ? ' ' + std::to_string(item.bits) : " \"" + item.text + '"';
        text += '\n';
    };
    for (const auto& [kind, blocks] : content) {
        for (const Content& block : blocks) {
            for (const std::string& word : block.head)
                text += word + '|';
            text += '\n';
            for (const auto& [keyword, value] : block.texts)
                text += "  " + keyword + '=' + value + '\n';
            items("x", block.x);
            items("y", block.y);
            items("values", block.values);
            text += "  rows:";
            for (const std::size_t row : block.rows)
                text += ' ' + std::to_string(row);
            text += '\n';
        }
    }
    return text;
}

} // namespace fuzz
