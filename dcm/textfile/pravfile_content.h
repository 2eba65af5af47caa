#pragma once

#include "dcm/textfile/file_text.h"
#include "dcm/textfile/pravfile.h"

#include <cstddef>
#include <cstdint>
#include <string_view>

/// The text of the open file and how much of it has been handed out.
struct PravFile::Content
{
    dcm::FileText m_strContent;
    std::int32_t m_nReadPos = 0;
    /// The number of the line at `m_nReadPos`, counted from 1.
    std::int32_t m_nLine = 1;

    std::string_view Rest() const
    {
        return m_strContent.Bytes().substr(static_cast<std::size_t>(m_nReadPos));
    }
    void SetRest(std::string_view rest)
    {
        m_nReadPos = static_cast<std::int32_t>(m_strContent.Bytes().size() - rest.size());
    }
};
