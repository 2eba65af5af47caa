#include "tools/names.h"

#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <cstddef>
#include <numeric>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

/// More near names than this help nobody.
constexpr std::size_t kMostNames = 3;
/// No name of a control unit is longer; the time for one comparison has a limit.
constexpr std::size_t kMostCharacters = 128;

wchar_t Folded(wchar_t character)
{
    return character >= L'A' && character <= L'Z' ? static_cast<wchar_t>(character + (L'a' - L'A'))
                                                  : character;
}

/// How many characters have to be put in, left out or exchanged to make one text the other, in
/// letters of any case.
std::size_t Distance(std::wstring_view a, std::wstring_view b)
{
    std::vector<std::size_t> row(b.size() + 1);
    std::iota(row.begin(), row.end(), std::size_t{0});
    for (const wchar_t character : a) {
        std::size_t diagonal = row[0]++;
        for (std::size_t i = 0; i < b.size(); ++i) {
            const std::size_t exchanged = diagonal + (Folded(character) == Folded(b[i]) ? 0 : 1);
            diagonal = row[i + 1];
            row[i + 1] = std::min({row[i] + 1, row[i + 1] + 1, exchanged});
        }
    }
    return row.back();
}

/// The names that a mistyped one may mean, the nearest first.
std::vector<CString> NearestNames(std::wstring_view mistyped, std::span<const Parameter> parameters)
{
    mistyped = mistyped.substr(0, kMostCharacters);
    const std::size_t most = std::max<std::size_t>(mistyped.size() / 3, 2);
    std::set<std::pair<std::size_t, CString>> nearest;
    for (const Parameter& parameter : parameters) {
        const std::wstring_view name = parameter.name.View().substr(0, kMostCharacters);
        if (name.size() > mistyped.size() + most || mistyped.size() > name.size() + most)
            continue;
        const std::size_t distance = Distance(mistyped, name);
        if (distance > most)
            continue;
        nearest.emplace(distance, parameter.name);
        if (nearest.size() > kMostNames)
            nearest.erase(std::prev(nearest.end()));
    }
    std::vector<CString> names;
    names.reserve(nearest.size());
    for (const auto& [distance, name] : nearest)
        names.push_back(name);
    return names;
}

std::string Question(const std::vector<CString>& names)
{
    std::string question;
    for (const CString& name : names)
        question += (question.empty() ? "; did you mean " : " or ") + Shown(name.View());
    return question.empty() ? question : question + "?";
}

} // namespace

bool Matches(std::wstring_view name, std::wstring_view pattern)
{
    std::size_t at = 0;
    std::size_t n = 0;
    // Where to go on when the text for the last `*` proves too short.
    std::size_t afterStar = std::wstring_view::npos;
    std::size_t starEnd = 0;
    while (n < name.size()) {
        if (at < pattern.size() && pattern[at] == L'*') {
            afterStar = ++at;
            starEnd = n;
        } else if (at < pattern.size() && (pattern[at] == L'?' || pattern[at] == name[n])) {
            ++at;
            ++n;
        } else if (afterStar != std::wstring_view::npos) {
            at = afterStar;
            n = ++starEnd;
        } else {
            return false;
        }
    }
    return pattern.find_first_not_of(L'*', at) == std::wstring_view::npos;
}

Patterns::Patterns(const std::vector<std::string>& patterns)
{
    for (const std::string& pattern : patterns)
        m_patterns.push_back(FromUtf8(pattern));
}

bool Patterns::Match(std::wstring_view name) const
{
    return std::any_of(m_patterns.begin(), m_patterns.end(),
                       [name](const CString& pattern) { return Matches(name, pattern.View()); });
}

void Patterns::RequireMatches(std::span<const Parameter> parameters, const std::string& where) const
{
    for (const CString& pattern : m_patterns) {
        const bool found = std::any_of(parameters.begin(), parameters.end(),
                                       [&pattern](const Parameter& parameter) {
                                           return Matches(parameter.name.View(), pattern.View());
                                       });
        if (!found) {
            throw Trouble(where + ": no parameter is named " + Shown(pattern.View()) +
                          Question(NearestNames(pattern.View(), parameters)));
        }
    }
}

} // namespace dcm::tools
