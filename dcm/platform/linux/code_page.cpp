#include "dcm/platform/code_page_system.h"

#include "dcm/platform/exception.h"

#include <array>
#include <cerrno>
#include <iconv.h>
#include <string>

namespace dcm::system {

namespace {

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

/// An open conversion of the C library.
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

    bool IsOpen() const { return m_handle != reinterpret_cast<iconv_t>(-1); }

    /// Converts `size` bytes at `from`; units of `unit` bytes that cannot be converted become
    /// `substitute`.
    std::string Convert(const void* from, std::size_t size, std::size_t unit,
                        std::string_view substitute)
    {
        std::string result;
        // The C library takes the input as not constant but does not write to it.
        char* in = static_cast<char*>(const_cast<void*>(from));
        std::size_t left = size;
        while (left > 0) {
            if (Step(&in, &left, result))
                continue;
            result += substitute;
            const std::size_t skipped = unit < left ? unit : left;
            in += skipped;
            left -= skipped;
        }
        // A page with shift states ends in its first state.
        Step(nullptr, nullptr, result);
        return result;
    }

private:
    /// Converts as much as fits into one piece. Returns false at a unit that cannot be converted.
    bool Step(char** in, std::size_t* left, std::string& result)
    {
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
    return Conversion("WCHAR_T", name).IsOpen() && Conversion(name, "WCHAR_T").IsOpen();
}

std::string CodePageToUtf8(unsigned identifier, std::string_view bytes)
{
    Conversion conversion("UTF-8", NameOf(identifier));
    if (!conversion.IsOpen())
        ThrowResult(E_OUTOFMEMORY);
    return conversion.Convert(bytes.data(), bytes.size(), 1, "\xEF\xBF\xBD");
}

std::string WideToCodePage(unsigned identifier, std::wstring_view text)
{
    const std::string name = NameOf(identifier);
    Conversion conversion(name, "WCHAR_T");
    if (!conversion.IsOpen())
        ThrowResult(E_OUTOFMEMORY);
    const std::wstring_view mark = L"?";
    const std::string substitute =
        Conversion(name, "WCHAR_T").Convert(mark.data(), sizeof(wchar_t), sizeof(wchar_t), "?");
    return conversion.Convert(text.data(), text.size() * sizeof(wchar_t), sizeof(wchar_t),
                              substitute);
}

} // namespace dcm::system
