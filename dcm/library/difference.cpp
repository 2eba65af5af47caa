#include "dcm/library/difference.h"

#include "dcm/elements/keywords.h"
#include "dcm/elements/variant_number.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstdint>
#include <functional>
#include <iterator>
#include <limits>
#include <optional>
#include <string>
#include <unordered_map>
#include <utility>

namespace dcm {

namespace {

/// The keywords of the fields, in their order.
constexpr std::wstring_view kFieldKeywords[] = {
    keyword::kLangname,
    keyword::kDisplayname,
    keyword::kFunktion,
    keyword::kEinheitW,
    keyword::kEinheitX,
    keyword::kEinheitY,
    keyword::kSstX,
    keyword::kSstY,
    L"X",
    L"Y",
};

using Points = std::vector<CComVariant>;
using Indices = std::vector<std::size_t>;

// ---- Pairs of parameters ----------------------------------------------------------------------

bool HaveSameKey(const Parameter& a, const Parameter& b)
{
    return a.kind == b.kind && a.name == b.name;
}

std::size_t HashOfKey(const Parameter& parameter)
{
    return std::hash<std::wstring_view>()(parameter.name) +
           static_cast<std::size_t>(parameter.kind);
}

/// Finds parameters by kind and name: a table of hashes without pointers, since most of the time of
/// a comparison goes into waiting for memory.
class ParameterTable
{
public:
    /// For the parameters from `first` on, which must outlive the table.
    ParameterTable(std::span<const Parameter> parameters, std::size_t first)
        : m_parameters(parameters), m_slots(std::bit_ceil(2 * (parameters.size() - first))),
          m_following(parameters.size(), kNoIndex)
    {
        // From the last to the first, so that each one finds those that follow it.
        for (std::size_t i = parameters.size(); i-- > first;) {
            Slot& slot = Find(parameters[i]);
            if (slot.owner == kNoIndex)
                slot.owner = i;
            m_following[i] = std::exchange(slot.next, i);
        }
    }

    /// The index of the next parameter of this kind and name; `kNoIndex` when there is none left.
    std::size_t Take(const Parameter& parameter)
    {
        Slot& slot = Find(parameter);
        if (slot.next == kNoIndex)
            return kNoIndex;
        return std::exchange(slot.next, m_following[slot.next]);
    }

private:
    struct Slot
    {
        std::size_t hash = 0;
        /// A parameter with the kind and name of the slot; `kNoIndex` for a free slot.
        std::size_t owner = kNoIndex;
        std::size_t next = kNoIndex;
    };

    /// The slot of the kind and name, or a free one for them.
    Slot& Find(const Parameter& parameter)
    {
        const std::size_t hash = HashOfKey(parameter);
        std::size_t at = hash;
        while (true) {
            Slot& slot = m_slots[at++ & (m_slots.size() - 1)];
            if (slot.owner == kNoIndex) {
                slot.hash = hash;
                return slot;
            }
            if (slot.hash == hash && HaveSameKey(m_parameters[slot.owner], parameter))
                return slot;
        }
    }

    std::span<const Parameter> m_parameters;
    std::vector<Slot> m_slots;
    /// The next parameter of the same kind and name.
    Indices m_following;
};

/// For each old parameter the index of the new one that it is paired with, or `kNoIndex`.
Indices Pairs(std::span<const Parameter> oldParameters, std::span<const Parameter> newParameters)
{
    Indices pairs(oldParameters.size(), kNoIndex);
    // Lists that begin alike need no table for their beginning.
    std::size_t first = 0;
    const std::size_t shorter = std::min(oldParameters.size(), newParameters.size());
    while (first < shorter && HaveSameKey(oldParameters[first], newParameters[first])) {
        pairs[first] = first;
        ++first;
    }
    if (first == shorter)
        return pairs;
    ParameterTable table(newParameters, first);
    for (std::size_t i = first; i < oldParameters.size(); ++i)
        pairs[i] = table.Take(oldParameters[i]);
    return pairs;
}

// ---- Values -----------------------------------------------------------------------------------

std::uint64_t BitsOf(double number)
{
    return std::bit_cast<std::uint64_t>(number);
}

bool AreNear(double a, double b, const Comparison& comparison)
{
    const double distance = std::abs(a - b);
    const double larger = std::max(std::abs(a), std::abs(b));
    // Infinities are near nothing.
    return distance <= std::numeric_limits<double>::max() &&
           ((comparison.absolute > 0.0 && distance <= comparison.absolute) ||
            (comparison.relative > 0.0 && distance <= comparison.relative * larger));
}

/// Numbers under any tag are compared as the numbers that they are.
bool AreSame(const CComVariant& a, const CComVariant& b, const Comparison& comparison)
{
    if (a.vt == b.vt && a.llVal == b.llVal)
        return true;
    if (a.vt == VT_BSTR || b.vt == VT_BSTR)
        return a.vt == b.vt && CComVariant::TextOf(a) == CComVariant::TextOf(b);
    const std::optional<double> x = NumberOf(a);
    const std::optional<double> y = NumberOf(b);
    if (!x || !y)
        return !x && !y;
    return BitsOf(*x) == BitsOf(*y) || AreNear(*x, *y, comparison);
}

/// Gathers the values or points that differ.
class ValueList
{
public:
    ValueList(const Points& oldValues, const Points& newValues, const Comparison& comparison,
              std::vector<ValueDifference>& differences)
        : m_old(oldValues), m_new(newValues), m_comparison(comparison), m_differences(differences)
    {}

    void Compare(std::size_t oldIndex, std::size_t newIndex)
    {
        if (!AreSame(m_old[oldIndex], m_new[newIndex], m_comparison))
            m_differences.push_back({oldIndex, newIndex, m_old[oldIndex], m_new[newIndex]});
    }
    void AddOld(std::size_t index) { m_differences.push_back({index, kNoIndex, m_old[index], {}}); }
    void AddNew(std::size_t index) { m_differences.push_back({kNoIndex, index, {}, m_new[index]}); }
    void CompareByIndex()
    {
        const std::size_t both = std::min(m_old.size(), m_new.size());
        for (std::size_t i = 0; i < both; ++i)
            Compare(i, i);
        for (std::size_t i = both; i < m_old.size(); ++i)
            AddOld(i);
        for (std::size_t i = both; i < m_new.size(); ++i)
            AddNew(i);
    }

private:
    const Points& m_old;
    const Points& m_new;
    const Comparison& m_comparison;
    std::vector<ValueDifference>& m_differences;
};

// ---- Pairs of axis points ---------------------------------------------------------------------

/// Which points of two axes are the same: for each point the index of the other side's, or
/// `kNoIndex`.
struct PointPairs
{
    Indices toNew;
    Indices toOld;

    PointPairs(std::size_t oldSize, std::size_t newSize)
        : toNew(oldSize, kNoIndex), toOld(newSize, kNoIndex)
    {}
    void Join(std::size_t oldIndex, std::size_t newIndex)
    {
        toNew[oldIndex] = newIndex;
        toOld[newIndex] = oldIndex;
    }
    /// Whether the points of both sides are there in the same order, and some on one side alone at
    /// places of their own.
    bool ShowInsertions() const
    {
        bool moved = toNew.size() != toOld.size();
        std::size_t next = 0;
        for (std::size_t i = 0; i < toNew.size(); ++i) {
            if (toNew[i] == kNoIndex)
                continue;
            if (toNew[i] < next)
                return false;
            next = toNew[i] + 1;
            moved = moved || toNew[i] != i;
        }
        return moved;
    }
};

struct HashOfPoint
{
    std::size_t operator()(const CComVariant* point) const noexcept
    {
        if (point->vt == VT_BSTR)
            return std::hash<std::wstring_view>()(CComVariant::TextOf(*point));
        return std::hash<std::uint64_t>()(BitsOf(NumberOf(*point).value_or(0.0)));
    }
};

struct EqualPoints
{
    bool operator()(const CComVariant* a, const CComVariant* b) const noexcept
    {
        return AreSame(*a, *b, {});
    }
};

/// Joins points of the same content; those that are there several times in their order.
void JoinEqual(const Points& oldPoints, const Points& newPoints, PointPairs& pairs)
{
    std::unordered_map<const CComVariant*, std::size_t, HashOfPoint, EqualPoints> firsts(
        newPoints.size());
    Indices nexts(newPoints.size(), kNoIndex);
    for (std::size_t i = newPoints.size(); i-- > 0;) {
        const auto [at, fresh] = firsts.try_emplace(&newPoints[i], i);
        if (!fresh)
            nexts[i] = std::exchange(at->second, i);
    }
    for (std::size_t i = 0; i < oldPoints.size(); ++i) {
        const auto at = firsts.find(&oldPoints[i]);
        if (at != firsts.end() && at->second != kNoIndex) {
            const std::size_t paired = at->second;
            at->second = nexts[paired];
            pairs.Join(i, paired);
        }
    }
}

Indices Unpaired(const Indices& pairs, const Points& points)
{
    Indices left;
    for (std::size_t i = 0; i < pairs.size(); ++i) {
        if (pairs[i] == kNoIndex && points[i].vt == VT_R8)
            left.push_back(i);
    }
    return left;
}

/// Joins numbers that are near each other. Axes rise or fall, so that one walk over both finds
/// them; on an axis that does neither some may not be found.
void JoinNear(const Points& oldPoints, const Points& newPoints, const Comparison& comparison,
              PointPairs& pairs)
{
    const Indices oldLeft = Unpaired(pairs.toNew, oldPoints);
    const Indices newLeft = Unpaired(pairs.toOld, newPoints);
    if (oldLeft.empty() || newLeft.empty())
        return;
    const bool falling = oldPoints[oldLeft.front()].dblVal > oldPoints[oldLeft.back()].dblVal ||
                         newPoints[newLeft.front()].dblVal > newPoints[newLeft.back()].dblVal;
    auto o = oldLeft.begin();
    auto n = newLeft.begin();
    while (o != oldLeft.end() && n != newLeft.end()) {
        const double a = oldPoints[*o].dblVal;
        const double b = newPoints[*n].dblVal;
        if (AreNear(a, b, comparison)) {
            pairs.Join(*o++, *n++);
        } else if ((a < b) != falling) {
            ++o;
        } else {
            ++n;
        }
    }
}

bool AreSame(const Points& a, const Points& b, const Comparison& comparison)
{
    return std::equal(
        a.begin(), a.end(), b.begin(), b.end(),
        [&](const CComVariant& x, const CComVariant& y) { return AreSame(x, y, comparison); });
}

PointPairs PairsOf(const Points& oldPoints, const Points& newPoints, const Comparison& comparison)
{
    PointPairs pairs(oldPoints.size(), newPoints.size());
    if (AreSame(oldPoints, newPoints, comparison)) {
        for (std::size_t i = 0; i < oldPoints.size(); ++i)
            pairs.Join(i, i);
    } else {
        JoinEqual(oldPoints, newPoints, pairs);
        JoinNear(oldPoints, newPoints, comparison, pairs);
    }
    return pairs;
}

/// Pairs for the columns of a block in rows, which have no points: by their index.
PointPairs PairsOf(std::size_t oldSize, std::size_t newSize)
{
    PointPairs pairs(oldSize, newSize);
    for (std::size_t i = 0; i < std::min(oldSize, newSize); ++i)
        pairs.Join(i, i);
    return pairs;
}

void ComparePoints(const PointPairs& pairs, ValueList& points)
{
    if (!pairs.ShowInsertions()) {
        points.CompareByIndex();
        return;
    }
    for (std::size_t i = 0; i < pairs.toNew.size(); ++i) {
        if (pairs.toNew[i] == kNoIndex)
            points.AddOld(i);
    }
    for (std::size_t i = 0; i < pairs.toOld.size(); ++i) {
        if (pairs.toOld[i] == kNoIndex)
            points.AddNew(i);
    }
}

/// Where a value of one side is on the other, which has the points of `pairsX` and `pairsY`.
/// Values beyond the last row are those beyond the last row there.
std::size_t OtherIndex(std::size_t index, const Indices& pairsX, const Indices& pairsY,
                       std::size_t otherColumns, std::size_t otherRows)
{
    const std::size_t columns = pairsX.size();
    const std::size_t beyond = columns * pairsY.size();
    if (index >= beyond)
        return otherColumns * otherRows + (index - beyond);
    const std::size_t column = pairsX[index % columns];
    const std::size_t row = pairsY[index / columns];
    return column == kNoIndex || row == kNoIndex ? kNoIndex : row * otherColumns + column;
}

/// Compares the values at the same points.
void CompareGrids(const PointPairs& x, const PointPairs& y, std::size_t oldCount,
                  std::size_t newCount, ValueList& values)
{
    for (std::size_t i = 0; i < oldCount; ++i) {
        const std::size_t other = OtherIndex(i, x.toNew, y.toNew, x.toOld.size(), y.toOld.size());
        if (other < newCount) {
            values.Compare(i, other);
        } else {
            values.AddOld(i);
        }
    }
    for (std::size_t i = 0; i < newCount; ++i) {
        if (OtherIndex(i, x.toOld, y.toOld, x.toNew.size(), y.toNew.size()) >= oldCount)
            values.AddNew(i);
    }
}

// ---- Parameters -------------------------------------------------------------------------------

bool HasRows(const Parameter& parameter)
{
    return parameter.kind == Kind::kFestwerteblock && parameter.countX > 0 && parameter.countY > 0;
}

bool IsCurve(Kind kind)
{
    return kind >= Kind::kKennlinie && kind <= Kind::kGruppenkennlinie;
}

bool IsMap(Kind kind)
{
    return kind >= Kind::kKennfeld && kind <= Kind::kGruppenkennfeld;
}

/// A count of the first line, and the number of points that it goes with.
struct Count
{
    std::int64_t written = 0;
    std::int64_t points = 0;
};

Count CountOf(std::int32_t declared, std::size_t points)
{
    const auto number = static_cast<std::int64_t>(points);
    return {declared > 0 ? declared : number, number};
}

Count CountX(const Parameter& parameter)
{
    if (IsMap(parameter.kind))
        return CountOf(parameter.countX, parameter.x.points.size());
    if (IsCurve(parameter.kind))
        return CountOf(parameter.countX, parameter.values.size());
    // A block in rows has no points that its counts could go with.
    return {parameter.countY != 0 ? parameter.countX : 0, -1};
}

Count CountY(const Parameter& parameter)
{
    if (IsMap(parameter.kind))
        return CountOf(parameter.countY, parameter.y.points.size());
    return {IsCurve(parameter.kind) ? 0 : parameter.countY, -1};
}

void CompareTexts(Field field, const CString& oldText, const CString& newText,
                  std::vector<FieldDifference>& fields)
{
    if (oldText != newText)
        fields.push_back({field, oldText, newText});
}

CString TextOf(std::int64_t count)
{
    return {std::to_wstring(count)};
}

void CompareCounts(Field field, Count oldCount, Count newCount,
                   std::vector<FieldDifference>& fields)
{
    const bool pointsTell =
        oldCount.written == oldCount.points && newCount.written == newCount.points;
    if (oldCount.written != newCount.written && !pointsTell)
        fields.push_back({field, TextOf(oldCount.written), TextOf(newCount.written)});
}

void CompareFields(const Parameter& a, const Parameter& b, const Comparison& comparison,
                   std::vector<FieldDifference>& fields)
{
    if (!comparison.ignoreTexts) {
        CompareTexts(Field::kLangname, a.langname, b.langname, fields);
        CompareTexts(Field::kDisplayname, a.displayname, b.displayname, fields);
        CompareTexts(Field::kFunction, a.function, b.function, fields);
    }
    if (!comparison.ignoreUnits) {
        CompareTexts(Field::kUnit, a.unit, b.unit, fields);
        CompareTexts(Field::kUnitX, a.x.unit, b.x.unit, fields);
        CompareTexts(Field::kUnitY, a.y.unit, b.y.unit, fields);
    }
    if (!comparison.ignoreAxes) {
        CompareTexts(Field::kDistributionX, a.x.distribution, b.x.distribution, fields);
        CompareTexts(Field::kDistributionY, a.y.distribution, b.y.distribution, fields);
        CompareCounts(Field::kCountX, CountX(a), CountX(b), fields);
        CompareCounts(Field::kCountY, CountY(a), CountY(b), fields);
    }
}

/// The values in a row of a block in rows, as far as it has any.
std::size_t RowOf(const Parameter& block)
{
    return std::min(static_cast<std::size_t>(block.countX), block.values.size());
}

std::size_t RowsOf(const Parameter& block)
{
    const std::size_t row = RowOf(block);
    return row == 0 ? 0 : (block.values.size() + row - 1) / row;
}

/// Compares the points of the axes, and the values at the same points.
void ComparePointsAndValues(const Parameter& a, const Parameter& b, const Comparison& comparison,
                            Difference& difference)
{
    ValueList values(a.values, b.values, comparison, difference.values);
    if (comparison.ignoreAxes) {
        values.CompareByIndex();
        return;
    }
    if (HasRows(a) && HasRows(b) && a.countX != b.countX) {
        CompareGrids(PairsOf(RowOf(a), RowOf(b)), PairsOf(RowsOf(a), RowsOf(b)), a.values.size(),
                     b.values.size(), values);
        return;
    }
    if (AreSame(a.x.points, b.x.points, comparison) &&
        AreSame(a.y.points, b.y.points, comparison)) {
        values.CompareByIndex();
        return;
    }
    const PointPairs x = PairsOf(a.x.points, b.x.points, comparison);
    const PointPairs y =
        IsMap(a.kind) ? PairsOf(a.y.points, b.y.points, comparison) : PairsOf(1, 1);
    ValueList pointsX(a.x.points, b.x.points, comparison, difference.x);
    ComparePoints(x, pointsX);
    if (IsMap(a.kind)) {
        ValueList pointsY(a.y.points, b.y.points, comparison, difference.y);
        ComparePoints(y, pointsY);
    }
    CompareGrids(x, y, a.values.size(), b.values.size(), values);
}

} // namespace

std::wstring_view KeywordOf(Field field) noexcept
{
    const auto index = static_cast<std::size_t>(field);
    return index < std::size(kFieldKeywords) ? kFieldKeywords[index] : std::wstring_view();
}

std::vector<Difference> Differences(std::span<const Parameter> oldParameters,
                                    std::span<const Parameter> newParameters,
                                    const Comparison& comparison)
{
    const Indices pairs = Pairs(oldParameters, newParameters);
    std::vector<bool> paired(newParameters.size());
    std::array<std::vector<Difference>, kKinds.size()> byKind;
    const auto add = [&](const Parameter& parameter, Difference&& difference) {
        difference.kind = parameter.kind;
        difference.name = parameter.name;
        byKind[static_cast<std::size_t>(parameter.kind)].push_back(std::move(difference));
    };
    for (std::size_t i = 0; i < oldParameters.size(); ++i) {
        const Parameter& parameter = oldParameters[i];
        Difference difference;
        difference.oldIndex = i;
        difference.newIndex = pairs[i];
        if (pairs[i] == kNoIndex) {
            difference.change = Change::kRemoved;
            add(parameter, std::move(difference));
            continue;
        }
        paired[pairs[i]] = true;
        const Parameter& other = newParameters[pairs[i]];
        CompareFields(parameter, other, comparison, difference.fields);
        ComparePointsAndValues(parameter, other, comparison, difference);
        if (!difference.fields.empty() || !difference.x.empty() || !difference.y.empty() ||
            !difference.values.empty())
            add(parameter, std::move(difference));
    }
    for (std::size_t i = 0; i < newParameters.size(); ++i) {
        if (!paired[i]) {
            Difference difference;
            difference.change = Change::kAdded;
            difference.newIndex = i;
            add(newParameters[i], std::move(difference));
        }
    }
    std::vector<Difference> all;
    for (std::vector<Difference>& differences : byKind)
        std::move(differences.begin(), differences.end(), std::back_inserter(all));
    return all;
}

} // namespace dcm
