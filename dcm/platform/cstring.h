#pragma once

#include "dcm/library/export.h"

#include <atomic>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <string_view>

class CString;

namespace dcm {

/// The head of a text that `CString` objects share; the characters follow it in memory.
struct CStringData
{
    /// How many strings share the text; negative for a text with static storage.
    std::atomic<std::int32_t> references;
    std::int32_t length;
    std::int32_t capacity;

    /// The characters; their owner sees to the terminating zero.
    wchar_t* Text() { return reinterpret_cast<wchar_t*>(this + 1); }
};

/// A constant text with static storage: a string is made from it without allocation, at any time,
/// the start of the process included.
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

} // namespace dcm

/// A text of wide characters. Copies share the characters until one of them is changed; the count
/// of sharers is atomic, so copies of one text may be used by different threads.
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
    /// Shares the text of the other; one that was moved from may hold any text.
    CString(const CString& other) noexcept;
    CString(CString&& other) noexcept;
    CString& operator=(const CString& other) noexcept;
    CString& operator=(CString&& other) noexcept;
    ~CString();

    /// The number of characters.
    int GetLength() const noexcept { return m_data->length; }
    /// Whether there is none.
    bool IsEmpty() const noexcept { return m_data->length == 0; }
    /// The character at `index`; an index outside the text raises `E_INVALIDARG`.
    wchar_t GetAt(int index) const;
    /// The text, zero-terminated; valid until the string is changed or destroyed.
    operator const wchar_t*() const noexcept { return m_data->Text(); }
    /// The same as a view.
    operator std::wstring_view() const noexcept { return View(); }
    std::wstring_view View() const noexcept
    {
        return {m_data->Text(), static_cast<std::size_t>(m_data->length)};
    }

    /// Negative, 0 or positive, by the numbers of the characters.
    int Compare(std::wstring_view other) const noexcept;
    /// The same with A to Z taken as a to z; other letters keep their case.
    int CompareNoCase(std::wstring_view other) const noexcept;

    /// Makes the text empty and keeps its memory for what is appended next.
    void Empty() noexcept;
    /// Adds a text at the end, which may be part of this one. Raises `std::bad_alloc`, with the
    /// text as it was, when memory runs out.
    CString& Append(std::wstring_view text);
    CString& operator+=(std::wstring_view text) { return Append(text); }

    /// Makes room for `room` more characters behind the text and returns where they go; the text
    /// is only longer once `EndExtend` has been told where they end.
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

    /// One text behind the other; null counts as empty.
    friend CString operator+(const CString& a, const CString& b)
    {
        CString sum(a);
        sum.Append(b.View());
        return sum;
    }
    friend CString operator+(const CString& a, const wchar_t* b) { return a + CString(b); }
    friend CString operator+(const wchar_t* a, const CString& b) { return CString(a) + b; }

    /// By the numbers of the characters, as `Compare`; null counts as empty.
    friend bool operator==(const CString& a, const CString& b) noexcept
    {
        return a.View() == b.View();
    }
    friend bool operator==(const CString& a, const wchar_t* b) noexcept
    {
        return a.View() == Whole(b);
    }
    friend bool operator==(const CString& a, std::wstring_view b) noexcept { return a.View() == b; }
    friend std::strong_ordering operator<=>(const CString& a, const CString& b) noexcept
    {
        return a.View() <=> b.View();
    }
    friend std::strong_ordering operator<=>(const CString& a, const wchar_t* b) noexcept
    {
        return a.View() <=> Whole(b);
    }
    friend std::strong_ordering operator<=>(const CString& a, std::wstring_view b) noexcept
    {
        return a.View() <=> b;
    }

private:
    static std::wstring_view Whole(const wchar_t* text) noexcept
    {
        return text == nullptr ? std::wstring_view() : std::wstring_view(text);
    }
    bool IsShared() const noexcept
    {
        return m_data->references.load(std::memory_order_acquire) != 1;
    }
    void Release() noexcept;
    void MakeRoom(std::size_t room);

    dcm::CStringData* m_data;
};
