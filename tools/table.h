#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace dcm::tools {

enum class Align
{
    kLeft,
    kRight,
};

/// Lines of cells that are printed in columns.
class Table
{
public:
    /// How each column is aligned; further columns are aligned to the right.
    explicit Table(std::vector<Align> columns) : m_columns(std::move(columns)) {}

    /// Adds a line; lines may have different numbers of cells.
    void Add(std::vector<std::string> cells) { m_lines.push_back(std::move(cells)); }

    /// All lines, each after `indent`, cells two blanks apart, without blanks at the end.
    std::string Text(std::string_view indent = "") const;

private:
    std::vector<Align> m_columns;
    std::vector<std::vector<std::string>> m_lines;
};

} // namespace dcm::tools
