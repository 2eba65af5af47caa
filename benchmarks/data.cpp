#include "benchmarks/data.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <random>
#include <span>
#include <stdexcept>

namespace dcm::bench {
namespace {

constexpr int kNumbersPerLine = 6;

/// Generates blocks. Random numbers are taken from the engine directly, because the distributions
/// of the standard library differ from system to system.
class Generator
{
public:
    Generator(Flavour flavour, std::uint64_t seed) : m_flavour(flavour), m_engine(seed) {}

    /// A number from `low` to `high`.
    std::size_t Draw(std::size_t low, std::size_t high)
    {
        return low + static_cast<std::size_t>(m_engine() % (high - low + 1));
    }

    double Number()
    {
        if (m_flavour == Flavour::kShort) {
            constexpr std::array<double, 6> powers = {1, 10, 100, 1000, 10'000, 100'000};
            const auto digits =
                static_cast<double>(m_engine() % static_cast<std::uint64_t>(powers[Draw(1, 5)]));
            return Sign() * digits / powers[Draw(0, 3)];
        }
        // Magnitudes from 0.001 to 100,000.
        const double fraction = static_cast<double>(m_engine() >> 11U) * 0x1p-53;
        constexpr std::array<double, 8> powers = {0.01, 0.1, 1, 10, 100, 1000, 10'000, 100'000};
        return Sign() * (0.1 + 0.9 * fraction) * powers[Draw(0, 7)];
    }

    std::vector<double> Numbers(std::size_t count)
    {
        std::vector<double> numbers(count);
        std::ranges::generate(numbers, [this] { return Number(); });
        return numbers;
    }

    std::vector<double> Axis(std::size_t count)
    {
        std::vector<double> points = Numbers(count);
        std::ranges::sort(points);
        return points;
    }

    Block Begin(std::string_view keyword)
    {
        static constexpr std::array<std::string_view, 6> components = {
            "ZndWnkl", "LdDrck", "Einspr", "Lambda", "AbgTmp", "DrhZhl"};
        static constexpr std::array<std::string_view, 4> subjects = {
            "Z\u00FCndwinkel", "Ladedruck", "Einspritzmenge", "K\u00FChlmitteltemperatur"};
        static constexpr std::array<std::string_view, 4> uses = {
            "\u00FCber Drehzahl und F\u00FCllung", "f\u00FCr den Kaltstart",
            "bei \u00DCberdrehzahl, begrenzt", "(R\u00FCckfallwert)"};
        Block block;
        block.keyword = keyword;
        block.name = std::string(Pick(components)) + "_" + std::string(Pick(components)) + "." +
                     std::to_string(m_count++) + "_C";
        block.langname = std::string(Pick(subjects)) + " " + std::string(Pick(uses));
        block.function = std::string(Pick(components)) + "_" + std::to_string(Draw(100, 999));
        block.unitW = Unit();
        return block;
    }

    std::string Unit()
    {
        static constexpr std::array<std::string_view, 8> units = {
            "\u00B0C", "\u00B5s", "1/min", "\u00B0KW", "mg/Hub", "hPa", "%", "-"};
        return std::string(Pick(units));
    }

private:
    double Sign() { return m_engine() % 4 == 0 ? -1.0 : 1.0; }

    template <std::size_t N>
    std::string_view Pick(const std::array<std::string_view, N>& choice)
    {
        return choice[Draw(0, N - 1)];
    }

    Flavour m_flavour;
    std::mt19937_64 m_engine;
    std::size_t m_count = 0;
};

void AppendDcmNumbers(std::string& text, std::string_view keyword, std::span<const double> numbers,
                      Flavour flavour)
{
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        if (i % kNumbersPerLine == 0)
            text.append(i == 0 ? "   " : "\r\n   ").append(keyword);
        text += "   ";
        AppendNumber(text, numbers[i], flavour);
    }
    if (!numbers.empty())
        text += "\r\n";
}

void AppendDcmText(std::string& text, std::string_view keyword, std::string_view value)
{
    if (!value.empty())
        text.append("   ").append(keyword).append(" \"").append(To1252(value)).append("\"\r\n");
}

void AppendDcmBlock(std::string& text, const Block& block, Flavour flavour)
{
    text.append(block.keyword).append(" ").append(To1252(block.name));
    if (!block.x.empty())
        text.append(" ").append(std::to_string(block.x.size()));
    if (!block.y.empty())
        text.append(" ").append(std::to_string(block.y.size()));
    if (block.x.empty() && block.values.size() > 1)
        text.append(" ").append(std::to_string(block.values.size()));
    text += "\r\n";
    if (block.keyword == "STUETZSTELLENVERTEILUNG")
        text += "*SST\r\n";
    AppendDcmText(text, "LANGNAME", block.langname);
    text.append("   FUNKTION ").append(To1252(block.function)).append("\r\n");
    AppendDcmText(text, "EINHEIT_X", block.unitX);
    AppendDcmText(text, "EINHEIT_Y", block.unitY);
    AppendDcmText(text, "EINHEIT_W", block.unitW);
    if (!block.sharedAxis.empty())
        text.append("*SSTX ").append(block.sharedAxis).append("\r\n");
    AppendDcmNumbers(text, "ST/X", block.x, flavour);
    std::span<const double> values = block.values;
    for (const double& point : block.y) {
        AppendDcmNumbers(text, "ST/Y", {&point, 1}, flavour);
        AppendDcmNumbers(text, "WERT", values.first(block.x.size()), flavour);
        values = values.subspan(block.x.size());
    }
    AppendDcmNumbers(text, "WERT", values, flavour);
    AppendDcmText(text, "TEXT", block.text);
    text += "END\r\n\r\n";
}

void AppendJsonText(std::string& text, std::string_view key, std::string_view value)
{
    text.append("\"").append(key).append("\":\"").append(value).append("\",");
}

void AppendJsonNumbers(std::string& text, std::string_view key, const std::vector<double>& numbers,
                       Flavour flavour)
{
    text.append("\"").append(key).append("\":[");
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        if (i > 0)
            text += ',';
        AppendNumber(text, numbers[i], flavour);
    }
    text += ']';
}

} // namespace

Flavour FlavourNamed(std::string_view name)
{
    if (name == "short")
        return Flavour::kShort;
    if (name == "full")
        return Flavour::kFull;
    throw std::invalid_argument("no such flavour: " + std::string(name));
}

Data MakeData(Flavour flavour, double factor, std::uint64_t seed)
{
    Generator make(flavour, seed);
    Data data{flavour, {}, 0, 0};
    const auto blocks = [&](std::size_t count, auto fill) {
        count = static_cast<std::size_t>(std::llround(static_cast<double>(count) * factor));
        for (std::size_t i = 0; i < count; ++i)
            data.blocks.push_back(fill());
    };
    const auto curves = [&](std::string_view keyword, std::size_t count) {
        blocks(count, [&] {
            Block block = make.Begin(keyword);
            block.unitX = make.Unit();
            block.x = make.Axis(make.Draw(8, 24));
            block.values = make.Numbers(block.x.size());
            if (keyword == "GRUPPENKENNLINIE")
                block.sharedAxis = "Achse_" + std::to_string(make.Draw(0, 499));
            return block;
        });
    };
    const auto maps = [&](std::string_view keyword, std::size_t count) {
        blocks(count, [&] {
            Block block = make.Begin(keyword);
            block.unitX = make.Unit();
            block.unitY = make.Unit();
            block.x = make.Axis(make.Draw(8, 20));
            block.y = make.Axis(make.Draw(8, 20));
            block.values = make.Numbers(block.x.size() * block.y.size());
            if (keyword == "GRUPPENKENNFELD")
                block.sharedAxis = "Achse_" + std::to_string(make.Draw(0, 499));
            return block;
        });
    };
    blocks(20'000, [&] {
        Block block = make.Begin("FESTWERT");
        block.values = make.Numbers(1);
        return block;
    });
    blocks(1'000, [&] {
        Block block = make.Begin("FESTWERTEBLOCK");
        block.values = make.Numbers(make.Draw(16, 256));
        return block;
    });
    blocks(500, [&] {
        Block block = make.Begin("STUETZSTELLENVERTEILUNG");
        block.unitX = make.Unit();
        block.unitW.clear();
        block.x = make.Axis(make.Draw(8, 24));
        return block;
    });
    curves("KENNLINIE", 2'000);
    curves("FESTKENNLINIE", 1'000);
    curves("GRUPPENKENNLINIE", 1'000);
    maps("KENNFELD", 1'500);
    maps("FESTKENNFELD", 750);
    maps("GRUPPENKENNFELD", 750);
    blocks(300, [&] {
        Block block = make.Begin("TEXTSTRING");
        block.unitW.clear();
        block.text = block.langname + ", gepr\u00FCft";
        return block;
    });

    Checksum checksum;
    for (const Block& block : data.blocks) {
        for (const auto* numbers : {&block.x, &block.y, &block.values}) {
            data.numbers += numbers->size();
            checksum.Add(*numbers);
        }
    }
    data.checksum = checksum.Value();
    return data;
}

void AppendNumber(std::string& text, double number, Flavour flavour)
{
    std::array<char, 40> digits;
    const char* const end =
        flavour == Flavour::kFull
            ? std::to_chars(digits.data(), digits.data() + digits.size(), number,
                            std::chars_format::general, 17)
                  .ptr
            : std::to_chars(digits.data(), digits.data() + digits.size(), number).ptr;
    const std::string_view written(digits.data(), static_cast<std::size_t>(end - digits.data()));
    text += written;
    if (written.find_first_of(".e") == written.npos)
        text += ".0";
}

std::string DcmText(const Data& data)
{
    std::string text = "* Made-up data for measurements\r\n\r\nKONSERVIERUNG_FORMAT 2.0\r\n\r\n";
    for (const Block& block : data.blocks)
        AppendDcmBlock(text, block, data.flavour);
    return text;
}

std::string JsonText(const Data& data)
{
    std::string text = "[";
    for (const Block& block : data.blocks) {
        text += text.size() > 1 ? ",{" : "{";
        AppendJsonText(text, "kind", block.keyword);
        AppendJsonText(text, "name", block.name);
        AppendJsonText(text, "langname", block.langname);
        AppendJsonText(text, "function", block.function);
        AppendJsonText(text, "unit_x", block.unitX);
        AppendJsonText(text, "unit_y", block.unitY);
        AppendJsonText(text, "unit_w", block.unitW);
        AppendJsonText(text, "text", block.text);
        AppendJsonNumbers(text, "x", block.x, data.flavour);
        text += ',';
        AppendJsonNumbers(text, "y", block.y, data.flavour);
        text += ',';
        AppendJsonNumbers(text, "values", block.values, data.flavour);
        text += '}';
    }
    return text + "]";
}

Data In1252(Data data)
{
    for (Block& block : data.blocks) {
        for (std::string* text : {&block.name, &block.langname, &block.function, &block.unitX,
                                  &block.unitY, &block.unitW, &block.text})
            *text = To1252(*text);
    }
    return data;
}

std::string To1252(std::string_view text)
{
    std::string bytes;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const auto lead = static_cast<unsigned char>(text[i]);
        if (lead < 0x80) {
            bytes += text[i];
        } else {
            const auto next = static_cast<unsigned char>(text[++i]);
            bytes += static_cast<char>((lead & 0x03U) << 6U | (next & 0x3FU));
        }
    }
    return bytes;
}

} // namespace dcm::bench
