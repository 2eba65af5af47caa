// Reads any file, writes it, reads the written file and writes it again. A document that is
// settled, as defined below, gives the same bytes both times.

#include "fuzz/target.h"

#include <algorithm>
#include <cmath>

namespace {

/// Whether the texts are read back unchanged: the reader removes white space and quotes at their
/// ends, a quote after a backslash does not close a text, and `true` and `false` become numbers.
bool AreSettled(std::initializer_list<std::wstring_view> texts)
{
    constexpr std::wstring_view kLost = L" \t\n\v\f\r\"\\";
    return std::all_of(texts.begin(), texts.end(), [&](std::wstring_view text) {
        return text.empty() ||
               (kLost.find(text.front()) == kLost.npos && kLost.find(text.back()) == kLost.npos &&
                text != L"true" && text != L"false");
    });
}

bool IsSettled(const DCMFestwert& block)
{
    CComVariant value;
    Require(block.GetValue(&value) == S_OK && value.vt == block.GetValueType(), "GetValue");
    return AreSettled({block.GetName(), block.GetLangname(), block.GetDisplayname(),
                       block.GetFunction(), block.GetUnit(),
                       value.vt == VT_BSTR ? CComVariant::TextOf(value) : std::wstring_view()});
}

/// An empty text or a quote can join texts. Rows have 15 digits: numbers at the limit of the range
/// are rounded to infinity. Without a name, the count is read as the name.
bool IsSettled(const DCMFestwerteblock& block)
{
    const auto numbers = block.GetDoubleValues();
    const auto texts = block.GetStringValues();
    return (block.GetYValueCount() == 0 || !block.GetName().IsEmpty()) &&
           AreSettled({block.GetName(), block.GetFunction()}) &&
           std::all_of(numbers.begin(), numbers.end(),
                       [](double d) { return std::isinf(d) || std::fabs(d) < 1.797e308; }) &&
           (!numbers.empty() || std::all_of(texts.begin(), texts.end(), [](std::wstring_view t) {
               return !t.empty() && AreSettled({t}) && t.find(L'"') == t.npos;
           }));
}

/// Points of a second type are counted but not written.
bool IsSettled(const DCMStuetzstellenverteilung& block)
{
    return block.GetValueType() != VT_ERROR;
}

bool IsSettled(const DCMKennlinie&)
{
    return true;
}

/// Points of a second type shift the rows. Without a name, a count is read as the name.
bool IsSettled(const DCMKennfeld& block)
{
    return !block.GetName().IsEmpty() && block.GetAxis_XType() != VT_ERROR &&
           block.GetAxis_YType() != VT_ERROR && block.GetValueType() != VT_ERROR;
}

/// Returns whether all blocks are settled. Appends the number of blocks of each kind that is always
/// written; a map with too few values is not.
bool IsSettled(const DCMConverter& document, std::vector<std::size_t>& counts)
{
    bool settled = true;
    test::ForEachKind([&](const char*, auto get, auto) {
        const auto blocks = (document.*get)();
        for (const auto& block : blocks)
            settled = IsSettled(block) && settled;
        if constexpr (!std::is_base_of_v<DCMKennfeld, test::BlockOf<decltype(get)>>)
            counts.push_back(blocks.size());
    });
    return settled;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const CString& file = MemoryFile();
    // A control character at the start chooses a code page other than the default.
    constexpr unsigned pages[] = {1252, 28591, 65001, 932, 500};
    const std::size_t choice = size > 0 && *data < std::size(pages) ? *data : 0;
    if (!test::ChoosePage(pages[choice]))
        return 0;
    std::string_view bytes(reinterpret_cast<const char*>(data), size);
    bytes.remove_prefix(choice > 0 ? 1 : 0);
    std::ofstream(test::PathOf(file), std::ios::binary) << bytes;

    DCMConverter document;
    const HRESULT imported = document.Import(file);
    Require(imported == S_OK || imported == E_UNEXPECTED, "the result of an import");

    std::string before;
    std::vector<std::size_t> countsBefore;
    bool settledBefore = false;
    for (int pass = 0; pass < 3; ++pass) {
        std::vector<std::size_t> counts;
        const bool settled = IsSettled(document, counts);
        const std::string exported = test::ExportBytes(document, file);
        Require(exported != "failed", "an export succeeds");
        Require(pass == 0 || counts == countsBefore, "every block comes back");
        Require(!settledBefore || (settled && exported == before), "a settled document comes back");
        before = exported;
        countsBefore = counts;
        settledBefore = settled;
        document = DCMConverter();
        Require(document.Import(file) == S_OK, "an exported file is read");
    }
    return 0;
}
