#pragma once

#include <random>
#include <string>

/// Files for a fuzz target that is after meaning rather than bytes.
namespace fuzz {

using Random = std::minstd_rand;

/// A small file of blocks of all kinds, laid out in any way that the format allows, in which next
/// to nothing is wrong.
std::string MakeFile(Random& random);

/// Inserts, replaces, repeats, exchanges, changes or removes one line.
void ChangeALine(std::string& file, Random& random);

} // namespace fuzz
