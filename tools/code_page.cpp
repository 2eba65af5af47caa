#include "tools/code_page.h"

#include "dcm/library/dcm.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <charconv>
#include <string>
#include <string_view>
#include <system_error>

namespace dcm::tools {

namespace {

/// Names that end in a number: what comes before it, and what is added to it.
constexpr struct
{
    std::string_view prefix;
    unsigned offset;
} kNumbered[] = {
    {"windows-", 0},
    {"cp", 0},
    {"iso-8859-", 28590},
    {"", 0},
};

unsigned NumberAtEnd(std::string_view digits)
{
    unsigned number = 0;
    const auto* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, number);
    return stop == end && error == std::errc() ? number : 0;
}

/// The identifier of a code page, 0 for a name that is none.
unsigned IdentifierOf(std::string_view name)
{
    if (name == "utf-8" || name == "utf8")
        return 65001;
    if (name == "latin1" || name == "latin-1")
        return 28591;
    for (const auto& [prefix, offset] : kNumbered) {
        if (name.starts_with(prefix)) {
            if (const unsigned number = NumberAtEnd(name.substr(prefix.size())))
                return number + offset;
        }
    }
    return 0;
}

std::string LowerCase(std::string text)
{
    for (char& character : text) {
        if (character >= 'A' && character <= 'Z')
            character = static_cast<char>(character + ('a' - 'A'));
    }
    return text;
}

} // namespace

void ChooseCodePage(const std::string& name)
{
    const unsigned identifier = IdentifierOf(LowerCase(name));
    if (identifier == 0 || !SetThreadCodePage(identifier)) {
        throw Trouble("unknown code page " + Shown(name) +
                      "; give utf-8, iso-8859-1 or a number such as 1252");
    }
}

} // namespace dcm::tools
