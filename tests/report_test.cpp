#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
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

} // namespace

TEST(Report, SaysWhyAFileCannotBeUsed)
{
    const Folder folder;
    const CString file = folder / L"file";
    WriteBytes(file, "");
    CFile open(file, kRead);
    const struct
    {
        CString path;
        const char* import;
        const char* export_;
        const wchar_t* words;
    } cases[] = {
        {folder / L"none" + CString(L"/none"), "cannot-open", "cannot-open", L""},
        {folder / L"", "cannot-open", "cannot-open", L"("},
        {file, "cannot-open", "cannot-open", L"(sharingViolation): "},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(dcm::ToUtf8(c.path));
        dcm::Report report;
        DCMConverter document;
        EXPECT_EQ(dcm::Import(document, c.path, report), E_UNEXPECTED);
        EXPECT_EQ(Listed(report), "0 error " + std::string(c.import) + "\n");
        EXPECT_NE(report.Findings().at(0).message.View().find(c.words), std::wstring_view::npos);
        EXPECT_EQ(dcm::Export(document, c.path, report), E_UNEXPECTED);
        EXPECT_EQ(Listed(report), "0 error " + std::string(c.export_) + "\n");
        EXPECT_NE(report.Findings().at(0).message.View().find(c.words), std::wstring_view::npos);
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
    EXPECT_EQ(dcm::Report(moved).Count(dcm::Severity::kError), 1U);
    EXPECT_EQ(dcm::Export(document, dcm::NullDevice(), moved), S_OK);
    EXPECT_EQ(moved.Summary(), L"no findings");
    EXPECT_EQ(moved.Count() + moved.Limit(), 0U);
    EXPECT_FALSE(moved.Incomplete());
}
