// A host as a user of the library writes it: writes a file, reads it, and meets an error.
#include "dcm/library/dcm.h"

#include <cstdio>
#include <string>
#include <vector>

int main()
{
    const std::string version = std::to_string(DCM_VERSION_MAJOR) + "." +
                                std::to_string(DCM_VERSION_MINOR) + "." +
                                std::to_string(DCM_VERSION_PATCH);
    if (dcm::LibraryVersion() != version)
        return std::puts("headers and library differ in version"), 1;

    DCMKennlinie curve;
    curve.SetName(L"Curve");
    for (const double x : {1.0, 2.5}) {
        curve.AddAxis(CComVariant(x));
        curve.AddValue(CComVariant(L"text"));
    }
    DCMConverter written;
    written.AddKennlinie(curve);
    DCMConverter read;
    std::vector<CComVariant> axis;
    if (written.Export(L"host.dcm") != S_OK || read.Import(L"host.dcm") != S_OK ||
        read.GetKennlinie().front().GetAxis(axis) != S_OK || axis.size() != 2 ||
        axis[1].dblVal != 2.5)
        return std::puts("the curve does not come back"), 1;

    try {
        PravFile(L"missing.dcm", CFile::modeRead);
    } catch (const CFileException& e) {
        return e.m_cause == CFileException::fileNotFound ? 0 : 1;
    }
    return std::puts("a missing file is not missed"), 1;
}
