#pragma once

#include "dcm/converter/document_io.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/findings.h"

class DCMConverter;

namespace dcm {

/// Exports the document as its `Export` does; failures are raised. Each piece that is written is
/// read back at once and compared with what it was made of. Returns false when the system does not
/// answer for the open file: nothing is written then.
bool ExportAndReadBack(const DCMConverter& document, const CString& path, FileStage& stage,
                       FindingList& findings);

} // namespace dcm
