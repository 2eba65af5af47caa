#include "fuzz/file_maker.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <string_view>
#include <utility>
#include <vector>

namespace fuzz {

namespace {

/// Lines and parts of lines that files have, right and wrong.
constexpr std::string_view kSnippets[] = {
    "",
    " ",
    "\t",
    "END",
    "END ",
    "* comment",
    "*SST",
    "FESTWERT F",
    "TEXTSTRING T",
    "FESTWERTEBLOCK B 2",
    "FESTWERTEBLOCK B 2 @ 1",
    "FESTWERTEBLOCK B 2@1",
    "STUETZSTELLENVERTEILUNG S 2",
    "KENNLINIE K 2",
    "GRUPPENKENNLINIE G 2",
    "KENNFELD M 2 1",
    "GRUPPENKENNFELD N 2 2",
    "KENNFELD M 2",
    "FUNKTIONEN",
    "VAR a=b",
    "LANGNAME \"a b\"",
    "LANGNAME \" a\"",
    "LANGNAME \"\"",
    "LANGNAME \"a",
    "DISPLAYNAME d",
    "FUNKTION f",
    "FUNKTION \"f\"",
    "EINHEIT_W \"mm\"",
    "EINHEIT_X \"\xb0\"",
    "EINHEIT_Y \" \"",
    "*SSTX S",
    "*SSTY S",
    "ST/X 1 2",
    "ST/Y 1",
    "ST/Y 1 2",
    "ST_TX/X \"a\" \"b\"",
    "ST_TX/Y \"a\"",
    "WERT 1 2",
    "WERT 0.1 1e400",
    "WERT -0.0",
    "WERT 1.#INF 1.#QNAN",
    "WERT 1,5",
    "WERT 1\t2",
    "WERT",
    "WERT ",
    "TEXT \"a\"",
    "TEXT \"a\" \"b c\"",
    "TEXT \"\" \"b\"",
    "TEXT \"a\"\"b\"",
    "TEXT \"a\\\" \"b\"",
    "TEXT \"true\"",
    "TEXT a b",
    "KONSERVIERUNG_FORMAT 2.0",
    "KONSERVIERUNG_FORMAT 1.0",
    "\xc3\xa4",
    "\xef\xbb\xbf",
};

constexpr std::string_view kNumbers[] = {"0",   "1.0",     "-0.0",   "+2",      ".5",     "7.",
                                         "1e3", "-2.5E-3", "1.#INF", "-1.#inf", "0.1000", "1e-400"};
constexpr std::string_view kWords[] = {"a", "b c", "\xe4", "", "END", "1", "true", "a\\", "x\ty"};
constexpr std::string_view kEnds[] = {"\n", "\r\n", " \n", "\n", "\n", "\n", "\n", "\n"};

/// One file being made.
class Maker
{
public:
    explicit Maker(Random& random) : m_random(random) {}

    std::string File()
    {
        if (Below(3) == 0)
            m_text += "* comment\n\n";
        if (Below(3) == 0)
            m_text += "KONSERVIERUNG_FORMAT 2.0\n\n";
        for (std::size_t blocks = 1 + Below(4); blocks > 0; --blocks)
            Block();
        return std::move(m_text);
    }

private:
    std::size_t Below(std::size_t limit) { return m_random() % limit; }
    template <std::size_t size>
    std::string Any(const std::string_view (&of)[size])
    {
        return std::string(of[Below(size)]);
    }

    void Line(const std::string& line) { m_text += "    " + line + Any(kEnds); }
    void FirstLine(const std::string& line) { m_text += line + Any(kEnds); }

    void Attributes(std::string_view units)
    {
        if (Below(2) == 0)
            Line("LANGNAME \"" + Any(kWords) + '"');
        if (Below(4) == 0)
            Line("DISPLAYNAME " + Any(kWords));
        if (Below(4) == 0)
            Line("FUNKTION f");
        for (const char unit : units) {
            if (Below(2) == 0)
                Line(std::string("EINHEIT_") + unit + " \"" + Any(kWords) + '"');
        }
    }

    /// Lines of `count` items, numbers or texts.
    void Items(const std::string& numbers, const std::string& texts, std::size_t count, bool text)
    {
        while (count > 0) {
            std::string line = text ? texts : numbers;
            for (std::size_t left = std::min(count, 1 + Below(6)); left > 0; --left, --count) {
                line += (Below(3) == 0 ? "   " : " ") +
                        (text ? '"' + Any(kWords) + '"' : Any(kNumbers));
            }
            Line(line);
        }
    }

    std::string Name() { return std::string(1, static_cast<char>('A' + Below(4))); }

    void Single()
    {
        const bool textstring = Below(3) == 0;
        FirstLine((textstring ? "TEXTSTRING " : "FESTWERT ") + Name());
        Attributes("W");
        if (textstring || Below(4) == 0) {
            Line("TEXT \"" + Any(kWords) + '"');
        } else {
            Line("WERT " + Any(kNumbers));
        }
    }

    void ValueBlock()
    {
        std::size_t count = Below(7);
        std::string first = "FESTWERTEBLOCK " + Name() + ' ' + std::to_string(count);
        if (Below(2) == 0) {
            const std::size_t rows = 1 + Below(3);
            first += " @ " + std::to_string(rows);
            count *= rows;
        }
        FirstLine(first);
        Attributes("W");
        Items("WERT", "TEXT", count, Below(3) == 0);
    }

    void Distribution()
    {
        const std::size_t count = Below(7);
        FirstLine("STUETZSTELLENVERTEILUNG S " + std::to_string(count));
        FirstLine("*SST");
        Attributes("X");
        Items("ST/X", "ST_TX/X", count, Below(3) == 0);
    }

    void Curve()
    {
        constexpr std::string_view keywords[] = {"KENNLINIE", "FESTKENNLINIE", "GRUPPENKENNLINIE"};
        const std::size_t count = Below(7);
        FirstLine(Any(keywords) + ' ' + Name() + ' ' + std::to_string(count));
        Attributes("XW");
        if (Below(3) == 0)
            FirstLine("*SSTX S");
        Items("ST/X", "ST_TX/X", count, Below(3) == 0);
        Items("WERT", "TEXT", count, Below(3) == 0);
    }

    void Map()
    {
        constexpr std::string_view keywords[] = {"KENNFELD", "FESTKENNFELD", "GRUPPENKENNFELD"};
        const std::size_t columns = 1 + Below(6);
        const std::size_t rows = 1 + Below(3);
        FirstLine(Any(keywords) + ' ' + Name() + ' ' + std::to_string(columns) + ' ' +
                  std::to_string(rows));
        Attributes("XYW");
        if (Below(3) == 0)
            FirstLine("*SSTX S");
        if (Below(3) == 0)
            FirstLine("*SSTY S");
        Items("ST/X", "ST_TX/X", columns, Below(3) == 0);
        const bool textAxis = Below(3) == 0;
        const bool texts = Below(3) == 0;
        for (std::size_t row = 0; row < rows; ++row) {
            Items("ST/Y", "ST_TX/Y", 1, textAxis);
            Items("WERT", "TEXT", columns, texts);
        }
    }

    void Block()
    {
        switch (Below(5)) {
        case 0:
            Single();
            break;
        case 1:
            ValueBlock();
            break;
        case 2:
            Distribution();
            break;
        case 3:
            Curve();
            break;
        default:
            Map();
        }
        m_text += "END\n\n";
    }

    Random& m_random;
    std::string m_text;
};

} // namespace

std::string MakeFile(Random& random)
{
    return Maker(random).File();
}

void ChangeALine(std::string& file, Random& random)
{
    std::vector<std::string> lines(1);
    for (const char c : file) {
        if (c == '\n') {
            lines.emplace_back();
        } else {
            lines.back() += c;
        }
    }
    const auto below = [&](std::size_t limit) { return random() % limit; };
    const std::size_t at = below(lines.size());
    const auto place = lines.begin() + static_cast<std::ptrdiff_t>(at);
    const std::string snippet(kSnippets[below(std::size(kSnippets))]);
    switch (below(6)) {
    case 0:
        lines.insert(place, snippet);
        break;
    case 1:
        *place = snippet;
        break;
    case 2:
        lines.insert(place, std::string(lines[below(lines.size())]));
        break;
    case 3:
        std::swap(lines[at], lines[below(lines.size())]);
        break;
    case 4:
        place->insert(below(place->size() + 1), snippet.substr(below(snippet.size() + 1)));
        break;
    default:
        if (lines.size() > 1)
            lines.erase(place);
    }
    file = lines[0];
    for (std::size_t i = 1; i < lines.size(); ++i)
        file += '\n' + lines[i];
}

} // namespace fuzz
