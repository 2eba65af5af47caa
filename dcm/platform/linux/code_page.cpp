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

/// A conversion of the C library. Pages that it knows fail to open for want of memory or files.
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

    /// Converts all of `text`; what cannot be converted becomes `substitute`, character by
    /// character in UTF-8, otherwise byte by byte.
    std::string Convert(std::string_view text, std::string_view substitute, bool isUtf8)
    {
        std::string result;
        // The C library takes the input as not constant but does not write to it.
        char* in = const_cast<char*>(text.data());
        std::size_t left = text.size();
        while (left > 0) {
            if (Step(&in, &left, result))
                continue;
            result += substitute;
            do {
                ++in;
                --left;
            } while (isUtf8 && left > 0 && (static_cast<unsigned char>(*in) & 0xC0U) == 0x80);
        }
        // A page with shift states ends in its first state.
        Step(nullptr, nullptr, result);
        return result;
    }

private:
    /// Converts as much as fits into one piece. Returns false at a unit that cannot be converted.
    bool Step(char** in, std::size_t* left, std::string& result)
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
    return Conversion(kUtf8, NameOf(identifier)).Convert(bytes, "\xEF\xBF\xBD", false);
}

std::string Utf8ToCodePage(unsigned identifier, std::string_view utf8)
{
    const std::string name = NameOf(identifier);
    const std::string substitute = Conversion(name, kUtf8).Convert("?", "?", true);
    return Conversion(name, kUtf8).Convert(utf8, substitute, true);
}

} // namespace dcm::system
