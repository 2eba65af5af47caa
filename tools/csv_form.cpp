#include "tools/csv_form.h"

#include "tools/number_text.h"
#include "tools/parameter_text.h"

#include <algorithm>
#include <cstddef>
#include <span>
#include <string>
#include <string_view>

namespace dcm::tools {

namespace {

class CsvWriter
{
public:
    explicit CsvWriter(const CsvStyle& style) : m_style(style) {}

    std::string Take() { return std::move(m_text); }

    void Add(const Parameter& parameter)
    {
        for (std::size_t i = 0; i < parameter.values.size(); ++i) {
            const auto [x, y] = CoordinatesOf(parameter, i);
            AddRow(parameter, x, y, parameter.values[i]);
        }
        if (!parameter.values.empty())
            return;
        const CComVariant none;
        for (const CComVariant& point : parameter.x.points)
            AddRow(parameter, point, none, none);
        if (parameter.x.points.empty())
            AddRow(parameter, none, none, none);
    }

    /// Adds a cell and, after the last one of a row, its end.
    void AddCell(std::string_view text, bool last = false)
    {
        const std::string special = std::string("\"\r\n") + m_style.separator;
        const bool quoted = text.find_first_of(special) != text.npos;
        if (quoted)
            m_text += '"';
        for (const char character : text)
            m_text.append(character == '"' ? 2 : 1, character);
        if (quoted)
            m_text += '"';
        if (last) {
            m_text += "\r\n";
        } else {
            m_text += m_style.separator;
        }
    }

private:
    void AddRow(const Parameter& parameter, const CComVariant& x, const CComVariant& y,
                const CComVariant& value)
    {
        AddCell(ToUtf8(parameter.name.View()));
        AddCell(ToUtf8(KeywordOf(parameter.kind)));
        AddValue(x);
        AddValue(y);
        AddValue(value);
        AddCell(ToUtf8(parameter.x.unit.View()));
        AddCell(ToUtf8(parameter.y.unit.View()));
        AddCell(ToUtf8(parameter.unit.View()), true);
    }

    void AddValue(const CComVariant& value)
    {
        std::string text;
        if (value.vt == VT_BSTR)
            text = ToUtf8(CComVariant::TextOf(value));
        if (value.vt == VT_R8) {
            text = NumberText(value.dblVal);
            if (m_style.decimalComma)
                std::replace(text.begin(), text.end(), '.', ',');
        }
        AddCell(text);
    }

    const CsvStyle m_style;
    std::string m_text = "\xEF\xBB\xBF";
};

} // namespace

std::string CsvText(std::span<const Parameter> parameters, const CsvStyle& style)
{
    CsvWriter writer(style);
    for (const char* const title : {"name", "kind", "x", "y", "value", "unit x", "unit y"})
        writer.AddCell(title);
    writer.AddCell("unit", true);
    for (const Parameter& parameter : parameters)
        writer.Add(parameter);
    return writer.Take();
}

} // namespace dcm::tools
