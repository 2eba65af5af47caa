#pragma once

#include "dcm/library/export.h"

#include <atomic>
#include <compare>
#include <concepts>
#include <cstddef>
#include <cstdint>
#include <iosfwd>
#include <string_view>
#include <type_traits>

class CString;

namespace dcm {

/// The head of a text that `CString` objects share; the characters come after it in memory.
struct CStringData
{
    /// How many strings share the text; negative for a text with static storage.
    std::atomic<std::int32_t> references;
    std::int32_t length;
    std::int32_t capacity;

    /// The characters, which callers must terminate with a zero.
    wchar_t* Text() { return reinterpret_cast<wchar_t*>(this + 1); }
};

/// A constant text with static storage. A string can be made from it without allocation at any
/// time, also while the process starts.
template <std::size_t N>
class TextConstant
{
public:
    /// Copies a literal, at compile time.
    constexpr TextConstant(const wchar_t (&text)[N]) : m_data{-1, N - 1, N - 1}
    {
        for (std::size_t i = 0; i < N; ++i)
            m_text[i] = text[i];
    }

    /// The text without its terminating zero.
    constexpr operator std::wstring_view() const { return {m_text, N - 1}; }

private:
    friend class ::CString;

    CStringData m_data;
    wchar_t m_text[N] = {};
};

/// A number that could be mistaken for a character.
template <class T>
concept NoCharacter = (std::is_arithmetic_v<T> || std::is_enum_v<T>)&&!std::same_as<T, wchar_t>;

} // namespace dcm

/// A text of wide characters. Copies share their characters until one copy is changed. The count of
/// copies is atomic, so different threads may use copies of one text.
///
/// Positions count from 0. White space is a tab, line feed, vertical tab, form feed, carriage
/// return or blank. A call that changes the text or makes a new one throws `std::bad_alloc` when
/// memory runs out; the text is then as it was. Where an argument is a `std::wstring_view`, a
/// zero-terminated text will do, but not a null pointer; it may be part of this text.
class DCM_API CString
{
public:
    /// An empty text.
    CString() noexcept;
    /// A copy of a zero-terminated text; null gives an empty text.
    CString(const wchar_t* text);
    /// The wide form of a zero-terminated text in the thread's code page; null gives an empty text.
    CString(const char* text);
    /// A copy of a text, zeros in it included.
    CString(std::wstring_view text);
    /// The constant itself; it must outlive the string and all its copies.
    template <std::size_t N>
    explicit CString(dcm::TextConstant<N>& text) noexcept : m_data(&text.m_data)
    {
        static_assert(offsetof(dcm::TextConstant<N>, m_text) == sizeof(dcm::CStringData));
    }
    /// Shares the text of the other. After a move the other may hold any text.
    CString(const CString& other) noexcept;
    CString(CString&& other) noexcept;
    CString& operator=(const CString& other) noexcept;
    CString& operator=(CString&& other) noexcept;
    ~CString();

    /// The number of characters.
    int GetLength() const noexcept { return m_data->length; }
    /// Whether the text has no characters.
    bool IsEmpty() const noexcept { return m_data->length == 0; }
    /// The character at `index`. Throws `dcm::ResultError` with `E_INVALIDARG` when the index is
    /// outside the text.
    wchar_t GetAt(int index) const;
    /// Replaces the character at `index`. Throws as `GetAt` does.
    void SetAt(int index, wchar_t character);
    /// The text, zero-terminated; valid until the string is changed or destroyed.
    operator const wchar_t*() const noexcept { return m_data->Text(); }
    /// The same as a view.
    operator std::wstring_view() const noexcept { return View(); }
    std::wstring_view View() const noexcept
    {
        return {m_data->Text(), static_cast<std::size_t>(m_data->length)};
    }

    /// Negative, 0 or positive, as this text comes before, equals or comes after the other by the
    /// numbers of their characters.
    int Compare(std::wstring_view other) const noexcept;
    /// The same with A to Z taken as a to z; other letters keep their case.
    int CompareNoCase(std::wstring_view other) const noexcept;

    /// The position of the first `text` or `character` at `start` or after it; -1 when there is
    /// none or `start` is outside the text. An empty text is found at once, at the end too.
    int Find(std::wstring_view text, int start = 0) const noexcept;
    int Find(wchar_t character, int start = 0) const noexcept;
    /// The position of the first character that is one of `characters`; -1 when there is none.
    int FindOneOf(std::wstring_view characters) const noexcept;

    /// The first or last `count` characters; none for a negative count, all when there are fewer.
    CString Left(int count) const { return Mid(0, count); }
    CString Right(int count) const;
    /// `count` characters from position `first` on, or as many as there are; without a count all. A
    /// negative position counts as 0, a negative count as 0.
    CString Mid(int first) const { return Mid(first, GetLength()); }
    CString Mid(int first, int count) const;

    /// Removes white space, or any of `characters`, at both ends, at the start or at the end.
    /// Returns this text.
    CString& Trim() { return Trim(kWhite); }
    CString& Trim(std::wstring_view characters);
    CString& TrimLeft() { return TrimLeft(kWhite); }
    CString& TrimLeft(std::wstring_view characters);
    CString& TrimRight() { return TrimRight(kWhite); }
    CString& TrimRight(std::wstring_view characters);

    /// Replaces each `from` by `to`, from left to right, and returns how many there were: 0 for an
    /// empty `from`.
    int Replace(std::wstring_view from, std::wstring_view to);
    int Replace(wchar_t from, wchar_t to)
    {
        return Replace(std::wstring_view(&from, 1), std::wstring_view(&to, 1));
    }

    /// Removes all characters. Keeps the memory for what is appended next.
    void Empty() noexcept;
    /// Appends a text.
    CString& Append(std::wstring_view text);
    CString& operator+=(std::wstring_view text) { return Append(text); }
    /// Appends a character.
    void AppendChar(wchar_t character)
    {
        wchar_t* const end = Extend(1);
        *end = character;
        EndExtend(end + 1);
    }
    CString& operator+=(wchar_t character)
    {
        AppendChar(character);
        return *this;
    }
    /// Other numbers are not characters.
    template <dcm::NoCharacter Number>
    CString& operator+=(Number) = delete;

    /// Makes room for `room` more characters after the text and returns where they go. Call
    /// `EndExtend` with the end of what was stored there to make it part of the text.
    wchar_t* Extend(std::size_t room)
    {
        if (room > static_cast<std::size_t>(m_data->capacity - m_data->length) || IsShared())
            MakeRoom(room);
        return m_data->Text() + m_data->length;
    }
    void EndExtend(const wchar_t* end) noexcept
    {
        wchar_t* const text = m_data->Text();
        m_data->length = static_cast<std::int32_t>(end - text);
        text[m_data->length] = L'\0';
    }

    /// One text after the other, or a text and a character; null counts as empty.
    friend CString operator+(const CString& a, const CString& b)
    {
        CString sum(a);
        sum.Append(b.View());
        return sum;
    }
    friend CString operator+(const CString& a, const wchar_t* b) { return a + CString(b); }
    friend CString operator+(const wchar_t* a, const CString& b) { return CString(a) + b; }
    friend CString operator+(const CString& a, wchar_t b) { return a + Whole(b); }
    friend CString operator+(wchar_t a, const CString& b) { return CString(Whole(a)) + b; }
    /// Other numbers are not characters.
    template <dcm::NoCharacter Number>
    friend CString operator+(const CString&, Number) = delete;
    template <dcm::NoCharacter Number>
    friend CString operator+(Number, const CString&) = delete;

    /// Writes the text to a wide stream as a text of the standard library.
    template <class Traits>
    friend std::basic_ostream<wchar_t, Traits>& operator<<(std::basic_ostream<wchar_t, Traits>& out,
                                                           const CString& text)
    {
        return out << std::basic_string_view<wchar_t, Traits>(text.View().data(),
                                                              text.View().size());
    }

    /// Compare texts, or a text and a character, as `Compare` does; null counts as empty.
    friend bool operator==(const CString& a, const CString& b) noexcept
    {
        return a.View() == b.View();
    }
    friend bool operator==(const CString& a, const wchar_t* b) noexcept
    {
        return a.View() == Whole(b);
    }
    friend bool operator==(const CString& a, std::wstring_view b) noexcept { return a.View() == b; }
    friend bool operator==(const CString& a, wchar_t b) noexcept { return a.View() == Whole(b); }
    friend std::strong_ordering operator<=>(const CString& a, const CString& b) noexcept
    {
        return a.View().compare(b.View()) <=> 0;
    }
    friend std::strong_ordering operator<=>(const CString& a, const wchar_t* b) noexcept
    {
        return a.View().compare(Whole(b)) <=> 0;
    }
    friend std::strong_ordering operator<=>(const CString& a, std::wstring_view b) noexcept
    {
        return a.View().compare(b) <=> 0;
    }
    friend std::strong_ordering operator<=>(const CString& a, wchar_t b) noexcept
    {
        return a.View().compare(Whole(b)) <=> 0;
    }
    /// Other numbers are not characters.
    template <dcm::NoCharacter Number>
    friend bool operator==(const CString&, Number) = delete;
    template <dcm::NoCharacter Number>
    friend std::strong_ordering operator<=>(const CString&, Number) = delete;

private:
    static constexpr std::wstring_view kWhite = L"\t\n\v\f\r ";

    static std::wstring_view Whole(const wchar_t* text) noexcept
    {
        return text == nullptr ? std::wstring_view() : std::wstring_view(text);
    }
    static std::wstring_view Whole(const wchar_t& character) noexcept { return {&character, 1}; }
    bool IsShared() const noexcept
    {
        return m_data->references.load(std::memory_order_acquire) != 1;
    }
    void Release() noexcept;
    void MakeRoom(std::size_t room);

    dcm::CStringData* m_data;
};
