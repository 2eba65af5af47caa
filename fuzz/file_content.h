#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

/// What the bytes of a calibration file say, found without any code of the library, so that two
/// files can be compared by it.
namespace fuzz {

/// A point or a value: the bits of a number, or a text.
struct Item
{
    bool isNumber = false;
    std::uint64_t bits = 0;
    std::string text;

    bool operator==(const Item&) const = default;
};

/// One block of a known kind, from its first line to its END.
struct Content
{
    /// The words of the first line, the keyword in capitals.
    std::vector<std::string> head;
    /// Attributes, units and distribution names by keyword, without quotes and blanks at their
    /// ends. What is empty is left out.
    std::map<std::string, std::string> texts;
    /// Points and values: those of the X axis, of the Y axis, and the values.
    std::vector<Item> x, y, values;
    /// How many values come before each point of the Y axis.
    std::vector<std::size_t> rows;
};

/// Whether the second block says all that the first one says, and no more. Where one lists several
/// points of the Y axis before their values, the order of the values alone tells their rows.
bool SayTheSame(const Content& said, const Content& kept);

/// The blocks by kind, in the order of the file within each kind.
using FileContent = std::map<std::string, std::vector<Content>>;

FileContent ContentOf(std::string_view file);
bool SayTheSame(const FileContent& said, const FileContent& kept);

/// The content for a message.
std::string Describe(const FileContent& content);

} // namespace fuzz
