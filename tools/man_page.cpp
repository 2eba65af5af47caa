#include "tools/man_page.h"

#include "dcm/library/dcm.h"

#include <string>
#include <string_view>

namespace dcm::tools {

namespace {

/// Text that no letter of which is a command: backslashes, hyphens, and dots at the start.
std::string Escaped(std::string_view text)
{
    std::string escaped;
    for (const char character : text) {
        if (character == '\\') {
            escaped += "\\e";
        } else if (character == '-') {
            escaped += "\\-";
        } else {
            escaped += character;
        }
    }
    return escaped.starts_with('.') || escaped.starts_with('\'') ? "\\&" + escaped : escaped;
}

/// Whether an option is named by its place.
bool IsPositional(const CLI::Option& option)
{
    return !option.nonpositional();
}

std::string OptionTitle(const CLI::Option& option)
{
    if (IsPositional(option))
        return "\\fI" + Escaped(option.get_name(true)) + "\\fR";
    std::string title = "\\fB" + Escaped(option.get_name(false, true)) + "\\fR";
    if (!option.get_type_name().empty())
        title += " \\fI" + Escaped(option.get_type_name()) + "\\fR";
    return title;
}

/// The arguments that a command cannot do without, and a word for the others.
std::string Synopsis(const CLI::App& command)
{
    std::string line = "\\fBdcm " + Escaped(command.get_name()) + R"(\fR [\fIOPTIONS\fR])";
    for (const CLI::Option* option : command.get_options()) {
        if (option->get_required() && !IsPositional(*option)) {
            line += " \\fB\\-" + option->get_snames().front() + "\\fR \\fI" +
                    option->get_type_name() + "\\fR";
        }
        if (!IsPositional(*option))
            continue;
        const std::string more = option->get_expected_max() > 1 ? "..." : "";
        const std::string name = "\\fI" + option->get_name(true) + "\\fR" + more;
        line += option->get_required() ? " " + name : " [" + name + "]";
    }
    return line;
}

std::string CommandText(const CLI::App& command)
{
    std::string text =
        ".SS " + Synopsis(command) + "\n" + Escaped(command.get_description()) + ".\n";
    for (const CLI::Option* option : command.get_options()) {
        if (!option->get_group().empty()) {
            text +=
                ".TP\n" + OptionTitle(*option) + "\n" + Escaped(option->get_description()) + "\n";
        }
    }
    if (!command.get_footer().empty())
        text += ".PP\n" + Escaped(command.get_footer()) + "\n";
    return text;
}

} // namespace

std::string ManPage(const CLI::App& app)
{
    std::string page = R"(.TH DCM 1 "" "dcm )" + std::string(LibraryVersion()) +
                       "\" \"User Commands\"\n"
                       ".SH NAME\ndcm \\- look at, check, compare, merge and convert calibration "
                       "data files\n"
                       ".SH SYNOPSIS\n\\fBdcm\\fR \\fICOMMAND\\fR [\\fIARGUMENTS\\fR]\n"
                       ".SH DESCRIPTION\n" +
                       Escaped(app.get_description()) + "\n" + Escaped(app.get_footer()) +
                       "\n.SH COMMANDS\n";
    for (const CLI::App* command : app.get_subcommands({}))
        page += CommandText(*command);
    return page + ".SH ENVIRONMENT\n.TP\n\\fBNO_COLOR\\fR\nIf it is not empty, nothing is "
                  "coloured unless \\-\\-color asks for it.\n";
}

} // namespace dcm::tools
