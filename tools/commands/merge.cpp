#include "tools/commands/merge.h"

#include "dcm/library/dcm.h"
#include "tools/dcm_file.h"
#include "tools/findings.h"
#include "tools/input.h"
#include "tools/names.h"
#include "tools/output.h"
#include "tools/parameter_text.h"
#include "tools/progress.h"
#include "tools/shown_text.h"
#include "tools/trouble.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <limits>
#include <map>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace dcm::tools {

namespace {

/// Every note counts for what is left out.
constexpr std::size_t kNoLimit = std::numeric_limits<std::size_t>::max();

/// The blocks of the new file.
class Merged
{
public:
    Merged(std::vector<Parameter> base, bool force)
        : m_parameters(std::move(base)), m_baseSize(m_parameters.size()), m_force(force),
          m_dropped(m_baseSize, false)
    {
        for (std::size_t i = 0; i < m_parameters.size(); ++i)
            m_indices[Key(m_parameters[i])].push_back(i);
    }

    /// Puts a block in the place of the one with its kind and name, or after all others.
    void Take(Parameter&& parameter)
    {
        std::vector<std::size_t>& sameName = m_indices[Key(parameter)];
        std::vector<std::size_t> same;
        for (const std::size_t index : sameName) {
            if (m_parameters[index].kind == parameter.kind)
                same.push_back(index);
        }
        if (same.empty() && !sameName.empty()) {
            throw Trouble(TitleOf(parameter) + " cannot be merged: it is there as " +
                          TitleOf(m_parameters[sameName.front()]));
        }
        if (same.size() > 1)
            RequireForce(parameter);
        if (same.empty()) {
            Append(std::move(parameter), sameName);
            return;
        }
        if (same.front() < m_baseSize)
            m_replaced.insert(same.front());
        m_parameters[same.front()] = std::move(parameter);
        std::for_each(same.begin() + 1, same.end(), [&](std::size_t i) { m_dropped[i] = true; });
    }

    /// How many blocks of the base have been replaced, and how many added.
    std::size_t Replaced() const { return m_replaced.size(); }
    std::size_t Added() const { return m_added; }

    /// The blocks in their order; this object has none afterwards.
    std::vector<Parameter> TakeAll()
    {
        std::vector<Parameter> all;
        all.reserve(m_parameters.size());
        for (std::size_t i = 0; i < m_parameters.size(); ++i) {
            if (!m_dropped[i])
                all.push_back(std::move(m_parameters[i]));
        }
        return all;
    }

private:
    static std::wstring Key(const Parameter& parameter)
    {
        return std::wstring(parameter.name.View());
    }

    void RequireForce(const Parameter& parameter) const
    {
        if (!m_force) {
            throw Trouble(TitleOf(parameter) +
                          " is in BASE more than once; --force replaces all of them by one");
        }
    }

    void Append(Parameter&& parameter, std::vector<std::size_t>& sameName)
    {
        sameName.push_back(m_parameters.size());
        m_parameters.push_back(std::move(parameter));
        m_dropped.push_back(false);
        ++m_added;
    }

    std::vector<Parameter> m_parameters;
    const std::size_t m_baseSize;
    const bool m_force;
    std::vector<bool> m_dropped;
    std::unordered_map<std::wstring, std::vector<std::size_t>> m_indices;
    /// Where blocks of the base have been replaced.
    std::set<std::size_t> m_replaced;
    std::size_t m_added = 0;
};

/// What the notes of a report say that a file written from the blocks does not hold.
class LeftOut
{
public:
    void Add(const Report& report)
    {
        m_variantLines += report.Count("variant-line");
        m_comments += report.Count("dropped-comment");
        for (const Finding& finding : report.Findings()) {
            if (finding.id == "unknown-block" && finding.severity == Severity::kNote)
                ++m_blocks[FirstWord(finding.block)];
        }
    }

    /// "1 FUNKTIONEN block, 3 VAR lines, 2 comments are not in OUT", or an empty text.
    std::string Line(std::string_view out) const
    {
        std::string list;
        std::size_t all = 0;
        const auto add = [&](std::size_t count, std::string_view noun) {
            if (count > 0)
                list += (list.empty() ? "" : ", ") + Counted(count, noun);
            all += count;
        };
        for (const auto& [keyword, count] : m_blocks)
            add(count, keyword.empty() ? "block" : keyword + " block");
        add(m_variantLines, "VAR line");
        add(m_comments, "comment");
        return list.empty() ? list : list + (all == 1 ? " is" : " are") + " not in " + Shown(out);
    }

private:
    static std::string FirstWord(const CString& block)
    {
        return Shown(block.View().substr(0, block.View().find(L' ')));
    }

    std::map<std::string, std::size_t> m_blocks;
    std::size_t m_variantLines = 0;
    std::size_t m_comments = 0;
};

/// A file whose report holds an error would lose data in the new one.
void RequireNoErrors(const Report& report, const std::string& label, bool force)
{
    const std::size_t errors = report.Count(Severity::kError);
    if (errors == 0)
        return;
    if (!force) {
        throw Trouble(Shown(label) + ": " + Counted(errors, "error") +
                      "; nothing is written without --force; dcm check tells more");
    }
    Complain(Shown(label) + ": " + Counted(errors, "error") + "; dcm check tells more");
}

/// The same for what the new file would lack.
void RequireWhole(const DCMConverter& document, const MergeOptions& options)
{
    const Report report = ReportOfExport(document, kFindingsPerId);
    for (const Finding& finding : report.Findings()) {
        if (finding.severity == Severity::kError)
            Complain(FindingText(options.out, finding, Plain));
    }
    if (report.Count(Severity::kError) > 0 && !options.force)
        throw Trouble(Shown(options.out) + ": nothing is written without --force");
}

Input ReadForMerge(const std::string& argument, Progress& progress, const MergeOptions& options)
{
    Input input = ReadInput(argument, progress, kNoLimit);
    RequireNoErrors(input.report, input.label, options.force);
    return input;
}

/// The blocks of the changes that the options choose.
std::vector<Parameter> Chosen(std::vector<Parameter> changes, const MergeOptions& options)
{
    const Patterns only(options.only);
    const Patterns excluded(options.excluded);
    only.RequireMatches(changes, "CHANGES");
    excluded.RequireMatches(changes, "CHANGES");
    std::erase_if(changes, [&](const Parameter& parameter) {
        const auto name = parameter.name.View();
        return (!only.IsEmpty() && !only.Match(name)) || excluded.Match(name);
    });
    return changes;
}

std::vector<std::string> AllInputs(const MergeOptions& options)
{
    std::vector<std::string> all = {options.base};
    all.insert(all.end(), options.changes.begin(), options.changes.end());
    return all;
}

} // namespace

int Merge(const MergeOptions& options)
{
    RequireOneStandardInput(AllInputs(options));
    Progress progress(options.changes.size() + 1);
    LeftOut leftOut;
    Input base = ReadForMerge(options.base, progress, options);
    leftOut.Add(base.report);
    const CString comment = base.document.GetComment();

    std::vector<Parameter> changes;
    for (const std::string& file : options.changes) {
        Input input = ReadForMerge(file, progress, options);
        leftOut.Add(input.report);
        std::vector<Parameter> parameters = ParametersOf(std::move(input.document));
        std::move(parameters.begin(), parameters.end(), std::back_inserter(changes));
    }

    Merged merged(ParametersOf(std::move(base.document)), options.force);
    for (Parameter& parameter : Chosen(std::move(changes), options))
        merged.Take(std::move(parameter));
    const DCMConverter document = DocumentOf(merged.TakeAll(), comment);
    RequireWhole(document, options);
    SaveFile(document, options.out);

    Print(Counted(merged.Replaced(), "block") + " replaced, " + std::to_string(merged.Added()) +
          " added\n");
    if (const std::string line = leftOut.Line(options.out); !line.empty())
        Complain(line);
    return 0;
}

} // namespace dcm::tools
