#include "dcm/library/read_back.h"

#include "dcm/converter/dcmconverter.h"
#include "dcm/converter/import_report.h"
#include "dcm/elements/block_io.h"
#include "dcm/library/parameter.h"
#include "dcm/platform/encoding.h"
#include "dcm/platform/text.h"
#include "dcm/textfile/file_text.h"
#include "dcm/textfile/file_text_builder.h"
#include "dcm/textfile/pravfile.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

namespace dcm {

namespace {

/// A file that keeps the piece written last.
class ExportedFile : public PravFile
{
public:
    using PravFile::PravFile;

    void Write(const void* buffer, UINT count) override
    {
        PravFile::Write(buffer, count);
        try {
            m_piece.assign(static_cast<const char*>(buffer), count);
        } catch (...) {
            m_lost = true;
        }
    }

    /// Takes the piece; `lost` is set when there was no memory for it.
    std::string TakePiece(bool& lost)
    {
        lost = std::exchange(m_lost, false);
        return std::exchange(m_piece, {});
    }

private:
    std::string m_piece;
    bool m_lost = false;
};

/// What becomes of a text.
enum class TextRole : unsigned char
{
    kName,
    kAttribute,
    kValue,
};

/// The text without quotes and white space at its ends.
std::wstring_view Trimmed(std::wstring_view text)
{
    constexpr const wchar_t* trimmed = L"\" \t\n\v\f\r";
    text.remove_prefix(std::min(text.find_first_not_of(trimmed), text.size()));
    if (text.empty())
        return text;
    return text.substr(0, text.find_last_not_of(trimmed) + 1);
}

/// What became of the characters of a text.
struct Fate
{
    /// Some were written as a full stop or a question mark, as a file cannot hold them.
    bool replaced = false;
    /// The code page lacks some.
    bool lacking = false;
    /// Others came back, or more or fewer.
    bool altered = false;
};

Fate FateOf(std::wstring_view wrote, std::wstring_view read)
{
    constexpr std::u32string_view stops = U"\n\r\t\b";
    Fate fate;
    while (!wrote.empty() && !read.empty()) {
        const char32_t from = TakeCharacter(wrote), to = TakeCharacter(read);
        if (from == to)
            continue;
        if ((to == U'.' && stops.find(from) != stops.npos) || (to == U'?' && from == U'\0')) {
            fate.replaced = true;
        } else if (to == U'?' || to == 0xFFFD) {
            fate.lacking = true;
        } else {
            fate.altered = true;
        }
    }
    fate.altered = fate.altered || wrote.empty() != read.empty();
    return fate;
}

std::wstring_view TextOf(const CComVariant& value)
{
    return CComVariant::TextOf(value);
}

bool IsNumber(const CComVariant& value)
{
    return value.vt == VT_R8;
}

bool IsText(const CComVariant& value)
{
    return value.vt == VT_BSTR;
}

std::vector<CComVariant> Chosen(const std::vector<CComVariant>& values,
                                bool (*chosen)(const CComVariant&))
{
    std::vector<CComVariant> result;
    std::copy_if(values.begin(), values.end(), std::back_inserter(result), chosen);
    return result;
}

/// Compares a parameter with what is read back of it.
class Comparer
{
public:
    Comparer(FindingList& findings, std::int64_t line, const CString& label)
        : m_findings(findings), m_line(line), m_label(label)
    {}

    void Compare(const Parameter& wrote, const Parameter& read)
    {
        CompareText(wrote.name, read.name, TextRole::kName);
        CompareText(wrote.langname, read.langname, TextRole::kAttribute);
        CompareText(wrote.displayname, read.displayname, TextRole::kAttribute);
        CompareText(wrote.function, read.function, TextRole::kAttribute);
        CompareText(wrote.unit, read.unit, TextRole::kAttribute);
        CompareAxis(wrote.x, read.x);
        CompareAxis(wrote.y, read.y);
        if (wrote.kind == Kind::kFestwerteblock)
            return CompareList(wrote, read);
        if (wrote.kind == Kind::kFestwert || wrote.kind == Kind::kTextstring)
            return CompareSingle(wrote.values, read.values);
        const bool map = wrote.kind >= Kind::kKennfeld && wrote.kind <= Kind::kGruppenkennfeld;
        const std::size_t wanted =
            map ? wrote.x.points.size() * wrote.y.points.size() : wrote.values.size();
        std::vector<CComVariant> values = wrote.values;
        if (wanted < values.size()) {
            Add(FindingKind::kSurplusValues, Severity::kError,
                {L"The map has ", values.size(), L" values where its axes ask for ", wanted,
                 L"; the others are not written."});
            values.resize(wanted);
        }
        CompareItems(values, read.values);
    }

    /// A map that is not written.
    void NothingWritten(const Parameter& wrote)
    {
        const std::size_t wanted = wrote.x.points.size() * wrote.y.points.size();
        if (wanted > wrote.values.size()) {
            Add(FindingKind::kIncompleteMap, Severity::kError,
                {L"The map has ", wrote.values.size(), L" values where its axes ask for ", wanted,
                 L"; it is not written."});
        } else {
            Add(FindingKind::kEmptyMap, Severity::kError,
                {L"The map has no axis points that can be written; it is not written."});
        }
    }

    /// Adds what the reader found altered, unless the comparison found as much.
    void AddAltered(BlockReport::Altered altered)
    {
        if (!m_worst || *m_worst < altered.severity) {
            Add(altered.kind, altered.severity,
                {L"A text is written so that what is between its quotes is another text."});
        }
    }

    void Add(FindingKind kind, Severity severity, std::initializer_list<MessagePart> message)
    {
        m_worst = m_worst ? std::max(*m_worst, severity) : severity;
        m_findings.Add(kind, severity, m_line, m_label, message);
    }
    void Add(FindingKind kind, std::initializer_list<MessagePart> message)
    {
        Add(kind, SeverityOf(kind), message);
    }

private:
    void CompareText(std::wstring_view wrote, std::wstring_view read, TextRole role)
    {
        // A unit of one blank asks for a line with an empty unit.
        if (wrote == read || (role == TextRole::kAttribute && wrote == L" " && read.empty()))
            return;
        const Fate fate = FateOf(wrote, read);
        const auto quoted = [](std::wstring_view text) { return MessagePart::Quoted(text); };
        if (!fate.altered && fate.replaced) {
            Add(FindingKind::kCharacterReplaced,
                {L"Control characters in ", quoted(wrote), L" are written as other characters."});
        }
        if (!fate.altered && fate.lacking) {
            Add(FindingKind::kNotInCodePage,
                {L"Characters of ", quoted(wrote), L" are not in the code page and are lost."});
        }
        if (!fate.altered)
            return;
        const bool trimmed = Trimmed(wrote) == Trimmed(read);
        const bool note = trimmed && role == TextRole::kAttribute;
        Add(trimmed ? FindingKind::kTextTrimmed : FindingKind::kTextAltered,
            note ? Severity::kNote : Severity::kWarning,
            {L"The text ", quoted(wrote), L" is read back as ", quoted(read), L"."});
    }

    void CompareAxis(const Axis& wrote, const Axis& read)
    {
        CompareText(wrote.unit, read.unit, TextRole::kAttribute);
        // A name that was read is not blank, so a blank one was set.
        const bool blank = wrote.distribution.View().find_first_not_of(L' ') == std::wstring::npos;
        if (!blank && read.distribution.IsEmpty()) {
            Add(FindingKind::kReferenceNotWritten,
                {L"The name of the distribution ", MessagePart::Quoted(wrote.distribution),
                 L" is not written, as it was not set for export."});
        } else {
            CompareText(wrote.distribution, read.distribution, TextRole::kName);
        }
        CompareItems(wrote.points, read.points);
    }

    void CompareSingle(const std::vector<CComVariant>& wrote, const std::vector<CComVariant>& read)
    {
        if (wrote.empty()) {
            Add(FindingKind::kNoValue, {L"The block has no value; it is written with 0.0."});
            return;
        }
        // A truth word was reported when it was read back.
        const bool truthWord = IsText(wrote.front()) && !read.empty() && IsNumber(read.front());
        if (!truthWord)
            CompareItems(wrote, read);
    }

    void CompareList(const Parameter& wrote, const Parameter& read)
    {
        const auto numbers = Chosen(wrote.values, IsNumber), texts = Chosen(wrote.values, IsText);
        if (!numbers.empty() && !texts.empty()) {
            Add(FindingKind::kNumbersAndTexts, Severity::kError,
                {L"The block has numbers and texts; its ", texts.size(),
                 L" texts are not written."});
        }
        CompareItems(numbers.empty() ? texts : numbers, read.values);
        if (wrote.countX != read.countX || wrote.countY != read.countY) {
            Add(FindingKind::kCountDiffers,
                {L"The counts ", std::int64_t{wrote.countX}, L" and ", std::int64_t{wrote.countY},
                 L" are read back as ", std::int64_t{read.countX}, L" and ",
                 std::int64_t{read.countY}, L"."});
        }
    }

    void CompareItems(const std::vector<CComVariant>& wrote, const std::vector<CComVariant>& read)
    {
        std::size_t at = 0, unwritten = 0;
        bool shifted = false;
        for (const CComVariant& item : wrote) {
            if (!IsNumber(item) && !IsText(item)) {
                ++unwritten;
            } else if (at < read.size() && item.vt == read[at].vt) {
                // An empty text that was dropped; those after it take its place.
                if (IsText(item) && TextOf(item).empty() && !TextOf(read[at]).empty()) {
                    EmptyTextDropped();
                } else {
                    CompareItem(item, read[at++]);
                }
            } else if (IsText(item) && TextOf(item).empty()) {
                EmptyTextDropped();
            } else {
                shifted = true;
            }
        }
        if (unwritten > 0) {
            Add(FindingKind::kValueNotWritten,
                {unwritten, L" entries are neither number nor text and are not written."});
        }
        if (shifted || at != read.size()) {
            Add(FindingKind::kTextAltered,
                {wrote.size() - unwritten, L" items are read back as ", read.size(), L" others."});
        }
    }

    void EmptyTextDropped()
    {
        Add(FindingKind::kEmptyTextDropped, {L"An empty text of the list is not read back."});
    }

    void CompareItem(const CComVariant& wrote, const CComVariant& read)
    {
        if (IsText(wrote))
            return CompareText(TextOf(wrote), TextOf(read), TextRole::kValue);
        if (std::bit_cast<std::uint64_t>(wrote.dblVal) == std::bit_cast<std::uint64_t>(read.dblVal))
            return;
        if (std::isnan(wrote.dblVal)) {
            Add(FindingKind::kLostNan, {L"A value is not a number and is read back as 1 or -1."});
        } else {
            Add(FindingKind::kDigitsDropped,
                {L"A value needs more digits than the 15 that rows are written with."});
        }
    }

    FindingList& m_findings;
    std::int64_t m_line;
    const CString& m_label;
    /// The worst finding so far.
    std::optional<Severity> m_worst;
};

/// Whether a curve has numbers that no file holds.
bool HasUnwrittenNumbers(const DCMKennlinie& block)
{
    return !block.GetAxis().empty() || !block.GetValues().empty();
}

template <class Block>
bool HasUnwrittenNumbers(const Block&)
{
    return false;
}

/// Reads back the pieces of a file, one after the other.
class Reader
{
public:
    Reader(const DCMConverter& document, FindingList& findings)
        : m_document(document), m_findings(findings), m_report(findings)
    {
        Guard([&] { m_report.SetDistributions(document); });
    }

    /// Reads what was written before the blocks.
    void ReadTop(ExportedFile& file)
    {
        Guard([&] { Read(file); });
    }

    /// After the header text and the version.
    void EndTop()
    {
        m_report.Block().LeaveAlteredToComparison();
        Guard([&] {
            if (!m_document.GetComment().IsEmpty() &&
                m_document.GetComment() != m_read.GetComment()) {
                m_findings.Add(FindingKind::kDroppedComment, Severity::kNote, 0, {},
                               {L"The comment of the document is not in its header text."});
            }
            const double version = DocumentIo::Version(m_document);
            if (version != 0.0 && version != 2.0) {
                m_findings.Add(FindingKind::kVersionNotKept, Severity::kNote, 0, {},
                               {L"Files are written as version 2.0, whatever was set."});
            }
        });
    }

    template <class Block>
    void ReadBlock(ExportedFile& file, const Block& block)
    {
        Guard([&] { ReadBlock(file, block, ParameterOf(block), HasUnwrittenNumbers(block)); });
    }

    void End() { m_report.End(m_document); }

private:
    void ReadBlock(ExportedFile& file, const DCMBaseType& block, const Parameter& wrote,
                   bool hasUnwrittenNumbers)
    {
        const std::int64_t line = m_line;
        CString label(KeywordOf(wrote.kind));
        label.Append(L" ").Append(wrote.name);
        const bool written = Read(file);
        const auto altered = m_report.Block().TakeAltered();
        Comparer comparer(m_findings, written ? line : 0, label);
        if (hasUnwrittenNumbers) {
            comparer.Add(FindingKind::kValueNotWritten,
                         {L"Numbers that were added with a keyword are not written."});
        }
        if (!written)
            return comparer.NothingWritten(wrote);
        const std::vector<Parameter> read = ParametersOf(m_read);
        if (read.size() != 1 || read.front().kind != wrote.kind) {
            return comparer.Add(FindingKind::kTextAltered, Severity::kError,
                                {L"The block is read back as ", read.size(),
                                 L" blocks, or as one of another kind."});
        }
        comparer.Compare(wrote, read.front());
        if (altered)
            comparer.AddAltered(*altered);
        m_report.Keep(block, static_cast<std::size_t>(wrote.kind), line, {}, false);
    }

    template <class Work>
    void Guard(Work work)
    {
        try {
            work();
        } catch (...) {
            m_findings.Miss();
        }
    }

    /// Reads a piece into `m_read`. Returns whether there was one.
    bool Read(ExportedFile& file)
    {
        bool lost = false;
        const std::string piece = file.TakePiece(lost);
        if (lost)
            m_findings.Miss();
        if (piece.empty())
            return false;
        DocumentIo::DropBlocks(m_read);
        TextBuffer buffer(piece.size());
        std::copy(piece.begin(), piece.end(), buffer.Data());
        buffer.EndAt(piece.size());
        const FileText text = FileText::OfFile(std::move(buffer));
        m_report.BeginText(text, m_line);
        std::string_view rest = text.Bytes();
        FileBlock block;
        for (;;) {
            block.Begin(text, m_line);
            const bool more = TakeBlock(rest, block);
            m_line = block.LineNumber(block.LineCount()) + (more ? 1 : 0);
            if (!more)
                break;
            DocumentIo::Read(m_read, block, &m_report, false);
            if (m_report.Block().Stored() != nullptr) {
                m_report.CompareAxes(*m_report.Block().Stored(), m_report.Block().Kind(),
                                     m_report.Block().FirstLine());
            }
        }
        m_report.Unfinished(block, rest.empty());
        return true;
    }

    const DCMConverter& m_document;
    FindingList& m_findings;
    ImportReport m_report;
    DCMConverter m_read;
    std::int32_t m_line = 1;
};

} // namespace

bool ExportAndReadBack(const DCMConverter& document, const CString& path, FileStage& stage,
                       FindingList& findings)
{
    stage = FileStage::kOpening;
    ExportedFile file(path, CFile::modeCreate | CFile::modeWrite);
    stage = FileStage::kBlocks;
    CFileStatus status;
    if (!file.GetStatus(status))
        return false;
    Reader reader(document, findings);
    DocumentIo::WriteHeader(document, file);
    reader.ReadTop(file);
    DocumentIo::WriteFormat(document, file);
    reader.ReadTop(file);
    reader.EndTop();
    auto text = FileTextBuilder::ForFile();
    ForEach(document, [&](const auto& block) {
        text.Clear();
        BlockIo::Compose(block, text);
        WriteText(text, file);
        reader.ReadBlock(file, block);
    });
    file.Close();
    reader.End();
    return true;
}

} // namespace dcm
