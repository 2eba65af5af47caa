#include "dcm/converter/dcmconverter.h"

#include "dcm/converter/document_io.h"
#include "dcm/converter/import_report.h"
#include "dcm/elements/block_io.h"
#include "dcm/elements/block_report.h"
#include "dcm/elements/keywords.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <new>
#include <string_view>
#include <utility>

/// What belongs to one kind of block: how it comes in and how its list goes out.
struct dcm::DocumentIo::Kind
{
    std::wstring_view keyword;
    HRESULT (DCMConverter::*insert)(const FileBlock& block);
    HRESULT (DCMConverter::*write)(PravFile& file) const;
};

/// The kinds in the order in which they are exported.
const dcm::DocumentIo::Kind dcm::DocumentIo::kKinds[] = {
    {keyword::kFestwert, &DCMConverter::InsertFestwert, &DCMConverter::WriteFestwerte},
    {keyword::kFestwerteblock, &DCMConverter::InsertFestwerteBlock,
     &DCMConverter::WriteFestwerteblock},
    {keyword::kStuetzstellenverteilung, &DCMConverter::InsertStuetzstellenverteilung,
     &DCMConverter::WriteStuetzstellenverteilung},
    {keyword::kKennlinie, &DCMConverter::InsertKennlinie, &DCMConverter::WriteKennlinie},
    {keyword::kFestkennlinie, &DCMConverter::InsertFestKennlinie,
     &DCMConverter::WriteFestKennlinie},
    {keyword::kGruppenkennlinie, &DCMConverter::InsertGruppenKennlinie,
     &DCMConverter::WriteGruppenKennlinie},
    {keyword::kKennfeld, &DCMConverter::InsertKennfeld, &DCMConverter::WriteKennfeld},
    {keyword::kFestkennfeld, &DCMConverter::InsertFestKennfeld, &DCMConverter::WriteFestKennfeld},
    {keyword::kGruppenkennfeld, &DCMConverter::InsertGruppenKennfeld,
     &DCMConverter::WriteGruppenKennfeld},
    {keyword::kTextstring, &DCMConverter::InsertTextstring, &DCMConverter::WriteTextstring},
};

namespace {

constexpr std::string_view kCommentMark = "* ";

/// Reads a new block and stores it unless its reader rejects it.
template <class Block>
HRESULT Insert(std::list<Block>& blocks, const dcm::FileBlock& block)
{
    std::list<Block> fresh(1);
    const HRESULT result = dcm::BlockIo::Read(block, fresh.front());
    if (SUCCEEDED(result)) {
        blocks.splice(blocks.end(), fresh);
        if (block.Report() != nullptr)
            block.Report()->SetStored(&blocks.back());
    }
    return result;
}

/// Writes each block's text. The stored blocks do not change: only the export of a block that the
/// host holds empties a unit of one blank.
template <class Block>
HRESULT Write(const std::list<Block>& blocks, PravFile& file)
{
    auto text = dcm::FileTextBuilder::ForFile();
    for (const Block& block : blocks) {
        text.Clear();
        dcm::BlockIo::Compose(block, text);
        dcm::WriteText(text, file);
    }
    return S_OK;
}

} // namespace

DCMConverter::DCMConverter() = default;

DCMConverter& DCMConverter::operator=(const DCMConverter& other)
{
    DCMConverter copy(other);
    return *this = std::move(copy);
}

DCMConverter::~DCMConverter() = default;

HRESULT DCMConverter::Import(const CString& strPath)
{
    try {
        auto stage = dcm::FileStage::kOpening;
        dcm::DocumentIo::Import(*this, strPath, stage, nullptr);
        return S_OK;
    } catch (...) {
        return E_UNEXPECTED;
    }
}

void dcm::DocumentIo::Import(DCMConverter& document, const CString& path, FileStage& stage,
                             ImportReport* report)
{
    PravFile file;
    CFileException error;
    stage = FileStage::kOpening;
    if (!file.CFile::Open(path, CFile::modeRead, &error))
        throw CFileException(error);
    stage = FileStage::kReading;
    BlockIo::Load(file);
    stage = FileStage::kBlocks;
    document.m_bBlockSeen = 0;
    FileBlock block;
    if (report != nullptr)
        report->BeginText(BlockIo::TextOf(file), 1);
    while (BlockIo::Next(file, block))
        Read(document, block, report, true);
    if (report != nullptr) {
        const bool lineEnds = BlockIo::AddRest(file, block);
        report->Unfinished(block, lineEnds);
        report->End(document);
    }
}

void dcm::DocumentIo::Read(DCMConverter& document, FileBlock& block, ImportReport* report,
                           bool keep)
{
    if (report == nullptr) {
        document.AnalyzeToken(block);
        return;
    }
    BlockReport& lines = report->Block();
    block.SetReport(&lines);
    lines.SetStored(nullptr);
    try {
        document.AnalyzeToken(block);
    } catch (const std::bad_alloc&) {
        lines.Add(FindingKind::kOutOfMemory, {L"Memory ran out in this block."});
        throw;
    } catch (...) {
        lines.Add(FindingKind::kStopped,
                  {L"The line has no value where one must be; the import ends with it."});
        throw;
    }
    if (keep && lines.Stored() != nullptr) {
        report->Keep(*lines.Stored(), lines.Kind(), lines.FirstLine(), lines.VariantLines(),
                     lines.HasReferenceX() || lines.HasReferenceY());
    }
}

void dcm::DocumentIo::DropBlocks(DCMConverter& document) noexcept
{
    document.m_listFestwerte.clear();
    document.m_listFestwerteblock.clear();
    document.m_listStuetzstellenverteilung.clear();
    document.m_listKennlinie.clear();
    document.m_listFestkennlinie.clear();
    document.m_listGruppenkennlinie.clear();
    document.m_listKennfeld.clear();
    document.m_listFestkennfeld.clear();
    document.m_listGruppenkennfeld.clear();
    document.m_listTextstring.clear();
}

void dcm::DocumentIo::WriteHeader(const DCMConverter& document, PravFile& file)
{
    document.WriteHeader(file);
}

void dcm::DocumentIo::WriteFormat(const DCMConverter& document, PravFile& file)
{
    document.WriteFormat(file);
}

double dcm::DocumentIo::Version(const DCMConverter& document)
{
    return document.m_format.GetValue();
}

const std::list<DCMStuetzstellenverteilung>&
dcm::DocumentIo::Distributions(const DCMConverter& document)
{
    return document.m_listStuetzstellenverteilung;
}

std::wstring_view dcm::DocumentIo::KeywordOf(std::size_t kind)
{
    return kKinds[kind].keyword;
}

/// Takes the text before the first blank as the keyword of the block. No keyword goes beyond the
/// first line.
HRESULT DCMConverter::AnalyzeToken(const dcm::FileBlock& block)
{
    if (block.LineCount() == 0)
        return S_OK;
    dcm::BlockReport* const report = block.Report();
    const std::string_view line = block.Line(0);
    // Without a blank this is no keyword.
    const std::string_view keyword = line.substr(0, std::min(line.find(' '), line.size()));
    const bool blankFollows = keyword.size() < line.size();
    const auto& kinds = dcm::DocumentIo::kKinds;
    const auto* const kind = std::find_if(std::begin(kinds), std::end(kinds), [&](const auto& k) {
        return blankFollows && dcm::EqualsNoCase(keyword, k.keyword);
    });
    if (kind != std::end(kinds)) {
        if (report != nullptr)
            report->BeginKind(block, static_cast<std::size_t>(kind - std::begin(kinds)));
        // A block that its parser rejects is dropped, but it ends the comment like any other.
        (this->*kind->insert)(block);
        m_bBlockSeen = 1;
    } else if (blankFollows && dcm::EqualsNoCase(keyword, dcm::keyword::kKonservierungFormat)) {
        if (report != nullptr)
            report->Version(block);
        InsertKonservierungsFormat(block);
        m_bBlockSeen = 1;
    } else if (blankFollows && dcm::EqualsNoCase(keyword, dcm::keyword::kComment) &&
               m_bBlockSeen == 0) {
        if (report != nullptr)
            report->Comment(block);
        InsertKommentar(block);
    } else if (report != nullptr) {
        report->Skipped(block, false);
    }
    return S_OK;
}

/// Removes the marks in one pass, so that a mark which forms anew stays.
HRESULT DCMConverter::InsertKommentar(const dcm::FileBlock& block)
{
    CString comment;
    for (std::size_t i = 0; i < block.LineCount(); ++i) {
        std::string_view rest = block.Line(i);
        std::size_t mark = 0;
        while ((mark = rest.find(kCommentMark)) != rest.npos) {
            block.Text().AppendWide(comment, rest.substr(0, mark));
            rest.remove_prefix(mark + kCommentMark.size());
        }
        block.Text().AppendWide(comment, rest);
        comment.Append(L"\n");
    }
    m_strComment = std::move(comment);
    return S_OK;
}

/// The version that a file declares changes nothing in the document.
HRESULT DCMConverter::InsertKonservierungsFormat(const dcm::FileBlock&)
{
    return S_OK;
}

HRESULT DCMConverter::InsertFestwert(const dcm::FileBlock& block)
{
    return Insert(m_listFestwerte, block);
}

HRESULT DCMConverter::InsertFestwerteBlock(const dcm::FileBlock& block)
{
    return Insert(m_listFestwerteblock, block);
}

HRESULT DCMConverter::InsertStuetzstellenverteilung(const dcm::FileBlock& block)
{
    return Insert(m_listStuetzstellenverteilung, block);
}

HRESULT DCMConverter::InsertKennlinie(const dcm::FileBlock& block)
{
    return Insert(m_listKennlinie, block);
}

HRESULT DCMConverter::InsertFestKennlinie(const dcm::FileBlock& block)
{
    return Insert(m_listFestkennlinie, block);
}

HRESULT DCMConverter::InsertGruppenKennlinie(const dcm::FileBlock& block)
{
    return Insert(m_listGruppenkennlinie, block);
}

HRESULT DCMConverter::InsertKennfeld(const dcm::FileBlock& block)
{
    return Insert(m_listKennfeld, block);
}

HRESULT DCMConverter::InsertFestKennfeld(const dcm::FileBlock& block)
{
    return Insert(m_listFestkennfeld, block);
}

HRESULT DCMConverter::InsertGruppenKennfeld(const dcm::FileBlock& block)
{
    return Insert(m_listGruppenkennfeld, block);
}

HRESULT DCMConverter::InsertTextstring(const dcm::FileBlock& block)
{
    return Insert(m_listTextstring, block);
}

HRESULT DCMConverter::AddFestwert(const DCMFestwert& block)
{
    m_listFestwerte.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddFestwerteblock(const DCMFestwerteblock& block)
{
    m_listFestwerteblock.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddStuetzstellenverteilung(DCMStuetzstellenverteilung block)
{
    m_listStuetzstellenverteilung.push_back(std::move(block));
    return S_OK;
}

HRESULT DCMConverter::AddKennlinie(const DCMKennlinie& block)
{
    m_listKennlinie.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddFestkennlinie(const DCMFestkennlinie& block)
{
    m_listFestkennlinie.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddGruppenkennlinie(const DCMGruppenkennlinie& block)
{
    m_listGruppenkennlinie.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddKennfeld(const DCMKennfeld& block)
{
    m_listKennfeld.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddFestkennfeld(const DCMFestkennfeld& block)
{
    m_listFestkennfeld.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddGruppenkennfeld(const DCMGruppenkennfeld& block)
{
    m_listGruppenkennfeld.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::AddTextstring(const DCMTextstring& block)
{
    m_listTextstring.push_back(block);
    return S_OK;
}

HRESULT DCMConverter::Export(const CString& strPath) const
{
    try {
        auto stage = dcm::FileStage::kOpening;
        dcm::DocumentIo::Export(*this, strPath, stage);
        return S_OK;
    } catch (...) {
        return E_UNEXPECTED;
    }
}

bool dcm::DocumentIo::Export(const DCMConverter& document, const CString& path, FileStage& stage)
{
    stage = FileStage::kOpening;
    PravFile file(path, CFile::modeCreate | CFile::modeWrite);
    stage = FileStage::kBlocks;
    CFileStatus status;
    if (!file.GetStatus(status))
        return false;
    // Every writer returns 0: what fails is thrown.
    document.WriteHeader(file);
    document.WriteFormat(file);
    for (const Kind& kind : kKinds)
        (document.*kind.write)(file);
    file.Close();
    return true;
}

HRESULT DCMConverter::WriteHeader(PravFile& file) const
{
    return m_header.Export(file);
}

HRESULT DCMConverter::WriteFormat(PravFile& file) const
{
    return m_format.Export(file);
}

HRESULT DCMConverter::WriteFestwerte(PravFile& file) const
{
    return Write(m_listFestwerte, file);
}

HRESULT DCMConverter::WriteFestwerteblock(PravFile& file) const
{
    return Write(m_listFestwerteblock, file);
}

HRESULT DCMConverter::WriteStuetzstellenverteilung(PravFile& file) const
{
    return Write(m_listStuetzstellenverteilung, file);
}

HRESULT DCMConverter::WriteKennlinie(PravFile& file) const
{
    return Write(m_listKennlinie, file);
}

HRESULT DCMConverter::WriteFestKennlinie(PravFile& file) const
{
    return Write(m_listFestkennlinie, file);
}

HRESULT DCMConverter::WriteGruppenKennlinie(PravFile& file) const
{
    return Write(m_listGruppenkennlinie, file);
}

HRESULT DCMConverter::WriteKennfeld(PravFile& file) const
{
    return Write(m_listKennfeld, file);
}

HRESULT DCMConverter::WriteFestKennfeld(PravFile& file) const
{
    return Write(m_listFestkennfeld, file);
}

HRESULT DCMConverter::WriteGruppenKennfeld(PravFile& file) const
{
    return Write(m_listGruppenkennfeld, file);
}

HRESULT DCMConverter::WriteTextstring(PravFile& file) const
{
    return Write(m_listTextstring, file);
}
