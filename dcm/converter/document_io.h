#pragma once

#include "dcm/converter/dcmconverter.h"
#include "dcm/platform/cstring.h"
#include "dcm/textfile/file_text.h"

#include <cstddef>
#include <list>
#include <string_view>

class PravFile;

#include <tuple>

/// Import and export of a document with what hosts do not see: how far they came, and why they
/// failed.
namespace dcm {

class ImportReport;

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

    /// What the document's Import does; failures are raised. `stage` is how far it came.
    /// Nothing is reported when `report` is null.
    static void Import(DCMConverter& document, const CString& path, FileStage& stage,
                       ImportReport* report);
    /// The same for Export. Returns false when the system does not answer for the open file:
    /// nothing is written then.
    static bool Export(const DCMConverter& document, const CString& path, FileStage& stage);

    /// Reads one block; `report` may be null. With `keep` the report keeps the block in mind, which
    /// must stay in the document.
    static void Read(DCMConverter& document, FileBlock& block, ImportReport* report, bool keep);
    /// Removes all blocks and keeps the rest.
    static void DropBlocks(DCMConverter& document) noexcept;
    /// Writes the header text, and the line of the version.
    static void WriteHeader(const DCMConverter& document, PravFile& file);
    static void WriteFormat(const DCMConverter& document, PravFile& file);
    /// What `SetVersion` has set.
    static double Version(const DCMConverter& document);
    static const std::list<DCMStuetzstellenverteilung>& Distributions(const DCMConverter& document);
    /// The keyword of the kind with this index.
    static std::wstring_view KeywordOf(std::size_t kind);
};

} // namespace dcm
