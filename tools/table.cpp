#include "tools/table.h"

#include "tools/shown_text.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace dcm::tools {

namespace {

constexpr std::size_t kGap = 2;

void TrimBlanks(std::string& text)
{
    text.erase(text.find_last_not_of(' ') + 1);
}

} // namespace

std::string Table::Text(std::string_view indent) const
{
    std::vector<std::size_t> widths;
    for (const auto& line : m_lines) {
        widths.resize(std::max(widths.size(), line.size()));
        for (std::size_t i = 0; i < line.size(); ++i)
            widths[i] = std::max(widths[i], Width(line[i]));
    }

    std::string text;
    for (const auto& line : m_lines) {
        std::string cells(indent);
        for (std::size_t i = 0; i < line.size(); ++i) {
            const std::string blanks(widths[i] - Width(line[i]), ' ');
            const bool left = i < m_columns.size() && m_columns[i] == Align::kLeft;
            cells.append(i == 0 ? 0 : kGap, ' ');
            cells += left ? line[i] + blanks : blanks + line[i];
        }
        TrimBlanks(cells);
        text += cells + '\n';
    }
    return text;
}

} // namespace dcm::tools
