#include "dcm/elements/keywords.h"
#include "dcm/platform/codepage.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <iterator>
#include <limits>
#include <new>
#include <thread>
#include <tuple>
#include <utility>

using namespace test;

namespace {

const wchar_t* Address(const CString& text)
{
    return text;
}

/// Puts the thread back to the code page that it starts with.
struct CodePage
{
    explicit CodePage(unsigned identifier) : known(dcm::SetThreadCodePage(identifier)) {}
    CodePage(const CodePage&) = delete;
    CodePage& operator=(const CodePage&) = delete;
    ~CodePage() { dcm::SetThreadCodePage(1252); }
    bool known;
};

} // namespace

TEST(Text, SharesItsCharactersUntilOneCopyChanges)
{
    // Even the keywords' own memory, which no string may write to.
    for (const CString& first : {CString(L"WERT"), CString(dcm::keyword::kWert)}) {
        CString text(first), other(first);
        EXPECT_EQ(Address(text), Address(first));
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
        expected += std::wstring(expected);
        expected += expected.substr(i, 3);
        text = *&text;
    }
    EXPECT_EQ(text.View(), expected);
    EXPECT_EQ(Address(text)[text.GetLength()], L'\0');
}

TEST(Text, ComparesAndRefusesWhatIsOutside)
{
    EXPECT_GT(CString(L"aZ").Compare(L"Az"), 0);
    EXPECT_EQ(CString(L"aZ[").CompareNoCase(L"Az["), 0);
    EXPECT_LT(CString(L"ab").CompareNoCase(L"B"), 0);
    EXPECT_LT(CString(L"\u00C4").CompareNoCase(L"\u00E4"), 0) << "only A to Z have two cases";
    EXPECT_GT(CString(L"\u017F").CompareNoCase(L"s"), 0);
    CString text(L"ab");
    EXPECT_THROW(text.GetAt(-1), dcm::ResultError);
    EXPECT_THROW(text.GetAt(2), dcm::ResultError);
    EXPECT_THROW(text.Extend(std::numeric_limits<std::size_t>::max()), std::bad_alloc);
    EXPECT_EQ(text, L"ab");
    EXPECT_STREQ(dcm::ResultError(E_INVALIDARG).what(), "invalid argument");
    EXPECT_STREQ(dcm::ResultError(DISP_E_BADVARTYPE).what(), "variant of an unknown type");
    EXPECT_STREQ(dcm::ResultError(E_FAIL).what(), "operation failed");
    const wchar_t* const noText = nullptr;
    const char* const noBytes = nullptr;
    EXPECT_EQ(CString(noText) + L"x" + CString("\xB5") + CString(noBytes), L"x\u00B5");
}

TEST(Variant, OwnsWhatItHolds)
{
    const wchar_t* const absent = nullptr;
    const CComVariant values[] = {CComVariant(), 1.5, 1.5F, 7, 7U, 7LL, true, L"a", absent};
    const VARTYPE tags[] = {VT_EMPTY, VT_R8,   VT_R4,   VT_I4,  VT_UI4,
                            VT_I8,    VT_BOOL, VT_BSTR, VT_BSTR};
    for (std::size_t i = 0; i < std::size(values); ++i) {
        EXPECT_EQ(values[i].vt, tags[i]);
        CComVariant copy(L"old");
        copy = static_cast<const VARIANT&>(values[i]);
        copy = *&copy;
        EXPECT_EQ(Show(copy), Show(values[i]));
        // A text is the copy's own, anything else is the same.
        EXPECT_EQ(copy.llVal == values[i].llVal, Show(copy) != "'a'");
        const CComVariant moved(std::move(copy));
        EXPECT_EQ(Show(moved), Show(values[i]));
        EXPECT_EQ(copy.vt, VT_EMPTY);
    }
    EXPECT_EQ(values[6].boolVal, VARIANT_TRUE);
    VARIANT text{};
    text.vt = VT_BSTR;
    text.bstrVal = SysAllocStringLen(L"a\0b", 3);
    CComVariant copy(text);
    EXPECT_EQ(VariantCopy(&text, &text), S_OK);
    EXPECT_EQ(VariantClear(&text), S_OK);
    text = copy.Detach();
    EXPECT_EQ(SysStringLen(text.bstrVal), 3U) << "a zero does not end it";
    EXPECT_EQ(VariantClear(&text), S_OK);
}

TEST(Variant, RefusesTagsThatItDoesNotKnow)
{
    VARIANT bad{};
    bad.lVal = 1;
    CComVariant value(L"text");
    for (const int tag : {15, 99}) {
        bad.vt = static_cast<VARTYPE>(tag);
        EXPECT_EQ(VariantClear(&bad), DISP_E_BADVARTYPE);
        EXPECT_EQ(VariantCopy(&bad, &value), DISP_E_BADVARTYPE);
        EXPECT_EQ(VariantCopy(&value, &bad), DISP_E_BADVARTYPE);
        EXPECT_EQ(Show(value) + std::to_string(bad.vt), "'text'" + std::to_string(tag));
    }
    EXPECT_THROW(value = bad, dcm::ResultError);
    EXPECT_EQ(value.vt, VT_ERROR);
    EXPECT_EQ(value.scode, DISP_E_BADVARTYPE);
}

TEST(CodePages, ConvertCharactersBothWays)
{
    const std::tuple<unsigned, std::string_view, std::wstring_view> cases[] = {
        {1252, "20\xB0 \xE4 \xB5 \x80", L"20\u00B0 \u00E4 \u00B5 \u20AC"},
        {1252, "\x81\x8D\x8F\x90\x9D", L"\u0081\u008D\u008F\u0090\u009D"},
        {28591, "\xB0\x80\xFF", L"\u00B0\u0080\u00FF"},
        {65001, "sixteen ASCII characters and \xC2\xB0 \xE2\x82\xAC \xF0\x9F\x98\x80 \xEF\xBB\xBF",
         L"sixteen ASCII characters and \u00B0 \u20AC \U0001F600 \uFEFF"},
        {932, "\x93\xFA\x96{ \xB1", L"\u65E5\u672C \uFF71"},
        {500, "\xC1\x82\x25", L"Ab\n"}};
    for (const auto& [identifier, bytes, text] : cases) {
        SCOPED_TRACE(testing::Message() << identifier << ": " << bytes);
        const CodePage page(identifier);
        ASSERT_TRUE(page.known);
        EXPECT_EQ(dcm::Widen(bytes), text);
        EXPECT_EQ(Narrow(text), bytes);
    }
    std::string all;
    for (int number = 0; number < 256; ++number)
        all += static_cast<char>(number);
    for (const unsigned identifier : {1252U, 28591U}) {
        const CodePage page(identifier);
        EXPECT_EQ(Narrow(dcm::Widen(all)), all);
    }
}

TEST(CodePages, PutAMarkForWhatIsNoCharacter)
{
    const std::wstring half(1, static_cast<wchar_t>(0xD800));
    const std::tuple<unsigned, std::wstring, std::string_view> lacking[] = {
        {1252, L"a\u03A9\u65E5\u0080z", "a???z"},
        {1252, L"\U0001F600", "?"},
        {932, L"a\u00E4z", "a?z"},
        {500, L"A\u65E5", "\xC1\x6F"},
        {65001, L"a" + half, "a\xEF\xBF\xBD"}};
    for (const auto& [identifier, text, bytes] : lacking) {
        const CodePage page(identifier);
        EXPECT_EQ(Narrow(text), bytes) << identifier;
    }
    // A mark for each byte that cannot go on, one for a character cut short.
    const CodePage utf8(65001);
    EXPECT_EQ(dcm::Widen("a\xFFz \xC0\x80 \xE2\x82! \xED\xA0\x80 \xE0\x9F \xF4\x90\x80 \xE2\x82"),
              L"a\uFFFDz \uFFFD\uFFFD \uFFFD! \uFFFD\uFFFD\uFFFD \uFFFD\uFFFD "
              L"\uFFFD\uFFFD\uFFFD \uFFFD");
}

TEST(CodePages, BelongToTheThreadThatChoseThem)
{
    const CodePage utf8(65001);
    EXPECT_FALSE(dcm::SetThreadCodePage(4711));
    std::thread([] { dcm::SetThreadCodePage(1252); }).join();
    EXPECT_EQ(Narrow(L"\u00B5"), "\xC2\xB5");
}

TEST(File, KeepsOthersOutWhileItIsOpen)
{
    const Folder folder;
    const CString path = folder / L"K\u00E4se \u65E5.txt";
    WriteBytes(path, "kept");
    for (const UINT first : {kRead, UINT{CFile::modeWrite}}) {
        for (const UINT second : {kRead, UINT{CFile::modeReadWrite}, kCreate}) {
            SCOPED_TRACE(testing::Message() << first << " then " << second);
            CFile holder(path, first);
            CFile other;
            CFileException error;
            EXPECT_FALSE(other.Open(path, second, &error));
            EXPECT_EQ(error.m_cause, CFileException::sharingViolation);
            // What was refused neither emptied the file nor took it from its holder.
            EXPECT_EQ(holder.GetLength(), 4U);
            holder.Close();
            EXPECT_TRUE(other.Open(path, kRead));
        }
    }
    EXPECT_EQ(ReadBytes(path), "kept");
}

TEST(File, SaysWhyItCannotBeOpened)
{
    const Folder folder;
    const std::tuple<CString, UINT, CFileException::Cause> cases[] = {
        {folder / L"missing", kRead, CFileException::fileNotFound},
        {folder / L"missing", CFile::modeWrite, CFileException::fileNotFound},
        {folder / L"", kRead, CFileException::accessDenied},
        {folder / L"", kCreate, CFileException::accessDenied}};
    for (const auto& [path, flags, cause] : cases) {
        CFileException record;
        EXPECT_FALSE(CFile().Open(path, flags, &record));
        EXPECT_EQ(record.m_cause, cause);
        EXPECT_EQ(record.m_strFileName, path);
        EXPECT_NE(std::string(record.what()).find(dcm::ToUtf8(path)), std::string::npos);
        EXPECT_FALSE(CFile().Open(path, flags));
        EXPECT_THROW(CFile(path, flags), CFileException);
    }
    EXPECT_THROW(CFile(L"", kRead), CFileException);
}

TEST(File, IsRefusedFromTwoGibibytesOn)
{
    const Folder folder;
    const CString path = folder / L"large";
    WriteBytes(path, "");
    std::filesystem::resize_file(PathOf(path), (1ULL << 31) - 1);
    EXPECT_TRUE(CFile().Open(path, kRead));
    std::filesystem::resize_file(PathOf(path), 1ULL << 31);
    for (const UINT flags : {kRead, kCreate}) {
        CFileException error;
        EXPECT_FALSE(CFile().Open(path, flags, &error));
        EXPECT_EQ(error.m_cause, CFileException::fileTooLarge);
    }
    EXPECT_EQ(std::filesystem::file_size(PathOf(path)), 1ULL << 31);
}

TEST(File, ReadsAndWritesWhatItsFlagsSay)
{
    const Folder folder;
    const CString path = folder / L"file";
    CFile file(path, kCreate);
    file.Write("abcdef", 6);
    EXPECT_TRUE(file.Open(path, CFile::modeWrite)) << "what is open before is closed first";
    file.Write("XY", 2);
    EXPECT_TRUE(file.Open(path, CFile::modeReadWrite));
    char bytes[8] = {};
    EXPECT_EQ(file.Read(bytes, 3) + file.Read(bytes + 3, 5), 6U);
    EXPECT_STREQ(bytes, "XYcdef");
    file.Write("g", 1);
    EXPECT_EQ(file.GetLength(), 7U);
    EXPECT_TRUE(file.Open(path, kCreate));
    EXPECT_EQ(file.GetLength(), 0U);
    EXPECT_THROW(file.Read(bytes, 1), CFileException) << "a file that is only written";
    file.Close();
    file.Close();
    CFileStatus status;
    EXPECT_FALSE(file.GetStatus(status));
    EXPECT_THROW(file.GetLength(), CFileException);
    EXPECT_THROW(file.Read(bytes, 1), CFileException);
    EXPECT_THROW(file.Write(bytes, 1), CFileException);
}

TEST(Modules, StandInTheListWhileTheyAreLoaded)
{
    CDynLinkLibrary* const before = CDynLinkLibrary::Last();
    AFX_EXTENSION_MODULE one, two;
    EXPECT_TRUE(AfxInitExtensionModule(one, nullptr));
    EXPECT_FALSE(AfxInitExtensionModule(one, nullptr));
    EXPECT_TRUE(AfxInitExtensionModule(two, nullptr));
    auto* const first = new CDynLinkLibrary(one);
    auto* const second = new CDynLinkLibrary(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), second);
    EXPECT_EQ(second->Previous(), first);
    AfxTermExtensionModule(one);
    EXPECT_EQ(second->Previous(), before);
    AfxTermExtensionModule(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), before);
}
