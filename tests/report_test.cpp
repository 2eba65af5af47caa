#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <functional>
#include <limits>
#include <set>
#include <sstream>
#include <string>
#include <string_view>
#include <utility>

using namespace test;

namespace {

/// The findings as text, one a line: line, severity, id, block.
std::string Listed(const dcm::Report& report)
{
    std::string text;
    for (const dcm::Finding& finding : report.Findings()) {
        text += std::to_string(finding.line) + " " + dcm::ToUtf8(dcm::NameOf(finding.severity)) +
                " " + std::string(finding.id);
        text += finding.block.IsEmpty() ? "\n" : " " + dcm::ToUtf8(finding.block) + "\n";
    }
    return text;
}

/// Adds the messages of the findings, each with its id.
void AddMessages(const dcm::Report& report, std::set<std::string>& messages)
{
    for (const dcm::Finding& finding : report.Findings())
        messages.insert(std::string(finding.id) + ": " + dcm::ToUtf8(finding.message));
}

/// Compares the messages with a file of data/findings/.
void ExpectMessages(const std::set<std::string>& messages, const std::string& file)
{
    std::string text;
    for (const std::string& message : messages)
        text += message + "\n";
    EXPECT_EQ(text, ReadBytes(dcm::FromUtf8(DCM_TEST_DATA "/findings/" + file)));
}

/// The bytes of `text` with each \xNN as a byte.
std::string Bytes(const std::string& text)
{
    std::string bytes;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\\' && text.substr(i, 2) == "\\x") {
            bytes += static_cast<char>(std::stoi(text.substr(i + 2, 2), nullptr, 16));
            i += 3;
        } else {
            bytes += text[i];
        }
    }
    return bytes;
}

/// Whether findings listed as text have this id.
bool HasId(const std::string& listed, std::string_view id)
{
    return listed.find(" " + std::string(id)) != std::string::npos;
}

/// Whether tests of their own have findings of this id: of files that cannot be used, of memory
/// that runs out, of a file without its last line end.
bool IsTestedAlone(std::string_view id)
{
    return id.starts_with("cannot-") || id == "out-of-memory" || id == "no-line-end";
}

/// A document, which may be an example of the page of findings, and the findings of its export.
struct ExportCase
{
    const char* title;
    std::function<void(DCMConverter&)> fill;
    const char* expected;
};

std::vector<ExportCase> ExportCases()
{
    const auto add = [](const wchar_t* block) {
        return [block](DCMConverter& d) {
            if (std::wstring_view(block).starts_with(L"KENNFELD")) {
                DCMKennfeld b;
                b.Init(block);
                d.AddKennfeld(b);
            } else if (std::wstring_view(block).starts_with(L"FESTWERTEBLOCK")) {
                DCMFestwerteblock b;
                b.Init(block);
                d.AddFestwerteblock(b);
            } else {
                DCMKennlinie b;
                b.Init(block);
                d.AddKennlinie(b);
            }
        };
    };
    const auto value = [](const CComVariant& v) {
        return [copy = v](DCMConverter& d) {
            DCMFestwert b;
            b.SetName(L"A");
            b.SetValue(copy);
            d.AddFestwert(b);
        };
    };
    const auto named = [](const wchar_t* n) {
        DCMFestwert b;
        b.SetName(n);
        b.SetValue(CComVariant(1.0));
        return b;
    };
    const auto texts = [](const std::vector<CComVariant>& values) {
        return [values](DCMConverter& d) {
            dcm::Parameter list;
            list.kind = dcm::Kind::kFestwerteblock;
            list.name = L"A";
            list.values = values;
            dcm::Add(d, list);
        };
    };
    const auto text = [](const wchar_t* t) {
        return [t](DCMConverter& d) {
            DCMStuetzstellenverteilung b;
            b.SetName(L"A");
            b.AddValue(t);
            d.AddStuetzstellenverteilung(b);
        };
    };
    const double nan = std::numeric_limits<double>::quiet_NaN();
    return {
        {"nothing", [](DCMConverter&) {}, ""},
        {"no value", value(CComVariant()), "5 warning no-value FESTWERT A\n"},
        {"an integer", value(CComVariant(7)), ""},
        {"truth word", value(L"true"), "7 warning truth-word FESTWERT A\n"},
        {"not a number", value(nan), "5 error lost-nan FESTWERT A\n"},
        {R"(a TEXTSTRING with the value `L"two\nlines"`.)",
         [](DCMConverter& d) {
             DCMTextstring b;
             b.SetName(L"A");
             b.SetValue(CComVariant(L"two\nlines"));
             d.AddTextstring(b);
         },
         "5 error character-replaced TEXTSTRING A\n"},
        {"a zero",
         [](DCMConverter& d) {
             DCMFestwert b;
             b.SetName(L"A");
             b.SetLangname(CString(std::wstring_view(L"a\0b", 3)));
             b.SetValue(CComVariant(1.0));
             d.AddFestwert(b);
         },
         "5 error character-replaced FESTWERT A\n"},
        {"an export of the text `L\"\u4E2D\"` in Windows-1252.", value(L"\u4E2D"),
         "5 error not-in-code-page FESTWERT A\n"},
        // With 16 bits the first is a pair of wide characters, of which the file has one.
        {"pair and half", value(CString(L"\U0001F600") + L"\xDE00"),
         "5 error not-in-code-page FESTWERT A\n"},
        {"tab in a point", text(L"a\tb"), "5 error character-replaced STUETZSTELLENVERTEILUNG A\n"},
        {"quote in a point", text(L"a\"b"),
         "5 warning count-differs STUETZSTELLENVERTEILUNG A\n"
         "5 warning text-altered STUETZSTELLENVERTEILUNG A\n"
         "5 warning text-altered STUETZSTELLENVERTEILUNG A\n"},
        {"incomplete map", add(L"KENNFELD A 2 1\nST/X 1 2\nST/Y 1\nWERT 1\n"),
         "0 error incomplete-map KENNFELD A\n"},
        {"empty map", add(L"KENNFELD A 0 0\n"), "0 error empty-map KENNFELD A\n"},
        {"surplus values", add(L"KENNFELD A 1 1\nST/X 1\nST/Y 1\nWERT 1 2\n"),
         "5 error surplus-values KENNFELD A\n"},
        {"numbers and texts", add(L"FESTWERTEBLOCK A 1\nWERT 1\nTEXT \"a\"\n"),
         "5 error numbers-and-texts FESTWERTEBLOCK A\n"},
        {"a FESTWERTEBLOCK with an X and a Y count that holds 0.12345678901234567.",
         add(L"FESTWERTEBLOCK A 1 @ 1\nWERT 0.12345678901234567\n"),
         "5 warning digits-dropped FESTWERTEBLOCK A\n"},
        {"a document that imports the file of `distribution-differs` and exports it.",
         [](DCMConverter& d) {
             ImportBytes(d, "STUETZSTELLENVERTEILUNG X 1\nST/X 1\nEND\n\n"
                            "KENNLINIE A 1\n*SSTX X\nST/X 2\nWERT 1\nEND\n\n");
         },
         "11 error reference-not-written KENNLINIE A\n"},
        {"references that are set",
         [](DCMConverter& d) {
             const std::pair<const wchar_t*, const wchar_t*> names[] = {
                 {L"A", L"S"}, {L"B", L"  "}, {L"C", L" S"}};
             for (const auto& [name, distribution] : names) {
                 DCMKennlinie b;
                 b.Init(L"KENNLINIE A 1\n*SSTX R\nST/X 1\nWERT 1\n");
                 b.SetName(name);
                 b.SetSharedAxisUniqueName(distribution);
                 d.AddKennlinie(b);
             }
         },
         "5 note unknown-distribution KENNLINIE A\n"
         "12 warning text-trimmed KENNLINIE B\n"
         "19 note unknown-distribution KENNLINIE C\n"
         "19 warning text-trimmed KENNLINIE C\n"},
        {"empty text", add(L"FESTWERTEBLOCK A 2\nTEXT \"\" \"a\"\n"), ""},
        {"a value of a KENNLINIE with the tag `VT_EMPTY`.",
         [](DCMConverter& d) {
             DCMKennlinie b;
             b.SetName(L"A");
             b.AddValue(CComVariant());
             d.AddKennlinie(b);
         },
         "5 warning count-differs KENNLINIE A\n5 error value-not-written KENNLINIE A\n"},
        {"the host's own numbers",
         [](DCMConverter& d) {
             DCMKennlinie b;
             b.SetName(L"A");
             b.AddValue(1.0, L"WERT");
             d.AddKennlinie(b);
         },
         "5 error value-not-written KENNLINIE A\n"},
        {"empty and trimmed texts", texts({L"", L" a", L"b", L""}),
         "5 warning count-differs FESTWERTEBLOCK A\n"
         "5 error empty-text-dropped FESTWERTEBLOCK A\n"
         "5 warning text-trimmed FESTWERTEBLOCK A\n"
         "5 error empty-text-dropped FESTWERTEBLOCK A\n"},
        {"texts that are split otherwise", texts({L"a\\", L"b"}),
         "5 warning count-differs FESTWERTEBLOCK A\n"
         "5 warning text-altered FESTWERTEBLOCK A\n"
         "5 warning text-altered FESTWERTEBLOCK A\n"},
        {"texts that only this reader splits as they were", texts({L"a\\\"   \"1", L"b"}),
         "5 warning text-altered FESTWERTEBLOCK A\n"},
        {"a tab before a name",
         [](DCMConverter& d) {
             DCMTextstring b;
             b.SetName(L"\ta");
             b.SetValue(CComVariant(L"b"));
             d.AddTextstring(b);
         },
         "5 warning text-trimmed TEXTSTRING \ta\n"},
        {"a count alone",
         [](DCMConverter& d) {
             DCMFestwerteblock b;
             b.Init(L"FESTWERTEBLOCK A 1\nWERT 1\n");
             b.SetXValueCount(1);
             d.AddFestwerteblock(b);
         },
         "5 warning count-differs FESTWERTEBLOCK A\n"},
        {"trimmed texts",
         [](DCMConverter& d) {
             DCMFestwert b;
             b.SetName(L"A ");
             b.SetLangname(L" l");
             b.SetDisplayname(L"\"d\"");
             b.SetFunction(L"\"");
             b.SetUnit(L" ");
             b.SetValue(CComVariant(L"v\t"));
             d.AddFestwert(b);
         },
         "5 warning text-trimmed FESTWERT A \n5 note text-trimmed FESTWERT A \n"
         "5 note text-trimmed FESTWERT A \n5 note text-trimmed FESTWERT A \n"
         "5 warning text-trimmed FESTWERT A \n"},
        {"a name that ends the block",
         [named](DCMConverter& d) { d.AddFestwert(named(L"A\n\nB")); },
         "5 warning missing-end FESTWERT A\n5 warning no-value FESTWERT A\n"
         "5 warning text-altered FESTWERT A\n\nB\n5 warning text-altered FESTWERT A\n\nB\n"
         "7 error unknown-block B\n"},
        {"a name that is two blocks",
         [named](DCMConverter& d) { d.AddFestwert(named(L"A\n\nTEXTSTRING B")); },
         "5 warning missing-end FESTWERT A\n5 warning no-value FESTWERT A\n"
         "5 error text-altered FESTWERT A\n\nTEXTSTRING B\n"},
        {"a comment and a version",
         [](DCMConverter& d) {
             ImportBytes(d, "* c\n\n");
             d.SetVersion(1.0);
         },
         "0 note dropped-comment\n0 note version-not-kept\n"},
        {"header of a block", [](DCMConverter& d) { d.SetHeader(L"* c\nFESTWERT A\nWERT 1\nEND"); },
         "2 error block-in-comment\n"},
    };
}

} // namespace

TEST(Findings, AreThoseThatTheFilesOfTheTableGive)
{
    const std::string table = DCM_TEST_DATA "/findings/import.txt";
    std::istringstream lines(Unmarked(ReadBytes(dcm::FromUtf8(table))) + "\n");
    const Folder folder;
    std::string title, file, expected;
    std::set<std::string> messages;
    int number = 0, titleLine = 0, cases = 0;
    for (std::string line; std::getline(lines, line);) {
        ++number;
        if (line.starts_with("|+")) {
            file += line.substr(2);
        } else if (line.starts_with("|")) {
            file += line.substr(1) + "\n";
        } else if (line.starts_with(">")) {
            expected += line.substr(1) + "\n";
        } else if (!line.empty() && line[0] != '#') {
            title = line;
            titleLine = number;
        } else if (!title.empty()) {
            const testing::ScopedTrace trace(table.c_str(), titleLine, title);
            const unsigned page =
                title.find(": ") == title.npos ? 1252U : static_cast<unsigned>(std::stoul(title));
            if (ChoosePage(page)) {
                const CString path = folder / L"in.dcm";
                WriteBytes(path, Bytes(file));
                DCMConverter document, plain;
                dcm::Report report;
                EXPECT_EQ(dcm::Import(document, path, report), plain.Import(path));
                EXPECT_EQ(Listed(report), expected);
                AddMessages(report, messages);
                EXPECT_EQ(ExportBytes(document), ExportBytes(plain));
                ASSERT_TRUE(dcm::SetThreadCodePage(1252));
            }
            title = file = expected = "";
            ++cases;
        }
    }
    EXPECT_GT(cases, 20);
    ExpectMessages(messages, "import_messages.txt");
}

TEST(Findings, AreThoseOfTheirPage)
{
    std::istringstream lines(ReadBytes(dcm::FromUtf8(DCM_DOCS "/findings.md")));
    const Folder folder;
    std::vector<std::string> sections;
    const std::vector<ExportCase> exports = ExportCases();
    std::string severities, file;
    bool inFile = false;
    int examples = 0;
    const auto checkExample = [&] {
        SCOPED_TRACE(sections.back());
        const CString path = folder / L"in.dcm";
        WriteBytes(path, Bytes(Unmarked(std::exchange(file, ""))));
        DCMConverter document;
        dcm::Report report;
        dcm::Import(document, path, report);
        EXPECT_GT(report.Count(sections.back()), 0U);
        for (const dcm::Finding& finding : report.Findings()) {
            const bool named =
                severities.find(dcm::ToUtf8(dcm::NameOf(finding.severity))) != std::string::npos;
            EXPECT_TRUE(named || finding.id != sections.back());
        }
        ++examples;
    };
    for (std::string line; std::getline(lines, line);) {
        if (line == "```") {
            inFile = false;
            checkExample();
        } else if (inFile) {
            file += line + "\n";
        } else if (line == "```dcm") {
            inFile = true;
        } else if (line.starts_with("Example: ") && !IsTestedAlone(sections.back())) {
            EXPECT_TRUE(std::any_of(exports.begin(), exports.end(), [&](const ExportCase& c) {
                return c.title == line.substr(9) && HasId(c.expected, sections.back());
            })) << line;
        } else if (line.starts_with("## ")) {
            sections.push_back(line.substr(3));
        } else if (line.starts_with("**")) {
            severities = line.substr(2, line.find(".**") - 2);
            severities[0] = static_cast<char>(std::tolower(severities[0]));
        }
    }
    const auto ids = dcm::FindingIds();
    EXPECT_TRUE(std::equal(sections.begin(), sections.end(), ids.begin(), ids.end()));
    EXPECT_GT(examples, 40);
}

TEST(Report, SaysWhyAFileCannotBeUsed)
{
    const Folder folder;
    const CString file = folder / L"file";
    WriteBytes(file, "");
    CFile open(file, kRead);
    const CString large = folder / L"large";
    WriteBytes(large, "");
    std::filesystem::resize_file(PathOf(large), 1ULL << 31);
    const struct
    {
        CString path;
        const char* import;
        const char* export_;
        const wchar_t* words;
        CFileException::Cause cause;
    } cases[] = {
        // Systems call the missing folder by different names.
        {folder / L"none" + CString(L"/none"), "cannot-open", "cannot-open", L"",
         CFileException::none},
        {folder / L"", "cannot-open", "cannot-open", L"(accessDenied): ",
         CFileException::accessDenied},
        {file, "cannot-open", "cannot-open", L"(sharingViolation): ",
         CFileException::sharingViolation},
        {large, "cannot-open", "", L"(fileTooLarge): ", CFileException::fileTooLarge},
        {L"/dev/full", "", "cannot-write", L"(diskFull): ", CFileException::diskFull},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(dcm::ToUtf8(c.path));
        DCMConverter document;
        dcm::Report report;
        const auto check = [&](HRESULT result, const char* id) {
            EXPECT_EQ(result, E_UNEXPECTED);
            EXPECT_EQ(Listed(report), "0 error " + std::string(id) + "\n");
            EXPECT_NE(report.Cause(), CFileException::none);
            EXPECT_TRUE(c.cause == CFileException::none || c.cause == report.Cause());
            EXPECT_NE(report.Findings().at(0).message.View().find(c.words),
                      std::wstring_view::npos);
        };
        if (*c.import != '\0')
            check(dcm::Import(document, c.path, report), c.import);
        // Not every system has a device that is full.
        if (*c.export_ != '\0' && (*c.import != '\0' || std::filesystem::exists("/dev/full")))
            check(dcm::Export(document, c.path, report), c.export_);
    }
}

TEST(Save, ReplacesAFileThatNobodyHasOpen)
{
    const Folder folder;
    const CString path = folder / L"out.dcm";
    const DCMConverter document;
    const std::string content = ExportBytes(document);
    dcm::Report report;
    EXPECT_EQ(dcm::Save(document, path, report), S_OK);
    EXPECT_EQ(ReadBytes(path), content);
    WriteBytes(path, "old");
    {
        const CFile open(path, kRead);
        EXPECT_EQ(dcm::Save(document, path, report), E_UNEXPECTED);
        EXPECT_EQ(report.Count("cannot-open"), 1U);
    }
    EXPECT_EQ(ReadBytes(path), "old");
    EXPECT_EQ(dcm::Save(document, path, report), S_OK);
    EXPECT_EQ(ReadBytes(path), content);
    EXPECT_EQ(dcm::Save(document, dcm::NullDevice(), report), S_OK);
    EXPECT_EQ(dcm::Save(document, folder / L"", report), E_UNEXPECTED);
    EXPECT_EQ(dcm::Save(document, folder / L"none/out.dcm", report), E_UNEXPECTED);
    const auto all = std::filesystem::directory_iterator(PathOf(path).parent_path());
    EXPECT_EQ(std::distance(all, {}), 1);
}

TEST(Report, IsEmptiedByTheNextCall)
{
    const Folder folder;
    const CString missing = folder / L"missing";
    DCMConverter document;
    dcm::Report report;
    report.SetLimit(0);
    EXPECT_EQ(dcm::Import(document, missing, report), E_UNEXPECTED);
    EXPECT_EQ(report.Summary(), L"1 error");
    EXPECT_EQ(report.Count("cannot-open"), 1U);
    EXPECT_EQ(report.Count("no-such-id"), 0U);
    EXPECT_TRUE(report.Incomplete() && report.Findings().empty());
    dcm::Report moved = std::move(report);
    EXPECT_EQ(report.Summary(), L"no findings");
    EXPECT_EQ(report.Cause(), CFileException::none);
    dcm::Report copy;
    copy = moved;
    EXPECT_EQ(copy.Count(dcm::Severity::kError), 1U);
    EXPECT_EQ(copy.Count("cannot-open"), 1U);
    EXPECT_EQ(copy.Cause(), CFileException::fileNotFound);
    EXPECT_NE(copy.SystemError(), 0);
    EXPECT_EQ(dcm::Report(report).Count(), 0U) << "a report without content";
    EXPECT_EQ(dcm::Export(document, dcm::NullDevice(), moved), S_OK);
    EXPECT_EQ(moved.Summary(), L"no findings");
    EXPECT_TRUE(moved.Cause() == CFileException::none && moved.SystemError() == 0);
    EXPECT_EQ(moved.Count() + moved.Limit(), 0U);
    EXPECT_FALSE(moved.Incomplete());
}

TEST(Findings, OfTheSampleAreNotesAndATruthWord)
{
    const Folder folder;
    const CString path = folder / L"in.dcm";
    WriteBytes(path, ReadBytes(CString(DCM_SAMPLE)));
    DCMConverter document;
    dcm::Report report;
    EXPECT_EQ(dcm::Import(document, path, report), S_OK);
    EXPECT_EQ(report.Count(dcm::Severity::kError), 0U);
    EXPECT_EQ(report.Count(dcm::Severity::kWarning), report.Count("truth-word"));
    DCMConverter copy;
    for (const dcm::Parameter& parameter : dcm::ParametersOf(document))
        dcm::Add(copy, parameter);
    EXPECT_EQ(dcm::Export(copy, dcm::NullDevice(), report), S_OK);
    EXPECT_EQ(Listed(report), "");
}

TEST(Findings, OfAnExportTellWhatTheFileLacks)
{
    std::set<std::string> messages;
    for (const ExportCase& c : ExportCases()) {
        SCOPED_TRACE(c.title);
        DCMConverter document;
        c.fill(document);
        dcm::Report report;
        const Folder folder;
        const CString path = folder / L"out.dcm";
        EXPECT_EQ(dcm::Export(document, path, report), S_OK);
        EXPECT_EQ(Listed(report), c.expected);
        // Half a pair of wide characters looks different where these have 32 bits.
        if (std::string_view(c.title) != "pair and half")
            AddMessages(report, messages);
        EXPECT_EQ(ReadBytes(path), ExportBytes(document));
    }
    ExpectMessages(messages, "export_messages.txt");
}

TEST(Findings, HaveARowForEachId)
{
    std::string rows = ReadBytes(dcm::FromUtf8(DCM_TEST_DATA "/findings/import.txt"));
    for (const ExportCase& c : ExportCases())
        rows += c.expected;
    for (const std::string_view id : dcm::FindingIds()) {
        SCOPED_TRACE(id);
        EXPECT_TRUE(IsTestedAlone(id) || HasId(rows, id));
    }
}
