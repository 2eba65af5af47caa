#include "benchmarks/plain.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>
#include <cstring>
#include <cwchar>
#include <sstream>
#include <stdexcept>
#include <string>

namespace dcm::bench {
namespace {

struct FileCloser
{
    void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, FileCloser>;

/// A file without a buffer, so that each call is a system call.
File OpenFile(const std::filesystem::path& path, const char* mode)
{
    File file(std::fopen(path.c_str(), mode));
    if (!file)
        throw std::runtime_error("cannot open " + path.string());
    std::setvbuf(file.get(), nullptr, _IONBF, 0);
    return file;
}

/// Removes the text before the first `separator`, and the separator, and returns the text.
template <class View>
View TakeUntil(View& rest, typename View::value_type separator)
{
    const std::size_t end = rest.find(separator);
    const View part = rest.substr(0, end);
    rest.remove_prefix(end == rest.npos ? rest.size() : end + 1);
    return part;
}

/// Removes the first word of `rest` and the blanks around it and returns the word.
template <class View>
View TakeWord(View& rest)
{
    rest.remove_prefix(
        std::min(rest.find_first_not_of(typename View::value_type{' '}), rest.size()));
    return TakeUntil(rest, typename View::value_type{' '});
}

/// The naive host: a stream of wide lines, one string for each word.
BlockNumbers ReadNaively(const std::filesystem::path& path)
{
    const FileBytes file = ReadFile(path);
    std::wstring wide;
    for (const char c : file.View())
        wide += static_cast<wchar_t>(static_cast<unsigned char>(c));
    std::wistringstream lines(std::move(wide));
    BlockNumbers blocks;
    std::vector<double> numbers;
    std::wstring line;
    while (std::getline(lines, line)) {
        if (line.ends_with(L'\r'))
            line.pop_back();
        if (line.empty()) {
            blocks.push_back(std::move(numbers));
            numbers.clear();
            continue;
        }
        std::wstring_view rest = line;
        const std::wstring_view keyword = TakeWord(rest);
        if (keyword != L"WERT" && keyword != L"ST/X" && keyword != L"ST/Y")
            continue;
        wchar_t* at = line.data() + (line.size() - rest.size());
        for (;;) {
            wchar_t* end = at;
            const double number = std::wcstod(at, &end);
            if (end == at)
                break;
            numbers.push_back(number);
            at = end;
        }
    }
    return blocks;
}

/// Appends numbers with std::to_chars or std::snprintf.
enum class Digits
{
    kToChars,
    kSnprintf,
};

template <Digits how>
void AppendNumber(std::string& text, double number)
{
    std::array<char, 40> digits;
    std::size_t length = 0;
    if constexpr (how == Digits::kToChars) {
        const char* const end = std::to_chars(digits.data(), digits.data() + digits.size(), number,
                                              std::chars_format::general, 17)
                                    .ptr;
        length = static_cast<std::size_t>(end - digits.data());
    } else {
        length =
            static_cast<std::size_t>(std::snprintf(digits.data(), digits.size(), "%.17g", number));
    }
    const std::string_view written(digits.data(), length);
    text.append(" ").append(written);
    if (written.find_first_of(".e") == written.npos)
        text.append(".0");
}

/// How much one call writes.
enum class Calls
{
    kOneABlock,
    kOne,
};

/// The lines of an exported file.
template <Digits how, Calls calls>
class Writer
{
public:
    explicit Writer(const std::filesystem::path& path) : m_file(OpenFile(path, "wb")) {}

    void Write(const Data& data)
    {
        m_text.append("\r\n\r\n");
        Flush();
        m_text.append("KONSERVIERUNG_FORMAT 2.0\r\n\r\n");
        Flush();
        for (const Block& block : data.blocks) {
            Append(block);
            Flush();
        }
        WriteText();
    }

private:
    void Append(const Block& block)
    {
        m_text.append(block.keyword).append(" ").append(block.name);
        if (!block.x.empty())
            m_text.append(" ").append(std::to_string(block.x.size()));
        if (!block.y.empty())
            m_text.append(" ").append(std::to_string(block.y.size()));
        if (block.keyword == "FESTWERTEBLOCK")
            m_text.append(" ").append(std::to_string(block.values.size()));
        m_text.append("\r\n");
        if (block.keyword == "STUETZSTELLENVERTEILUNG")
            m_text.append("*SST\r\n");
        AppendQuoted("LANGNAME", block.langname);
        m_text.append("    FUNKTION ").append(block.function).append("\r\n");
        AppendUnit("EINHEIT_X", block.unitX);
        AppendUnit("EINHEIT_Y", block.unitY);
        AppendUnit("EINHEIT_W", block.unitW);
        if (block.keyword == "FESTWERT") {
            m_text.append("    WERT");
            AppendNumber<how>(m_text, block.values.front());
            m_text.append("\r\n");
        } else if (!block.text.empty()) {
            AppendQuoted("TEXT", block.text);
        } else {
            AppendLines(block);
        }
        m_text.append("END\r\n\r\n");
    }

    void AppendLines(const Block& block)
    {
        AppendNumbers("ST/X", block.x.data(), block.x.size());
        const double* row = block.values.data();
        for (const double& point : block.y) {
            AppendNumbers("ST/Y", &point, 1);
            AppendNumbers("WERT", row, block.x.size());
            row += block.x.size();
        }
        if (block.y.empty())
            AppendNumbers("WERT", row, block.values.size());
    }

    void AppendNumbers(std::string_view keyword, const double* numbers, std::size_t count)
    {
        constexpr std::size_t perLine = 5;
        for (std::size_t i = 0; i < count; ++i) {
            if (i % perLine == 0)
                m_text.append(i == 0 ? "    " : "\r\n    ").append(keyword);
            AppendNumber<how>(m_text, numbers[i]);
            m_text.append("   ");
        }
        if (count > 0)
            m_text.append("\r\n");
    }

    void AppendQuoted(std::string_view keyword, std::string_view value)
    {
        m_text.append("    ").append(keyword).append(" \"").append(value).append("\"\r\n");
    }

    void AppendUnit(std::string_view keyword, std::string_view unit)
    {
        if (!unit.empty())
            AppendQuoted(keyword, unit);
    }

    void Flush()
    {
        if constexpr (calls == Calls::kOneABlock)
            WriteText();
    }

    void WriteText()
    {
        if (std::fwrite(m_text.data(), 1, m_text.size(), m_file.get()) != m_text.size())
            throw std::runtime_error("cannot write");
        m_text.clear();
    }

    File m_file;
    std::string m_text;
};

template <Digits how, Calls calls>
Outcome WritePlainly(const Stage& stage)
{
    Outcome outcome;
    Timed(outcome.seconds, [&] { Writer<how, calls>(stage.outputFile).Write(stage.narrowData); });
    return outcome;
}

const TakesPart kReadFloor("import/floor", [](const Stage& stage) {
    return TimedRead([&] { return ReadFloor(stage.dcmFile); });
});

const TakesPart kReadNaively("import/naive", [](const Stage& stage) {
    return TimedRead([&] { return ReadNaively(stage.dcmFile); });
});

const TakesPart kToChars("text/to_chars", [](const Stage& stage) {
    return TimedNumberTexts<char>(stage, [](double number, char* to) {
        return std::to_chars(to, to + 40, number, std::chars_format::general, 17).ptr;
    });
});

const TakesPart kFromChars("token/from_chars", [](const Stage& stage) {
    Outcome outcome;
    Timed(outcome.seconds, [&] {
        for (std::size_t i = Repetitions(stage); i > 0; --i) {
            for (std::string_view rest = stage.someTexts; !rest.empty();) {
                const std::string_view token = TakeWord(rest);
                double number = 0;
                std::from_chars(token.data(), token.data() + token.size(), number);
                benchmark::DoNotOptimize(number);
            }
        }
    });
    return outcome;
});

const TakesPart kWriteFloor("export/floor", WritePlainly<Digits::kToChars, Calls::kOneABlock>);

const TakesPart kWriteAtOnce("export/floor-at-once", WritePlainly<Digits::kToChars, Calls::kOne>);

const TakesPart kWriteNaively("export/snprintf",
                              WritePlainly<Digits::kSnprintf, Calls::kOneABlock>);

} // namespace

FileBytes ReadFile(const std::filesystem::path& path)
{
    FileBytes file;
    file.size = std::filesystem::file_size(path);
    file.bytes = std::make_unique_for_overwrite<char[]>(file.size);
    if (std::fread(file.bytes.get(), 1, file.size, OpenFile(path, "rb").get()) != file.size)
        throw std::runtime_error("cannot read " + path.string());
    return file;
}

BlockNumbers ReadFloor(const std::filesystem::path& path)
{
    const FileBytes file = ReadFile(path);
    BlockNumbers blocks;
    std::vector<double> numbers;
    std::string_view text = file.View();
    while (!text.empty()) {
        std::string_view line = TakeUntil(text, '\n');
        if (line.ends_with('\r'))
            line.remove_suffix(1);
        if (line.empty()) {
            blocks.push_back(numbers);
            numbers.clear();
            continue;
        }
        const std::string_view keyword = TakeWord(line);
        if (keyword != "WERT" && keyword != "ST/X" && keyword != "ST/Y")
            continue;
        while (!line.empty()) {
            const std::string_view token = TakeWord(line);
            double number = 0;
            std::from_chars(token.data(), token.data() + token.size(), number);
            numbers.push_back(number);
        }
    }
    return blocks;
}

} // namespace dcm::bench
