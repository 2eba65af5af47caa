#pragma once

#include <CLI/CLI.hpp>

#include <string>

namespace dcm::tools {

/// The man page of the program, made of the same words as its help.
std::string ManPage(const CLI::App& app);

} // namespace dcm::tools
