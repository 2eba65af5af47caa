#include "dcm/textfile/shared_texts.h"

#include "dcm/platform/word.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>

namespace dcm {

namespace {

/// A hash of `bytes`, which must not be empty: of the length and the first and last eight bytes.
std::uint8_t HashOf(std::string_view bytes)
{
    const std::size_t size = std::min(bytes.size(), std::size_t{8});
    const std::uint64_t first = LoadWord(bytes.data()) << (64 - 8 * size);
    const std::uint64_t last = LoadWord(bytes.data() + bytes.size() - size) << (64 - 8 * size);
    constexpr std::uint64_t factor = 0x9E37'79B9'7F4A'7C15;
    return static_cast<std::uint8_t>(((first + bytes.size()) * factor ^ last) * factor >> 56);
}

} // namespace

CString SharedTexts::Get(std::string_view bytes, Encoding encoding)
{
    constexpr std::size_t longest = 64;
    if (bytes.empty() || bytes.size() > longest)
        return Decode(bytes, encoding);
    Entry& entry = m_entries[HashOf(bytes)];
    if (entry.bytes != bytes) {
        // Many texts occur only once. The wide form is kept when a text occurs again.
        entry = {bytes, {}};
        return Decode(bytes, encoding);
    }
    if (entry.wide.IsEmpty())
        entry.wide = Decode(bytes, encoding);
    return entry.wide;
}

} // namespace dcm
