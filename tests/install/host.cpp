// A host as users write it: it writes a file, reads it and handles an error.
#include "dcm/library/dcm.h"

#include <cstdio>
#include <string>

int main()
{
    const std::string version = std::to_string(DCM_VERSION_MAJOR) + "." +
                                std::to_string(DCM_VERSION_MINOR) + "." +
                                std::to_string(DCM_VERSION_PATCH);
    if (dcm::LibraryVersion() != version)
        return std::puts("headers and library differ in version"), 1;

    DCMFestwert block;
    block.SetValue(CComVariant(2.5));
    DCMConverter written, read;
    written.AddFestwert(block);
    if (written.Export(L"host.dcm") != S_OK || read.Import(L"host.dcm") != S_OK ||
        read.GetFestwerte().front().GetValueType() != VT_R8)
        return std::puts("the block does not come back"), 1;

    try {
        PravFile(L"missing.dcm", CFile::modeRead);
    } catch (const CFileException& e) {
        return e.m_cause == CFileException::fileNotFound ? 0 : 1;
    }
    return std::puts("opening a missing file does not fail"), 1;
}
