// Compares copies of documents and of their lists with copies of the same payload: lists of blocks
// with only the same texts and vectors of 16-byte values.

#include "benchmarks/contestant.h"
#include "dcm/library/dcm.h"

#include <array>
#include <list>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>

namespace dcm::bench {
namespace {

struct PayloadValue
{
    std::uint64_t tag;
    double value;
};
static_assert(sizeof(PayloadValue) == 16);

/// The texts of a block, in memory of just their size.
template <std::size_t N>
std::array<CString, N> TextsOf(const Block& block)
{
    std::array<CString, N> texts;
    auto* next = texts.begin();
    for (const std::string* text : {&block.name, &block.langname, &block.function, &block.unitX,
                                    &block.unitY, &block.unitW}) {
        if (!text->empty())
            *next++ = CString(text->c_str());
    }
    return texts;
}

struct SinglePayload
{
    explicit SinglePayload(const Block& block)
        : texts(TextsOf<4>(block)), value{VT_R8, block.values.front()}
    {}

    std::array<CString, 4> texts;
    PayloadValue value;
};

struct TextPayload
{
    explicit TextPayload(const Block& block)
        : texts(TextsOf<3>(block)), value(CString(block.text.c_str()).View())
    {}

    std::array<CString, 3> texts;
    /// Each copy owns its value.
    std::wstring value;
};

template <std::size_t TextCount, std::size_t ArrayCount>
struct ArrayPayload
{
    explicit ArrayPayload(const Block& block) : texts(TextsOf<TextCount>(block))
    {
        auto* next = arrays.begin();
        for (const auto* numbers : {&block.x, &block.y, &block.values}) {
            if (numbers->empty())
                continue;
            for (const double number : *numbers)
                next->push_back({VT_R8, number});
            next->shrink_to_fit();
            ++next;
        }
    }

    std::array<CString, TextCount> texts;
    std::array<std::vector<PayloadValue>, ArrayCount> arrays;
};

using ListPayload = ArrayPayload<4, 1>;
using CurvePayload = ArrayPayload<5, 2>;
using MapPayload = ArrayPayload<6, 3>;

template <class Payload>
std::list<Payload> PayloadOf(const Data& data, std::string_view keyword)
{
    std::list<Payload> payload;
    for (const Block& block : data.blocks) {
        if (block.keyword == keyword)
            payload.emplace_back(block);
    }
    return payload;
}

const auto kDocumentPayload = [](const Data& data) {
    return std::tuple(
        PayloadOf<SinglePayload>(data, "FESTWERT"), PayloadOf<ListPayload>(data, "FESTWERTEBLOCK"),
        PayloadOf<ListPayload>(data, "STUETZSTELLENVERTEILUNG"),
        PayloadOf<CurvePayload>(data, "KENNLINIE"), PayloadOf<CurvePayload>(data, "FESTKENNLINIE"),
        PayloadOf<CurvePayload>(data, "GRUPPENKENNLINIE"), PayloadOf<MapPayload>(data, "KENNFELD"),
        PayloadOf<MapPayload>(data, "FESTKENNFELD"), PayloadOf<MapPayload>(data, "GRUPPENKENNFELD"),
        PayloadOf<TextPayload>(data, "TEXTSTRING"));
};

/// Times making a copy, without releasing it.
template <class Copy>
Outcome TimedCopy(Copy copy)
{
    Outcome outcome;
    const auto made = Timed(outcome.seconds, copy);
    benchmark::DoNotOptimize(&made);
    return outcome;
}

/// Times copies of a payload, which is made at the first call.
template <class Make>
auto CopyOfPayload(Make make)
{
    return [make, payload = std::optional<decltype(make(Data()))>()](const Stage& stage) mutable {
        if (!payload)
            payload = make(stage.data);
        return TimedCopy([&] { return *payload; });
    };
}

/// Both contestants for one Get, which returns a copy.
template <class Payload, class List>
void CompareGet(std::string_view keyword, List (DCMConverter::*get)() const)
{
    const std::string name = "get-" + std::string(keyword);
    Contestants().push_back({name + "/dcm", [get](const Stage& stage) {
                                 return TimedCopy([&] { return (stage.document.*get)(); });
                             }});
    Contestants().push_back({name + "/payload", CopyOfPayload([keyword](const Data& data) {
                                 return PayloadOf<Payload>(data, keyword);
                             })});
}

const TakesPart kCopy("copy/dcm", [](const Stage& stage) {
    return TimedCopy([&] { return DCMConverter(stage.document); });
});

const TakesPart kCopyPayload("copy/payload", CopyOfPayload(kDocumentPayload));

const bool kCompared = [] {
    CompareGet<SinglePayload>("FESTWERT", &DCMConverter::GetFestwerte);
    CompareGet<ListPayload>("FESTWERTEBLOCK", &DCMConverter::GetFestwerteblock);
    CompareGet<ListPayload>("STUETZSTELLENVERTEILUNG", &DCMConverter::GetStuetzstellenverteilung);
    CompareGet<CurvePayload>("KENNLINIE", &DCMConverter::GetKennlinie);
    CompareGet<CurvePayload>("FESTKENNLINIE", &DCMConverter::GetFestkennlinie);
    CompareGet<CurvePayload>("GRUPPENKENNLINIE", &DCMConverter::GetGruppenkennlinie);
    CompareGet<MapPayload>("KENNFELD", &DCMConverter::GetKennfeld);
    CompareGet<MapPayload>("FESTKENNFELD", &DCMConverter::GetFestkennfeld);
    CompareGet<MapPayload>("GRUPPENKENNFELD", &DCMConverter::GetGruppenkennfeld);
    CompareGet<TextPayload>("TEXTSTRING", &DCMConverter::GetTextstring);
    return true;
}();

} // namespace
} // namespace dcm::bench
