#include "tools/command_line.h"

#include "dcm/library/dcm.h"
#include "tools/code_page.h"
#include "tools/commands/check.h"
#include "tools/commands/convert.h"
#include "tools/commands/diff.h"
#include "tools/commands/merge.h"
#include "tools/commands/report.h"
#include "tools/commands/show.h"
#include "tools/man_page.h"
#include "tools/output.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

const std::map<std::string, ColourChoice> kColours = {
    {"auto", ColourChoice::kAuto},
    {"always", ColourChoice::kAlways},
    {"never", ColourChoice::kNever},
};

const std::map<std::string, Severity> kSeverityNames = {
    {"note", Severity::kNote},
    {"warning", Severity::kWarning},
    {"error", Severity::kError},
};

template <class Map>
std::vector<std::string> NamesOf(const Map& map)
{
    std::vector<std::string> names;
    names.reserve(map.size());
    for (const auto& [name, value] : map)
        names.push_back(name);
    return names;
}

} // namespace

CommandLine::CommandLine()
    : m_app("Looks at calibration data files in the DCM text format, checks, compares, merges and "
            "converts them.",
            "dcm"),
      m_codePage(kDefaultCodePage)
{
    m_app.allow_windows_style_options(false);
    m_app.set_version_flag("--version", std::string("dcm ") + LibraryVersion());
    m_app.require_subcommand(1);
    m_app.footer("A FILE that is - is the standard input. Exit codes: 0 for success, 1 for "
                 "differences or findings, 2 for trouble.");
    AddShow();
    AddCheck();
    AddDiff();
    AddMerge();
    AddConvert();
    AddReport();
    AddHelp();
}

int CommandLine::Run(std::vector<std::string> arguments)
{
    if (!arguments.empty() && !arguments.front().starts_with('-'))
        About(arguments.front());
    std::reverse(arguments.begin(), arguments.end());
    try {
        m_app.parse(std::move(arguments));
    } catch (const CLI::Success& asked) {
        // Help or the version.
        Print(asked.get_name() == "CallForVersion" ? std::string(asked.what()) + '\n'
                                                   : m_app.help());
        return 0;
    }
    ChooseCodePage(m_codePage);
    ChooseColour(kColours.at(m_colour));
    return m_work();
}

CLI::App& CommandLine::AddCommand(const char* name, const char* does, std::function<int()> work)
{
    CLI::App& command = *m_app.add_subcommand(name, does);
    command
        .add_option("--code-page", m_codePage,
                    "Code page of the files: utf-8, iso-8859-1 or a number")
        ->type_name("PAGE")
        ->capture_default_str();
    command.add_option("--color", m_colour, "When to colour: auto is on a terminal")
        ->type_name("WHEN")
        ->check(CLI::IsMember(NamesOf(kColours)))
        ->capture_default_str();
    command.final_callback([this, work = std::move(work)] { m_work = work; });
    return command;
}

void CommandLine::AddShow()
{
    const auto options = std::make_shared<ShowOptions>();
    CLI::App& command =
        AddCommand("show", "Shows what is in a file", [options] { return Show(*options); });
    command.add_option("FILE", options->file, "The file")->type_name("")->required();
    command.add_option("NAME", options->names,
                       "Parameters to show whole, with * and ? as in names of files");
    CLI::Option* const all = command.add_flag("--all", options->all, "Shows all parameters whole");
    CLI::Option* const lines =
        command.add_flag("--lines", options->lines, "One line a value, each with its name");
    command.add_flag("--json", options->json, "Writes JSON")->excludes(all)->excludes(lines);
    command.footer("Exit codes: 0, or 2 when the file cannot be read whole or a NAME matches "
                   "nothing.");
}

void CommandLine::AddCheck()
{
    const auto options = std::make_shared<CheckOptions>();
    const auto failOn = std::make_shared<std::string>("warning");
    CLI::App& command =
        AddCommand("check", "Lists what reading and writing a file loses", [options, failOn] {
            options->failOn = kSeverityNames.at(*failOn);
            return Check(*options);
        });
    command.add_option("FILE", options->files, "Files")->type_name("")->required();
    command.add_option("--fail-on", *failOn, "The exit code is 1 from this severity on")
        ->type_name("SEVERITY")
        ->check(CLI::IsMember(NamesOf(kSeverityNames)))
        ->capture_default_str();
    command.add_option("--limit", options->limit, "How many findings of one id are listed")
        ->type_name("N")
        ->capture_default_str();
    command.add_flag("--json", options->json, "Writes JSON");
    command.footer("Exit codes: 0 clean, 1 findings, 2 when a file cannot be read.");
}

void CommandLine::AddDiff()
{
    const auto options = std::make_shared<DiffOptions>();
    CLI::App& command = AddCommand("diff", "Shows in which parameters two files differ",
                                   [options] { return Diff(*options); });
    command.add_option("OLD", options->oldFile, "The old file")->type_name("")->required();
    command.add_option("NEW", options->newFile, "The new file")->type_name("")->required();
    command
        .add_option("--tolerance", options->tolerances,
                    "Numbers this near are the same: 1e-6, or 0.1% of the larger one")
        ->type_name("T");
    command.add_option("--ignore", options->ignored, "Leaves out texts, units or axes")
        ->type_name("WHAT")
        ->delimiter(',')
        ->check(CLI::IsMember({"texts", "units", "axes"}));
    command.add_flag("--summary", options->summary, "One line a parameter, without values");
    command.add_flag("--json", options->json, "Writes JSON");
    command.footer("Exit codes: 0 the same, 1 different, 2 trouble, also when no difference is "
                   "found but reading a file met errors.");
}

void CommandLine::AddMerge()
{
    const auto options = std::make_shared<MergeOptions>();
    CLI::App& command = AddCommand("merge", "Puts parameters of other files into a file",
                                   [options] { return Merge(*options); });
    command.add_option("BASE", options->base, "The file to start from")->type_name("")->required();
    command
        .add_option("CHANGES", options->changes,
                    "Files whose parameters replace or join those of BASE; the last one wins")
        ->required();
    command.add_option("-o,--output", options->out, "The new file")->type_name("OUT")->required();
    command.add_option("--only", options->only, "Takes only parameters with such names")
        ->type_name("PATTERN")
        ->expected(1)
        ->take_all();
    command.add_option("--exclude", options->excluded, "Takes no parameters with such names")
        ->type_name("PATTERN")
        ->expected(1)
        ->take_all();
    command.add_flag("--force", options->force, "Writes though data are lost");
    command.footer("Exit codes: 0, or 2 when nothing is written.");
}

void CommandLine::AddConvert()
{
    const auto options = std::make_shared<ConvertOptions>();
    CLI::App& command = AddCommand("convert", "Writes a file as JSON, CSV or DCM",
                                   [options] { return Convert(*options); });
    command.add_option("FILE", options->file, "A DCM file, or one in JSON")
        ->type_name("")
        ->required();
    command.add_option("-o,--output", options->out, "The new file: .json, .csv or .dcm")
        ->type_name("OUT")
        ->required();
    command
        .add_option("--separator", options->separator, "Between cells of CSV: a character or tab")
        ->type_name("CHARACTER");
    command.add_flag("--decimal-comma", options->decimalComma,
                     "CSV with 1,5 for 1.5, and with ; between cells");
    command.footer(
        "Exit codes: 0, 1 when the new file lacks something, 2 when nothing is written.");
}

void CommandLine::AddReport()
{
    const auto options = std::make_shared<ReportOptions>();
    CLI::App& command = AddCommand("report", "Makes a page to look at in a browser",
                                   [options] { return MakeReport(*options); });
    command.add_option("FILE", options->file, "The file")->type_name("")->required();
    command.add_option("OTHER", options->other, "A file to compare it with")->type_name("");
    command.add_option("-o,--output", options->out, "The page")->type_name("PAGE")->required();
    command.footer("Exit codes: 0, or 2 when nothing is written.");
}

CLI::App& CommandLine::About(const std::string& name)
{
    if (name.empty())
        return m_app;
    try {
        return *m_app.get_subcommand(name);
    } catch (const CLI::OptionNotFound&) {
        throw Trouble("there is no command " + Shown(name) + "; see dcm --help");
    }
}

void CommandLine::AddHelp()
{
    const auto name = std::make_shared<std::string>();
    const auto man = std::make_shared<bool>(false);
    CLI::App& command = *m_app.add_subcommand("help", "Shows the help of a command");
    command.add_option("COMMAND", *name, "The command")->type_name("");
    command.add_flag("--man", *man, "Writes the man page of all commands")->group("");
    command.final_callback([this, name, man] {
        m_work = [this, name, man] {
            Print(*man ? ManPage(m_app) : About(*name).help(name->empty() ? "" : "dcm"));
            return 0;
        };
    });
}

} // namespace dcm::tools
