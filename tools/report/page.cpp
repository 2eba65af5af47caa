#include "tools/report/page.h"

#include "tools/report/json.h"
#include "tools/report/model.h"
#include "tools/report/page_parts.h"

#include <algorithm>
#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dcm::tools {
namespace {

/// All that the page is made of. `other` is null without a comparison.
struct Content
{
    const PageFile& file;
    const PageFile* other;
    std::vector<PageKind> kinds;
};

/// UTF-8 for the text and quoted attributes of a page: nothing in it ends either.
std::string Html(std::wstring_view text)
{
    constexpr std::string_view kSpecial = "&<>\"'";
    constexpr const char* kEntities[] = {"&amp;", "&lt;", "&gt;", "&quot;", "&#39;"};
    std::string html;
    for (const char c : dcm::ToUtf8(text)) {
        const std::size_t special = kSpecial.find(c);
        if (special == kSpecial.npos) {
            html += c;
        } else {
            html += kEntities[special];
        }
    }
    return html;
}

// ---- The model for the script ----------------------------------------------------------------

void AppendKey(std::string& json, std::string_view key)
{
    json += '"';
    json += key;
    json += R"(":)";
}

/// Ends a list, or an object, each of whose elements ended with a comma.
void AppendEnd(std::string& json, char end)
{
    if (json.back() == ',')
        json.pop_back();
    json += end;
}

/// Texts that repeat, such as units: each is in the page once.
class SharedTexts
{
public:
    SharedTexts() { IndexOf({}); }
    std::size_t IndexOf(const CString& text)
    {
        const auto [place, isNew] = m_indices.try_emplace(text, m_texts.size());
        if (isNew)
            m_texts.push_back(&place->first);
        return place->second;
    }
    void AppendTo(std::string& json) const
    {
        json += '[';
        for (const CString* text : m_texts) {
            AppendJsonText(json, *text);
            json += ',';
        }
        AppendEnd(json, ']');
    }

private:
    std::map<CString, std::size_t> m_indices;
    std::vector<const CString*> m_texts;
};

/// Appends a list with one element for each block under a key, and a comma.
template <class Append>
void AppendColumn(std::string& json, std::string_view key, const Content& content, Append append)
{
    AppendKey(json, key);
    json += '[';
    for (const PageKind& kind : content.kinds) {
        for (const PageBlock& block : kind.blocks) {
            append(block);
            json += ',';
        }
    }
    AppendEnd(json, ']');
    json += ",\n";
}

constexpr struct
{
    const char* key;
    const CString& (*textOf)(const Parameter&);
} kSharedColumns[] = {
    {"displayname", [](const Parameter& p) -> const CString& { return p.displayname; }},
    {"function", [](const Parameter& p) -> const CString& { return p.function; }},
    {"unit", [](const Parameter& p) -> const CString& { return ShownUnit(p); }},
    {"unitX", [](const Parameter& p) -> const CString& { return p.x.unit; }},
    {"unitY", [](const Parameter& p) -> const CString& { return p.y.unit; }},
    {"axisX", [](const Parameter& p) -> const CString& { return p.x.distribution; }},
    {"axisY", [](const Parameter& p) -> const CString& { return p.y.distribution; }},
};

void AppendKinds(std::string& json, const Content& content)
{
    static constexpr std::wstring_view kLooks[] = {L"row", L"list", L"curve", L"map"};
    AppendKey(json, "kinds");
    json += '[';
    for (const PageKind& kind : content.kinds) {
        json += '{';
        AppendKey(json, "keyword");
        AppendJsonText(json, KeywordOf(kind.kind));
        json += ',';
        AppendKey(json, "look");
        AppendJsonText(json, kLooks[static_cast<std::size_t>(kind.look)]);
        json += ',';
        AppendKey(json, "count");
        json += std::to_string(kind.blocks.size()) + "},";
    }
    AppendEnd(json, ']');
    json += ",\n";
}

void AppendFindings(std::string& json, const PageFile& file)
{
    json += '[';
    if (file.report != nullptr) {
        for (const Finding& finding : file.report->Findings()) {
            json += '[' + std::to_string(static_cast<int>(finding.severity)) + ',' +
                    std::to_string(finding.line) + ',';
            AppendJsonText(json, finding.block);
            json += ',';
            AppendJsonText(json, finding.message);
            json += R"(,")";
            json += finding.id;
            json += R"("],)";
        }
    }
    AppendEnd(json, ']');
}

/// 0 for the same, then as `Change`: 1 changed, 2 added, 3 removed.
char ChangeDigit(const PageBlock& block)
{
    if (block.difference == nullptr)
        return '0';
    switch (block.difference->change) {
    case Change::kChanged:
        return '1';
    case Change::kAdded:
        return '2';
    case Change::kRemoved:
        return '3';
    }
    return '0';
}

std::string ModelOf(const Content& content)
{
    std::string json = "{";
    AppendKey(json, "title");
    AppendJsonText(json, content.file.title);
    json += ",\n";
    AppendKinds(json, content);
    AppendColumn(json, "name", content,
                 [&](const PageBlock& b) { AppendJsonText(json, b.parameter->name); });
    AppendColumn(json, "langname", content,
                 [&](const PageBlock& b) { AppendJsonText(json, b.parameter->langname); });
    SharedTexts texts;
    for (const auto& column : kSharedColumns) {
        AppendColumn(json, column.key, content, [&](const PageBlock& b) {
            json += std::to_string(texts.IndexOf(column.textOf(*b.parameter)));
        });
    }
    AppendColumn(json, "columns", content, [&](const PageBlock& b) {
        json += std::to_string(ShapeOf(*b.parameter).columns);
    });
    AppendColumn(json, "rows", content,
                 [&](const PageBlock& b) { json += std::to_string(ShapeOf(*b.parameter).rows); });
    if (content.other != nullptr) {
        AppendColumn(json, "change", content, [&](const PageBlock& b) { json += ChangeDigit(b); });
        AppendKey(json, "other");
        AppendJsonText(json, content.other->title);
        json += ",\n";
    }
    AppendKey(json, "findings");
    json += '[';
    AppendFindings(json, content.file);
    if (content.other != nullptr) {
        json += ',';
        AppendFindings(json, *content.other);
    }
    json += "],\n";
    AppendKey(json, "texts");
    texts.AppendTo(json);
    json += "}";
    return json;
}

// ---- The values for the script ---------------------------------------------------------------

/// Appends a list under a key, and a comma.
void AppendValues(std::string& json, const char* key, const std::vector<CComVariant>& values)
{
    AppendKey(json, key);
    json += '[';
    for (const CComVariant& value : values) {
        AppendJsonValue(json, value);
        json += ',';
    }
    AppendEnd(json, ']');
    json += ',';
}

void AppendText(std::string& json, const char* key, const CString& text)
{
    AppendKey(json, key);
    AppendJsonText(json, text);
    json += ',';
}

/// What the other file has else.
void AppendOther(std::string& json, const PageBlock& block)
{
    const Parameter& own = *block.parameter;
    const Parameter& other = *block.other;
    AppendKey(json, "o");
    json += '{';
    if (own.langname != other.langname)
        AppendText(json, "langname", other.langname);
    for (const auto& column : kSharedColumns) {
        if (column.textOf(own) != column.textOf(other))
            AppendText(json, column.key, column.textOf(other));
    }
    const bool isDistribution = own.kind == Kind::kStuetzstellenverteilung;
    const Difference& difference = *block.difference;
    if (!difference.values.empty() || (isDistribution && !difference.x.empty()))
        AppendValues(json, "w", ShownValues(other));
    if (!isDistribution && !difference.x.empty())
        AppendValues(json, "x", other.x.points);
    if (!difference.y.empty())
        AppendValues(json, "y", other.y.points);
    // The values of a map change their places with its axes.
    const Shape shape = ShapeOf(other);
    AppendKey(json, "columns");
    json += std::to_string(shape.columns) + ',';
    AppendKey(json, "rows");
    json += std::to_string(shape.rows) + "},";
}

void AppendBlock(std::string& json, const PageBlock& block)
{
    const Parameter& parameter = *block.parameter;
    json += '{';
    AppendValues(json, "w", ShownValues(parameter));
    if (parameter.kind != Kind::kStuetzstellenverteilung && !parameter.x.points.empty())
        AppendValues(json, "x", parameter.x.points);
    if (!parameter.y.points.empty())
        AppendValues(json, "y", parameter.y.points);
    if (block.other != nullptr)
        AppendOther(json, block);
    AppendEnd(json, '}');
}

/// Writes the values in pieces, so that the script reads only those of the blocks in view.
void WriteValues(std::ostream& out, const Content& content)
{
    constexpr std::size_t kPiece = 1 << 18;
    std::size_t first = 0;
    std::size_t next = 0;
    std::string json;
    const auto write = [&] {
        if (json.empty())
            return;
        json.back() = ']';
        out << "<script type='application/json' class='chunk' data-first='" << first << "'>["
            << json << "</script>\n";
        json.clear();
        first = next;
    };
    for (const PageKind& kind : content.kinds) {
        for (const PageBlock& block : kind.blocks) {
            AppendBlock(json, block);
            json += ",";
            ++next;
            if (json.size() >= kPiece)
                write();
        }
    }
    write();
}

// ---- The page --------------------------------------------------------------------------------

void WriteSummary(std::ostream& out, const PageFile& file, const char* id)
{
    out << "<div class='findings' id='" << id << "'><p>Import of " << Html(file.title) << ": "
        << Html(file.report->Summary()) << (file.report->Incomplete() ? ", not all are listed" : "")
        << "</p></div>\n";
}

/// What a browser without JavaScript shows.
void WriteList(std::ostream& out, const Content& content)
{
    out << "<noscript><p>This page draws its blocks with JavaScript, which the browser has turned "
           "off. These are their names.</p>\n";
    for (const PageKind& kind : content.kinds) {
        out << "<h2>" << Html(KeywordOf(kind.kind)) << "</h2><ul>\n";
        for (const PageBlock& block : kind.blocks) {
            out << "<li>" << Html(block.parameter->name) << " <small>"
                << Html(block.parameter->langname) << "</small>\n";
        }
        out << "</ul>\n";
    }
    out << "</noscript>\n";
}

void Write(std::ostream& out, const Content& content)
{
    const PageFile& file = content.file;
    std::string title = Html(file.title);
    if (content.other != nullptr)
        title += " \u2192 " + Html(content.other->title);
    out << "<!DOCTYPE html>\n<html lang='en'><head><meta charset='utf-8'>"
        << R"(<meta http-equiv="Content-Security-Policy" content=")" << page::kPolicy << R"(">)"
        << "<meta name='viewport' content='width=device-width, initial-scale=1'><title>" << title
        << "</title><style>" << page::kStyle << "</style></head><body>\n"
        << page::kIndex << "<main><h1>" << title << "</h1><pre>" << Html(file.comment)
        << "</pre>\n";
    if (file.report != nullptr)
        WriteSummary(out, file, "findings0");
    if (content.other != nullptr && content.other->report != nullptr)
        WriteSummary(out, *content.other, "findings1");
    out << "<div id='blocks'></div>\n";
    WriteList(out, content);
    out << "</main><div id='tip' hidden></div>\n<script type='application/json' id='model'>"
        << ModelOf(content) << "</script>\n<script>" << page::kScript << "</script>\n";
    WriteValues(out, content);
    out << "</body></html>\n";
}

} // namespace

void WritePage(std::ostream& out, const PageFile& file)
{
    Write(out, {file, nullptr, PageKindsOf(file.parameters)});
}

void WritePage(std::ostream& out, const PageFile& file, const PageFile& other,
               std::span<const Difference> differences)
{
    Write(out, {file, &other, PageKindsOf(file.parameters, other.parameters, differences)});
}

} // namespace dcm::tools
