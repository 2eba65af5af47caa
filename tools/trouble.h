#pragma once

#include <stdexcept>

namespace dcm::tools {

/// Why the program cannot do what it was asked for: one line in UTF-8 for the user, without the
/// name of the program. It ends a command with the exit code 2.
class Trouble : public std::runtime_error
{
public:
    using std::runtime_error::runtime_error;
};

/// The exit code of trouble.
inline constexpr int kTrouble = 2;

} // namespace dcm::tools
