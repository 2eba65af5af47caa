#include "tools/system/system.h"

#include "dcm/library/dcm.h"
#include "tools/trouble.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstddef>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include <fcntl.h>
#include <io.h>
#include <windows.h>

namespace dcm::tools {

namespace {

/// The wide form of a path in UTF-8.
std::wstring Wide(const std::string& path)
{
    return std::wstring(FromUtf8(path).View());
}

/// What the system says of an error.
std::string SystemWords(DWORD error)
{
    std::array<wchar_t, 512> text = {};
    DWORD length =
        FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr, error,
                       0, text.data(), static_cast<DWORD>(text.size()), nullptr);
    while (length > 0 && (text[length - 1] <= L' ' || text[length - 1] == L'.'))
        --length;
    if (length == 0)
        return "error " + std::to_string(error);
    return ToUtf8({text.data(), length});
}

std::string SystemWords()
{
    return SystemWords(GetLastError());
}

/// Ends the program's use of a handle.
class Handle
{
public:
    explicit Handle(HANDLE handle) : m_handle(handle) {}
    Handle(const Handle&) = delete;
    Handle& operator=(const Handle&) = delete;
    ~Handle() { Close(); }

    HANDLE Get() const { return m_handle; }
    bool IsOpen() const { return m_handle != INVALID_HANDLE_VALUE; }
    void Close()
    {
        if (IsOpen())
            CloseHandle(m_handle);
        m_handle = INVALID_HANDLE_VALUE;
    }

private:
    HANDLE m_handle;
};

/// Writes all of `content`; false, with the system's last error, when that fails.
bool WriteAll(HANDLE file, std::string_view content)
{
    constexpr std::size_t kMost = 1U << 30U;
    while (!content.empty()) {
        DWORD written = 0;
        if (!::WriteFile(file, content.data(), static_cast<DWORD>(std::min(content.size(), kMost)),
                         &written, nullptr))
            return false;
        content.remove_prefix(written);
    }
    return true;
}

/// The file that an interrupt has to remove; null for none.
std::atomic<const wchar_t*> copyToRemove = nullptr;
std::atomic<int> holds = 0;
std::atomic<bool> interrupted = false;

/// Runs on a thread of the system's own.
BOOL WINAPI OnInterrupt(DWORD)
{
    if (holds > 0) {
        interrupted = true;
        return TRUE;
    }
    if (const wchar_t* const path = copyToRemove)
        DeleteFileW(path);
    return FALSE;
}

std::wstring TemporaryName(const std::wstring& folder)
{
    std::array<wchar_t, MAX_PATH + 1> name = {};
    return GetTempFileNameW(folder.c_str(), L"dcm", 0, name.data()) == 0
               ? std::wstring()
               : std::wstring(name.data());
}

std::wstring FolderOf(const std::wstring& path)
{
    const std::size_t end = path.find_last_of(L"\\/:");
    return end == path.npos ? L"." : path.substr(0, end + 1);
}

void WriteDirectly(const std::string& path, std::string_view content)
{
    const Handle file(CreateFileW(Wide(path).c_str(), GENERIC_WRITE,
                                  FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr, OPEN_EXISTING, 0,
                                  nullptr));
    if (!file.IsOpen() || !WriteAll(file.Get(), content))
        throw Trouble(path + ": cannot write: " + SystemWords());
}

/// Whether the path leads to a device, such as `nul`.
bool IsDevice(const std::wstring& path)
{
    const Handle file(CreateFileW(path.c_str(), GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE,
                                  nullptr, OPEN_EXISTING, 0, nullptr));
    return file.IsOpen() && GetFileType(file.Get()) != FILE_TYPE_DISK;
}

} // namespace

bool IsTerminal(Stream stream)
{
    DWORD mode = 0;
    return GetConsoleMode(
               GetStdHandle(stream == Stream::kOutput ? STD_OUTPUT_HANDLE : STD_ERROR_HANDLE),
               &mode) != 0;
}

void PrepareStreams()
{
    SetConsoleCtrlHandler(OnInterrupt, TRUE);
    for (std::FILE* const stream : {stdout, stderr})
        _setmode(_fileno(stream), _O_BINARY);
    if (!IsTerminal(Stream::kOutput) && !IsTerminal(Stream::kError))
        return;
    SetConsoleOutputCP(CP_UTF8);
    for (const DWORD name : {STD_OUTPUT_HANDLE, STD_ERROR_HANDLE}) {
        DWORD mode = 0;
        if (GetConsoleMode(GetStdHandle(name), &mode))
            SetConsoleMode(GetStdHandle(name), mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING);
    }
}

InputCopy::InputCopy()
{
    std::array<wchar_t, MAX_PATH + 1> folder = {};
    GetTempPathW(static_cast<DWORD>(folder.size()), folder.data());
    static std::wstring name;
    name = TemporaryName(folder.data());
    if (name.empty())
        throw Trouble("<stdin>: cannot keep a copy: " + SystemWords());
    m_path = ToUtf8(name);
    copyToRemove = name.c_str();
    try {
        Copy();
    } catch (...) {
        DeleteFileW(name.c_str());
        copyToRemove = nullptr;
        throw;
    }
}

void InputCopy::Copy() const
{
    const Handle file(CreateFileW(Wide(m_path).c_str(), GENERIC_WRITE, FILE_SHARE_DELETE, nullptr,
                                  CREATE_ALWAYS, FILE_ATTRIBUTE_TEMPORARY, nullptr));
    if (!file.IsOpen())
        throw Trouble("<stdin>: cannot keep a copy: " + SystemWords());
    std::array<char, 65536> buffer;
    for (;;) {
        DWORD count = 0;
        if (!ReadFile(GetStdHandle(STD_INPUT_HANDLE), buffer.data(),
                      static_cast<DWORD>(buffer.size()), &count, nullptr) &&
            GetLastError() != ERROR_BROKEN_PIPE)
            throw Trouble("<stdin>: cannot read: " + SystemWords());
        if (count == 0)
            return;
        if (!WriteAll(file.Get(), {buffer.data(), count}))
            throw Trouble("<stdin>: cannot keep a copy: " + SystemWords());
    }
}

InputCopy::~InputCopy()
{
    copyToRemove = nullptr;
    DeleteFileW(Wide(m_path).c_str());
}

HoldInterrupts::HoldInterrupts()
{
    ++holds;
}

HoldInterrupts::~HoldInterrupts()
{
    if (--holds == 0 && interrupted)
        ExitProcess(static_cast<UINT>(STATUS_CONTROL_C_EXIT));
}

void WriteWholeFile(const std::string& path, std::string_view content)
{
    const HoldInterrupts hold;
    const std::wstring target = Wide(path);
    const DWORD attributes = GetFileAttributesW(target.c_str());
    if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0)
        throw Trouble(path + ": cannot write: it is a folder");
    if (IsDevice(target)) {
        WriteDirectly(path, content);
        return;
    }

    const std::wstring name = TemporaryName(FolderOf(target));
    if (name.empty())
        throw Trouble(path + ": cannot create: " + SystemWords());
    Handle file(CreateFileW(name.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr));
    bool written =
        file.IsOpen() && WriteAll(file.Get(), content) && FlushFileBuffers(file.Get()) != 0;
    DWORD error = GetLastError();
    file.Close();
    if (written) {
        written = MoveFileExW(name.c_str(), target.c_str(),
                              MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != 0;
        error = GetLastError();
    }
    if (!written) {
        DeleteFileW(name.c_str());
        throw Trouble(path + ": cannot write: " + SystemWords(error));
    }
}

} // namespace dcm::tools
