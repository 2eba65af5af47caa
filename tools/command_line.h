#pragma once

#include <CLI/CLI.hpp>

#include <functional>
#include <string>
#include <vector>

namespace dcm::tools {

/// The command line: commands with their options and help.
class CommandLine
{
public:
    CommandLine();
    CommandLine(const CommandLine&) = delete;
    CommandLine& operator=(const CommandLine&) = delete;

    /// Does what the arguments say and returns the exit code. Throws `CLI::ParseError` for
    /// arguments that it does not understand, and `Trouble`.
    int Run(std::vector<std::string> arguments);

private:
    CLI::App& AddCommand(const char* name, const char* does, std::function<int()> work);
    void AddShow();
    void AddCheck();
    void AddDiff();
    void AddMerge();
    void AddConvert();
    void AddReport();
    void AddHelp();
    /// The command of this name, or all of them for an empty one. Throws `Trouble` for no command.
    CLI::App& About(const std::string& name);

    CLI::App m_app;
    std::string m_codePage;
    std::string m_colour = "auto";
    std::function<int()> m_work;
};

} // namespace dcm::tools
