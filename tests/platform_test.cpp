#include "dcm/elements/keywords.h"
#include "dcm/platform/codepage.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <limits>
#include <new>
#include <thread>
#include <tuple>
#include <utility>

using namespace test;

namespace {

std::string Narrow(std::wstring_view text)
{
    return std::string(dcm::ToThreadCodePage(dcm::FileTextFromWide(text)).View());
}

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
    CString a(L"abc");
    CString b(a);
    EXPECT_EQ(Address(a), Address(b));
    b += L"d";
    EXPECT_EQ(a, L"abc");
    a = b;
    b.Empty();
    EXPECT_EQ(a + b, L"abcd");
    const CString moved(std::move(a));
    EXPECT_EQ(moved + a, L"abcd");
    // Even the keywords' own memory, which no string may write to.
    CString keyword(dcm::keyword::kWert);
    const CString other(dcm::keyword::kWert);
    EXPECT_EQ(Address(keyword), Address(other));
    keyword += L"E";
    keyword.Empty();
    EXPECT_EQ(other, L"WERT");
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
    const std::tuple<CString, CString, int, int> cases[] = {{L"a", L"", 1, 1},
                                                            {L"aZ", L"Az", 1, 0},
                                                            {L"ab", L"B", 1, -1},
                                                            {L"\u00C4", L"\u00E4", -1, -1},

                                                            {L"\u017F", L"s", 1, 1}};
    const auto sign = [](int n) { return (n > 0) - (n < 0); };
    for (const auto& [a, b, withCase, without] : cases) {
        EXPECT_EQ(sign(a.Compare(b)), withCase);
        EXPECT_EQ(sign(a.CompareNoCase(b)), without);
        EXPECT_EQ(a < b, withCase < 0);
        EXPECT_EQ(a == b, withCase == 0);
    }
    CString text(L"ab");
    EXPECT_EQ(text.GetAt(1), L'b');
    EXPECT_THROW(text.GetAt(-1), dcm::ResultError);
    EXPECT_THROW(text.GetAt(2), dcm::ResultError);
    EXPECT_THROW(text.Extend(std::numeric_limits<std::size_t>::max()), std::bad_alloc);
    EXPECT_EQ(text, L"ab");
    const wchar_t* const noText = nullptr;
    const char* const noBytes = nullptr;
    EXPECT_EQ(CString(noText) + L"x" + CString("\xB5") + CString(noBytes), L"x\u00B5");
}

TEST(Variant, TakesTheTagOfWhatItIsMadeFrom)
{
    const wchar_t* const noText = nullptr;
    const std::pair<CComVariant, VARTYPE> cases[] = {{CComVariant(), VT_EMPTY},
                                                     {1.5, VT_R8},

                                                     {7, VT_I4},

                                                     {7U, VT_UI4},
                                                     {7LL, VT_I8},
                                                     {true, VT_BOOL},
                                                     {L"a", VT_BSTR},

                                                     {noText, VT_BSTR}};
    for (const auto& [value, tag] : cases) {
        EXPECT_EQ(value.vt, tag);
        CComVariant copy(L"old");
        copy = static_cast<const VARIANT&>(value);
        EXPECT_EQ(Show(copy), Show(value));
        if (tag != VT_BSTR) {
            EXPECT_EQ(copy.llVal, value.llVal);
        } else if (value.bstrVal != nullptr) {
            EXPECT_NE(copy.bstrVal, value.bstrVal);
        }
        const CComVariant moved(std::move(copy));
        EXPECT_EQ(Show(moved), Show(value));
        EXPECT_EQ(copy.vt, VT_EMPTY);
    }
    EXPECT_EQ(CComVariant(true).boolVal, VARIANT_TRUE);
}

TEST(Variant, CopiesATextWithItsZeros)
{
    VARIANT text{};
    text.vt = VT_BSTR;
    text.bstrVal = SysAllocStringLen(L"a\0b", 3);
    CComVariant copy(text);
    EXPECT_EQ(VariantCopy(&text, &text), S_OK);
    EXPECT_EQ(VariantClear(&text), S_OK);
    EXPECT_EQ(text.vt, VT_EMPTY);
    copy = *&copy;
    VARIANT detached = copy.Detach();
    EXPECT_EQ(copy.vt, VT_EMPTY);
    EXPECT_EQ(std::wstring(detached.bstrVal, SysStringLen(detached.bstrVal)),
              std::wstring(L"a\0b", 3));
    EXPECT_EQ(VariantClear(&detached), S_OK);
    EXPECT_EQ(SysStringLen(SysAllocString(nullptr)), 0U);
}

TEST(Variant, RefusesTagsThatItDoesNotKnow)
{
    VARIANT bad{};
    bad.vt = 99;
    bad.lVal = 1;
    CComVariant value(L"text");
    EXPECT_EQ(VariantClear(&bad), DISP_E_BADVARTYPE);
    EXPECT_EQ(VariantCopy(&bad, &value), DISP_E_BADVARTYPE);
    EXPECT_EQ(bad.vt, 99);
    EXPECT_EQ(VariantCopy(&value, &bad), DISP_E_BADVARTYPE);
    EXPECT_EQ(Show(value), "'text'");
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
        {65001, "\xC2\xB0 \xE2\x82\xAC \xF0\x9F\x98\x80 \xEF\xBB\xBF",
         L"\u00B0 \u20AC \U0001F600 \uFEFF"},
        {65001, "sixteen ASCII characters and \xC3\xA4", L"sixteen ASCII characters and \u00E4"},
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
    for (int byte = 0; byte < 256; ++byte)
        all += static_cast<char>(byte);
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

        {1252, L"\U0001F600", sizeof(wchar_t) == 2 ? "??" : "?"},
        {932, L"a\u00E4z", "a?z"},
        {500, L"A\u65E5", "\xC1\x6F"},
        {65001, L"a" + half, "a\xEF\xBF\xBD"}};
    for (const auto& [identifier, text, bytes] : lacking) {
        const CodePage page(identifier);
        EXPECT_EQ(Narrow(text), bytes) << identifier;
    }
    const std::pair<std::string_view, std::wstring_view> invalid[] = {
        {"a\xFFz", L"a\uFFFDz"},
        {"\xC0\x80", L"\uFFFD\uFFFD"},

        {"\xE2\x82!", L"\uFFFD!"},
        {"\xE2\x82", L"\uFFFD"},
        {"\xED\xA0\x80", L"\uFFFD\uFFFD\uFFFD"},

        {"\xF4\x90\x80\x80", L"\uFFFD\uFFFD\uFFFD\uFFFD"}};
    const CodePage utf8(65001);
    for (const auto& [bytes, text] : invalid)
        EXPECT_EQ(dcm::Widen(bytes), text) << testing::PrintToString(bytes);
}

TEST(CodePages, BelongToTheThreadThatChoseThem)
{
    const CodePage utf8(65001);
    EXPECT_FALSE(dcm::SetThreadCodePage(4711));
    EXPECT_EQ(Narrow(L"\u00B5"), "\xC2\xB5");
    std::string other;
    std::thread([&] { dcm::SetThreadCodePage(1252), other = Narrow(L"\u00B5"); }).join();
    EXPECT_EQ(other, "\xB5");
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
            EXPECT_EQ(error.m_strFileName, path);
            EXPECT_THROW(CFile(path, second), CFileException);
            CFileStatus status;
            EXPECT_FALSE(other.GetStatus(status));
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
    EXPECT_THROW(CFile(folder / L"no/such/folder", kCreate), CFileException);
    EXPECT_THROW(CFile(L"", kRead), CFileException);
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
    CFileStatus status;
    EXPECT_TRUE(file.GetStatus(status));
    EXPECT_EQ(status.m_size, 7U);
    EXPECT_TRUE(file.Open(path, kCreate));
    EXPECT_EQ(file.GetLength(), 0U);
    EXPECT_THROW(file.Read(bytes, 1), CFileException) << "a file that is only written";
    file.Close();
    file.Close();
    EXPECT_THROW(file.GetLength(), CFileException);
    EXPECT_THROW(file.Read(bytes, 1), CFileException);
    EXPECT_THROW(file.Write(bytes, 1), CFileException);
}

TEST(Modules, StandInTheListWhileTheyAreLoaded)
{
    CDynLinkLibrary* const before = CDynLinkLibrary::Last();
    AFX_EXTENSION_MODULE one, two;
    int handle = 0;
    EXPECT_TRUE(AfxInitExtensionModule(one, &handle));
    EXPECT_FALSE(AfxInitExtensionModule(one, nullptr));
    EXPECT_EQ(one.hModule, &handle);
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
