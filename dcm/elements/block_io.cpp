#include "dcm/elements/block_io.h"

#include "dcm/textfile/pravfile.h"

void dcm::BlockIo::Load(PravFile& file)
{
    file.LoadContent(CFile::modeRead);
}

bool dcm::BlockIo::AddRest(PravFile& file, FileBlock& block)
{
    return file.AddRest(block);
}

const dcm::FileText& dcm::BlockIo::TextOf(const PravFile& file)
{
    return file.Text();
}

bool dcm::BlockIo::Next(PravFile& file, FileBlock& block)
{
    return file.ReadBlock(block);
}
