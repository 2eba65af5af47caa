#include "dcm/elements/number.h"

#include "dcm/elements/block_report.h"
#include "dcm/elements/decimal.h"
#include "dcm/elements/exact_decimal.h"
#include "dcm/platform/text.h"
#include "dcm/platform/variant.h"
#include "dcm/platform/word.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <string_view>
#include <vector>

namespace dcm {
namespace {

using namespace std::string_view_literals;

/// The lowest decimal exponent in fixed notation.
constexpr int kFixedMin = -4;

constexpr bool IsDigit(char c)
{
    return c >= '0' && c <= '9';
}

/// Removes a sign from the start of `text`; returns whether it was a minus sign.
bool TakeSign(std::string_view& text)
{
    const bool negative = text.starts_with('-');
    if (negative || text.starts_with('+'))
        text.remove_prefix(1);
    return negative;
}

constexpr std::string_view kInfinityName = "1.#INF";

/// The name of the infinity or not-a-number with these bits, without the sign.
std::string_view SpecialName(std::uint64_t bits)
{
    constexpr std::uint64_t quietBit = 0x0008'0000'0000'0000;
    constexpr std::uint64_t defaultNotANumber = kSignBit | kInfinityBits | quietBit;
    if ((bits & ~kSignBit) == kInfinityBits)
        return kInfinityName;
    if (bits == defaultNotANumber)
        return "1.#IND";
    return (bits & quietBit) != 0 ? "1.#QNAN" : "1.#SNAN";
}

/// Writes "e", a sign and at least three digits.
char* WriteExponent(int exponent, char* to)
{
    to[0] = 'e';
    to[1] = exponent < 0 ? '-' : '+';
    const int size = std::abs(exponent);
    to[2] = static_cast<char>('0' + size / 100);
    to[3] = static_cast<char>('0' + size / 10 % 10);
    to[4] = static_cast<char>('0' + size % 10);
    return to + 5;
}

/// Moves the bytes of `text` from the marked one on up by one, and puts a point before them. `mark`
/// is the lowest bit of a byte, or 0 for no change.
constexpr std::uint64_t InsertPoint(std::uint64_t text, std::uint64_t mark)
{
    const auto before = text & (mark - 1);
    return before | (text ^ before) << 8 | mark * '.';
}

/// The first of seventeen digits, and the other sixteen as the bytes of two words; all as
/// characters.
struct Digits
{
    char first;
    std::uint64_t upper;
    std::uint64_t lower;
};

/// Writes the digits with a point after the first and `point` others, from 0 to 7; below 0, "0."
/// and zeros before the digits. Returns the place of the first digit.
inline char* WriteAroundPoint(const Digits& digits, int point, char* to)
{
    // No branch on the point: it changes from number to number. All digits are written where they
    // are after a point, then the upper ones once more with the point inserted.
    constexpr char zeros[] = {'0', '.', '0', '0', '0', '0', '0', '0'};
    std::memcpy(to, zeros, sizeof zeros);
    const int within = point >= 0 ? 1 : 0;
    to += std::max(1 - point, 1) - within;
    to[0] = digits.first;
    char* const next = to + 1 + within;
    StoreWord(digits.upper, next);
    StoreWord(digits.lower, next + 8);
    StoreWord(InsertPoint(digits.upper, static_cast<std::uint64_t>(within) << (8 * (point & 7))),
              to + 1);
    return to;
}

/// Writes the digits with a point after the first and `point` others, from 8 to 16; "0" follows a
/// point at the end.
void WriteBeforePoint(const Digits& digits, int point, char* to)
{
    to[0] = digits.first;
    StoreWord(digits.upper, to + 1);
    StoreWord(digits.lower, to + 10);
    StoreWord(InsertPoint(digits.lower, point < 16 ? std::uint64_t{1} << (8 * (point - 8)) : 0),
              to + 9);
    if (point == 16) {
        to[17] = '.';
        to[18] = '0';
    }
}

/// The exponent at the start of `text`, "e" included; 0 when there is none.
std::int64_t Exponent(std::string_view text)
{
    if (!text.starts_with('e') && !text.starts_with('E'))
        return 0;
    text.remove_prefix(1);
    const bool negative = TakeSign(text);
    std::int64_t exponent = 0;
    for (std::size_t i = 0; i < text.size() && IsDigit(text[i]); ++i) {
        // No count of digits makes up for more, and it is far from overflow.
        constexpr std::int64_t enough = 100'000'000'000'000'000;
        exponent = std::min(exponent * 10 + (text[i] - '0'), enough);
    }
    return negative ? -exponent : exponent;
}

/// ReadNumber for tokens of every kind and length.
double ReadToken(std::string_view token) noexcept
{
    constexpr double infinity = std::numeric_limits<double>::infinity();
    if (EqualsNoCase(token, kInfinityName))
        return infinity;
    if (token.starts_with('-') && EqualsNoCase(token.substr(1), kInfinityName))
        return -infinity;
    return ReadDecimal(token);
}

constexpr std::array<std::uint64_t, 8> kTens = {1,      10,      100,       1'000,
                                                10'000, 100'000, 1'000'000, 10'000'000};

/// Appends the digits at `at` to `number`, up to eight at a time; returns their end.
inline const char* TakeDigits(const char* at, std::uint64_t& number)
{
    for (;;) {
        const auto bytes = DigitBytes(at);
        const auto others = NotDigits(bytes);
        if (others != 0) {
            // No branch on the count, which changes from number to number.
            const auto size = LowestByteSet(others);
            number = number * kTens[size] + JoinEight(bytes << 8 << (56 - 8 * size));
            return at + size;
        }
        number = number * kTenTo8 + JoinEight(bytes);
        at += 8;
    }
}

/// Whether there are at most 19 digits from `at` to `end`. Leading zeros do not count, unless there
/// are so many that the exponent could overflow.
inline bool FitsInDecimal(const char* at, const char* end)
{
    constexpr std::ptrdiff_t most = 19;
    constexpr std::ptrdiff_t mostWithZeros = 1000;
    if (end - at > most && end - at <= mostWithZeros) {
        while (*at == '0' || *at == '.') {
            ++at;
        }
    }
    return end - at <= most;
}

/// The bytes of a word, with those before the first of `others` moved up by one, so that they
/// overwrite it: if it is the point, the digits are then adjacent.
inline std::uint64_t WithoutFirst(std::uint64_t bytes, std::uint64_t others)
{
    const auto upToFirst = others ^ (others - 1);
    return bytes ^ ((bytes ^ bytes << 8) & upToFirst);
}

/// TakeFixed for a number whose first eight characters are digits.
inline const char* TakeLongInteger(const char* at, Decimal& decimal)
{
    const auto* const start = at;
    at = TakeDigits(at, decimal.digits);
    if (*at == '.') {
        const auto* const fraction = at + 1;
        at = TakeDigits(fraction, decimal.digits);
        decimal.exponent = static_cast<int>(fraction - at);
    }
    return FitsInDecimal(start, at) ? at : nullptr;
}

/// TakeFixed for a number that has a point, at `point`, and seven digits, `digits`, in its first
/// eight characters.
inline const char* TakeLongFraction(const char* at, std::uint64_t digits, std::size_t point,
                                    Decimal& decimal)
{
    const auto seven = JoinEight(digits);
    decimal.digits = seven;
    const auto eight = DigitBytes(at + 8);
    if (NotDigits(eight) == 0) {
        const auto bytes = DigitBytes(at + 16);
        const auto mark = static_cast<unsigned>(std::countr_zero(NotDigits(bytes)));
        if (mark < 5 * 8) {
            // Numbers with all their digits have up to 19, the last 4 of them in this word.
            const auto last = static_cast<std::uint32_t>(bytes << (4 * 8 + kNotDigitBit - mark));
            const std::size_t size = mark / 8;
            decimal.exponent = static_cast<int>(point) - 15 - static_cast<int>(size);
            decimal.digits = (seven * kTenTo8 + JoinEight(eight)) * kTens[size] + JoinFour(last);
            return at + 16 + size;
        }
    }
    const auto* const end = TakeDigits(at + 8, decimal.digits);
    const auto count = end - at - 8;
    const bool fits =
        count <= 12 || (count <= 19 && seven < kTens[static_cast<std::size_t>(19 - count)]);
    decimal.exponent = static_cast<int>(point) - 7 - static_cast<int>(count);
    return fits ? end : nullptr;
}

/// Reads the digits at `at` and a point among them; returns their end, or a null pointer when there
/// is no digit or too many of them.
inline const char* TakeFixed(const char* at, Decimal& decimal)
{
    const auto bytes = DigitBytes(at);
    const auto others = NotDigits(bytes);
    if (others == 0)
        return TakeLongInteger(at, decimal);
    const auto first = LowestByteSet(others);
    const auto digits = WithoutFirst(bytes, others);
    const auto ends = at[first] == '.' ? others & (others - 1) : others;
    if (ends == 0)
        return TakeLongFraction(at, digits, first, decimal);
    // No branch on where the point is and how long the number: that changes from one to the next.
    const auto size = LowestByteSet(ends);
    const auto last = std::max(size, first + 1);
    if (last == 1)
        return nullptr;
    decimal.digits = JoinEight(digits << ((64 - 8 * last) % 64));
    decimal.exponent = static_cast<int>(first + 1 - last);
    return at + size;
}

/// Adds the exponent at `at`, "e" included, to `exponent` and returns its end; `at` itself when
/// there is none of one to four digits.
const char* TakeExponent(const char* at, int& exponent)
{
    const auto* next = at;
    if (*next != 'e' && *next != 'E')
        return at;
    ++next;
    const bool negative = *next == '-';
    next += negative || *next == '+' ? 1 : 0;
    std::uint64_t size = 0;
    const auto* const last = TakeDigits(next, size);
    if (last == next || last > next + 4)
        return at;
    exponent += negative ? -static_cast<int>(size) : static_cast<int>(size);
    return last;
}

/// Takes a minus sign from `at`; returns the sign bit of the number.
inline std::uint64_t TakeMinus(const char*& at)
{
    const std::uint64_t negative = *at == '-' ? 1 : 0;
    at += negative;
    return negative << 63;
}

/// The number nearest to `decimal`, with the given sign bit.
inline double SignedDouble(Decimal decimal, std::uint64_t sign)
{
    double value = 0.0;
    if (!ToDouble(decimal, value)) [[unlikely]]
        value = NearestDouble(decimal);
    return std::bit_cast<double>(std::bit_cast<std::uint64_t>(value) | sign);
}

/// The first character after the blanks at `at`, or `end`.
inline const char* SkipBlanks(const char* at, const char* end)
{
    for (; at < end; at += 8) {
        const auto others = LoadWord(at) ^ RepeatByte(' ');
        if (others != 0) {
            at += LowestByteSet(others);
            break;
        }
    }
    if (at > end) [[unlikely]]
        at = end;
    return at;
}

/// Reads the token from `at` to `end`, where a number cannot go on. Few forms need ReadToken.
double ReadKnownToken(const char* at, const char* end)
{
    const auto* next = at;
    const auto sign = TakeMinus(next);
    Decimal decimal;
    next = TakeFixed(next, decimal);
    if (next != nullptr && TakeExponent(next, decimal.exponent) == end)
        return SignedDouble(decimal, sign);
    return ReadToken({at, static_cast<std::size_t>(end - at)});
}

} // namespace

char* WriteNumber(double value, int digits, char* to) noexcept
{
    const auto bits = std::bit_cast<std::uint64_t>(value);
    to[0] = ' ';
    to[1] = '-';
    to += 1 + (bits >> 63);
    const auto magnitude = bits & ~kSignBit;
    Decimal decimal;
    constexpr auto minNormal = std::uint64_t{1} << kFractionBits;
    if (magnitude - minNormal < kInfinityBits - minNormal) [[likely]] {
        decimal = ToDecimal(magnitude, digits);
    } else {
        if (magnitude - 1 >= kInfinityBits - 1) {
            const auto name = magnitude == 0 ? "0.0"sv : SpecialName(bits);
            return std::copy(name.begin(), name.end(), to);
        }
        decimal = ToDecimalExactly(std::bit_cast<double>(magnitude), digits);
    }
    int exponent = decimal.exponent + digits - 1;
    const auto whole = digits == kFullDigits ? decimal.digits : decimal.digits * 100;
    const auto firstNine = static_cast<std::uint32_t>(whole / kTenTo8);
    auto first = firstNine / std::uint32_t{kTenTo8};
    const auto upper = SplitEight(firstNine - first * std::uint32_t{kTenTo8});
    const auto lower = SplitEight(whole - firstNine * kTenTo8);
    if (first == 10) [[unlikely]] {
        first = 1;
        ++exponent;
    }
    // Up to the last digit that is not 0: how many bytes its word uses, and the digits before it.
    const auto used = std::bit_width((lower != 0 ? lower : upper) * 2 + 1);
    const int count = static_cast<int>(static_cast<unsigned>(used + 6) / 8) + (lower != 0 ? 9 : 1);
    const Digits text{static_cast<char>('0' + first), upper | RepeatByte('0'),
                      lower | RepeatByte('0')};

    if (exponent >= kFixedMin && exponent < 8) [[likely]] {
        to = WriteAroundPoint(text, exponent, to);
        return to + std::max(count, exponent + 2) + (exponent < 0 ? 0 : 1);
    }
    if (exponent >= 8 && exponent < digits) {
        WriteBeforePoint(text, exponent, to);
        return to + std::max(count, exponent + 2) + 1;
    }
    WriteAroundPoint(text, 0, to);
    return WriteExponent(exponent, to + (count > 1 ? count + 1 : 1));
}

double ReadDecimal(std::string_view text) noexcept
{
    std::string_view token = TrimLeft(text, IsWhite);
    const bool negative = TakeSign(token);
    ExactDecimal decimal;
    bool point = false;
    std::size_t i = 0;
    for (; i < token.size(); ++i) {
        if (IsDigit(token[i])) {
            decimal.Append(token[i], point);
        } else if (token[i] == '.' && !point) {
            point = true;
        } else {
            break;
        }
    }
    const bool found = i > (point ? 1 : 0);
    if (!found)
        return 0.0;
    const double value = decimal.Value(Exponent(token.substr(i)));
    return negative ? -value : value;
}

double ReadNumber(std::string_view token) noexcept
{
    constexpr std::size_t longest = 64;
    if (token.size() > longest)
        return ReadToken(token);
    std::array<char, longest + kReadAhead> piece{};
    token.copy(piece.data(), longest);
    return ReadKnownToken(piece.data(), piece.data() + token.size());
}

NumberFault FaultOf(std::string_view token, double value) noexcept
{
    token = TrimRight(TrimLeft(token, IsWhite), IsWhite);
    if (std::isinf(value)) {
        TakeSign(token);
        return EqualsNoCase(token, kInfinityName) ? NumberFault::kNone : NumberFault::kOutOfRange;
    }
    TakeSign(token);
    std::size_t digits = 0;
    bool point = false;
    std::size_t i = 0;
    for (; i < token.size() && (IsDigit(token[i]) || (token[i] == '.' && !point)); ++i) {
        point = point || token[i] == '.';
        digits += IsDigit(token[i]) ? 1 : 0;
    }
    if (digits == 0)
        return NumberFault::kUnreadable;
    std::string_view rest = token.substr(i);
    if (token.substr(0, i) == "1." && !rest.empty() && rest[0] == '#') {
        for (const auto name : {"QNAN"sv, "SNAN"sv, "IND"sv, "NAN"sv}) {
            if (EqualsNoCase(rest.substr(1, name.size()), name))
                return NumberFault::kNotANumber;
        }
    }
    if (rest.starts_with('e') || rest.starts_with('E')) {
        std::string_view exponent = rest.substr(1);
        TakeSign(exponent);
        const std::string_view after = TrimLeft(exponent, IsDigit);
        rest = after.size() < exponent.size() ? after : rest;
    }
    return rest.empty() ? NumberFault::kNone : NumberFault::kCut;
}

template <class Number>
void ReadNumbers(std::string_view text, BlockReport* report, std::vector<Number>& numbers)
{
    if (text.empty())
        return;
    const char* at = text.data();
    const char* const end = at + text.size();
    for (;;) {
        const auto* last = at;
        const auto sign = TakeMinus(last);
        Decimal decimal;
        last = TakeFixed(last, decimal);
        if (last != nullptr && (*last == ' ' || last == end)) [[likely]] {
            numbers.emplace_back(SignedDouble(decimal, sign));
        } else {
            // Only after a blank is white space of other kinds skipped.
            at = at == text.data() ? at : SkipWhite(at, end);
            last = std::find(at, end, ' ');
            const double number = ReadKnownToken(at, last);
            numbers.emplace_back(number);
            if (report != nullptr)
                report->Number({at, last}, number);
        }
        if (last >= end)
            return;
        at = SkipBlanks(last, end);
    }
}

template void ReadNumbers(std::string_view text, BlockReport* report, std::vector<double>& numbers);
template void ReadNumbers(std::string_view text, BlockReport* report,
                          std::vector<CComVariant>& numbers);

std::int32_t ReadInteger(std::string_view text) noexcept
{
    text = TrimLeft(text, IsWhite);
    const bool negative = TakeSign(text);
    constexpr std::int64_t limit = std::int64_t{1} << 31;
    std::int64_t value = 0;
    for (std::size_t i = 0; i < text.size() && IsDigit(text[i]); ++i)
        value = std::min(value * 10 + (text[i] - '0'), limit);
    return static_cast<std::int32_t>(negative ? -value : std::min(value, limit - 1));
}

} // namespace dcm
