// report IN.dcm OUT.html
// Turns a DCM file into one page to look at in a browser: an index with search, tables of single
// values, curves as plots and maps as coloured tables. The page brings all it needs along.
#include "dcm/library/dcm.h"
#include "examples/report_page.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <chrono>
#include <cmath>
#include <condition_variable>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <limits>
#include <map>
#include <mutex>
#include <sstream>
#include <string>
#include <string_view>
#include <system_error>
#include <thread>
#include <utility>
#include <vector>

namespace {

// ---- What the page shows ----------------------------------------------------------------------

using Values = std::vector<CComVariant>;

/// One axis: its points, and the distribution that it shares or an empty name.
struct Axis
{
    CString distribution;
    CString unit;
    Values points;
};

/// A block of any kind.
struct Block
{
    std::size_t id = 0;
    CString name;
    CString langname;
    CString displayname;
    CString function;
    Axis x;
    Axis y;
    CString unit;
    Values values;
    /// How many values stand in a row; 0 when they are a plain list.
    std::size_t rowLength = 0;
};

enum class Look
{
    kRow,
    kList,
    kCurve,
    kMap,
};

struct Kind
{
    const char* keyword;
    Look look;
    std::vector<Block> blocks;
};

/// The distributions of the file by name.
using Distributions = std::map<CString, const Block*>;

void Read(const DCMFestwert& from, Block& block)
{
    block.unit = from.GetUnit();
    from.GetValue(&block.values.emplace_back());
}

void Read(const DCMFestwerteblock& from, Block& block)
{
    block.unit = from.GetUnit();
    for (const double number : from.GetDoubleValues())
        block.values.emplace_back(number);
    if (block.values.empty())
        for (const CString& text : from.GetStringValues())
            block.values.emplace_back(text);
    if (from.GetXValueCount() > 0 && from.GetYValueCount() > 0)
        block.rowLength =
            std::min(static_cast<std::size_t>(from.GetXValueCount()), block.values.size());
}

void Read(const DCMStuetzstellenverteilung& from, Block& block)
{
    block.unit = from.GetUnit();
    from.GetValues(block.values);
}

void Read(const DCMKennlinie& from, Block& block)
{
    block.x = {from.GetStuetzstellenverteilung(), from.GetUnit_X(), {}};
    block.unit = from.GetUnit_W();
    from.GetAxis(block.x.points);
    from.GetValues(block.values);
}

void Read(const DCMKennfeld& from, Block& block)
{
    block.x = {from.GetStuetzstellenverteilungX(), from.GetUnit_X(), {}};
    block.y = {from.GetStuetzstellenverteilungY(), from.GetUnit_Y(), {}};
    block.unit = from.GetUnit_W();
    from.GetAxis_X(block.x.points);
    from.GetAxis_Y(block.y.points);
    from.GetValues(block.values);
    block.rowLength = block.x.points.size();
}

template <class Elements>
Kind KindOf(const char* keyword, Look look, const Elements& elements, std::size_t& lastId)
{
    Kind kind{keyword, look, {}};
    kind.blocks.reserve(elements.size());
    for (const auto& element : elements) {
        Block& block = kind.blocks.emplace_back();
        block.id = ++lastId;
        block.name = element.GetName();
        block.langname = element.GetLangname();
        block.displayname = element.GetDisplayname();
        block.function = element.GetFunction();
        Read(element, block);
    }
    return kind;
}

std::vector<Kind> KindsOf(const DCMConverter& document)
{
    std::size_t id = 0;
    std::vector<Kind> kinds;
    kinds.push_back(KindOf("FESTWERT", Look::kRow, document.GetFestwerte(), id));
    kinds.push_back(KindOf("TEXTSTRING", Look::kRow, document.GetTextstring(), id));
    kinds.push_back(KindOf("FESTWERTEBLOCK", Look::kList, document.GetFestwerteblock(), id));
    kinds.push_back(KindOf("KENNLINIE", Look::kCurve, document.GetKennlinie(), id));
    kinds.push_back(KindOf("FESTKENNLINIE", Look::kCurve, document.GetFestkennlinie(), id));
    kinds.push_back(KindOf("GRUPPENKENNLINIE", Look::kCurve, document.GetGruppenkennlinie(), id));
    kinds.push_back(KindOf("KENNFELD", Look::kMap, document.GetKennfeld(), id));
    kinds.push_back(KindOf("FESTKENNFELD", Look::kMap, document.GetFestkennfeld(), id));
    kinds.push_back(KindOf("GRUPPENKENNFELD", Look::kMap, document.GetGruppenkennfeld(), id));
    kinds.push_back(
        KindOf("STUETZSTELLENVERTEILUNG", Look::kList, document.GetStuetzstellenverteilung(), id));
    std::erase_if(kinds, [](const Kind& kind) { return kind.blocks.empty(); });
    return kinds;
}

// ---- Texts and numbers ------------------------------------------------------------------------

/// UTF-8 for the text and quoted attributes of a page: nothing in it ends either.
std::string Html(std::wstring_view text)
{
    constexpr std::string_view kSpecial = "&<>\"'";
    constexpr const char* kEntities[] = {"&amp;", "&lt;", "&gt;", "&quot;", "&#39;"};
    std::string html;
    for (const char c : dcm::ToUtf8(text)) {
        const std::size_t special = kSpecial.find(c);
        if (special == kSpecial.npos)
            html += c;
        else
            html += kEntities[special];
    }
    return html;
}

/// The same, cut to what fits beside a plot.
std::string Short(std::wstring_view text, std::size_t most)
{
    return text.size() <= most ? Html(text) : Html(text.substr(0, most - 1)) + "…";
}

template <class... Format>
std::string Digits(double number, Format... format)
{
    std::array<char, 512> digits;
    const auto result =
        std::to_chars(digits.data(), digits.data() + digits.size(), number, format...);
    return {digits.data(), result.ptr};
}

/// Few digits, which leave out what computing a tick has lost.
std::string TickLabel(double tick)
{
    const std::string rounded = Digits(tick, std::chars_format::general, 7);
    const std::string shortest = Digits(tick);
    return shortest.size() < rounded.size() ? shortest : rounded;
}

/// A coordinate or share of the page.
std::string Place(double number)
{
    return Digits(number, std::chars_format::fixed, 2);
}

/// The shortest digits that read back as the same number, a text as it is.
std::string ValueOf(const CComVariant& value)
{
    if (value.vt == VT_R8)
        return Digits(value.dblVal);
    return value.vt == VT_BSTR ? Html(CComVariant::TextOf(value)) : std::string("–");
}

std::string Titled(const std::string& title, const CString& unit)
{
    return unit.IsEmpty() ? title : title + " [" + Short(unit, 30) + "]";
}

/// What an axis shows: the distribution that it shares, otherwise just its letter.
std::string TitleOf(const Axis& axis, const char* letter)
{
    return Titled(axis.distribution.IsEmpty() ? letter : Short(axis.distribution, 40), axis.unit);
}

std::string TitleOfValues(const Block& block)
{
    return Titled(Short(block.displayname.IsEmpty() ? block.name : block.displayname, 20),
                  block.unit);
}

// ---- Ranges of numbers ------------------------------------------------------------------------

/// The finite numbers of some values lie in it; low is above high when there are none.
struct Range
{
    double low = std::numeric_limits<double>::infinity();
    double high = -std::numeric_limits<double>::infinity();

    bool IsEmpty() const { return low > high; }
    void Add(double number)
    {
        if (!std::isfinite(number))
            return;
        low = std::min(low, number);
        high = std::max(high, number);
    }
    /// 0 for low to 1 for high. Halves keep the widest range from overflowing.
    double Share(double number) const
    {
        const double span = high / 2 - low / 2;
        return span > 0 ? (number / 2 - low / 2) / span : 0.5;
    }
};

double NumberOf(const CComVariant& value)
{
    return value.vt == VT_R8 ? value.dblVal : std::numeric_limits<double>::quiet_NaN();
}

Range RangeOf(const Values& values)
{
    Range range;
    for (const CComVariant& value : values)
        range.Add(NumberOf(value));
    return range;
}

/// Round numbers within the range, about five.
std::vector<double> Ticks(const Range& range)
{
    const double rough = (range.high - range.low) / 5;
    const double power = std::pow(10.0, std::floor(std::log10(rough)));
    if (!(power > 0))
        return {range.low, range.high}; // no span to divide
    const double ratio = rough / power;
    const double step = power * (ratio > 5 ? 10 : ratio > 2 ? 5 : ratio > 1 ? 2 : 1);
    const double first = std::ceil(range.low / step);
    if (!std::isfinite(step) || !std::isfinite(first))
        return {range.low, range.high};
    std::vector<double> ticks;
    for (int i = 0; i <= 5 && (first + i) * step <= range.high; ++i)
        ticks.push_back((first + i) * step + 0.0); // no negative zero
    return ticks;
}

// ---- The plot of a curve ----------------------------------------------------------------------

constexpr double kLeft = 66, kRight = 510, kTop = 12, kBottom = 210, kInset = 10;

void WriteGridLineX(std::ostream& out, double x, const std::string& label)
{
    out << "<line class='grid' x1='" << Place(x) << "' x2='" << Place(x) << "' y1='" << kTop
        << "' y2='" << kBottom << "'/><text text-anchor='middle' x='" << Place(x) << "' y='"
        << kBottom + 16 << "'>" << label << "</text>";
}

void WriteGridLineY(std::ostream& out, double y, const std::string& label)
{
    out << "<line class='grid' x1='" << kLeft << "' x2='" << kRight << "' y1='" << Place(y)
        << "' y2='" << Place(y) << "'/><text text-anchor='end' x='" << kLeft - 6 << "' y='"
        << Place(y + 4) << "'>" << label << "</text>";
}

/// Where the points of the X axis stand: by their numbers, texts at even distances.
class AxisX
{
public:
    explicit AxisX(const Values& points) : m_points(points), m_range(RangeOf(points))
    {
        m_texts = m_range.IsEmpty();
        if (m_texts)
            m_range = {0, static_cast<double>(points.size()) - 1};
    }

    double At(double number) const
    {
        return kLeft + kInset + m_range.Share(number) * (kRight - kLeft - 2 * kInset);
    }
    /// Not a number where the point has no place.
    double AtPoint(std::size_t i) const
    {
        const double number = m_texts ? static_cast<double>(i) : NumberOf(m_points[i]);
        return std::isfinite(number) ? At(number) : std::numeric_limits<double>::quiet_NaN();
    }
    void Write(std::ostream& out) const
    {
        constexpr std::size_t kMostTexts = 5, kMostLetters = 13;
        if (!m_texts) {
            for (const double tick : Ticks(m_range))
                WriteGridLineX(out, At(tick), TickLabel(tick));
            return;
        }
        const std::size_t step = (m_points.size() + kMostTexts - 1) / kMostTexts;
        for (std::size_t i = 0; i < m_points.size(); i += step)
            if (m_points[i].vt == VT_BSTR)
                WriteGridLineX(out, AtPoint(i),
                               Short(CComVariant::TextOf(m_points[i]), kMostLetters));
    }

private:
    const Values& m_points;
    Range m_range;
    bool m_texts;
};

void WritePlot(std::ostream& out, const Block& block)
{
    const std::size_t count = std::min(block.x.points.size(), block.values.size());
    const Range range = RangeOf(block.values);
    if (count == 0 || range.IsEmpty())
        return; // texts have no plot
    const AxisX axis(block.x.points);
    const auto atValue = [&](double number) {
        return kBottom - kInset - range.Share(number) * (kBottom - kTop - 2 * kInset);
    };

    out << "<div class='scroll'><svg viewBox='0 0 520 252' role='img' aria-label='"
        << Html(block.name) << "'>";
    axis.Write(out);
    for (const double tick : Ticks(range))
        WriteGridLineY(out, atValue(tick), TickLabel(tick));
    out << "<text text-anchor='middle' x='" << (kLeft + kRight) / 2 << "' y='246'>"
        << TitleOf(block.x, "x") << "</text><text text-anchor='middle' transform='translate(14 "
        << (kTop + kBottom) / 2 << ") rotate(-90)'>" << TitleOfValues(block) << "</text>";

    std::ostringstream curve;
    std::ostringstream marks;
    const char* radius = count > 60 ? "2" : "4.5";
    bool drawing = false;
    for (std::size_t i = 0; i < count; ++i) {
        const double x = axis.AtPoint(i);
        const double number = NumberOf(block.values[i]);
        const bool drawable = std::isfinite(x) && std::isfinite(number);
        if (drawable) {
            const std::string y = Place(atValue(number));
            const std::string at = " cx='" + Place(x) + "' cy='" + y + "' r='";
            curve << (drawing ? 'L' : 'M') << Place(x) << ' ' << y;
            marks << "<circle class='point'" << at << radius << "'/><circle class='aim'" << at
                  << "10' data-tip='" << Titled(ValueOf(block.x.points[i]), block.x.unit) << '\n'
                  << Titled(ValueOf(block.values[i]), block.unit) << "'/>";
        }
        drawing = drawable;
    }
    out << "<path class='curve' d='" << curve.str() << "'/>" << marks.str() << "</svg></div>\n";
}

// ---- Tables -----------------------------------------------------------------------------------

/// Some values from `at` on, as far as there are; coloured by their place in a range if given.
void WriteCells(std::ostream& out, const Values& values, std::size_t at, std::size_t count,
                const Range* range = nullptr)
{
    const std::size_t end = at + std::min(count, values.size() - std::min(at, values.size()));
    for (; at < end; ++at) {
        out << "<td";
        if (range != nullptr && std::isfinite(NumberOf(values[at])))
            out << " style='--t:" << Place(range->Share(NumberOf(values[at]))) << "'";
        out << '>' << ValueOf(values[at]) << "</td>";
    }
}

/// The points of a curve above its values.
void WriteCurveTable(std::ostream& out, const Block& block)
{
    out << "<div class='scroll'><table><tr><th>x</th>";
    WriteCells(out, block.x.points, 0, block.x.points.size());
    out << "</tr><tr><th>w</th>";
    WriteCells(out, block.values, 0, block.values.size());
    out << "</tr></table></div>\n";
}

std::string PointOrIndex(const Axis& axis, std::size_t index)
{
    if (axis.points.empty())
        return std::to_string(index);
    return index < axis.points.size() ? ValueOf(axis.points[index]) : std::string("–");
}

/// At least one row for each point of the Y axis.
std::size_t RowsOf(const Block& block)
{
    const std::size_t full = (block.values.size() + block.rowLength - 1) / block.rowLength;
    return std::max(full, block.y.points.size());
}

/// A list of values or points in rows of ten, each row with the number of its first.
void WriteList(std::ostream& out, const Values& values)
{
    constexpr std::size_t kRow = 10;
    out << "<div class='scroll'><table>";
    for (std::size_t at = 0; at < values.size(); at += kRow) {
        out << "<tr><th>" << at << "</th>";
        WriteCells(out, values, at, kRow);
        out << "</tr>\n";
    }
    out << "</table></div>\n";
}

/// Values in rows under the points of the X axis and behind those of the Y axis, coloured by size;
/// without an axis under and behind numbers. A row that lacks values stays short.
void WriteGrid(std::ostream& out, const Block& block)
{
    const Range range = RangeOf(block.values);
    out << "<div class='scroll'><table class='map' data-x='" << TitleOf(block.x, "x")
        << "' data-y='" << TitleOf(block.y, "y") << "' data-unit='" << Html(block.unit)
        << "'><thead><tr><th>y \\ x</th>";
    for (std::size_t i = 0; i < block.rowLength; ++i)
        out << "<th>" << PointOrIndex(block.x, i) << "</th>";
    out << "</tr></thead><tbody>\n";
    for (std::size_t row = 0; row < RowsOf(block); ++row) {
        out << "<tr><th>" << PointOrIndex(block.y, row) << "</th>";
        WriteCells(out, block.values, row * block.rowLength, block.rowLength, &range);
        out << "</tr>\n";
    }
    out << "</tbody></table></div>\n";
}

// ---- Blocks and kinds -------------------------------------------------------------------------

/// The unit of an axis and the distribution that it shares, as a link if the file has it.
void WriteAxis(std::ostream& out, const char* letter, const Axis& axis,
               const Distributions& distributions)
{
    if (axis.points.empty() && axis.distribution.IsEmpty())
        return;
    out << "<span>" << Titled(letter, axis.unit);
    const auto found = distributions.find(axis.distribution);
    if (found != distributions.end())
        out << " from <a href='#b" << found->second->id << "'>" << Html(axis.distribution)
            << "</a>";
    else if (!axis.distribution.IsEmpty())
        out << " from " << Html(axis.distribution) << ", which the file lacks";
    out << "</span>";
}

std::string SizeOf(const Block& block)
{
    if (block.rowLength == 0)
        return std::to_string(block.values.size());
    return std::to_string(block.rowLength) + " × " + std::to_string(RowsOf(block));
}

void WriteCard(std::ostream& out, const Block& block, Look look, const Distributions& distributions)
{
    constexpr std::size_t kNarrowMap = 6; // fits in half a window
    out << "<section class='card" << (block.rowLength > kNarrowMap ? " wide" : "") << "' id='b"
        << block.id << "'><h3>" << Html(block.name) << "<small>" << Html(block.langname)
        << "</small></h3><p class='meta'><span>" << Titled(SizeOf(block) + " values", block.unit)
        << "</span>";
    for (const CString* text : {&block.displayname, &block.function})
        if (!text->IsEmpty())
            out << "<span>" << Html(*text) << "</span>";
    WriteAxis(out, "x", block.x, distributions);
    WriteAxis(out, "y", block.y, distributions);
    out << "</p>";
    if (look == Look::kCurve) {
        WritePlot(out, block);
        WriteCurveTable(out, block);
    } else if (block.rowLength > 0) {
        WriteGrid(out, block);
    } else {
        WriteList(out, block.values);
    }
    out << "</section>\n";
}

void WriteRow(std::ostream& out, const Block& block)
{
    out << "<tr id='b" << block.id << "'><td>" << Html(block.name) << "<small>"
        << Html(block.langname) << "</small></td><td>" << ValueOf(block.values.front())
        << "</td><td>" << Html(block.unit) << "</td><td>" << Html(block.function) << "</td></tr>\n";
}

void WriteKind(std::ostream& out, const Kind& kind, const Distributions& distributions)
{
    out << "<section id='" << kind.keyword << "'><h2>" << kind.keyword << "</h2>\n";
    if (kind.look == Look::kRow) {
        out << "<div class='values'><table><tr><th>Name</th><th>Value</th><th>Unit</th>"
               "<th>Function</th></tr>\n";
        for (const Block& block : kind.blocks)
            WriteRow(out, block);
        out << "</table></div>";
    } else {
        out << "<div class='cards'>\n";
        for (const Block& block : kind.blocks)
            WriteCard(out, block, kind.look, distributions);
        out << "</div>";
    }
    out << "</section>\n";
}

void WriteIndex(std::ostream& out, const std::vector<Kind>& kinds)
{
    out << "<nav><input id='search' type='search' placeholder='Search names and texts' "
           "aria-label='Search names and texts'><p id='none' hidden>Nothing found.</p>\n";
    for (const Kind& kind : kinds) {
        out << "<details open data-kind='" << kind.keyword << "'><summary>" << kind.keyword
            << " <span>" << kind.blocks.size() << "</span></summary><ul>\n";
        for (const Block& block : kind.blocks)
            out << "<li><a href='#b" << block.id << "'>" << Html(block.name) << "<small>"
                << Html(block.langname) << "</small></a></li>\n";
        out << "</ul></details>\n";
    }
    out << "</nav>\n";
}

void WritePage(std::ostream& out, const CString& title, const CString& comment,
               const std::vector<Kind>& kinds)
{
    Distributions distributions;
    for (const Kind& kind : kinds)
        if (kind.keyword == std::string_view("STUETZSTELLENVERTEILUNG"))
            for (const Block& block : kind.blocks)
                distributions.try_emplace(block.name, &block);

    out << "<!DOCTYPE html>\n<html lang='en'><head><meta charset='utf-8'>"
        << R"(<meta http-equiv="Content-Security-Policy" content=")" << page::kPolicy << R"(">)"
        << "<meta name='viewport' content='width=device-width, initial-scale=1'><title>"
        << Html(title) << "</title><style>" << page::kStyle << "</style></head><body>\n";
    WriteIndex(out, kinds);
    out << "<main><h1>" << Html(title) << "</h1><pre>" << Html(comment) << "</pre>\n";
    for (const Kind& kind : kinds)
        WriteKind(out, kind, distributions);
    out << "</main><div id='tip' hidden></div><script>" << page::kScript
        << "</script></body></html>\n";
}

// ---- The program ------------------------------------------------------------------------------

/// Shows on the terminal, from the first second on, how long the work takes.
class Progress
{
public:
    explicit Progress(const std::string& path) : m_thread([this, path] { Run(path); }) {}
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    ~Progress()
    {
        {
            const std::lock_guard lock(m_mutex);
            m_done = true;
        }
        m_wake.notify_one();
        m_thread.join();
    }

private:
    void Run(const std::string& path)
    {
        std::unique_lock lock(m_mutex);
        int seconds = 0;
        while (!m_wake.wait_for(lock, std::chrono::seconds(1), [this] { return m_done; }))
            std::fprintf(stderr, "\rreport: working on %s, %d s", path.c_str(), ++seconds);
        if (seconds > 0)
            std::fprintf(stderr, "\n");
    }

    std::mutex m_mutex;
    std::condition_variable m_wake;
    bool m_done = false;
    std::thread m_thread;
};

/// Returns what could not be done, an empty text for nothing.
std::string Report(const std::string& from, const std::string& to)
{
    const Progress progress(from);
    std::error_code none;
    if (std::filesystem::equivalent(from, to, none))
        return "cannot write over " + from;
    DCMConverter document;
    if (FAILED(document.Import(dcm::FromUtf8(from))))
        return "cannot read " + from;

    std::ofstream out(to, std::ios::binary);
    WritePage(out, dcm::FromUtf8(std::filesystem::path(from).filename().string()),
              document.GetComment(), KindsOf(document));
    out.close();
    return out ? "" : "cannot write " + to;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "usage: report IN.dcm OUT.html\n");
        return 2;
    }
    const std::string failure = Report(argv[1], argv[2]);
    if (!failure.empty()) {
        std::fprintf(stderr, "report: %s\n", failure.c_str());
        return 1;
    }
}
