#pragma once

#include "dcm/converter/dcmconverter.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/findings.h"

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
