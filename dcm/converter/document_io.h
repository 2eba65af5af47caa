#pragma once

#include "dcm/converter/dcmconverter.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/findings.h"

#include <tuple>

/// Import and export of a document with what hosts do not see: how far they came, and why they
/// failed.
namespace dcm {

/// How far an import or export has come.
enum class FileStage : unsigned char
{
    kOpening,
    /// The whole text of a file.
    kReading,
    kBlocks,
};

/// The one friend of the document.
struct DocumentIo
{
    /// The kinds of blocks, in the order in which they are exported.
    struct Kind;
    static const Kind kKinds[];

    /// The lists of blocks of a document, constant or not, in the order in which they are exported.
    template <class Document>
    static auto Lists(Document& document)
    {
        return std::tie(document.m_listFestwerte, document.m_listFestwerteblock,
                        document.m_listStuetzstellenverteilung, document.m_listKennlinie,
                        document.m_listFestkennlinie, document.m_listGruppenkennlinie,
                        document.m_listKennfeld, document.m_listFestkennfeld,
                        document.m_listGruppenkennfeld, document.m_listTextstring);
    }

    /// What the document's Import does; failures are raised. `stage` tells how far it came.
    /// Nothing is reported when `findings` is null.
    static void Import(DCMConverter& document, const CString& path, FileStage& stage,
                       FindingList* findings);
    /// The same for Export. Returns false when the system does not answer for the open file:
    /// nothing is written then.
    static bool Export(const DCMConverter& document, const CString& path, FileStage& stage,
                       FindingList* findings);
};

} // namespace dcm
