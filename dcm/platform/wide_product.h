#pragma once

#include <cstdint>

namespace dcm {

/// A number of 128 bits.
struct WideProduct
{
    std::uint64_t high;
    std::uint64_t low;
};

/// a x b, in products of 32-bit halves.
constexpr WideProduct MultiplyInHalves(std::uint64_t a, std::uint64_t b)
{
    constexpr std::uint64_t lowHalf = 0xFFFF'FFFF;
    const auto low = (a & lowHalf) * (b & lowHalf);
    // Neither sum can overflow: (2^32 - 1)^2 + 2 x (2^32 - 1) is 2^64 - 1.
    const auto middle = (a >> 32) * (b & lowHalf) + (low >> 32);
    const auto other = (a & lowHalf) * (b >> 32) + (middle & lowHalf);
    return {(a >> 32) * (b >> 32) + (middle >> 32) + (other >> 32), other << 32 | (low & lowHalf)};
}

/// a x b, by the compiler's integer of 128 bits where it has one.
constexpr WideProduct Multiply(std::uint64_t a, std::uint64_t b)
{
#ifdef __SIZEOF_INT128__
    // NOLINTNEXTLINE(modernize-use-using): only a typedef can carry the mark of an extension.
    __extension__ typedef unsigned __int128 Wide;
    const auto product = Wide{a} * b;
    return {static_cast<std::uint64_t>(product >> 64), static_cast<std::uint64_t>(product)};
#else
    return MultiplyInHalves(a, b);
#endif
}

} // namespace dcm
