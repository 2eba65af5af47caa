#include "dcm/elements/block_io.h"

#include "dcm/textfile/pravfile.h"

void dcm::BlockIo::Load(PravFile& file)
{
    file.LoadContent(CFile::modeRead);
}

bool dcm::BlockIo::Next(PravFile& file, FileBlock& block)
{
    return file.ReadBlock(block);
}
