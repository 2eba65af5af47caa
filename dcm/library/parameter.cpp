#include "dcm/library/parameter.h"

#include "dcm/converter/dcmconverter.h"
#include "dcm/elements/keywords.h"
#include "dcm/elements/variant_number.h"
#include "dcm/platform/text.h"

#include <algorithm>
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

template <class Block>
Parameter Named(Kind kind, const Block& block)
{
    Parameter parameter;
    parameter.kind = kind;
    parameter.name = block.GetName();
    parameter.langname = block.GetLangname();
    parameter.displayname = block.GetDisplayname();
    parameter.function = block.GetFunction();
    return parameter;
}

template <class Block>
Block BlockOf(const Parameter& parameter)
{
    Block block;
    block.SetName(parameter.name);
    block.SetLangname(parameter.langname);
    block.SetDisplayname(parameter.displayname);
    block.SetFunction(parameter.function);
    return block;
}

/// What a parameter holds of a value: the number that it stands for, a text, or nothing.
CComVariant Plain(const CComVariant& value)
{
    if (value.vt == VT_BSTR)
        return value;
    const std::optional<double> number = NumberOf(value);
    return number ? CComVariant(*number) : CComVariant();
}

/// Takes the value away from points that the block does not write.
void DropUnwritten(std::vector<CComVariant>& points)
{
    for (CComVariant& point : points) {
        if (point.vt != VT_R8 && point.vt != VT_BSTR)
            point = CComVariant();
    }
}

template <class Block>
void AddDistribution(DCMConverter& document, const Parameter& parameter)
{
    auto block = BlockOf<Block>(parameter);
    block.SetUnit(parameter.x.unit);
    for (const CComVariant& point : parameter.x.points)
        block.AddValue(Plain(point));
    document.AddStuetzstellenverteilung(std::move(block));
}

template <class Block>
Block ValueBlock(const Parameter& parameter)
{
    auto block = BlockOf<Block>(parameter);
    block.SetUnit(parameter.unit);
    if (!parameter.values.empty())
        block.SetValue(Plain(parameter.values.front()));
    return block;
}

DCMFestwerteblock ListBlock(const Parameter& parameter)
{
    auto block = BlockOf<DCMFestwerteblock>(parameter);
    block.SetUnit(parameter.unit);
    block.SetXValueCount(parameter.countX);
    block.SetYValueCount(parameter.countY);
    for (const CComVariant& value : parameter.values) {
        if (value.vt == VT_BSTR) {
            block.AddValue(CString(CComVariant::TextOf(value)));
        } else {
            block.AddValue(NumberOf(value).value_or(0.0));
        }
    }
    return block;
}

template <class Block>
Block Curve(const Parameter& parameter)
{
    auto block = BlockOf<Block>(parameter);
    block.SetUnit_X(parameter.x.unit);
    block.SetUnit_W(parameter.unit);
    block.SetSharedAxisUniqueName(parameter.x.distribution);
    block.SetAxisLenghtX(parameter.countX);
    for (const CComVariant& point : parameter.x.points)
        block.AddAxis(Plain(point));
    for (const CComVariant& value : parameter.values)
        block.AddValue(Plain(value));
    return block;
}

template <class Block>
Block Map(const Parameter& parameter)
{
    auto block = BlockOf<Block>(parameter);
    block.SetUnit_X(parameter.x.unit);
    block.SetUnit_Y(parameter.y.unit);
    block.SetUnit_W(parameter.unit);
    block.SetSharedXAxisUniqueName(parameter.x.distribution);
    block.SetSharedYAxisUniqueName(parameter.y.distribution);
    block.SetAxisLenghtX(parameter.countX);
    block.SetAxisLenghtY(parameter.countY);
    for (const CComVariant& point : parameter.x.points)
        block.AddAxisX(Plain(point));
    for (const CComVariant& point : parameter.y.points)
        block.AddAxisY(Plain(point));
    for (const CComVariant& value : parameter.values)
        block.AddValue(Plain(value));
    return block;
}

template <class Blocks>
void VisitAll(const Blocks& blocks, BlockVisitor& visitor)
{
    for (const auto& block : blocks)
        visitor.Visit(block);
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
        if (std::ranges::equal(keyword, KeywordOf(kind), {}, FoldCase, FoldCase))
            return kind;
    }
    return std::nullopt;
}

Parameter ParameterOf(const DCMFestwert& block)
{
    const bool text = dynamic_cast<const DCMTextstring*>(&block) != nullptr;
    Parameter parameter = Named(text ? Kind::kTextstring : Kind::kFestwert, block);
    parameter.unit = block.GetUnit();
    CComVariant value;
    block.GetValue(&value);
    value = Plain(value);
    if (value.vt != VT_EMPTY)
        parameter.values.push_back(std::move(value));
    parameter.columns = parameter.values.size();
    return parameter;
}

Parameter ParameterOf(const DCMFestwerteblock& block)
{
    Parameter parameter = Named(Kind::kFestwerteblock, block);
    parameter.unit = block.GetUnit();
    parameter.countX = block.GetXValueCount();
    parameter.countY = block.GetYValueCount();
    for (const double number : block.GetDoubleValues())
        parameter.values.emplace_back(number);
    for (const CString& text : block.GetStringValues())
        parameter.values.emplace_back(text);
    const bool rows = parameter.countX > 0 && parameter.countY > 0;
    parameter.columns = rows ? static_cast<std::size_t>(parameter.countX) : parameter.values.size();
    return parameter;
}

Parameter ParameterOf(const DCMStuetzstellenverteilung& block)
{
    Parameter parameter = Named(Kind::kStuetzstellenverteilung, block);
    parameter.x.unit = block.GetUnit();
    block.GetValues(parameter.x.points);
    DropUnwritten(parameter.x.points);
    return parameter;
}

Parameter ParameterOf(const DCMKennlinie& block)
{
    Kind kind = Kind::kKennlinie;
    if (dynamic_cast<const DCMFestkennlinie*>(&block) != nullptr) {
        kind = Kind::kFestkennlinie;
    } else if (dynamic_cast<const DCMGruppenkennlinie*>(&block) != nullptr) {
        kind = Kind::kGruppenkennlinie;
    }
    Parameter parameter = Named(kind, block);
    parameter.x.unit = block.GetUnit_X();
    parameter.x.distribution = block.GetStuetzstellenverteilung();
    parameter.unit = block.GetUnit_W();
    parameter.countX = block.GetAxisLenghtX();
    block.GetAxis(parameter.x.points);
    block.GetValues(parameter.values);
    DropUnwritten(parameter.x.points);
    DropUnwritten(parameter.values);
    parameter.columns = parameter.values.size();
    return parameter;
}

Parameter ParameterOf(const DCMKennfeld& block)
{
    Kind kind = Kind::kKennfeld;
    if (dynamic_cast<const DCMFestkennfeld*>(&block) != nullptr) {
        kind = Kind::kFestkennfeld;
    } else if (dynamic_cast<const DCMGruppenkennfeld*>(&block) != nullptr) {
        kind = Kind::kGruppenkennfeld;
    }
    Parameter parameter = Named(kind, block);
    parameter.x.unit = block.GetUnit_X();
    parameter.x.distribution = block.GetStuetzstellenverteilungX();
    parameter.y.unit = block.GetUnit_Y();
    parameter.y.distribution = block.GetStuetzstellenverteilungY();
    parameter.unit = block.GetUnit_W();
    parameter.countX = block.GetAxisLenghtX();
    parameter.countY = block.GetAxisLenghtY();
    block.GetAxis_X(parameter.x.points);
    block.GetAxis_Y(parameter.y.points);
    block.GetValues(parameter.values);
    DropUnwritten(parameter.x.points);
    DropUnwritten(parameter.y.points);
    DropUnwritten(parameter.values);
    parameter.columns = parameter.x.points.size();
    return parameter;
}

std::vector<Parameter> ParametersOf(const DCMConverter& document)
{
    std::vector<Parameter> parameters;
    ForEach(document, [&](const auto& block) { parameters.push_back(ParameterOf(block)); });
    return parameters;
}

std::vector<Parameter> ParametersOf(DCMConverter&& document)
{
    return ParametersOf(std::as_const(document));
}

void Add(DCMConverter& document, const Parameter& parameter)
{
    switch (parameter.kind) {
    case Kind::kFestwert:
        document.AddFestwert(ValueBlock<DCMFestwert>(parameter));
        break;
    case Kind::kFestwerteblock:
        document.AddFestwerteblock(ListBlock(parameter));
        break;
    case Kind::kStuetzstellenverteilung:
        AddDistribution<DCMStuetzstellenverteilung>(document, parameter);
        break;
    case Kind::kKennlinie:
        document.AddKennlinie(Curve<DCMKennlinie>(parameter));
        break;
    case Kind::kFestkennlinie:
        document.AddFestkennlinie(Curve<DCMFestkennlinie>(parameter));
        break;
    case Kind::kGruppenkennlinie:
        document.AddGruppenkennlinie(Curve<DCMGruppenkennlinie>(parameter));
        break;
    case Kind::kKennfeld:
        document.AddKennfeld(Map<DCMKennfeld>(parameter));
        break;
    case Kind::kFestkennfeld:
        document.AddFestkennfeld(Map<DCMFestkennfeld>(parameter));
        break;
    case Kind::kGruppenkennfeld:
        document.AddGruppenkennfeld(Map<DCMGruppenkennfeld>(parameter));
        break;
    case Kind::kTextstring:
        document.AddTextstring(ValueBlock<DCMTextstring>(parameter));
        break;
    }
}

void Add(DCMConverter& document, Parameter&& parameter)
{
    Add(document, std::as_const(parameter));
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
    VisitAll(document.GetFestwerte(), visitor);
    VisitAll(document.GetFestwerteblock(), visitor);
    VisitAll(document.GetStuetzstellenverteilung(), visitor);
    VisitAll(document.GetKennlinie(), visitor);
    VisitAll(document.GetFestkennlinie(), visitor);
    VisitAll(document.GetGruppenkennlinie(), visitor);
    VisitAll(document.GetKennfeld(), visitor);
    VisitAll(document.GetFestkennfeld(), visitor);
    VisitAll(document.GetGruppenkennfeld(), visitor);
    VisitAll(document.GetTextstring(), visitor);
}

} // namespace dcm
