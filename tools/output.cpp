#include "tools/output.h"

#include "tools/system/system.h"
#include "tools/trouble.h"

#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>

namespace dcm::tools {

namespace {

bool coloured = false;

bool IsColourWanted()
{
    const char* const refused = std::getenv("NO_COLOR");
    return IsTerminal(Stream::kOutput) && (refused == nullptr || *refused == '\0');
}

std::string_view Code(Colour colour)
{
    switch (colour) {
    case Colour::kBold:
        return "1";
    case Colour::kRed:
        return "31";
    case Colour::kGreen:
        return "32";
    case Colour::kYellow:
        return "33";
    case Colour::kCyan:
        return "36";
    }
    return "0";
}

} // namespace

void ChooseColour(ColourChoice choice)
{
    coloured =
        choice == ColourChoice::kAlways || (choice == ColourChoice::kAuto && IsColourWanted());
}

std::string Painted(std::string_view text, Colour colour)
{
    if (!coloured)
        return std::string(text);
    return "\x1b[" + std::string(Code(colour)) + "m" + std::string(text) + "\x1b[0m";
}

std::string Plain(std::string_view text, Colour)
{
    return std::string(text);
}

void Print(std::string_view text)
{
    std::fwrite(text.data(), 1, text.size(), stdout);
}

void Complain(std::string_view message)
{
    // What has been printed comes first where both streams lead to the same place.
    std::fflush(stdout);
    // On a terminal the progress may still be shown in this line.
    const std::string_view wipe = IsTerminal(Stream::kError) ? "\r\x1b[K" : "";
    const std::string line = std::string(wipe) + "dcm: " + std::string(message) + "\n";
    std::fwrite(line.data(), 1, line.size(), stderr);
}

void FinishOutput()
{
    if (std::fflush(stdout) != 0 || std::ferror(stdout) != 0)
        throw Trouble("cannot write to the standard output");
}

} // namespace dcm::tools
