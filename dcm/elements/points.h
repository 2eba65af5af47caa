#pragma once

#include "dcm/elements/block_reader.h"
#include "dcm/elements/block_writer.h"
#include "dcm/elements/keywords.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/variant.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"

#include <cstdint>
#include <initializer_list>
#include <span>
#include <string_view>
#include <vector>

/// The typed arrays of points that distributions, curves and maps hold.
namespace dcm {

/// An array of points with its type: `VT_EMPTY` while it has none, the tag of the first point, and
/// `VT_ERROR` from the first point of another tag on.
struct PointArray
{
    std::vector<CComVariant>& points;
    VARTYPE& type;
};

/// Appends a point under the array's type. Its value is kept for `VT_R8`, `VT_R4` and `VT_BSTR` (a
/// text of its own); a point of any other type, `VT_ERROR` included, has no value.
void AppendPoint(const PointArray& array, const VARIANT& point);
/// The same with a point whose text becomes the array's own.
void AppendPoint(const PointArray& array, CComVariant&& point);

/// Gives the array, whose points have been replaced, the type that appending them would have given
/// it, and takes the value away from the points that have none then.
void SetTypeOfPoints(const PointArray& array);

/// An array of points and how many of them a block announces.
struct AnnouncedPoints
{
    std::vector<CComVariant>& points;
    std::int64_t count;
};

/// Reserves memory for the points that a block announces, unless they are more in all than its text
/// can hold.
void ReservePoints(std::initializer_list<AnnouncedPoints> arrays, const FileBlock& block);

/// Reads the items of one point line, `rest`, which is a part of `text`: quoted texts when it
/// begins and ends with a double quote, numbers otherwise. Items of a kind without an array are
/// dropped. Findings go to `report`, if that is not null.
void ReadPoints(std::string_view rest, const FileText& text, const PointArray* numbers,
                const PointArray* texts, BlockReport* report);

/// Replaces `target` by copies of the points, each text its own; leaves it as it was when memory
/// runs out.
void CopyPoints(const std::vector<CComVariant>& points, std::vector<CComVariant>& target);

/// The keywords under which the points of one array are read and written.
struct PointKeywords
{
    std::wstring_view numbers;
    std::wstring_view texts;
};

inline constexpr PointKeywords kAxisX = {keyword::kStX, keyword::kStTxX};
inline constexpr PointKeywords kAxisY = {keyword::kStY, keyword::kStTxY};
inline constexpr PointKeywords kValues = {keyword::kWert, keyword::kText};

/// An array and the keywords of its lines in the blocks of a curve or map, where numbers and texts
/// have keywords of their own.
struct PointTarget
{
    PointKeywords keywords;
    PointArray array;
};

/// Reads the point lines of a block into the targets whose keywords they have.
class PointReader
{
public:
    /// For lines of `text`; `report` may be null. The text and the targets must outlive the reader.
    PointReader(std::span<const PointTarget> targets, const FileText& text, BlockReport* report)
        : m_targets(targets), m_text(text), m_report(report)
    {}
    PointReader(const PointReader&) = delete;
    PointReader& operator=(const PointReader&) = delete;

    /// Reads a point line; false when it has the keyword of no target. Numbers under the keyword of
    /// texts are dropped, and the reverse.
    bool Read(const BlockLine& line);

private:
    /// The characters of a keyword, none of which is zero, in one word, and the array that takes
    /// what its lines hold, if there is one.
    struct Line
    {
        std::uint64_t keyword = 0;
        const PointArray* numbers = nullptr;
        const PointArray* texts = nullptr;
    };

    void Find(std::string_view keyword, Line& line) const;

    std::span<const PointTarget> m_targets;
    const FileText& m_text;
    BlockReport* m_report;
    /// Most lines have the keyword of the line before them, or of the last line with another one.
    Line m_lines[2];
    Line* m_last = m_lines;
    Line* m_other = m_lines + 1;
};

/// Writes the points of an array five to a line; those that are neither number nor text take no
/// place.
class PointLines
{
public:
    PointLines(FileTextBuilder& block, const PointKeywords& keywords)
        : m_lines(block, kItemsPerLine), m_keywords(keywords)
    {}

    void Add(const VARIANT& point);
    /// Adds the points and ends the line.
    void AddGroup(std::span<const CComVariant> points);

private:
    ItemLines m_lines;
    PointKeywords m_keywords;
};

} // namespace dcm
