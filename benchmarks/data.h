#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

/// The generated data that all measurements use.
namespace dcm::bench {

enum class Flavour
{
    kShort, ///< One to five significant digits, as tools write.
    kFull,  ///< 17 significant digits.
};

/// The flavour named "short" or "full"; throws std::invalid_argument for any other name.
Flavour FlavourNamed(std::string_view name);

/// One block. Texts are UTF-8.
struct Block
{
    std::string keyword;
    std::string name;
    std::string langname;
    std::string function;
    std::string unitX;
    std::string unitY;
    std::string unitW;
    /// The distribution that the axis is taken from; empty for none.
    std::string sharedAxis;
    /// Of a map, x.size() values for each of y.
    std::vector<double> x;
    std::vector<double> y;
    std::vector<double> values;
    /// Of a TEXTSTRING alone.
    std::string text;
};

/// The blocks of a file, kinds in the order in which a document is exported.
struct Data
{
    Flavour flavour;
    std::vector<Block> blocks;
    std::size_t numbers = 0;
    /// Of all numbers, see Checksum.
    std::uint64_t checksum = 0;
};

/// About one million numbers in 28,800 blocks at factor 1, in proportion otherwise. The same for
/// the same arguments, on every machine.
Data MakeData(Flavour flavour, double factor, std::uint64_t seed = 1);

/// The text of `number` in the files.
void AppendNumber(std::string& text, double number, Flavour flavour);

/// The data as a file in DCM format, in code page 1252: six numbers a line, CR LF.
std::string DcmText(const Data& data);

/// The data as a JSON file, without any white space.
std::string JsonText(const Data& data);

/// The data with its texts, of characters below U+0100, in code page 1252.
Data In1252(Data data);

/// `text`, of characters below U+0100 in UTF-8, in code page 1252.
std::string To1252(std::string_view text);

/// The sum of the numbers' bits, to check that two readers got the same numbers, in any order.
class Checksum
{
public:
    void Add(double number) { m_sum += std::bit_cast<std::uint64_t>(number); }
    void Add(const std::vector<double>& numbers)
    {
        for (const double number : numbers)
            Add(number);
    }
    std::uint64_t Value() const { return m_sum; }

private:
    std::uint64_t m_sum = 0;
};

} // namespace dcm::bench
