#include "dcm/textfile/utf8_look.h"

#include <cstdint>
#include <cstring>

namespace dcm {

namespace {

/// The length of the character that begins at `at`, which is no ASCII; 0 when it is none.
std::size_t LengthAt(std::string_view bytes, std::size_t at)
{
    const auto byte = [&](std::size_t i) -> unsigned {
        return at + i < bytes.size() ? static_cast<unsigned char>(bytes[at + i]) : 0U;
    };
    const auto follows = [&](std::size_t i) { return (byte(i) & 0xC0U) == 0x80U; };
    const unsigned first = byte(0);
    const unsigned second = byte(1);
    if (first >= 0xC2 && first <= 0xDF)
        return follows(1) ? 2 : 0;
    if (first >= 0xE0 && first <= 0xEF) {
        const bool shortest = first != 0xE0 || second >= 0xA0;
        const bool surrogate = first == 0xED && second >= 0xA0;
        return follows(1) && follows(2) && shortest && !surrogate ? 3 : 0;
    }
    if (first >= 0xF0 && first <= 0xF4) {
        const bool inRange = (first != 0xF0 || second >= 0x90) && (first != 0xF4 || second < 0x90);
        return follows(1) && follows(2) && follows(3) && inRange ? 4 : 0;
    }
    return 0;
}

} // namespace

Utf8Look LookAsUtf8(std::string_view bytes)
{
    Utf8Look look;
    for (std::size_t at = 0; at < bytes.size();) {
        std::uint64_t word = 0;
        while (bytes.size() - at >= sizeof word) {
            std::memcpy(&word, bytes.data() + at, sizeof word);
            if ((word & 0x8080'8080'8080'8080U) != 0)
                break;
            at += sizeof word;
        }
        if (at == bytes.size())
            break;
        if (static_cast<unsigned char>(bytes[at]) < 0x80) {
            ++at;
            continue;
        }
        const std::size_t length = LengthAt(bytes, at);
        if (length == 0) {
            look.firstBad = at;
            return look;
        }
        if (look.firstWide == bytes.npos)
            look.firstWide = at;
        at += length;
    }
    return look;
}

} // namespace dcm
