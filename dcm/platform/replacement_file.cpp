#include "dcm/platform/replacement_file.h"

#include "dcm/platform/codepage.h"

#include <array>
#include <charconv>
#include <cstdint>
#include <random>
#include <string_view>

namespace dcm {

namespace {

/// A name that no other file has by chance. It is short: that of the target may be as long as names
/// can be.
CString NewName()
{
    std::random_device random;
    const std::uint64_t number = std::uint64_t{random()} << 32 | random();
    std::array<char, 16> digits{};
    const char* const end =
        std::to_chars(digits.data(), digits.data() + digits.size(), number, 16).ptr;
    CString name(L".dcm-");
    name += FromUtf8({digits.data(), end});
    name += L".tmp";
    return name;
}

} // namespace

ReplacementFile::ReplacementFile(const CString& path) : m_path(path)
{
    try {
        auto refusal = CFileException::none;
        const long error = system::FindTarget(path, m_replacement, refusal);
        Check(error, refusal);
        if (m_replacement.device)
            return;
        const CString file = system::FolderOf(m_replacement.target) + NewName();
        Check(system::CreateBeside(file, m_replacement), CFileException::none);
        m_replacement.file = file;
    } catch (...) {
        system::Abandon(m_replacement);
        throw;
    }
}

ReplacementFile::~ReplacementFile()
{
    system::Abandon(m_replacement);
}

void ReplacementFile::TakePlace()
{
    if (!m_replacement.device)
        Check(system::TakePlace(m_replacement), CFileException::none);
}

void ReplacementFile::Check(long error, CFileException::Cause refusal) const
{
    if (refusal == CFileException::none && error != 0)
        refusal = system::CauseOf(error);
    if (refusal != CFileException::none)
        throw CFileException(refusal, error, m_path);
}

} // namespace dcm
