#include "dcm/elements/keywords.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <climits>
#include <concepts>
#include <cstdint>
#include <iomanip>
#include <limits>
#include <new>
#include <thread>
#include <tuple>

using namespace test;

namespace {

template <class A, class B>
concept Adds = requires(const A& a, const B& b)
{
    a + b;
};

template <class A, class B>
concept Appends = requires(A& a, const B& b)
{
    a += b;
};

} // namespace

TEST(Text, SharesItsCharactersUntilOneCopyChanges)
{
    // The second text is a keyword constant, whose memory must not be written to.
    for (const CString& first : {CString(L"WERT"), CString(dcm::keyword::kWert)}) {
        CString text(first), other(first);
        EXPECT_EQ(text.View().data(), first.View().data());
        text += L"E";
        other.Empty();
        const CString moved(std::move(text));
        EXPECT_EQ(first + moved + text + other, L"WERTWERTE");
    }
}

TEST(Text, AppendsItselfAndPartsOfItself)
{
    CString text(L"ab");
    std::wstring expected(L"ab");
    for (std::size_t i = 0; i < 10; ++i) {
        text += text;
        text += text.View().substr(i, 3);
        text = *&text;
        expected += expected;
        expected += expected.substr(i, 3);
        EXPECT_STREQ(static_cast<const wchar_t*>(text), expected.c_str());
    }
}

TEST(Text, ComparesAndRefusesWhatIsOutside)
{
    EXPECT_GT(CString(L"aZ").Compare(L"Az"), 0);
    EXPECT_EQ(CString(L"aZ[").CompareNoCase(L"Az["), 0);
    EXPECT_LT(CString(L"ab").CompareNoCase(L"B"), 0);
    EXPECT_LT(CString(L"a").CompareNoCase(L"AB"), 0);
    EXPECT_GT(CString(L"ab").CompareNoCase(L"A"), 0);
    EXPECT_LT(CString(L"\u00C4").CompareNoCase(L"\u00E4"), 0) << "only A to Z have two cases";
    CString text(L"ab");
    EXPECT_EQ(text.GetAt(1), L'b');
    EXPECT_THROW(text.GetAt(-1), dcm::ResultError);
    EXPECT_THROW(text.GetAt(2), dcm::ResultError);
    EXPECT_THROW(text.Extend(std::numeric_limits<std::size_t>::max()), std::bad_alloc);
    const wchar_t* const noText = nullptr;
    const char* const noBytes = nullptr;
    EXPECT_EQ(text + CString(noText) + CString("\xB5") + CString(noBytes), L"ab\u00B5");
}

TEST(Text, FindsAndCuts)
{
    const CString text(L"abcabc");
    const std::pair<int, int> found[] = {
        {text.Find(L"bc"), 1},          {text.Find(L"bc", 2), 4},      {text.Find(L"bc", 5), -1},
        {text.Find(L"bc", -1), -1},     {text.Find(L"", 6), 6},        {text.Find(L"", 7), -1},
        {text.Find(L'c'), 2},           {text.Find(L'c', 3), 5},       {text.Find(L'c', 6), -1},
        {text.Find(L'a', -1), -1},      {text.Find(L'x'), -1},         {text.FindOneOf(L"xcb"), 1},
        {text.FindOneOf(L"xyz"), -1},   {text.FindOneOf(L""), -1},     {CString().Find(L'a'), -1},
        {text.Find(L'b', INT_MAX), -1}, {text.Find(CString(L"ca")), 2}};
    for (std::size_t i = 0; i < std::size(found); ++i)
        EXPECT_EQ(found[i].first, found[i].second) << i;
    const std::pair<CString, const wchar_t*> cut[] = {{text.Left(2), L"ab"},
                                                      {text.Left(-1), L""},
                                                      {text.Left(7), L"abcabc"},
                                                      {text.Right(2), L"bc"},
                                                      {text.Right(-1), L""},
                                                      {text.Right(7), L"abcabc"},
                                                      {text.Mid(4), L"bc"},
                                                      {text.Mid(-1), L"abcabc"},
                                                      {text.Mid(7), L""},
                                                      {text.Mid(1, 2), L"bc"},
                                                      {text.Mid(-1, 2), L"ab"},
                                                      {text.Mid(6, 1), L""},
                                                      {text.Mid(2, INT_MAX), L"cabc"},
                                                      {text.Mid(1, INT_MIN), L""}};
    for (const auto& [part, expected] : cut)
        EXPECT_EQ(part, expected);
}

TEST(Text, TrimsAndReplaces)
{
    const CString text(L"\t\n\v\f\r a b\u00A0 \r\n");
    EXPECT_EQ(CString(text).Trim(), L"a b\u00A0");
    EXPECT_EQ(CString(text).TrimLeft(), L"a b\u00A0 \r\n");
    EXPECT_EQ(CString(text).TrimRight(), L"\t\n\v\f\r a b\u00A0");
    EXPECT_EQ(CString(L" \r\n").Trim(), L"");
    EXPECT_EQ(CString(L"\"'x' \"").Trim(L"'\""), L"x' ");
    EXPECT_EQ(CString(L"aabaa").TrimLeft(L"a").TrimRight(L"b"), L"baa");
    EXPECT_EQ(CString(L" a ").Trim(L""), L" a ");
    const std::tuple<const wchar_t*, const wchar_t*, int, const wchar_t*> cases[] = {
        {L"ab", L"x", 2, L"xaxa"}, {L"a", L"aa", 4, L"aabaaaabaa"}, {L"", L"x", 0, L"abaaba"},
        {L"abaaba", L"", 1, L""},  {L"c", L"x", 0, L"abaaba"},      {L"aba", L"ab", 2, L"abab"}};
    for (const auto& [from, to, count, expected] : cases) {
        const CString whole(L"abaaba");
        CString changed(whole);
        EXPECT_EQ(changed.Replace(from, to), count);
        EXPECT_EQ(changed, expected);
        EXPECT_EQ(whole, L"abaaba");
    }
    CString own(L"ab");
    EXPECT_EQ(own.Replace(own.View().substr(1), own), 1);
    EXPECT_EQ(own.Replace(L'a', L'c'), 2);
    EXPECT_EQ(own, L"ccb");
}

TEST(Text, TakesCharacters)
{
    const CString name(L"Name");
    CString text = L'<' + name + L'_' + L'\0';
    text += L'>';
    text.AppendChar(L'!');
    EXPECT_EQ(text.View(), std::wstring_view(L"<Name_\0>!", 9));
    const CString copy(text);
    text.SetAt(0, L'(');
    text.SetAt(8, L'?');
    EXPECT_EQ(text.Left(5) + text.Right(2) + copy.Left(1), L"(Name>?<");
    EXPECT_THROW(text.SetAt(9, L'x'), dcm::ResultError);
    EXPECT_THROW(text.SetAt(-1, L'x'), dcm::ResultError);
    EXPECT_TRUE(name.Left(1) == L'N' && L'N' == name.Left(1) && name != L'N' && name > L'N');
    EXPECT_TRUE(L'O' > name && CString() < L'\0' && CString() != L'\0');
    std::wostringstream out;
    out << std::setw(5) << name << L'|' << name + L'_';
    EXPECT_EQ(out.str(), L" Name|Name_");
    // Any other number is no character.
    EXPECT_FALSE((Adds<CString, char> || Adds<CString, int> || Adds<char, CString>));
    EXPECT_FALSE((std::equality_comparable_with<CString, int> || Appends<CString, char>));
}

// A constant cannot read another member than the one that was set.
static_assert(CComVariant(static_cast<signed char>(-1)).cVal == -1);
static_assert(CComVariant(std::uint8_t{255}).bVal == 255);
static_assert(CComVariant(std::int16_t{-2}).iVal == -2);
static_assert(CComVariant(std::uint16_t{65535}).uiVal == 65535);
static_assert(CComVariant(-7).lVal == -7);
static_assert(CComVariant(7U).ulVal == 7);
static_assert(CComVariant(std::int64_t{-1} << 40).llVal == std::int64_t{-1} << 40);
static_assert(CComVariant(~std::uint64_t{0}).ullVal == ~std::uint64_t{0});
static_assert(CComVariant(true).boolVal == VARIANT_TRUE);
static_assert(CComVariant(0.5F).fltVal == 0.5F);

TEST(Variant, OwnsItsText)
{
    const CComVariant source(std::wstring_view(L"a\0b", 3));
    CComVariant text(L"old");
    text = source;
    text = *&text;
    EXPECT_NE(text.bstrVal, source.bstrVal);
    CComVariant moved(std::move(text));
    EXPECT_EQ(text.vt, VT_EMPTY);
    VARIANT taken = moved.Detach();
    EXPECT_EQ(VariantCopy(&taken, &taken), S_OK);
    EXPECT_EQ(SysStringLen(taken.bstrVal), 3U) << "a zero does not end it";
    EXPECT_EQ(VariantClear(&taken), S_OK);
}

TEST(Variant, RefusesTagsThatItDoesNotKnow)
{
    VARIANT bad{};
    bad.lVal = 1;
    CComVariant value(L"text");
    for (const VARTYPE tag : {VARTYPE{15}, VARTYPE{99}}) {
        bad.vt = tag;
        EXPECT_EQ(VariantClear(&bad), DISP_E_BADVARTYPE);
        EXPECT_EQ(VariantCopy(&bad, &value), DISP_E_BADVARTYPE);
        EXPECT_EQ(VariantCopy(&value, &bad), DISP_E_BADVARTYPE);
        EXPECT_EQ(Show(value), "'text'");
    }
    try {
        value = bad;
        ADD_FAILURE() << "not raised";
    } catch (const dcm::ResultError& error) {
        EXPECT_STREQ(error.what(), "variant of an unknown type");
    }
    EXPECT_EQ(value.scode, DISP_E_BADVARTYPE);
}

TEST(Results, AreTheNumbersThatHostsKnow)
{
    static_assert(VT_BSTR == 8 && VT_BOOL == 11 && VT_VARIANT == 12 && VT_UI4 == 19);
    VARIANT unknown{};
    unknown.vt = 99;
    const auto raised = [](const CString& text) {
        try {
            return static_cast<HRESULT>(text.GetAt(1));
        } catch (const dcm::ResultError& error) {
            EXPECT_STREQ(error.what(), "invalid argument");
            return error.Code();
        }
    };
    EXPECT_STREQ(dcm::ResultError(E_FAIL).what(), "operation failed");
    const std::pair<HRESULT, std::uint32_t> cases[] = {
        {DCMFestwert().SetValue(CComVariant(1.0)), 0U},
        {DCMConverter().Import(L"no such folder/a.dcm"), 0x8000FFFFU},
        {DCMFestwert().GetValue(nullptr), 0x80004003U},
        {DCMKennlinie().Init(L"ST_TX/Y \"a\"\n"), 0x80004005U},
        {raised(L""), 0x80070057U},
        {VariantClear(&unknown), 0x80020008U},
        {E_OUTOFMEMORY, 0x8007000EU}};
    for (const auto& [result, number] : cases) {
        EXPECT_EQ(static_cast<std::uint32_t>(result), number);
        EXPECT_TRUE(FAILED(result) != SUCCEEDED(result) && FAILED(result) == (number != 0));
    }
}

TEST(CodePages, ConvertAsTheirCasesSay)
{
    const auto rows = Rows(DCM_TEST_DATA "/codepages.txt");
    EXPECT_GT(rows.size(), 20U);
    for (const auto& row : rows) {
        SCOPED_TRACE(testing::PrintToString(row));
        if (row[0].starts_with("linux") && std::filesystem::path::preferred_separator != '/')
            continue;
        if (!ChoosePage(static_cast<unsigned>(std::stoul(row[1]))))
            continue;
        std::string bytes;
        for (std::size_t i = 0; i < row[3].size(); i += 2)
            bytes += static_cast<char>(std::stoi(row[3].substr(i, 2), nullptr, 16));
        if (!row[0].ends_with("write")) {
            EXPECT_EQ(dcm::Widen(bytes), dcm::FromUtf8(row[2]));
        }
        if (!row[0].ends_with("read")) {
            EXPECT_EQ(Narrow(dcm::FromUtf8(row[2])), bytes);
        }
    }
    EXPECT_FALSE(dcm::SetThreadCodePage(28607) || dcm::SetThreadCodePage(4711));
    EXPECT_TRUE(dcm::SetThreadCodePage(65001));
    std::thread([] { dcm::SetThreadCodePage(1252); }).join();
    EXPECT_EQ(dcm::ThreadCodePage(), 65001U);
    for (const int half : {0xD800, 0xDC00}) {
        const std::wstring text{L'\u00B5', static_cast<wchar_t>(half)};
        EXPECT_EQ(Narrow(text), "\xC2\xB5\xEF\xBF\xBD") << "each thread has its own page";
    }
    EXPECT_TRUE(dcm::SetThreadCodePage(1252));
}

TEST(CodePages, KeepEachByte)
{
    for (const unsigned page : {28591U, 1252U}) {
        dcm::SetThreadCodePage(page);
        for (int number = 1; number < 256; ++number) {
            const std::string text(1, static_cast<char>(number));
            EXPECT_EQ(Replaced(Narrow(dcm::Widen(text)), "\r\n", "\n"), text);
        }
        EXPECT_EQ(dcm::Widen("\x81\x8D\x8F\x90\x9D"), L"\u0081\u008D\u008F\u0090\u009D");
    }
}

TEST(File, KeepsOthersOutWhileItIsOpen)
{
    const Folder folder;
    const CString path = folder / L"K\u00E4se \u65E5.txt";
    WriteBytes(path, "kept");
    for (const UINT first : {kRead, UINT{CFile::modeWrite}}) {
        for (const UINT second : {kRead, UINT{CFile::modeReadWrite}, kCreate}) {
            CFile holder(path, first);
            EXPECT_EQ(CauseOf(path, second), CFileException::sharingViolation) << second;
            // The refused open neither emptied the file nor ended its exclusive use.
            EXPECT_EQ(holder.GetLength(), 4U);
            CFileException error;
            EXPECT_FALSE(CFile().Open(path, second, &error));
            EXPECT_NE(std::string(error.what()).find("has the file open"), std::string::npos);
        }
    }
}

TEST(File, SaysWhyItCannotBeOpened)
{
    const Folder folder;
    const CString large = folder / L"large";
    WriteBytes(large, "");
    std::filesystem::resize_file(PathOf(large), (1ULL << 31) - 1);
    EXPECT_EQ(CauseOf(large, kRead), CFileException::none);
    std::filesystem::resize_file(PathOf(large), 1ULL << 31);
    EXPECT_EQ(CauseOf(large, kRead), CFileException::fileTooLarge);
    EXPECT_EQ(CauseOf(large, CFile::modeCreate), CFileException::fileTooLarge);
    EXPECT_EQ(CauseOf(large, CFile::modeWrite), CFileException::fileTooLarge);
    EXPECT_EQ(std::filesystem::file_size(PathOf(large)), 1ULL << 31);
    ASSERT_EQ(DCMConverter().Export(large), S_OK) << "a file that is emptied may have any size";
    EXPECT_EQ(ReadBytes(large), ExportBytes(DCMConverter()));
    EXPECT_EQ(CauseOf(folder / L"missing", CFile::modeWrite), CFileException::fileNotFound);
    EXPECT_EQ(CauseOf(folder / L"", kCreate), CFileException::accessDenied);
    EXPECT_NE(CauseOf(L"", kRead), CFileException::none);
    const CString missing = folder / L"missing";
    EXPECT_THROW(CFile(missing, kRead), CFileException);
    CFileException error;
    EXPECT_FALSE(CFile().Open(missing, kRead, &error));
    EXPECT_EQ(error.m_cause, CFileException::fileNotFound);
    EXPECT_EQ(error.m_strFileName, missing);
    EXPECT_TRUE(std::string(error.what()).starts_with(dcm::ToUtf8(missing)));
}

TEST(File, SaysInWordsWhatWentWrong)
{
    const std::pair<CFileException::Cause, std::string> cases[] = {
        {CFileException::invalidFile, "not an open file"},
        {CFileException::accessDenied, "not a file that can be read or written as a whole"},
        {CFileException::fileTooLarge, "2 GiB or larger"},
        {CFileException::diskFull, "no room for all of the text"},
        {CFileException::sharingViolation, "another program or document has the file open"},
        {CFileException::generic, "file error"}};
    for (const auto& [cause, words] : cases)
        EXPECT_EQ(CFileException(cause, 0, L"\u00E4").what(), "\xC3\xA4: " + words);
}

TEST(File, ReadsAndWritesWhatItsFlagsSay)
{
    const Folder folder;
    const CString path = folder / L"file";
    CFile file(path, kCreate);
    file.Write("abcdef", 6);
    EXPECT_TRUE(file.Open(path, CFile::modeWrite)) << "the open file is closed first";
    file.Write("XY", 2);
    EXPECT_TRUE(file.Open(path, CFile::modeReadWrite));
    char bytes[8] = {};
    EXPECT_EQ(file.Read(bytes, 3) + file.Read(bytes + 3, 5), 6U);
    EXPECT_STREQ(bytes, "XYcdef");
    file.Write("g", 1);
    CFileStatus status;
    EXPECT_TRUE(file.GetStatus(status));
    EXPECT_EQ(status.m_size, 7U);
    EXPECT_EQ(file.GetLength(), 7U);
    EXPECT_TRUE(file.Open(path, kCreate));
    EXPECT_EQ(file.GetLength(), 0U);
    EXPECT_THROW(file.Read(bytes, 1), CFileException) << "a file that is only written";
    file.Close();
    EXPECT_FALSE(file.GetStatus(status));
    EXPECT_THROW(file.GetLength(), CFileException);
    EXPECT_THROW(file.Write(bytes, 1), CFileException);
    WriteBytes(path, "kept");
    EXPECT_TRUE(file.Open(path, CFile::modeCreate));
    EXPECT_EQ(file.Read(bytes, 8), 4U) << "a file that is only read is not emptied";
    EXPECT_TRUE(file.Open(folder / L"new", CFile::modeCreate));
    EXPECT_EQ(file.Read(bytes, 8), 0U);
}

TEST(Modules, AreInTheListWhileTheyAreLoaded)
{
    CDynLinkLibrary* const before = CDynLinkLibrary::Last();
    AFX_EXTENSION_MODULE one, two;
    EXPECT_TRUE(AfxInitExtensionModule(one, nullptr));
    EXPECT_FALSE(AfxInitExtensionModule(one, nullptr));
    auto* const first = new CDynLinkLibrary(one);
    auto* const second = new CDynLinkLibrary(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), second);
    EXPECT_EQ(&second->Module(), &two);
    EXPECT_EQ(second->Previous(), first);
    AfxTermExtensionModule(one);
    EXPECT_EQ(second->Previous(), before);
    AfxTermExtensionModule(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), before);
}
