#include "dcm/library/parameter.h"

#include "dcm/converter/dcmconverter.h"
#include "dcm/converter/document_io.h"
#include "dcm/elements/block_fields.h"
#include "dcm/elements/block_io.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/variant_number.h"
#include "dcm/platform/text.h"

#include <algorithm>
#include <initializer_list>
#include <list>
#include <tuple>
#include <utility>

namespace dcm {

namespace {

/// The keywords of the kinds, in the order of `kKinds`.
constexpr std::array<std::wstring_view, kKinds.size()> kKeywords = {
    keyword::kFestwert,   keyword::kFestwerteblock, keyword::kStuetzstellenverteilung,
    keyword::kKennlinie,  keyword::kFestkennlinie,  keyword::kGruppenkennlinie,
    keyword::kKennfeld,   keyword::kFestkennfeld,   keyword::kGruppenkennfeld,
    keyword::kTextstring,
};

constexpr std::wstring_view kCommentMark = L"* ";

Parameter TakeTexts(Kind kind, DCMBaseType& block)
{
    Parameter parameter;
    parameter.kind = kind;
    parameter.name = std::move(block.GetName());
    parameter.langname = std::move(block.GetLangname());
    parameter.displayname = std::move(block.GetDisplayname());
    parameter.function = std::move(block.GetFunction());
    return parameter;
}

void PutTexts(Parameter& parameter, DCMBaseType& block)
{
    block.GetName() = std::move(parameter.name);
    block.GetLangname() = std::move(parameter.langname);
    block.GetDisplayname() = std::move(parameter.displayname);
    block.GetFunction() = std::move(parameter.function);
}

/// The one of a family's kinds that the block writes; the first when a host's class has a keyword
/// of its own.
Kind KindOf(const CString& keyword, std::initializer_list<Kind> family)
{
    const auto* const kind =
        std::find_if(family.begin(), family.end(), [&](Kind k) { return keyword == KeywordOf(k); });
    return kind == family.end() ? *family.begin() : *kind;
}

/// Turns a value into what a parameter holds: its number, its text, or nothing.
void MakePlain(CComVariant& value)
{
    if (value.vt == VT_R8 || value.vt == VT_BSTR)
        return;
    const std::optional<double> number = NumberOf(value);
    value = number ? CComVariant(*number) : CComVariant();
}

/// Takes the points, without the value of those that the block does not write.
std::vector<CComVariant> TakePoints(const PointArray& array)
{
    // Before the first point of the type there are only empty ones.
    if (array.type != VT_R8 && array.type != VT_BSTR) {
        for (CComVariant& point : array.points) {
            if (point.vt != VT_R8 && point.vt != VT_BSTR)
                point = CComVariant();
        }
    }
    return std::move(array.points);
}

void PutPoints(std::vector<CComVariant>& points, const PointArray& array)
{
    std::for_each(points.begin(), points.end(), MakePlain);
    array.points = std::move(points);
    SetTypeOfPoints(array);
}

Axis TakeAxis(CString& unit, const AxisFields& axis)
{
    return {std::move(unit), std::move(axis.written.IsEmpty() ? axis.read : axis.written),
            TakePoints(axis.points)};
}

void PutAxis(Axis& axis, CString& unit, const AxisFields& fields)
{
    unit = std::move(axis.unit);
    fields.written = std::move(axis.distribution);
    PutPoints(axis.points, fields.points);
}

// ---- Parameters of blocks that lose their content -----------------------------------------------

Parameter Take(DCMFestwert& block)
{
    const ValueFields fields = BlockIo::FieldsOf(block);
    Parameter parameter =
        TakeTexts(KindOf(fields.keyword, {Kind::kFestwert, Kind::kTextstring}), block);
    parameter.unit = std::move(block.GetUnit());
    MakePlain(fields.value);
    if (fields.value.vt != VT_EMPTY)
        parameter.values.push_back(std::move(fields.value));
    parameter.columns = parameter.values.size();
    return parameter;
}

Parameter Take(DCMFestwerteblock& block)
{
    const ListFields fields = BlockIo::FieldsOf(block);
    Parameter parameter = TakeTexts(Kind::kFestwerteblock, block);
    parameter.unit = std::move(block.GetUnit());
    parameter.countX = block.GetXValueCount();
    parameter.countY = block.GetYValueCount();
    parameter.values.reserve(fields.numbers.size() + fields.texts.size());
    parameter.values.assign(fields.numbers.begin(), fields.numbers.end());
    parameter.values.insert(parameter.values.end(), fields.texts.begin(), fields.texts.end());
    const bool hasRows = parameter.countX > 0 && parameter.countY > 0;
    parameter.columns =
        hasRows ? static_cast<std::size_t>(parameter.countX) : parameter.values.size();
    return parameter;
}

Parameter Take(DCMStuetzstellenverteilung& block)
{
    Parameter parameter = TakeTexts(Kind::kStuetzstellenverteilung, block);
    parameter.x.unit = std::move(block.GetUnit());
    parameter.x.points = TakePoints(BlockIo::FieldsOf(block).points);
    return parameter;
}

Parameter Take(DCMKennlinie& block)
{
    const CurveFields fields = BlockIo::FieldsOf(block);
    Parameter parameter = TakeTexts(
        KindOf(fields.keyword, {Kind::kKennlinie, Kind::kFestkennlinie, Kind::kGruppenkennlinie}),
        block);
    parameter.x = TakeAxis(block.GetUnit_X(), fields.x);
    parameter.unit = std::move(block.GetUnit_W());
    parameter.values = TakePoints(fields.values);
    parameter.countX = block.GetAxisLenghtX();
    parameter.columns = parameter.values.size();
    return parameter;
}

Parameter Take(DCMKennfeld& block)
{
    const MapFields fields = BlockIo::FieldsOf(block);
    Parameter parameter = TakeTexts(
        KindOf(fields.keyword, {Kind::kKennfeld, Kind::kFestkennfeld, Kind::kGruppenkennfeld}),
        block);
    parameter.x = TakeAxis(block.GetUnit_X(), fields.x);
    parameter.y = TakeAxis(block.GetUnit_Y(), fields.y);
    parameter.unit = std::move(block.GetUnit_W());
    parameter.values = TakePoints(fields.values);
    parameter.countX = block.GetAxisLenghtX();
    parameter.countY = block.GetAxisLenghtY();
    parameter.columns = parameter.x.points.size();
    return parameter;
}

template <class Block>
Parameter TakeCopy(const Block& block)
{
    Block copy(block);
    return Take(copy);
}

// ---- Blocks of parameters that lose their content -----------------------------------------------

void Put(Parameter& parameter, DCMFestwert& block)
{
    block.GetUnit() = std::move(parameter.unit);
    if (parameter.values.empty())
        return;
    MakePlain(parameter.values.front());
    BlockIo::FieldsOf(block).value = std::move(parameter.values.front());
}

void Put(Parameter& parameter, DCMFestwerteblock& block)
{
    block.GetUnit() = std::move(parameter.unit);
    block.SetXValueCount(parameter.countX);
    block.SetYValueCount(parameter.countY);
    const ListFields fields = BlockIo::FieldsOf(block);
    const auto texts = std::count_if(parameter.values.begin(), parameter.values.end(),
                                     [](const CComVariant& value) { return value.vt == VT_BSTR; });
    fields.numbers.reserve(parameter.values.size() - static_cast<std::size_t>(texts));
    for (const CComVariant& value : parameter.values) {
        if (value.vt == VT_BSTR) {
            fields.texts.emplace_back(CComVariant::TextOf(value));
        } else {
            fields.numbers.push_back(NumberOf(value).value_or(0.0));
        }
    }
}

void Put(Parameter& parameter, DCMStuetzstellenverteilung& block)
{
    block.GetUnit() = std::move(parameter.x.unit);
    PutPoints(parameter.x.points, BlockIo::FieldsOf(block).points);
}

void Put(Parameter& parameter, DCMKennlinie& block)
{
    const CurveFields fields = BlockIo::FieldsOf(block);
    PutAxis(parameter.x, block.GetUnit_X(), fields.x);
    block.GetUnit_W() = std::move(parameter.unit);
    PutPoints(parameter.values, fields.values);
    block.SetAxisLenghtX(parameter.countX);
}

void Put(Parameter& parameter, DCMKennfeld& block)
{
    const MapFields fields = BlockIo::FieldsOf(block);
    PutAxis(parameter.x, block.GetUnit_X(), fields.x);
    PutAxis(parameter.y, block.GetUnit_Y(), fields.y);
    block.GetUnit_W() = std::move(parameter.unit);
    PutPoints(parameter.values, fields.values);
    block.SetAxisLenghtX(parameter.countX);
    block.SetAxisLenghtY(parameter.countY);
}

/// Appends the parameter as a block when it is complete.
template <class Block>
void Append(Parameter& parameter, std::list<Block>& blocks)
{
    std::list<Block> fresh(1);
    PutTexts(parameter, fresh.front());
    Put(parameter, fresh.front());
    blocks.splice(blocks.end(), fresh);
}

std::size_t CountOfBlocks(const DCMConverter& document)
{
    return std::apply([](const auto&... lists) { return (lists.size() + ...); },
                      DocumentIo::Lists(document));
}

} // namespace

std::wstring_view KeywordOf(Kind kind) noexcept
{
    const auto index = static_cast<std::size_t>(kind);
    return index < kKeywords.size() ? kKeywords[index] : std::wstring_view();
}

std::optional<Kind> KindOf(std::wstring_view keyword) noexcept
{
    for (const Kind kind : kKinds) {
        const std::wstring_view own = KeywordOf(kind);
        if (std::equal(keyword.begin(), keyword.end(), own.begin(), own.end(),
                       [](wchar_t a, wchar_t b) { return FoldCase(a) == FoldCase(b); }))
            return kind;
    }
    return std::nullopt;
}

Parameter ParameterOf(const DCMFestwert& block)
{
    return TakeCopy(block);
}

Parameter ParameterOf(const DCMFestwerteblock& block)
{
    return TakeCopy(block);
}

Parameter ParameterOf(const DCMStuetzstellenverteilung& block)
{
    return TakeCopy(block);
}

Parameter ParameterOf(const DCMKennlinie& block)
{
    return TakeCopy(block);
}

Parameter ParameterOf(const DCMKennfeld& block)
{
    return TakeCopy(block);
}

std::vector<Parameter> ParametersOf(const DCMConverter& document)
{
    std::vector<Parameter> parameters;
    parameters.reserve(CountOfBlocks(document));
    ForEach(document, [&](const auto& block) { parameters.push_back(ParameterOf(block)); });
    return parameters;
}

std::vector<Parameter> ParametersOf(DCMConverter&& document)
{
    std::vector<Parameter> parameters;
    parameters.reserve(CountOfBlocks(document));
    const auto takeAll = [&](auto& blocks) {
        for (; !blocks.empty(); blocks.pop_front())
            parameters.push_back(Take(blocks.front()));
    };
    std::apply([&](auto&... lists) { (takeAll(lists), ...); }, DocumentIo::Lists(document));
    return parameters;
}

void Add(DCMConverter& document, const Parameter& parameter)
{
    Add(document, Parameter(parameter));
}

void Add(DCMConverter& document, Parameter&& parameter)
{
    const auto* kind = kKinds.begin();
    const auto add = [&](auto& blocks) {
        if (*kind++ == parameter.kind)
            Append(parameter, blocks);
    };
    std::apply([&](auto&... lists) { (add(lists), ...); }, DocumentIo::Lists(document));
}

CString HeaderOfComment(const CString& comment)
{
    CString header;
    std::wstring_view rest = comment;
    while (!rest.empty()) {
        const std::size_t end = rest.find(L'\n');
        std::wstring_view line = rest.substr(0, end);
        rest.remove_prefix(end == rest.npos ? rest.size() : end + 1);
        // A later line that is a row of asterisks needs no mark: it is read as it is.
        const bool isRead = line.starts_with(L'*') && line.find(kCommentMark) == line.npos;
        if (!header.IsEmpty())
            header += L"\n";
        if (header.IsEmpty() || !isRead)
            header += kCommentMark;
        // A mark within the line is removed by the reader. It gets another one between its two
        // characters, which joins them when it is removed.
        for (std::size_t mark = 0; (mark = line.find(kCommentMark)) != line.npos;) {
            header += line.substr(0, mark + 1);
            header += kCommentMark;
            line.remove_prefix(mark + 1);
        }
        header += line;
    }
    return header;
}

BlockVisitor::~BlockVisitor() = default;

void BlockVisitor::Visit(const DCMFestwert&)
{}

void BlockVisitor::Visit(const DCMFestwerteblock&)
{}

void BlockVisitor::Visit(const DCMStuetzstellenverteilung&)
{}

void BlockVisitor::Visit(const DCMKennlinie&)
{}

void BlockVisitor::Visit(const DCMFestkennlinie&)
{}

void BlockVisitor::Visit(const DCMGruppenkennlinie&)
{}

void BlockVisitor::Visit(const DCMKennfeld&)
{}

void BlockVisitor::Visit(const DCMFestkennfeld&)
{}

void BlockVisitor::Visit(const DCMGruppenkennfeld&)
{}

void BlockVisitor::Visit(const DCMTextstring&)
{}

void ForEach(const DCMConverter& document, BlockVisitor& visitor)
{
    const auto visitAll = [&](const auto& blocks) {
        for (const auto& block : blocks)
            visitor.Visit(block);
    };
    std::apply([&](const auto&... lists) { (visitAll(lists), ...); }, DocumentIo::Lists(document));
}

} // namespace dcm
