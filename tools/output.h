#pragma once

#include <string>
#include <string_view>

/// @file
/// What the program says: results on the standard output, complaints on the standard error.

namespace dcm::tools {

enum class ColourChoice
{
    /// On a terminal, unless the environment variable NO_COLOR is set and not empty.
    kAuto,
    kAlways,
    kNever,
};

/// Decides whether `Painted` colours; until then it does not.
void ChooseColour(ColourChoice choice);

enum class Colour
{
    kBold,
    kRed,
    kGreen,
    kYellow,
    kCyan,
};

/// The text in a colour, or as it is where none is wanted. For the standard output.
std::string Painted(std::string_view text, Colour colour);

/// The text as it is, for the standard error.
std::string Plain(std::string_view text, Colour colour);

/// Writes to the standard output.
void Print(std::string_view text);

/// Writes one line to the standard error, after the name of the program.
void Complain(std::string_view message);

/// Writes out what is still buffered. Throws `Trouble` when any of the output could not be written.
void FinishOutput();

} // namespace dcm::tools
