#include "dcm/elements/block_io.h"

#include "dcm/textfile/file_text.h"
#include "dcm/textfile/pravfile.h"
#include "dcm/textfile/pravfile_content.h"

#include <string_view>

void dcm::BlockIo::Load(PravFile& file)
{
    file.LoadContent(CFile::modeRead);
}

bool dcm::BlockIo::AddRest(PravFile& file, FileBlock& block)
{
    const std::string_view rest = file.m_pContent->Rest();
    const std::string_view line = rest.substr(0, rest.find('\0'));
    if (!line.empty())
        block.AddLine(line);
    return line.empty();
}

const dcm::FileText& dcm::BlockIo::TextOf(const PravFile& file)
{
    return file.m_pContent->m_strContent;
}

bool dcm::BlockIo::Next(PravFile& file, FileBlock& block)
{
    if (!file.m_pContent)
        return false;
    PravFile::Content& content = *file.m_pContent;
    block.Begin(content.m_strContent, content.m_nLine);
    std::string_view rest = content.Rest();
    const bool more = TakeBlock(rest, block);
    content.SetRest(rest);
    content.m_nLine = block.LineNumber(block.LineCount()) + (more ? 1 : 0);
    return more;
}
