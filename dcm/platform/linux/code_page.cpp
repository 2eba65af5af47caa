#include "dcm/platform/code_page_system.h"

#include "dcm/platform/exception.h"

#include <array>
#include <cerrno>
#include <iconv.h>
#include <string>

namespace dcm::system {

namespace {

constexpr const char* kUtf8 = "UTF-8";

/// The C library's names of the code pages begin with "CP", those of a few with other words.
std::string NameOf(unsigned identifier)
{
    switch (identifier) {
    case 20127:
        return "US-ASCII";
    case 20866:
        return "KOI8-R";
    case 21866:
        return "KOI8-U";
    case 54936:
        return "GB18030";
    default:
        if (identifier > 28591 && identifier <= 28606)
            return "ISO-8859-" + std::to_string(identifier - 28590);
        return "CP" + std::to_string(identifier);
    }
}

/// A conversion of the C library. A page that it knows fails to open only when memory
/// or files run out.
class Conversion
{
public:
    Conversion(const std::string& to, const std::string& from)
        : m_handle(iconv_open(to.c_str(), from.c_str()))
    {}
    Conversion(const Conversion&) = delete;
    Conversion& operator=(const Conversion&) = delete;
    ~Conversion()
    {
        if (IsOpen())
            iconv_close(m_handle);
    }

    // NOLINTNEXTLINE(performance-no-int-to-ptr): how the C library marks a failure.
    bool IsOpen() const { return m_handle != reinterpret_cast<iconv_t>(-1); }

    /// Converts all of `text` from UTF-8; a character that the page lacks becomes `?`.
    std::string FromUtf8(std::string_view text)
    {
        return Convert(text, [](std::string_view& rest, std::string& result, Conversion& page) {
            do {
                rest.remove_prefix(1);
            } while (!rest.empty() && (static_cast<unsigned char>(rest[0]) & 0xC0U) == 0x80);
            // By the same conversion, which knows whether the page has to change its shift state.
            std::string_view substitute = "?";
            while (!substitute.empty() && page.Step(substitute, result)) {
            }
        });
    }

    /// Converts all of `text` to UTF-8; a byte that is not a character becomes U+FFFD.
    /// `holdsLetters` says that the page holds a letter back until it knows whether marks for it
    /// follow.
    std::string ToUtf8(std::string_view text, bool holdsLetters)
    {
        return Convert(text, [=](std::string_view& rest, std::string& result, Conversion& page) {
            if (holdsLetters)
                page.Finish(result);
            rest.remove_prefix(1);
            result += "\xEF\xBF\xBD";
        });
    }

private:
    /// Converts all of `text`; `substitute` replaces what cannot be converted at the start of the
    /// rest.
    template <class Substitute>
    std::string Convert(std::string_view text, Substitute substitute)
    {
        std::string result;
        while (!text.empty()) {
            if (!Step(text, result))
                substitute(text, result, *this);
        }
        // A page with shift states ends in its first state.
        Finish(result);
        return result;
    }

    /// Converts as much of `text` as fits into one piece and takes it off. Returns false at a unit
    /// that cannot be converted.
    bool Step(std::string_view& text, std::string& result)
    {
        // The C library takes the input as not constant but does not write to it.
        char* in = const_cast<char*>(text.data());
        std::size_t left = text.size();
        const bool converted = Call(&in, &left, result);
        text.remove_prefix(text.size() - left);
        return converted;
    }

    /// Writes what the conversion holds back and returns it to its first state.
    void Finish(std::string& result) { Call(nullptr, nullptr, result); }

    bool Call(char** in, std::size_t* left, std::string& result)
    {
        if (!IsOpen())
            ThrowResult(E_OUTOFMEMORY);
        std::array<char, 4096> piece;
        char* out = piece.data();
        std::size_t room = piece.size();
        const bool stopped = iconv(m_handle, in, left, &out, &room) == static_cast<std::size_t>(-1);
        const int error = errno;
        result.append(piece.data(), piece.size() - room);
        if (stopped && error != E2BIG && error != EILSEQ && error != EINVAL)
            ThrowResult(E_OUTOFMEMORY);
        return !stopped || error == E2BIG;
    }

    iconv_t m_handle;
};

} // namespace

unsigned DefaultCodePage()
{
    return 1252;
}

bool KnowsCodePage(unsigned identifier)
{
    const std::string name = NameOf(identifier);
    return Conversion(kUtf8, name).IsOpen() && Conversion(name, kUtf8).IsOpen();
}

std::string CodePageToUtf8(unsigned identifier, std::string_view bytes)
{
    // Hebrew and Vietnamese, whose letters are joined with the marks after them.
    const bool holdsLetters = identifier == 1255 || identifier == 1258;
    return Conversion(kUtf8, NameOf(identifier)).ToUtf8(bytes, holdsLetters);
}

std::string Utf8ToCodePage(unsigned identifier, std::string_view utf8)
{
    return Conversion(NameOf(identifier), kUtf8).FromUtf8(utf8);
}

} // namespace dcm::system
