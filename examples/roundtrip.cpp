// roundtrip IN.dcm [OUT.dcm]
// Prints what is in a DCM file, in UTF-8, and writes it again.
#include "dcm/library/dcm.h"

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <iterator>
#include <string>
#include <vector>

namespace {

using Values = std::vector<CComVariant>;

/// The value of a FESTWERT or TEXTSTRING, the values of a block, curve or map, the points of a
/// distribution.
template <class Block>
Values ValuesOf(const Block& block)
{
    Values values;
    if constexpr (requires { block.GetDoubleValues(); }) {
        for (const double number : block.GetDoubleValues())
            values.emplace_back(number);
        for (const CString& text : block.GetStringValues())
            values.emplace_back(text);
    } else if constexpr (requires { block.GetValues(values); }) {
        block.GetValues(values);
    } else {
        block.GetValue(&values.emplace_back());
    }
    return values;
}

template <class Block>
const CString& UnitOf(const Block& block)
{
    if constexpr (requires { block.GetUnit_W(); }) {
        return block.GetUnit_W();
    } else {
        return block.GetUnit();
    }
}

std::string TextOf(const VARIANT& value)
{
    if (value.vt == VT_BSTR)
        return '"' + dcm::ToUtf8(CComVariant::TextOf(value)) + '"';
    if (value.vt != VT_R8)
        return "-";
    char digits[32];
    return {digits, std::to_chars(digits, std::end(digits), value.dblVal).ptr};
}

/// The first values, and the count of all values if there are more.
std::string Summary(const Values& values)
{
    constexpr std::size_t kMostShown = 6;
    std::string summary;
    for (std::size_t i = 0; i < std::min(values.size(), kMostShown); ++i)
        summary += (i == 0 ? "" : "  ") + TextOf(values[i]);
    if (values.size() > kMostShown)
        summary += "  ... (" + std::to_string(values.size()) + ")";
    return summary;
}

/// `text` in UTF-8, padded with blanks to `width` characters.
std::string Column(const CString& text, int width)
{
    const int missing = std::max(width - text.GetLength(), 0);
    return dcm::ToUtf8(text) + std::string(static_cast<std::size_t>(missing), ' ');
}

template <class Blocks>
void Show(const char* kind, const Blocks& blocks)
{
    int nameWidth = 0;
    int unitWidth = 0;
    for (const auto& block : blocks) {
        nameWidth = std::max(nameWidth, block.GetName().GetLength());
        unitWidth = std::max(unitWidth, UnitOf(block).GetLength());
    }
    std::printf("\n%s\n", kind);
    for (const auto& block : blocks) {
        std::printf("  %s  %s  %s\n", Column(block.GetName(), nameWidth).c_str(),
                    Column(UnitOf(block), unitWidth).c_str(), Summary(ValuesOf(block)).c_str());
    }
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 2 && argc != 3) {
        std::fprintf(stderr, "usage: roundtrip IN.dcm [OUT.dcm]\n");
        return 2;
    }

    DCMConverter document;
    if (FAILED(document.Import(dcm::FromUtf8(argv[1])))) {
        std::fprintf(stderr, "roundtrip: cannot read %s\n", argv[1]);
        return 1;
    }

    std::printf("%s", dcm::ToUtf8(document.GetComment()).c_str());
    Show("FESTWERT", document.GetFestwerte());
    Show("FESTWERTEBLOCK", document.GetFestwerteblock());
    Show("STUETZSTELLENVERTEILUNG", document.GetStuetzstellenverteilung());
    Show("KENNLINIE", document.GetKennlinie());
    Show("FESTKENNLINIE", document.GetFestkennlinie());
    Show("GRUPPENKENNLINIE", document.GetGruppenkennlinie());
    Show("KENNFELD", document.GetKennfeld());
    Show("FESTKENNFELD", document.GetFestkennfeld());
    Show("GRUPPENKENNFELD", document.GetGruppenkennfeld());
    Show("TEXTSTRING", document.GetTextstring());

    if (argc == 3 && FAILED(document.Export(dcm::FromUtf8(argv[2])))) {
        std::fprintf(stderr, "roundtrip: cannot write %s\n", argv[2]);
        return 1;
    }
}
