#pragma once

#include "dcm/elements/festwert.h"
#include "dcm/elements/festwerteblock.h"
#include "dcm/elements/kennfeld.h"
#include "dcm/elements/kennlinie.h"
#include "dcm/elements/stuetzstellenverteilung.h"
#include "dcm/library/export.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/variant.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <type_traits>
#include <vector>

class DCMConverter;

/// @file
/// The blocks of a document as parameters: one type for all kinds, with name, axes and values.

namespace dcm {

/// The kinds of blocks, in the order in which a document is exported.
enum class Kind : unsigned char
{
    kFestwert,
    kFestwerteblock,
    kStuetzstellenverteilung,
    kKennlinie,
    kFestkennlinie,
    kGruppenkennlinie,
    kKennfeld,
    kFestkennfeld,
    kGruppenkennfeld,
    kTextstring,
};

/// All kinds, in the order of export.
inline constexpr std::array kKinds = {
    Kind::kFestwert,   Kind::kFestwerteblock, Kind::kStuetzstellenverteilung,
    Kind::kKennlinie,  Kind::kFestkennlinie,  Kind::kGruppenkennlinie,
    Kind::kKennfeld,   Kind::kFestkennfeld,   Kind::kGruppenkennfeld,
    Kind::kTextstring,
};

/// The keyword of a kind, such as L"KENNFELD"; empty for a number that is no kind.
DCM_API std::wstring_view KeywordOf(Kind kind) noexcept;
/// The kind of a keyword, in letters of any case; none for any other word.
DCM_API std::optional<Kind> KindOf(std::wstring_view keyword) noexcept;

/// One axis of a curve or map, or the points of a distribution.
struct Axis
{
    /// Text of EINHEIT_X or EINHEIT_Y, not interpreted; empty for none.
    CString unit;
    /// Name of the STUETZSTELLENVERTEILUNG that the axis shares; empty for none.
    CString distribution;
    /// The points in their order, each a number (`VT_R8`), a text (`VT_BSTR`) or nothing
    /// (`VT_EMPTY`). Nothing is what the block counts but never writes, see `DCMKennlinie`: a point
    /// that is of another type than those before it, or that a host stored under another tag.
    std::vector<CComVariant> points;
};

/// One named block of any kind. It owns all that it holds and is not tied to a document.
struct Parameter
{
    /// The kind of the block.
    Kind kind = Kind::kFestwert;
    /// The name, and the texts of LANGNAME, DISPLAYNAME and FUNKTION; empty for none.
    CString name;
    CString langname;
    CString displayname;
    CString function;
    /// The axes as far as the kind has them: curves have x, maps x and y, and the points of a
    /// distribution are x. What a kind does not have is empty, and `Add` ignores it.
    Axis x;
    Axis y;
    /// Unit of the values; empty for none. Distributions have none.
    CString unit;
    /// The values row after row, one row for each point of y: the value at point i of x and point
    /// j of y has the index j * columns + i. A FESTWERT or TEXTSTRING has one, or none when the
    /// block has no value; a distribution has none. A FESTWERTEBLOCK that holds numbers and texts
    /// gives its numbers first, then its texts. Values are numbers, texts or nothing as points are;
    /// a number that a FESTWERT holds under any other tag is `VT_R8` here.
    std::vector<CComVariant> values;
    /// Values in a row. For a map the number of points of x, for a FESTWERTEBLOCK in rows its X
    /// count, otherwise the number of values. The values need not fill their last row. `Add` does
    /// not look at it.
    std::size_t columns = 0;
    /// The counts of curves and maps as their first line declares them, whatever the number of
    /// points, and the X and Y count of a FESTWERTEBLOCK in rows; 0 for none. `Add` stores them:
    /// a count that is not above 0 leaves the first line to the number of points.
    std::int32_t countX = 0;
    std::int32_t countY = 0;
};

/// One block as a parameter: a copy. `distribution` is the name that is set for export if there is
/// one, otherwise the name that was read. The kind is that of the keyword which the block writes.
/// The number lists of a curve, which no file holds, are no part of it. Throws only when memory
/// runs out.
DCM_API Parameter ParameterOf(const DCMFestwert& block);
DCM_API Parameter ParameterOf(const DCMFestwerteblock& block);
DCM_API Parameter ParameterOf(const DCMStuetzstellenverteilung& block);
DCM_API Parameter ParameterOf(const DCMKennlinie& block);
DCM_API Parameter ParameterOf(const DCMKennfeld& block);

/// All blocks of a document in the order of export. Throws only when memory runs out.
DCM_API std::vector<Parameter> ParametersOf(const DCMConverter& document);
/// The same by moving the content out of the blocks, without copying points and values. The
/// document has no blocks afterwards; its comment, header text and version stay. When memory runs
/// out, the failure is raised and the content of the document is not defined.
DCM_API std::vector<Parameter> ParametersOf(DCMConverter&& document);

/// Appends the parameter to the document as a block of its kind. Distribution names are set for
/// export, so that they are written. A number under any tag, such as the `VT_I4` of an int, becomes
/// a `VT_R8`; what is neither number nor text becomes a value or point without content, and 0.0 in
/// a FESTWERTEBLOCK. A FESTWERT or TEXTSTRING takes the first value. A curve or map holds numbers
/// or texts in each array: from the first of the other type on, its points are not written.
/// Nothing is checked: names may repeat and values need not fill their rows. When memory runs out,
/// the failure is thrown and the document is as it was before.
DCM_API void Add(DCMConverter& document, const Parameter& parameter);
/// The same by moving points and values; the parameter has no defined content afterwards.
DCM_API void Add(DCMConverter& document, Parameter&& parameter);

/// The header text for a comment: its lines with "* " before each, so that an import of the
/// exported file finds the same comment. `out.SetHeader(dcm::HeaderOfComment(in.GetComment()))`
/// carries the comment of a file over. A later line that is a row of asterisks stays as it is, and
/// a "* " within a line is written as "**  ". An empty comment gives an empty text. Throws only
/// when memory runs out.
DCM_API CString HeaderOfComment(const CString& comment);

/// What `ForEach` calls for each block. The blocks are those of the document, valid during the
/// call alone. A member that is not overridden does nothing; a class that overrides some of them
/// says `using BlockVisitor::Visit;` to keep the others visible.
class DCM_API BlockVisitor
{
public:
    /// A visitor has no content of its own.
    BlockVisitor() = default;
    BlockVisitor(const BlockVisitor&) = default;
    BlockVisitor& operator=(const BlockVisitor&) = default;
    virtual ~BlockVisitor();

    /// One block of the class.
    virtual void Visit(const DCMFestwert& block);
    virtual void Visit(const DCMFestwerteblock& block);
    virtual void Visit(const DCMStuetzstellenverteilung& block);
    virtual void Visit(const DCMKennlinie& block);
    virtual void Visit(const DCMFestkennlinie& block);
    virtual void Visit(const DCMGruppenkennlinie& block);
    virtual void Visit(const DCMKennfeld& block);
    virtual void Visit(const DCMFestkennfeld& block);
    virtual void Visit(const DCMGruppenkennfeld& block);
    virtual void Visit(const DCMTextstring& block);
};

/// Visits all blocks of a document in the order of export, without copying them. The document must
/// not be changed meanwhile. What the visitor throws ends the visit and is passed on.
DCM_API void ForEach(const DCMConverter& document, BlockVisitor& visitor);

/// The same with a function that takes a block of any class, such as
/// `[](const auto& block) { std::wcout << block.GetName() << L'\n'; }`.
template <class Function>
requires(!std::is_base_of_v<BlockVisitor, std::remove_cvref_t<Function>>) void ForEach(
    const DCMConverter& document, Function&& function)
{
    class Visitor final : public BlockVisitor
    {
    public:
        explicit Visitor(Function& f) : m_function(f) {}
        void Visit(const DCMFestwert& block) override { m_function(block); }
        void Visit(const DCMFestwerteblock& block) override { m_function(block); }
        void Visit(const DCMStuetzstellenverteilung& block) override { m_function(block); }
        void Visit(const DCMKennlinie& block) override { m_function(block); }
        void Visit(const DCMFestkennlinie& block) override { m_function(block); }
        void Visit(const DCMGruppenkennlinie& block) override { m_function(block); }
        void Visit(const DCMKennfeld& block) override { m_function(block); }
        void Visit(const DCMFestkennfeld& block) override { m_function(block); }
        void Visit(const DCMGruppenkennfeld& block) override { m_function(block); }
        void Visit(const DCMTextstring& block) override { m_function(block); }

    private:
        Function& m_function;
    };
    Visitor visitor(function);
    ForEach(document, static_cast<BlockVisitor&>(visitor));
}

} // namespace dcm
