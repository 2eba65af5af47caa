#include "dcm/platform/replacement_file.h"

#include <cstddef>
#include <string>

namespace dcm::system {

namespace {

HANDLE HandleOf(FileHandle file)
{
    return reinterpret_cast<HANDLE>(file);
}

long LastError()
{
    return static_cast<long>(GetLastError());
}

HANDLE OpenToWrite(const wchar_t* path, DWORD creation)
{
    constexpr DWORD kShareWithNobody = 0;
    return CreateFileW(path, GENERIC_WRITE, kShareWithNobody, nullptr, creation,
                       FILE_ATTRIBUTE_NORMAL, nullptr);
}

/// The path of an open file itself, with all links followed.
CString FinalPath(HANDLE file)
{
    std::wstring path(MAX_PATH, L'\0');
    for (;;) {
        const auto room = static_cast<DWORD>(path.size());
        const DWORD size = GetFinalPathNameByHandleW(file, path.data(), room, FILE_NAME_NORMALIZED);
        if (size < room) {
            path.resize(size);
            return CString(path);
        }
        path.resize(size);
    }
}

bool IsLink(const wchar_t* path)
{
    const DWORD attributes = GetFileAttributesW(path);
    return attributes != INVALID_FILE_ATTRIBUTES &&
           (attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
}

void LetGo(Replacement& replacement)
{
    if (replacement.held != kNoFile)
        CloseHandle(HandleOf(replacement.held));
    replacement.held = kNoFile;
}

} // namespace

long FindTarget(const CString& path, Replacement& replacement, CFileException::Cause& refusal)
{
    replacement.target = path;
    // A link to a missing file creates that file, as writing through the link would.
    const HANDLE file = OpenToWrite(path, IsLink(path) ? OPEN_ALWAYS : OPEN_EXISTING);
    if (file == INVALID_HANDLE_VALUE)
        return GetLastError() == ERROR_FILE_NOT_FOUND ? 0 : LastError();
    replacement.held = reinterpret_cast<FileHandle>(file);
    const DWORD type = GetFileType(file);
    if (type == FILE_TYPE_CHAR) {
        replacement.device = true;
        LetGo(replacement);
    } else if (type != FILE_TYPE_DISK) {
        refusal = CFileException::accessDenied;
    } else if (IsLink(path)) {
        const CString target = FinalPath(file);
        if (!target.IsEmpty())
            replacement.target = target;
    }
    return 0;
}

CString FolderOf(const CString& target)
{
    const std::size_t separator = target.View().find_last_of(L"\\/:");
    return separator == std::wstring_view::npos ? CString()
                                                : CString(target.View().substr(0, separator + 1));
}

long CreateBeside(const CString& path, const Replacement& replacement)
{
    const HANDLE file = OpenToWrite(path, CREATE_NEW);
    if (file == INVALID_HANDLE_VALUE)
        return LastError();
    CloseHandle(file);
    if (replacement.held == kNoFile)
        return 0;
    const DWORD attributes = GetFileAttributesW(replacement.target);
    if (attributes != INVALID_FILE_ATTRIBUTES && SetFileAttributesW(path, attributes))
        return 0;
    const long error = LastError();
    DeleteFileW(path);
    return error;
}

long TakePlace(Replacement& replacement)
{
    const HANDLE file = OpenToWrite(replacement.file, OPEN_EXISTING);
    if (file == INVALID_HANDLE_VALUE)
        return LastError();
    const long error = FlushFileBuffers(file) ? 0 : LastError();
    CloseHandle(file);
    if (error != 0)
        return error;
    // The system replaces no file that is open.
    LetGo(replacement);
    if (!MoveFileExW(replacement.file, replacement.target,
                     MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH))
        return LastError();
    replacement.file.Empty();
    return 0;
}

void Abandon(Replacement& replacement) noexcept
{
    LetGo(replacement);
    if (!replacement.file.IsEmpty())
        DeleteFileW(replacement.file);
    replacement.file.Empty();
}

} // namespace dcm::system
