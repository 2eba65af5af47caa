#include "dcm/platform/cstring.h"

#include "dcm/platform/exception.h"
#include "dcm/platform/text.h"
#include "dcm/platform/thread_code_page.h"

#include <algorithm>
#include <cwchar>
#include <limits>
#include <new>
#include <utility>

namespace {

constinit dcm::TextConstant kEmpty{L""};

/// The longest text: its length is a signed 32-bit number.
constexpr std::size_t kMaxLength = std::numeric_limits<std::int32_t>::max() - 1;

/// The position as a number of 32 bits, -1 for none.
int Position(std::size_t position)
{
    return position == std::wstring_view::npos ? -1 : static_cast<int>(position);
}

bool IsStatic(const dcm::CStringData& data)
{
    return data.references.load(std::memory_order_relaxed) < 0;
}

dcm::CStringData* NewData(std::size_t capacity)
{
    if (capacity > kMaxLength)
        dcm::ThrowResult(E_OUTOFMEMORY);
    void* const memory =
        ::operator new(sizeof(dcm::CStringData) + (capacity + 1) * sizeof(wchar_t));
    auto* const data = new (memory) dcm::CStringData{1, 0, static_cast<std::int32_t>(capacity)};
    data->Text()[0] = L'\0';
    return data;
}

} // namespace

CString::CString() noexcept : CString(kEmpty)
{}

CString::CString(const wchar_t* text) : CString(Whole(text))
{}

CString::CString(const char* text)
    : CString(dcm::Widen(text == nullptr ? std::string_view() : std::string_view(text)))
{}

CString::CString(std::wstring_view text) : CString()
{
    if (text.empty())
        return;
    m_data = NewData(text.size());
    EndExtend(std::copy(text.begin(), text.end(), m_data->Text()));
}

CString::CString(const CString& other) noexcept : m_data(other.m_data)
{
    if (!IsStatic(*m_data))
        m_data->references.fetch_add(1, std::memory_order_relaxed);
}

CString::CString(CString&& other) noexcept : CString()
{
    std::swap(m_data, other.m_data);
}

CString& CString::operator=(const CString& other) noexcept
{
    CString copy(other);
    std::swap(m_data, copy.m_data);
    return *this;
}

CString& CString::operator=(CString&& other) noexcept
{
    std::swap(m_data, other.m_data);
    return *this;
}

CString::~CString()
{
    Release();
}

wchar_t CString::GetAt(int index) const
{
    if (index < 0 || index >= GetLength())
        dcm::ThrowResult(E_INVALIDARG);
    return m_data->Text()[index];
}

void CString::SetAt(int index, wchar_t character)
{
    if (index < 0 || index >= GetLength())
        dcm::ThrowResult(E_INVALIDARG);
    Extend(0); // A copy of its own.
    m_data->Text()[index] = character;
}

int CString::Compare(std::wstring_view other) const noexcept
{
    return View().compare(other);
}

int CString::CompareNoCase(std::wstring_view other) const noexcept
{
    const std::wstring_view own = View();
    const auto [a, b] =
        std::mismatch(own.begin(), own.end(), other.begin(), other.end(),
                      [](wchar_t x, wchar_t y) { return dcm::FoldCase(x) == dcm::FoldCase(y); });
    if (a == own.end() || b == other.end())
        return (b == other.end() ? 1 : 0) - (a == own.end() ? 1 : 0);
    return dcm::FoldCase(*a) < dcm::FoldCase(*b) ? -1 : 1;
}

int CString::Find(std::wstring_view text, int start) const noexcept
{
    return start < 0 ? -1 : Position(View().find(text, static_cast<std::size_t>(start)));
}

int CString::Find(wchar_t character, int start) const noexcept
{
    return start < 0 ? -1 : Position(View().find(character, static_cast<std::size_t>(start)));
}

int CString::FindOneOf(std::wstring_view characters) const noexcept
{
    return Position(View().find_first_of(characters));
}

CString CString::Right(int count) const
{
    return Mid(GetLength() - std::clamp(count, 0, GetLength()));
}

CString CString::Mid(int first, int count) const
{
    const int start = std::clamp(first, 0, GetLength());
    const int length = std::clamp(count, 0, GetLength() - start);
    if (length == GetLength())
        return *this;
    return View().substr(static_cast<std::size_t>(start), static_cast<std::size_t>(length));
}

CString& CString::Trim(std::wstring_view characters)
{
    // Both at once: `characters` may be part of this text.
    const std::size_t first = View().find_first_not_of(characters);
    const std::size_t last = View().find_last_not_of(characters);
    return *this = first == std::wstring_view::npos
                       ? CString()
                       : Mid(Position(first), Position(last) + 1 - Position(first));
}

CString& CString::TrimLeft(std::wstring_view characters)
{
    const std::size_t first = View().find_first_not_of(characters);
    return *this = first == std::wstring_view::npos ? CString() : Mid(Position(first));
}

CString& CString::TrimRight(std::wstring_view characters)
{
    return *this = Left(Position(View().find_last_not_of(characters)) + 1);
}

int CString::Replace(std::wstring_view from, std::wstring_view to)
{
    if (from.empty())
        return 0;
    CString result;
    int count = 0;
    std::size_t done = 0;
    for (std::size_t at; (at = View().find(from, done)) != std::wstring_view::npos; ++count) {
        result.Append(View().substr(done, at - done)).Append(to);
        done = at + from.size();
    }
    if (count > 0) {
        result.Append(View().substr(done));
        *this = std::move(result);
    }
    return count;
}

void CString::Empty() noexcept
{
    // The other owners of a shared text keep it.
    if (IsShared()) {
        *this = CString();
    } else {
        EndExtend(m_data->Text());
    }
}

CString& CString::Append(std::wstring_view text)
{
    if (text.size() <= static_cast<std::size_t>(m_data->capacity - m_data->length) && !IsShared()) {
        EndExtend(std::copy(text.begin(), text.end(), m_data->Text() + m_data->length));
    } else if (!text.empty()) {
        // `text` may be part of this string: keep its memory until it is copied.
        const CString keep(*this);
        EndExtend(std::copy(text.begin(), text.end(), Extend(text.size())));
    }
    return *this;
}

void CString::MakeRoom(std::size_t room)
{
    const auto length = static_cast<std::size_t>(m_data->length);
    const auto capacity = static_cast<std::size_t>(m_data->capacity);
    if (room > kMaxLength - length)
        dcm::ThrowResult(E_OUTOFMEMORY);
    // Half as much again, so that a text that grows piece by piece is copied only a few times.
    const std::size_t grown =
        length + room > capacity ? std::min(capacity + capacity / 2, kMaxLength) : capacity;
    dcm::CStringData* const data = NewData(std::max(length + room, grown));
    if (length > 0) {
        std::wmemcpy(data->Text(), m_data->Text(), length + 1);
        data->length = m_data->length;
    }
    Release();
    m_data = data;
}

void CString::Release() noexcept
{
    if (IsStatic(*m_data))
        return;
    // A count of 1 cannot change: only this owner could share the text again.
    if (m_data->references.load(std::memory_order_acquire) == 1 ||
        m_data->references.fetch_sub(1, std::memory_order_acq_rel) == 1)
        ::operator delete(m_data);
}
