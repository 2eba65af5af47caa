#include "bindings/c/handles.h"
#include "bindings/c/result.h"

#include <iterator>
#include <limits>
#include <optional>
#include <utility>
#include <vector>

using namespace dcm::c;
using dcm::Kind;
using dcm::Parameter;

namespace {

using Elements = std::vector<CComVariant>;

bool IsSingle(const Parameter& parameter)
{
    return parameter.kind == Kind::kFestwert || parameter.kind == Kind::kTextstring;
}

bool IsDistribution(const Parameter& parameter)
{
    return parameter.kind == Kind::kStuetzstellenverteilung;
}

bool IsCurve(const Parameter& parameter)
{
    return parameter.kind == Kind::kKennlinie || parameter.kind == Kind::kFestkennlinie ||
           parameter.kind == Kind::kGruppenkennlinie;
}

bool IsMap(const Parameter& parameter)
{
    return parameter.kind == Kind::kKennfeld || parameter.kind == Kind::kFestkennfeld ||
           parameter.kind == Kind::kGruppenkennfeld;
}

/// Where a text of a parameter is: in itself, or in one of its axes.
struct TextField
{
    CString Parameter::*text;
    CString dcm::Axis::*axisText;
    dcm::Axis Parameter::*axis;
};

/// By the constants of the C interface.
constexpr TextField kTexts[] = {
    {&Parameter::name, nullptr, nullptr},
    {&Parameter::langname, nullptr, nullptr},
    {&Parameter::displayname, nullptr, nullptr},
    {&Parameter::function, nullptr, nullptr},
    {&Parameter::unit, nullptr, nullptr},
    {nullptr, &dcm::Axis::unit, &Parameter::x},
    {nullptr, &dcm::Axis::unit, &Parameter::y},
    {nullptr, &dcm::Axis::distribution, &Parameter::x},
    {nullptr, &dcm::Axis::distribution, &Parameter::y},
};
static_assert(std::size(kTexts) == DCM_DISTRIBUTION_Y + 1);

bool IsText(int32_t field)
{
    return field >= DCM_NAME && field <= DCM_DISTRIBUTION_Y;
}

template <class Content>
auto& TextOf(Content& parameter, int32_t field)
{
    const TextField& row = kTexts[field];
    return row.text != nullptr ? parameter.*row.text : parameter.*row.axis.*row.axisText;
}

bool HasText(const Parameter& parameter, int32_t field)
{
    switch (field) {
    case DCM_UNIT:
        return !IsDistribution(parameter);
    case DCM_UNIT_X:
        return IsDistribution(parameter) || IsCurve(parameter) || IsMap(parameter);
    case DCM_DISTRIBUTION_X:
        return IsCurve(parameter) || IsMap(parameter);
    case DCM_UNIT_Y:
    case DCM_DISTRIBUTION_Y:
        return IsMap(parameter);
    default:
        return true;
    }
}

bool IsArray(int32_t array)
{
    return array >= DCM_VALUES && array <= DCM_POINTS_Y;
}

template <class Content>
auto& ElementsOf(Content& parameter, int32_t array)
{
    if (array == DCM_VALUES)
        return parameter.values;
    return array == DCM_POINTS_X ? parameter.x.points : parameter.y.points;
}

/// How many elements blocks of the parameter's kind can have in an array.
std::size_t MostElements(const Parameter& parameter, int32_t array)
{
    constexpr std::size_t any = std::numeric_limits<std::size_t>::max();
    switch (array) {
    case DCM_VALUES:
        return IsDistribution(parameter) ? 0 : IsSingle(parameter) ? 1 : any;
    case DCM_POINTS_X:
        return IsDistribution(parameter) || IsCurve(parameter) || IsMap(parameter) ? any : 0;
    default:
        return IsMap(parameter) ? any : 0;
    }
}

dcm_result FailForKind()
{
    return Fail(DCM_ERROR_ARGUMENT, "A parameter of this kind does not have this or so many.");
}

/// After a change of an array the declared count of an axis would be wrong.
void DropCount(Parameter& parameter, int32_t array)
{
    if (array == DCM_POINTS_X)
        parameter.countX = 0;
    else if (array == DCM_POINTS_Y)
        parameter.countY = 0;
}

/// Stores the element at an index or at the end of the array.
dcm_result Put(Parameter& parameter, int32_t array, std::size_t index, CComVariant&& element)
{
    Elements& elements = ElementsOf(parameter, array);
    if (index > elements.size())
        return FailForIndex();
    if (index < elements.size()) {
        elements[index] = std::move(element);
        return DCM_OK;
    }
    if (index >= MostElements(parameter, array))
        return FailForKind();
    elements.push_back(std::move(element));
    DropCount(parameter, array);
    return DCM_OK;
}

/// Refuses what is no element of an array.
dcm_result CheckElement(const dcm_parameter* parameter, int32_t array, std::size_t index)
{
    if (parameter == nullptr)
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    return index < ElementsOf(parameter->content, array).size() ? DCM_OK : FailForIndex();
}

} // namespace

dcm_result dcm_parameter_kind(const dcm_parameter* parameter, int32_t* kind)
{
    if (parameter == nullptr || kind == nullptr)
        return FailForNull();
    *kind = static_cast<int32_t>(parameter->content.kind);
    return DCM_OK;
}

dcm_result dcm_parameter_get_text(const dcm_parameter* parameter, int32_t field, char* buffer,
                                  size_t size, size_t* length)
{
    if (parameter == nullptr)
        return FailForNull();
    if (!IsText(field))
        return FailForConstant();
    return Try([&]() -> dcm_result {
        return GiveText(TextOf(parameter->content, field), buffer, size, length);
    });
}

dcm_result dcm_parameter_set_text(dcm_parameter* parameter, int32_t field, const char* text,
                                  size_t length)
{
    if (parameter == nullptr)
        return FailForNull();
    if (!IsText(field))
        return FailForConstant();
    if (!HasText(parameter->content, field))
        return FailForKind();
    if (const dcm_result refused = CheckText(text, length))
        return refused;
    return Try([&]() -> dcm_result {
        CString taken = TextFrom(text, length);
        std::optional<NameIndex>& names = parameter->document->names;
        if (field == DCM_NAME && names) {
            NameIndex::node_type entry = names->extract(parameter);
            parameter->content.name = std::move(taken);
            names->insert(std::move(entry));
        } else {
            TextOf(parameter->content, field) = std::move(taken);
        }
        return DCM_OK;
    });
}

dcm_result dcm_parameter_count(const dcm_parameter* parameter, int32_t array, size_t* count)
{
    if (parameter == nullptr || count == nullptr)
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    *count = ElementsOf(parameter->content, array).size();
    return DCM_OK;
}

dcm_result dcm_parameter_columns(const dcm_parameter* parameter, size_t* columns)
{
    if (parameter == nullptr || columns == nullptr)
        return FailForNull();
    const Parameter& content = parameter->content;
    if (IsMap(content))
        *columns = content.x.points.size();
    else if (content.kind == Kind::kFestwerteblock && content.countX > 0 && content.countY > 0)
        *columns = static_cast<size_t>(content.countX);
    else
        *columns = content.values.size();
    return DCM_OK;
}

dcm_result dcm_parameter_get_counts(const dcm_parameter* parameter, int32_t* x, int32_t* y)
{
    if (parameter == nullptr || x == nullptr || y == nullptr)
        return FailForNull();
    *x = parameter->content.countX;
    *y = parameter->content.countY;
    return DCM_OK;
}

dcm_result dcm_parameter_set_counts(dcm_parameter* parameter, int32_t x, int32_t y)
{
    if (parameter == nullptr)
        return FailForNull();
    Parameter& content = parameter->content;
    const bool hasY = IsMap(content) || content.kind == Kind::kFestwerteblock;
    if ((x != 0 && !hasY && !IsCurve(content)) || (y != 0 && !hasY))
        return FailForKind();
    content.countX = x;
    content.countY = y;
    return DCM_OK;
}

dcm_result dcm_parameter_get_numbers(const dcm_parameter* parameter, int32_t array, double* numbers,
                                     size_t size, size_t* count)
{
    if (parameter == nullptr || count == nullptr || (numbers == nullptr && size != 0))
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    const Elements& elements = ElementsOf(parameter->content, array);
    *count = elements.size();
    if (size < elements.size())
        return Fail(DCM_ERROR_SIZE, "There is no room for all numbers.");
    bool allNumbers = true;
    for (const CComVariant& element : elements) {
        const bool isNumber = element.vt == VT_R8;
        allNumbers = allNumbers && isNumber;
        *numbers++ = isNumber ? element.dblVal : std::numeric_limits<double>::quiet_NaN();
    }
    return allNumbers ? DCM_OK : Fail(DCM_ERROR_TYPE, "Some elements are no numbers.");
}

dcm_result dcm_parameter_set_numbers(dcm_parameter* parameter, int32_t array, const double* numbers,
                                     size_t count)
{
    if (parameter == nullptr || (numbers == nullptr && count != 0))
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    if (count > MostElements(parameter->content, array))
        return FailForKind();
    return Try([&]() -> dcm_result {
        Elements fresh;
        fresh.reserve(count);
        for (size_t i = 0; i < count; ++i)
            fresh.emplace_back(numbers[i]);
        Elements& elements = ElementsOf(parameter->content, array);
        if (count != elements.size())
            DropCount(parameter->content, array);
        elements = std::move(fresh);
        return DCM_OK;
    });
}

dcm_result dcm_parameter_element_type(const dcm_parameter* parameter, int32_t array, size_t index,
                                      int32_t* type)
{
    if (type == nullptr)
        return FailForNull();
    if (const dcm_result refused = CheckElement(parameter, array, index))
        return refused;
    const CComVariant& element = ElementsOf(parameter->content, array)[index];
    *type = element.vt == VT_R8     ? DCM_ELEMENT_NUMBER
            : element.vt == VT_BSTR ? DCM_ELEMENT_TEXT
                                    : DCM_ELEMENT_EMPTY;
    return DCM_OK;
}

dcm_result dcm_parameter_get_number(const dcm_parameter* parameter, int32_t array, size_t index,
                                    double* number)
{
    if (number == nullptr)
        return FailForNull();
    if (const dcm_result refused = CheckElement(parameter, array, index))
        return refused;
    const CComVariant& element = ElementsOf(parameter->content, array)[index];
    if (element.vt != VT_R8)
        return Fail(DCM_ERROR_TYPE, "The element is no number.");
    *number = element.dblVal;
    return DCM_OK;
}

dcm_result dcm_parameter_set_number(dcm_parameter* parameter, int32_t array, size_t index,
                                    double number)
{
    if (parameter == nullptr)
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    return Try(
        [&]() -> dcm_result { return Put(parameter->content, array, index, CComVariant(number)); });
}

dcm_result dcm_parameter_get_element_text(const dcm_parameter* parameter, int32_t array,
                                          size_t index, char* buffer, size_t size, size_t* length)
{
    if (const dcm_result refused = CheckElement(parameter, array, index))
        return refused;
    const CComVariant& element = ElementsOf(parameter->content, array)[index];
    if (element.vt != VT_BSTR)
        return Fail(DCM_ERROR_TYPE, "The element is no text.");
    return Try([&]() -> dcm_result {
        return GiveText(CComVariant::TextOf(element), buffer, size, length);
    });
}

dcm_result dcm_parameter_set_element_text(dcm_parameter* parameter, int32_t array, size_t index,
                                          const char* text, size_t length)
{
    if (parameter == nullptr)
        return FailForNull();
    if (!IsArray(array))
        return FailForConstant();
    if (const dcm_result refused = CheckText(text, length))
        return refused;
    return Try([&]() -> dcm_result {
        CComVariant element;
        element.SetText(TextFrom(text, length).View());
        return Put(parameter->content, array, index, std::move(element));
    });
}
