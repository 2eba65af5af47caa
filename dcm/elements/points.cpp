#include "dcm/elements/points.h"

#include "dcm/elements/block_report.h"
#include "dcm/elements/number.h"
#include "dcm/platform/text.h"
#include "dcm/platform/word.h"

#include <algorithm>
#include <utility>

namespace dcm {

namespace {

/// Besides line ends, the characters that a value block leaves as they are.
constexpr TextItemStyle kPointText = {L"\n\r\t\b", " "};

VARTYPE TypeWith(VARTYPE type, VARTYPE added)
{
    if (type == VT_EMPTY || type == added)
        return added;
    return VT_ERROR;
}

bool KeepsValue(VARTYPE type)
{
    return type == VT_R8 || type == VT_R4 || type == VT_BSTR;
}

/// The type of an array of this type that the point is added to. The point loses its value if it
/// has none there.
VARTYPE JoinType(VARTYPE type, CComVariant& point)
{
    type = TypeWith(type, point.vt);
    if (!KeepsValue(type)) {
        point = CComVariant();
        point.vt = type;
    }
    return type;
}

/// Gives the array, when it is destroyed, the type that appending the new points one by one gives.
class NewPoints
{
public:
    explicit NewPoints(const PointArray& array) : m_array(array), m_before(array.points.size()) {}
    NewPoints(const NewPoints&) = delete;
    NewPoints& operator=(const NewPoints&) = delete;
    ~NewPoints()
    {
        for (std::size_t i = m_before; m_array.type != VT_R8 && i < m_array.points.size(); ++i)
            m_array.type = JoinType(m_array.type, m_array.points[i]);
    }

private:
    const PointArray& m_array;
    std::size_t m_before;
};

void ReadPointNumbers(std::string_view rest, const PointArray& array, BlockReport* report)
{
    const NewPoints points(array);
    ReadNumbers(rest, report, array.points);
}

/// A text begins after an opening quote, which is any character that follows the text before it,
/// and ends at the next quote or with the line.
void ReadTexts(std::string_view rest, const FileText& text, const PointArray& array,
               BlockReport* report)
{
    while (!rest.empty()) {
        const bool opened = rest.starts_with('"');
        rest = text.WithoutFirstCharacter(rest);
        const std::size_t end = rest.find('"');
        if (report != nullptr && !opened)
            report->TextsAltered();
        if (report != nullptr && end == rest.npos)
            report->OpenQuote();
        AppendPoint(array, CComVariant(text.Wide(rest.substr(0, end))));
        rest = end == rest.npos ? std::string_view() : TrimWhite(rest.substr(end + 1));
    }
}

} // namespace

void AppendPoint(const PointArray& array, const VARIANT& point)
{
    CComVariant copy;
    if (KeepsValue(point.vt)) {
        copy = point;
    } else {
        copy.vt = point.vt;
    }
    AppendPoint(array, std::move(copy));
}

void AppendPoint(const PointArray& array, CComVariant&& point)
{
    const VARTYPE type = JoinType(array.type, point);
    array.points.push_back(std::move(point));
    array.type = type;
}

void SetTypeOfPoints(const PointArray& array)
{
    array.type = VT_EMPTY;
    for (CComVariant& point : array.points)
        array.type = JoinType(array.type, point);
}

void ReservePoints(std::initializer_list<AnnouncedPoints> arrays, const FileBlock& block)
{
    // The shortest item is a digit and a blank.
    auto left = static_cast<std::int64_t>(block.Size() / 2);
    for (const AnnouncedPoints& array : arrays)
        left -= std::clamp(array.count, std::int64_t{0}, left + 1);
    for (const AnnouncedPoints& array : arrays) {
        // An array that has points grows by itself: reserving exactly would copy it on each line.
        if (left >= 0 && array.count > 0 && array.points.empty())
            array.points.reserve(static_cast<std::size_t>(array.count));
    }
}

void ReadPoints(std::string_view rest, const FileText& text, const PointArray* numbers,
                const PointArray* texts, BlockReport* report)
{
    const char* const end = rest.data() + rest.size();
    rest = TrimRight({SkipWhite(rest.data(), end), end}, IsWhite);
    const bool quoted = rest.starts_with('"') && rest.ends_with('"');
    const PointArray* const array = quoted ? texts : numbers;
    if (array == nullptr) {
        if (report != nullptr && !rest.empty())
            report->DroppedItems(quoted);
        return;
    }
    const bool mixed = array->type == VT_ERROR;
    if (quoted) {
        ReadTexts(rest, text, *array, report);
    } else {
        ReadPointNumbers(rest, *array, report);
    }
    if (report != nullptr && !mixed && array->type == VT_ERROR)
        report->MixedTypes();
}

bool PointReader::Read(const BlockLine& line)
{
    // No keyword of points is longer than a word.
    const std::size_t size = line.keyword.size();
    if (size == 0 || size > sizeof(std::uint64_t))
        return false;
    const std::uint64_t all = ~std::uint64_t{0} >> (64 - 8 * size);
    const std::uint64_t keyword = LoadWord(line.keyword.data()) & all;
    if (m_last->keyword != keyword) {
        std::swap(m_last, m_other);
        if (m_last->keyword != keyword) {
            *m_last = {keyword};
            Find(line.keyword, *m_last);
        }
    }
    if (m_last->numbers == nullptr && m_last->texts == nullptr)
        return false;
    ReadPoints(line.rest, m_text, m_last->numbers, m_last->texts, m_report);
    return true;
}

/// Finds the array that takes what lines with this keyword hold.
void PointReader::Find(std::string_view keyword, Line& line) const
{
    for (const PointTarget& target : m_targets) {
        if (EqualsNoCase(keyword, target.keywords.numbers)) {
            line.numbers = &target.array;
        } else if (EqualsNoCase(keyword, target.keywords.texts)) {
            line.texts = &target.array;
        }
    }
}

void CopyPoints(const std::vector<CComVariant>& points, std::vector<CComVariant>& target)
{
    std::vector<CComVariant> copy(points);
    target.swap(copy);
}

void PointLines::Add(const VARIANT& point)
{
    if (point.vt == VT_R8) {
        m_lines.AddNumber(m_keywords.numbers, point.dblVal, kFullDigits);
    } else if (point.vt == VT_BSTR) {
        m_lines.AddText(m_keywords.texts, CComVariant::TextOf(point), kPointText);
    }
}

void PointLines::AddGroup(std::span<const CComVariant> points)
{
    for (const CComVariant& point : points)
        Add(point);
    m_lines.EndLine();
}

} // namespace dcm
