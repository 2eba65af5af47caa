#include "dcm/textfile/fileblock.h"

#include "dcm/platform/exception.h"

#include <limits>

namespace dcm {

HostBlock::HostBlock(std::wstring_view text) : m_text(FileTextOfHost(text)), m_block(m_text)
{
    if (m_text.size > std::numeric_limits<std::uint32_t>::max())
        ThrowResult(E_OUTOFMEMORY);
    std::string_view rest = m_text.Bytes();
    if (rest.starts_with('\n'))
        return;
    for (std::size_t end = 0; (end = rest.find('\n')) != rest.npos; rest.remove_prefix(end + 1))
        m_block.AddLine(rest.substr(0, end));
}

} // namespace dcm
