#include "dcm/elements/block_report.h"

#include "dcm/elements/keywords.h"
#include "dcm/elements/number.h"
#include "dcm/platform/encoding.h"
#include "dcm/platform/text.h"

#include <algorithm>
#include <charconv>
#include <span>
#include <string>

namespace dcm {

namespace {

constexpr std::wstring_view kKindKeywords[] = {
    keyword::kFestwert,   keyword::kFestwerteblock, keyword::kStuetzstellenverteilung,
    keyword::kKennlinie,  keyword::kFestkennlinie,  keyword::kGruppenkennlinie,
    keyword::kKennfeld,   keyword::kFestkennfeld,   keyword::kGruppenkennfeld,
    keyword::kTextstring,
};

constexpr std::wstring_view kLineKeywords[] = {
    keyword::kLangname, keyword::kDisplayname, keyword::kFunktion, keyword::kEinheitX,
    keyword::kEinheitY, keyword::kEinheitW,    keyword::kWert,     keyword::kText,
    keyword::kStX,      keyword::kStY,         keyword::kStTxX,    keyword::kStTxY,
    keyword::kSst,      keyword::kSstX,        keyword::kSstY,     keyword::kKonservierungFormat,
};

/// Blocks of other tools that hold no parameters.
constexpr std::wstring_view kOtherBlocks[] = {L"FUNKTIONEN", L"VARIANTENKODIERUNG"};

constexpr std::wstring_view kVariant = L"VAR";

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

bool IsOneOf(std::string_view word, std::span<const std::wstring_view> keywords)
{
    return std::any_of(keywords.begin(), keywords.end(),
                       [&](auto k) { return EqualsNoCase(word, k); });
}

/// What a rest of a line means as one text: what is between its quotes, or all of it.
std::string_view Meant(std::string_view rest)
{
    const std::string_view text = TrimWhite(rest);
    if (text.size() >= 2 && text.starts_with('"') && text.ends_with('"'))
        return text.substr(1, text.size() - 2);
    return text;
}

/// Whether the text can begin with the keyword of a kind. Size and second letter rule out most
/// lines.
bool MayBeKind(std::string_view text)
{
    constexpr std::size_t shortest = 8;
    constexpr std::string_view second = "ETRetr";
    return text.size() >= shortest && second.find(text[1]) != second.npos;
}

bool IsBlank(std::string_view text)
{
    return TrimWhite(text).empty();
}

/// Whether a finding of the kind says that content is altered.
bool IsOfAlteredContent(FindingKind kind)
{
    return kind == FindingKind::kTextTrimmed || kind == FindingKind::kTextAltered ||
           kind == FindingKind::kEmptyTextDropped || kind == FindingKind::kLostNan ||
           kind == FindingKind::kNotInCodePage;
}

} // namespace

bool IsKindKeyword(std::string_view word)
{
    return MayBeKind(word) && IsOneOf(word, kKindKeywords);
}

std::string_view WordOf(std::string_view text)
{
    const auto* const end = std::find_if(text.begin(), text.end(), IsWhite);
    return text.substr(0, static_cast<std::size_t>(end - text.begin()));
}

void RowCheck::AfterLine(std::size_t points, std::size_t values, std::int64_t line)
{
    if (points > m_points) {
        // Lines of the Y axis with no value between them before the first value are one group.
        if (m_groupPoints > 0 && (m_groupValues > 0 || m_anyGroup)) {
            EndGroup();
        } else if (m_groupPoints == 0 && values > 0 && m_moved == 0) {
            m_moved = line;
        }
        if (m_groupPoints == 0)
            m_groupLine = line;
        m_groupPoints += points - m_points;
        m_points = points;
    }
    if (m_groupPoints > 0)
        m_groupValues += values - m_values;
    m_values = values;
}

void RowCheck::EndGroup()
{
    const std::size_t width = m_groupValues / m_groupPoints;
    const bool even = width * m_groupPoints == m_groupValues;
    if (!m_anyGroup) {
        m_width = width;
        m_firstLine = m_groupLine;
    }
    if ((!even || width != m_width) && m_moved == 0)
        m_moved = m_groupLine;
    m_anyGroup = true;
    m_groupPoints = 0;
    m_groupValues = 0;
}

std::int64_t RowCheck::FirstMoved(std::size_t width) const
{
    if (m_anyGroup && m_width != width)
        return m_moved != 0 ? std::min(m_moved, m_firstLine) : m_firstLine;
    return m_moved;
}

void BlockReport::Start(const FileBlock& block)
{
    m_block = &block;
    m_firstLine = m_line = block.LineNumber(0);
    m_labelled = false;
    m_slotsUsed = 0;
    m_end = m_textAfterEnd = m_otherBlock = false;
    m_referenceX = m_referenceY = false;
    m_variantLines.clear();
    m_noName = false;
    m_rows = {};
}

void BlockReport::BeginKind(const FileBlock& block, std::size_t kind)
{
    Start(block);
    m_kind = kind;
    m_inComment = false;
}

void BlockReport::Comment(const FileBlock& block)
{
    Start(block);
    m_inComment = true;
    if (m_commentLine != 0) {
        Add(FindingKind::kDroppedComment, Severity::kNote, m_commentLine,
            {L"The comment is not kept, as another one follows before the first block."});
    }
    m_commentLine = m_firstLine;
    LookForKinds(1);
}

void BlockReport::Version(const FileBlock& block)
{
    Start(block);
    m_inComment = false;
    VersionNotKept(TrimWhite(Line(0)));
    for (std::size_t i = 1; i < block.LineCount(); ++i) {
        m_line = block.LineNumber(i);
        const std::string_view line = TrimWhite(Line(i));
        if (LookForKind(i) || m_otherBlock || line.empty() || EqualsNoCase(line, keyword::kEnd))
            continue;
        if (line.starts_with('*')) {
            DroppedComment(line);
        } else {
            Add(FindingKind::kUnknownLine,
                {L"The line ", Quote(line), L" after the version is not read."});
        }
    }
}

void BlockReport::VersionNotKept(std::string_view line)
{
    const std::string_view version = TrimWhite(line.substr(WordOf(line).size()));
    if (ReadDecimal(TrimBlanksAndQuotes(version)) != 2.0) {
        Add(FindingKind::kVersionNotKept,
            {L"The version ", Quote(version), L" is not kept; files are written as version 2.0."});
    }
}

void BlockReport::Skipped(const FileBlock& block, bool unfinished)
{
    Start(block);
    m_inComment = false;
    std::size_t index = 0;
    while (index < block.LineCount() && IsBlank(Line(index)))
        ++index;
    if (index == block.LineCount())
        return;
    m_line = block.LineNumber(index);
    std::string_view line = TrimWhite(Line(index));
    const bool marked = m_line == 1 && line.starts_with(kByteOrderMark);
    if (marked)
        line = TrimWhite(line.substr(kByteOrderMark.size()));
    const std::string_view word = WordOf(line);
    m_inComment = line.starts_with('*');
    if (marked) {
        const bool costs = IsKindKeyword(word);
        Add(FindingKind::kByteOrderMark, costs ? Severity::kError : Severity::kNote, m_line,
            {L"The file begins with a byte-order mark",
             costs ? L", so its first block is not read." : L", so its first line is not kept."});
        if (costs || line.empty() || line.starts_with('*'))
            return LookForKinds(1);
    }
    if (index == 0 && IsKindKeyword(word)) {
        LostKind(line, word, unfinished);
    } else if (!IsKindKeyword(word)) {
        OtherBlock(line, word);
    }
    LookForKinds(std::max(index, std::size_t{1}));
}

/// A block of one of the kinds whose first line does not show it.
void BlockReport::LostKind(std::string_view line, std::string_view word, bool unfinished)
{
    if (unfinished) {
        AddToBlock(FindingKind::kUnfinishedBlock,
                   {L"No empty line follows the block, so it is not read."});
    } else if (line.size() > word.size() && line[word.size()] != ' ') {
        Add(FindingKind::kTabAfterKeyword,
            {L"A blank must follow ", Quote(word), L", so the block is not read."});
    } else if (line.size() == word.size()) {
        Add(FindingKind::kUnknownBlock,
            {L"No blank and name follow ", Quote(word), L", so the block is not read."});
    } else {
        Add(FindingKind::kUnknownBlock,
            {L"There is white space before ", Quote(word), L", so the block is not read."});
    }
}

/// A block that is none of the ten kinds.
void BlockReport::OtherBlock(std::string_view line, std::string_view word)
{
    if (EqualsNoCase(word, keyword::kKonservierungFormat))
        return VersionNotKept(line);
    if (EqualsNoCase(word, keyword::kComment))
        return DroppedComment(line);
    const bool known = line.starts_with('*') || IsOneOf(word, kOtherBlocks);
    Add(FindingKind::kUnknownBlock, known ? Severity::kNote : Severity::kError, m_line,
        {L"The block ", Quote(word), L" is of no kind that is kept."});
}

void BlockReport::DroppedComment(std::string_view line)
{
    Add(FindingKind::kDroppedComment, {L"The comment ", Quote(line), L" is not kept."});
}

/// Reports lines from `index` on that begin a block.
void BlockReport::LookForKinds(std::size_t index)
{
    for (; index < m_block->LineCount(); ++index)
        LookForKind(index);
}

/// Reports the line if it begins a block but does not follow an empty line.
bool BlockReport::LookForKind(std::size_t index)
{
    const std::string_view line = TrimLeft(Line(index), IsWhite);
    const std::string_view word = WordOf(line);
    if (index == 0 || !IsKindKeyword(word))
        return false;
    m_otherBlock = m_textAfterEnd = true;
    const std::int64_t number = m_block->LineNumber(index);
    if (IsBlank(Line(index - 1))) {
        Add(FindingKind::kBlankSeparator, SeverityOf(FindingKind::kBlankSeparator), number,
            {L"The line before ", Quote(line),
             L" is not empty but white space, so the block is not read."});
    } else if (m_inComment) {
        Add(FindingKind::kBlockInComment, SeverityOf(FindingKind::kBlockInComment), number,
            {L"No empty line precedes ", Quote(line), L", so the block is part of a comment."});
    } else {
        Add(FindingKind::kBlockInsideBlock, SeverityOf(FindingKind::kBlockInsideBlock), number,
            {L"No empty line precedes ", Quote(line), L", so it is part of the block before."});
    }
    return true;
}

void BlockReport::KeywordLine(std::size_t index, std::string_view keyword, std::string_view rest)
{
    m_index = index;
    m_line = m_block->LineNumber(index);
    m_keyword = keyword;
    m_rest = rest;
    if (m_badBytes != BadBytes::kNone)
        LookAtCharacters(Line(index));
    // The lines of points have short keywords, and a file consists of them.
    m_known = LookForKind(index, keyword);
    if (m_known)
        return;
    if (m_end) {
        m_known = true;
        AfterEnd();
    } else if (EqualsNoCase(keyword, keyword::kEnd)) {
        m_known = m_end = true;
        if (!IsBlank(rest))
            AfterEnd();
    } else if (std::any_of(keyword.begin(), keyword.end(), IsWhite)) {
        m_known = TabFollows(Line(index));
    }
}

bool BlockReport::LookForKind(std::size_t index, std::string_view keyword)
{
    return MayBeKind(keyword) && LookForKind(index);
}

void BlockReport::OtherLine(std::size_t index, std::string_view bytes)
{
    m_index = index;
    m_line = m_block->LineNumber(index);
    const std::string_view line = TrimWhite(bytes);
    if (line.empty())
        return;
    if (m_badBytes != BadBytes::kNone)
        LookAtCharacters(line);
    m_keyword = WordOf(line);
    m_rest = line.substr(m_keyword.size());
    if (LookForKind(index))
        return;
    if (m_end) {
        AfterEnd();
    } else if (EqualsNoCase(m_keyword, keyword::kEnd)) {
        m_end = true;
        if (!m_rest.empty())
            AfterEnd();
    } else if (!TabFollows(line)) {
        m_known = false;
        UnknownLine();
    }
}

/// Whether the line has a keyword that is not seen as one, since other white space than a blank
/// follows. Reports it unless nothing else does.
bool BlockReport::TabFollows(std::string_view bytes)
{
    const std::string_view line = TrimWhite(bytes);
    const std::string_view word = WordOf(line);
    if (word.size() == line.size() || line[word.size()] == ' ' || !IsOneOf(word, kLineKeywords))
        return false;
    if (!Meant(line.substr(word.size())).empty()) {
        Add(FindingKind::kTabAfterKeyword,
            {L"A blank must follow ", Quote(word), L", so the line is not read."});
    }
    return true;
}

void BlockReport::AfterEnd()
{
    if (!m_textAfterEnd && !IsBlank(Line(m_index))) {
        Add(FindingKind::kTextAfterEnd,
            {L"The line ", Quote(TrimWhite(Line(m_index))), L" goes on after END."});
    }
    m_textAfterEnd = true;
}

void BlockReport::End()
{
    if (!m_end)
        AddToBlock(FindingKind::kMissingEnd, {L"The block has no END."});
}

void BlockReport::UnknownLine()
{
    if (m_known)
        return;
    const std::string_view line = TrimWhite(Line(m_index));
    const bool bare = Meant(m_rest).empty();
    if (EqualsNoCase(m_keyword, kVariant)) {
        NoteVariantLine();
        return;
    }
    if (IsOneOf(m_keyword, kLineKeywords)) {
        if (bare)
            return;
        if (EqualsNoCase(m_keyword, keyword::kSst))
            return DroppedComment(line);
    } else if (line.starts_with('*')) {
        return DroppedComment(line);
    }
    Add(FindingKind::kUnknownLine, {L"The line ", Quote(line), L" is not read in such a block."});
}

/// Keeps the line's number. Whether it is a warning depends on the rest of the file.
void BlockReport::NoteVariantLine()
{
    try {
        m_variantLines.push_back(static_cast<std::int32_t>(m_line));
    } catch (...) {
        m_findings.Miss();
    }
}

void BlockReport::Rejected()
{
    Add(FindingKind::kRejectedBlock,
        {L"The block is not kept, as it has the line ", Quote(TrimWhite(Line(m_index))), L"."});
    LookForKinds(m_index + 1);
}

void BlockReport::Name(std::string_view kept)
{
    CheckName(kept, TrimWhite(m_rest), L"The block has no name.");
}

void BlockReport::NameWord(std::string_view kept)
{
    const std::string_view rest = TrimWhite(m_rest);
    CheckName(kept, TrimRight(rest.substr(0, rest.find(' ')), IsWhite),
              L"The name is not read, as a count must follow it after a blank.");
}

void BlockReport::CheckName(std::string_view kept, std::string_view meant, const wchar_t* none)
{
    m_noName = kept.empty();
    if (m_noName) {
        Add(FindingKind::kNoName, {none});
    } else if (kept != meant) {
        Add(FindingKind::kTextTrimmed,
            {L"The name ", Quote(meant), L" is kept as ", Quote(kept), L"."});
    }
}

void BlockReport::Attribute(std::string_view kept)
{
    const std::string_view meant = Meant(m_rest);
    Repeated(m_keyword, meant, meant.empty());
    if (kept == meant || TrimWhite(kept) == TrimWhite(m_rest))
        return;
    const bool trimmed = TrimBlanksAndQuotes(kept) == TrimBlanksAndQuotes(meant);
    Add(trimmed ? FindingKind::kTextTrimmed : FindingKind::kTextAltered,
        trimmed ? Severity::kNote : Severity::kWarning, m_line,
        {L"The text ", Quote(meant), L" is kept as ", Quote(kept), L"."});
}

void BlockReport::Reference()
{
    const std::string_view name = TrimBlanks(m_rest);
    Repeated(m_keyword, name, name.empty());
    if (!name.empty())
        (EqualsNoCase(m_keyword, keyword::kSstX) ? m_referenceX : m_referenceY) = true;
}

void BlockReport::SingleNumber(std::string_view token, double value)
{
    SingleValue();
    if (token.empty())
        return;
    Numbers(token);
    Number(token, value);
}

void BlockReport::Numbers(std::string_view kept)
{
    if (kept != TrimWhite(m_rest))
        Add(FindingKind::kTextAltered, {L"The quotes around ", Quote(kept), L" are not kept."});
}

void BlockReport::SingleText(std::string_view kept)
{
    SingleValue();
    const std::string_view text = TrimWhite(m_rest);
    const std::string_view meant = Meant(text);
    if (text.starts_with('"') != text.ends_with('"') || text.size() == 1)
        OpenQuote();
    if (kept != meant && TrimBlanksAndQuotes(text) != kept) {
        Add(FindingKind::kTextAltered,
            {L"The text ", Quote(meant), L" is kept as ", Quote(kept), L"."});
    } else if (kept != meant) {
        Add(FindingKind::kTextTrimmed,
            {L"The text ", Quote(meant), L" is kept as ", Quote(kept), L"."});
    }
}

void BlockReport::OpenQuote()
{
    Add(FindingKind::kOpenQuote,
        {L"A double quote in ", Quote(TrimWhite(m_rest)), L" has no other one."});
}

void BlockReport::TruthWord()
{
    SingleValue();
    Add(FindingKind::kTruthWord,
        {L"The text ", Quote(Meant(m_rest)), L" is kept as a number, 1 or 0."});
}

/// All lines of a single value set the same one.
void BlockReport::SingleValue()
{
    constexpr std::string_view slot = "=";
    const std::string_view line(m_keyword.data(), m_rest.data() + m_rest.size());
    Repeated(slot, TrimWhite(line), IsBlank(m_rest));
}

void BlockReport::Repeated(std::string_view keyword, std::string_view content, bool empty)
{
    if (m_otherBlock)
        return;
    const auto used = std::span(m_slots).first(m_slotsUsed);
    const auto slot = std::find_if(used.begin(), used.end(),
                                   [&](const Slot& s) { return EqualsNoCase(keyword, s.keyword); });
    if (slot == used.end()) {
        if (!empty && m_slotsUsed < m_slots.size())
            m_slots[m_slotsUsed++] = {keyword, content};
        return;
    }
    if (content != slot->content && !slot->content.empty()) {
        Add(FindingKind::kRepeatedLine,
            {L"The line replaces an earlier one with other content, ", Quote(slot->content), L"."});
    }
    slot->content = empty ? std::string_view() : content;
}

void BlockReport::Number(std::string_view token, double value)
{
    switch (FaultOf(token, value)) {
    case NumberFault::kNone:
        return;
    case NumberFault::kUnreadable:
        Add(FindingKind::kUnreadableNumber, {Quote(token), L" is no number and is read as 0."});
        return;
    case NumberFault::kCut:
        Add(FindingKind::kNumberCut,
            {L"The number in ", Quote(token), L" ends before the text does; the rest is lost."});
        return;
    case NumberFault::kOutOfRange:
        Add(FindingKind::kOutOfRange,
            {L"The number ", Quote(token), L" is too large and is read as infinity."});
        return;
    case NumberFault::kNotANumber:
        Add(FindingKind::kLostNan, {Quote(token), L" is not read as not-a-number but as 1 or -1."});
        return;
    }
}

void BlockReport::BeginTexts()
{
    m_texts = TrimWhite(m_rest);
    m_quoted = m_texts.starts_with('"');
}

/// Takes the next text as what lies between a pair of quotes, by no other rule. False when there
/// is none, or when it is not that simple.
bool BlockReport::TakeText(std::string_view& text)
{
    if (m_texts.empty())
        return false;
    if (!m_quoted) {
        text = m_texts;
        m_texts = {};
        return true;
    }
    const std::size_t close = m_texts.starts_with('"') ? m_texts.find('"', 1) : m_texts.npos;
    const bool plain =
        close != m_texts.npos && (close + 1 == m_texts.size() || m_texts[close + 1] == ' ');
    if (!plain) {
        if (std::count(m_texts.begin(), m_texts.end(), '"') % 2 != 0) {
            OpenQuote();
        } else {
            TextsAltered();
        }
        m_texts = {};
        return false;
    }
    text = m_texts.substr(1, close - 1);
    m_texts = TrimWhite(m_texts.substr(close + 1));
    return true;
}

void BlockReport::KeptText(std::string_view kept)
{
    std::string_view meant;
    while (TakeText(meant)) {
        if (meant == kept)
            return;
        if (!meant.empty()) {
            if (TrimBlanksAndQuotes(meant) == TrimBlanksAndQuotes(kept)) {
                Add(FindingKind::kTextTrimmed,
                    {L"The text ", Quote(meant), L" is kept as ", Quote(kept), L"."});
            } else {
                TextsAltered();
                m_texts = {};
            }
            return;
        }
        EmptyTextDropped();
    }
}

void BlockReport::EndTexts()
{
    std::string_view meant;
    while (TakeText(meant)) {
        if (meant.empty()) {
            EmptyTextDropped();
        } else {
            TextsAltered();
            m_texts = {};
        }
    }
}

void BlockReport::EmptyTextDropped()
{
    Add(FindingKind::kEmptyTextDropped, {L"An empty text of the list is not kept."});
}

void BlockReport::TextsAltered()
{
    Add(FindingKind::kTextAltered,
        {L"The texts ", Quote(TrimWhite(m_rest)), L" are not split at each pair of quotes."});
}

bool BlockReport::Count(std::string_view text, std::int64_t read)
{
    // Without a blank before it a count takes the place of the name, which is reported.
    if (m_noName)
        return false;
    std::int64_t count = 0;
    const char* const end = text.data() + text.size();
    const auto [at, error] = std::from_chars(text.data(), end, count);
    if (error == std::errc() && at == end && !text.starts_with('-') && count == read)
        return true;
    AddToBlock(FindingKind::kCountNotRead,
               {L"The count ", Quote(text), L" is not read; a plain number is expected there."});
    return false;
}

void BlockReport::CompareCount(std::string_view text, std::size_t items, const wchar_t* what)
{
    std::int64_t count = 0;
    std::from_chars(text.data(), text.data() + text.size(), count);
    if (Count(text, count))
        CompareCount(count, items, what);
}

void BlockReport::CompareCount(std::int64_t count, std::size_t items, const wchar_t* what)
{
    if (count != static_cast<std::int64_t>(items))
        CountDiffers(count, items, what);
}

void BlockReport::DroppedItems(bool texts)
{
    if (texts) {
        Add(FindingKind::kTextAmongNumbers,
            {L"The texts ", Quote(TrimWhite(m_rest)), L" are not read on a line for numbers."});
    } else {
        Add(FindingKind::kNumbersAmongTexts,
            {Quote(TrimWhite(m_rest)), L" is not read on a line for texts, which have quotes."});
    }
}

void BlockReport::MixedTypes()
{
    Add(FindingKind::kMixedTypes,
        {L"The items ", Quote(TrimWhite(m_rest)),
         L" have no value, as they are of another type than those before."});
}

void BlockReport::CountDiffers(std::int64_t count, std::size_t items, const wchar_t* what)
{
    AddToBlock(FindingKind::kCountDiffers,
               {L"The first line declares ", count, L" ", what, L", but there are ", items, L"."});
}

void BlockReport::Add(FindingKind kind, Severity severity, std::int64_t line,
                      std::initializer_list<MessagePart> message) noexcept
{
    if (m_compared && IsOfAlteredContent(kind)) {
        if (!m_altered || m_altered->severity < severity)
            m_altered = {kind, severity};
        return;
    }
    if (m_findings.Count(kind, severity))
        m_findings.List(kind, severity, line, Label(), message);
}

MessagePart BlockReport::Quote(std::string_view part) const
{
    return MessagePart::Quoted(part, m_block->Text());
}

const CString& BlockReport::Label() noexcept
{
    if (m_labelled)
        return m_label;
    m_label.Empty();
    m_labelled = true;
    if (m_block == nullptr || m_block->LineCount() == 0)
        return m_label;
    std::string_view line = TrimWhite(Line(0));
    if (m_firstLine == 1 && line.starts_with(kByteOrderMark))
        line = TrimWhite(line.substr(kByteOrderMark.size()));
    const std::string_view word = WordOf(line);
    if (line.starts_with('*') || EqualsNoCase(word, keyword::kKonservierungFormat))
        return m_label;
    try {
        std::string upper;
        for (const char c : word)
            upper += c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
        CString label = m_block->Text().Wide(upper);
        const std::string_view rest = TrimWhite(line.substr(word.size()));
        const bool whole =
            EqualsNoCase(word, keyword::kFestwert) || EqualsNoCase(word, keyword::kTextstring);
        const std::string_view name = whole ? rest : WordOf(rest);
        if (!name.empty())
            m_block->Text().AppendWide(label.Append(L" "), name);
        m_label = std::move(label);
    } catch (...) {
        m_findings.Miss();
    }
    return m_label;
}

void BlockReport::LookAtCharacters(std::string_view line)
{
    const bool bad = m_badBytes == BadBytes::kReplaced ? line.find("\xEF\xBF\xBD") != line.npos
                                                       : LookAsUtf8(line).firstBad != line.npos;
    if (bad) {
        Add(FindingKind::kNotInCodePage,
            {L"The line ", Quote(TrimWhite(line)),
             L" has bytes that are no character of the code page; they are lost."});
    }
}

} // namespace dcm
