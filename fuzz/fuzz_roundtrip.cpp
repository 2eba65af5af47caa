// Any file is read; what is written from it reads back and is written again. A document that is
// settled, in the sense below, gives the same bytes both times.

#include "dcm/library/dcm.h"
#include "dcm/platform/text.h"
#include "fuzz/kinds.h"
#include "fuzz/memory_file.h"
#include "fuzz/target.h"

#include <algorithm>
#include <cmath>
#include <list>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

namespace {

constexpr std::wstring_view kQuotes = L"\"";
constexpr std::wstring_view kWhiteAndQuotes = L" \t\n\v\f\r\"";

/// Whether `text` has none of `lost` at its ends, where the reader would take them off.
bool KeepsEnds(std::wstring_view text, std::wstring_view lost)
{
    return text.empty() ||
           (lost.find(text.front()) == lost.npos && lost.find(text.back()) == lost.npos);
}

/// The reader takes quotes, and then blanks, off a text once: what stands behind them may be
/// quotes or white space again. A text that looks like a truth word becomes a number.
bool IsSettled(const DCMFestwert& block)
{
    CComVariant value;
    Require(block.GetValue(&value) == S_OK && value.vt == block.GetValueType(), "GetValue");
    const std::wstring_view text =
        value.vt == VT_BSTR ? CComVariant::TextOf(value) : std::wstring_view();
    return KeepsEnds(block.GetName(), kWhiteAndQuotes) && KeepsEnds(block.GetLangname(), kQuotes) &&
           KeepsEnds(block.GetDisplayname(), kQuotes) &&
           KeepsEnds(block.GetFunction(), kWhiteAndQuotes) && KeepsEnds(block.GetUnit(), kQuotes) &&
           KeepsEnds(text, kWhiteAndQuotes) && text != L"true" && text != L"false";
}

/// In a list of texts the first and last of a line lose blanks and quotes at their ends, and an
/// empty text, a quote or a backslash in front of one can join texts. Rows have 15 digits: numbers
/// at the limit of the range round up to infinity. Without a name, the count is taken for it.
bool IsSettled(const DCMFestwerteblock& block)
{
    constexpr double kLargestOf15Digits = 1.79769313486231e308;
    const std::list<double> numbers = block.GetDoubleValues();
    const std::list<CString> texts = block.GetStringValues();
    const bool rows = block.GetXValueCount() > 0 && block.GetYValueCount() > 0;
    return (block.GetYValueCount() == 0 || !block.GetName().IsEmpty()) &&
           KeepsEnds(block.GetName(), L" \t\n\v\f\r") &&
           KeepsEnds(block.GetFunction(), kWhiteAndQuotes) &&
           std::all_of(numbers.begin(), numbers.end(),
                       [&](double d) {
                           return !rows || std::isinf(d) || std::fabs(d) <= kLargestOf15Digits;
                       }) &&
           (!numbers.empty() || std::all_of(texts.begin(), texts.end(), [](std::wstring_view t) {
               return !t.empty() && KeepsEnds(t, L" \t\n\v\f\r\\") && t.find(L'"') == t.npos;
           }));
}

/// Points of a second type are counted but not written.
bool IsSettled(const DCMStuetzstellenverteilung& block)
{
    std::vector<CComVariant> values;
    Require(block.GetValues(values) == S_OK, "GetValues");
    return block.GetValueType() != VT_ERROR;
}

bool IsSettled(const DCMKennlinie& block)
{
    std::vector<CComVariant> points;
    Require(block.GetAxis(points) == S_OK && block.GetValues(points) == S_OK, "GetValues");
    return true;
}

/// Points of a second type move the rows. Without a name, a count is taken for it.
bool IsSettled(const DCMKennfeld& block)
{
    std::vector<CComVariant> points;
    Require(block.GetAxis_X(points) == S_OK && block.GetAxis_Y(points) == S_OK &&
                block.GetValues(points) == S_OK,
            "GetValues");
    return !block.GetName().IsEmpty() && block.GetAxis_XType() != VT_ERROR &&
           block.GetAxis_YType() != VT_ERROR && block.GetValueType() != VT_ERROR;
}

/// Looks at every block. Returns whether all are settled, and how many there are of the kinds that
/// are always written: a map with too few values is not.
bool IsSettled(const DCMConverter& document, std::vector<std::size_t>& counts)
{
    bool settled = true;
    ForEachKind([&](auto get, auto) {
        const auto blocks = (document.*get)();
        for (const auto& block : blocks)
            settled = IsSettled(block) && settled;
        if constexpr (!std::is_base_of_v<DCMKennfeld, typename decltype(blocks)::value_type>)
            counts.push_back(blocks.size());
    });
    return settled;
}

/// A control character in front chooses another code page than the usual one.
unsigned TakeCodePage(std::string_view& bytes)
{
    constexpr unsigned pages[] = {1252, 28591, 65001, 932, 500};
    const auto choice = bytes.empty() ? 0U : static_cast<unsigned char>(bytes.front());
    if (choice == 0 || choice >= std::size(pages))
        return pages[0];
    bytes.remove_prefix(1);
    return pages[choice];
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static MemoryFile file;
    std::string_view bytes(reinterpret_cast<const char*>(data), size);
    Require(dcm::SetThreadCodePage(TakeCodePage(bytes)), "the code page is known");
    file.SetBytes(bytes);

    DCMConverter document;
    const HRESULT imported = document.Import(file.Path());
    Require(imported == S_OK || imported == E_UNEXPECTED, "the result of an import");
    Require(document.GetComment().GetLength() <= static_cast<int>(size), "the comment's length");

    std::string before;
    std::vector<std::size_t> countsBefore;
    bool settledBefore = false;
    for (int pass = 0; pass < 3; ++pass) {
        std::vector<std::size_t> counts;
        const bool settled = IsSettled(document, counts);
        Require(document.Export(file.Path()) == S_OK, "an export succeeds");
        const std::string exported = file.Bytes();
        Require(pass == 0 || counts == countsBefore, "every block comes back");
        Require(!settledBefore || settled, "a settled document stays settled");
        Require(!settledBefore || exported == before, "a settled document comes back");
        // Once it has come back it comes back for good.
        if (settledBefore)
            break;
        before = exported;
        countsBefore = counts;
        settledBefore = settled;
        DCMConverter next;
        Require(next.Import(file.Path()) == S_OK, "an exported file is read");
        DCMConverter copy(next);
        document = copy;
    }
    return 0;
}
