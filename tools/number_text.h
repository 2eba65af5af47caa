#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace dcm::tools {

/// The shortest text from which `NumberOf` reads the same number, bit by bit: "720", "-0", "inf",
/// "-inf", "nan", and "nan:" with the sixteen hexadecimal digits of its bits for any not-a-number
/// but the usual one.
std::string NumberText(double number);

/// The number with six digits, for people.
std::string ShortNumberText(double number);

/// The number that the whole of a text is, in decimal notation or as one of the words above; none
/// for any other text and for numbers out of range.
std::optional<double> NumberOf(std::string_view text);

} // namespace dcm::tools
