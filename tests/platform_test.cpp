#include "dcm/elements/keywords.h"
#include "dcm/platform/codepage.h"
#include "tests/support.h"

#include <gtest/gtest.h>

#include <limits>
#include <new>
#include <thread>

using namespace test;

namespace {

std::string Narrow(std::wstring_view text)
{
    dcm::TextEncoder encoder(text.size());
    encoder.Append(text);
    return std::string(encoder.Finish());
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

constexpr UINT kCreate = CFile::modeCreate | CFile::modeWrite;

} // namespace

TEST(Text, SharesItsCharactersUntilOneCopyChanges)
{
    CString a(L"abc");
    CString b(a);
    EXPECT_EQ(Address(a), Address(b));
    b += L"d";
    EXPECT_EQ(a, L"abc");
    EXPECT_EQ(b, L"abcd");
    a = b;
    b.Empty();
    EXPECT_EQ(a, L"abcd");
    EXPECT_EQ(b, L"");
    const CString moved(std::move(a));
    EXPECT_EQ(moved, L"abcd");
    EXPECT_TRUE(a.IsEmpty());
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
    for (int i = 0; i < 10; ++i) {
        text += text;
        expected += std::wstring(expected);
        text += text.View().substr(1, 3);
        expected += expected.substr(1, 3);
        text += text.View().substr(static_cast<std::size_t>(text.GetLength()) - 1);
        expected += expected.back();
    }
    EXPECT_EQ(text.View(), expected);
    EXPECT_EQ(Address(text)[text.GetLength()], L'\0');
    text = *&text;
    EXPECT_EQ(text.View(), expected);
}

TEST(Text, ComparesAndRefusesWhatIsOutside)
{
    const struct
    {
        const wchar_t* a;
        const wchar_t* b;
        int withCase;
        int without;
    } cases[] = {
        {L"", L"", 0, 0},     {L"a", L"", 1, 1},    {L"aZ", L"Az", 1, 0}, {L"ab", L"B", 1, -1},
        {L"Ä", L"ä", -1, -1}, {L"[", L"{", -1, -1}, {L"ſ", L"s", 1, 1},
    };
    const auto sign = [](int n) { return (n > 0) - (n < 0); };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << c.a << " and " << c.b);
        EXPECT_EQ(sign(CString(c.a).Compare(c.b)), c.withCase);
        EXPECT_EQ(sign(CString(c.a).CompareNoCase(c.b)), c.without);
        EXPECT_EQ(CString(c.a) < c.b, c.withCase < 0);
        EXPECT_EQ(CString(c.a) == CString(c.b), c.withCase == 0);
    }
    CString text(L"ab");
    EXPECT_EQ(text.GetAt(1), L'b');
    for (const int index : {-1, 2})
        EXPECT_THROW(text.GetAt(index), dcm::ResultError);
    EXPECT_THROW(text.Extend(std::numeric_limits<std::size_t>::max()), std::bad_alloc);
    EXPECT_EQ(text, L"ab");
    EXPECT_EQ(CString(static_cast<const wchar_t*>(nullptr)) + L"x" + CString("\xB5"), L"x\u00B5");
    EXPECT_TRUE(CString(static_cast<const char*>(nullptr)).IsEmpty());
}

TEST(Text, MayBeSharedByThreads)
{
    const CString shared(L"shared");
    const auto work = [copy = shared] {
        for (int i = 0; i < 1000; ++i) {
            CString own(copy);
            own += L"!";
            ASSERT_EQ(own, L"shared!");
        }
    };
    std::thread one(work);
    std::thread two(work);
    one.join();
    two.join();
    EXPECT_EQ(shared, L"shared");
}

TEST(Variant, TakesTheTagOfWhatItIsMadeFrom)
{
    const CString text(L"a");
    const struct
    {
        CComVariant value;
        VARTYPE tag;
    } cases[] = {
        {{}, VT_EMPTY},  {1.5, VT_R8},           {1.5F, VT_R4},
        {7, VT_I4},      {short{7}, VT_I2},      {7U, VT_UI4},
        {7LL, VT_I8},    {true, VT_BOOL},        {L"a", VT_BSTR},
        {text, VT_BSTR}, {text.View(), VT_BSTR}, {static_cast<const wchar_t*>(nullptr), VT_BSTR},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(c.value.vt, c.tag);
        CComVariant copy(c.value);
        CComVariant assigned(L"old");
        assigned = static_cast<const VARIANT&>(c.value);
        const CComVariant moved(std::move(copy));
        for (const auto* other : {static_cast<const CComVariant*>(&assigned), &moved}) {
            EXPECT_EQ(other->vt, c.tag);
            if (c.tag != VT_BSTR) {
                EXPECT_EQ(other->llVal, c.value.llVal);
            } else if (c.value.bstrVal == nullptr) {
                EXPECT_EQ(other->bstrVal, nullptr);
            } else {
                EXPECT_NE(other->bstrVal, c.value.bstrVal);
                EXPECT_STREQ(other->bstrVal, L"a");
            }
        }
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
    EXPECT_EQ(SysStringLen(copy.bstrVal), 3U);
    EXPECT_EQ(copy.bstrVal[2], L'b');
    copy = *&copy;
    EXPECT_EQ(SysStringLen(copy.bstrVal), 3U);
    EXPECT_EQ(VariantCopy(&text, &text), S_OK);
    EXPECT_EQ(VariantClear(&text), S_OK);
    EXPECT_EQ(text.vt, VT_EMPTY);
    VARIANT detached = copy.Detach();
    EXPECT_EQ(copy.vt, VT_EMPTY);
    EXPECT_EQ(VariantClear(&detached), S_OK);
    EXPECT_EQ(SysAllocString(nullptr), nullptr);
    EXPECT_EQ(SysStringLen(nullptr), 0U);
}

TEST(Variant, RefusesTagsThatItDoesNotKnow)
{
    VARIANT bad{};
    bad.vt = 99;
    bad.lVal = 1;
    EXPECT_EQ(VariantClear(&bad), DISP_E_BADVARTYPE);
    EXPECT_EQ(bad.vt, 99);
    CComVariant value(L"text");
    EXPECT_EQ(VariantCopy(&value, &bad), DISP_E_BADVARTYPE);
    EXPECT_EQ(Show(value), "'text'");
    try {
        value = bad;
        ADD_FAILURE() << "copied";
    } catch (const dcm::ResultError& error) {
        EXPECT_EQ(error.Code(), DISP_E_BADVARTYPE);
    }
    EXPECT_EQ(value.vt, VT_ERROR);
    EXPECT_EQ(value.scode, DISP_E_BADVARTYPE);
    EXPECT_EQ(VariantCopy(&bad, &value), DISP_E_BADVARTYPE);
}

TEST(CodePages, ConvertCharactersBothWays)
{
    const struct
    {
        unsigned page;
        std::string_view bytes;
        std::wstring_view text;
    } cases[] = {
        {1252, "20\xB0 \xE4 \xB5 \x80", L"20\u00B0 \u00E4 \u00B5 \u20AC"},
        {1252, "\x81\x8D\x8F\x90\x9D", L"\u0081\u008D\u008F\u0090\u009D"},
        {28591, "\xB0\x80\xFF", L"\u00B0\u0080\u00FF"},
        {65001, "\xC2\xB0 \xE2\x82\xAC \xF0\x9F\x98\x80 \xEF\xBB\xBF",
         L"\u00B0 \u20AC \U0001F600 \uFEFF"},
        {65001, "sixteen ASCII characters and some \xC3\xA4",
         L"sixteen ASCII characters and some \u00E4"},
        {932, "\x93\xFA\x96{ \xB1", L"\u65E5\u672C \uFF71"},
        {500, "\xC1\x82\x25", L"Ab\n"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << c.page << ": " << c.bytes);
        const CodePage page(c.page);
        ASSERT_TRUE(page.known);
        EXPECT_EQ(dcm::Widen(c.bytes), c.text);
        EXPECT_EQ(Narrow(c.text), c.bytes);
    }
    std::string all;
    for (int byte = 0; byte < 256; ++byte)
        all += static_cast<char>(byte);
    for (const unsigned identifier : {1252U, 28591U}) {
        const CodePage page(identifier);
        EXPECT_EQ(Narrow(dcm::Widen(all)), all);
    }
}

TEST(CodePages, PutAMarkForWhatTheyLack)
{
    const struct
    {
        unsigned page;
        std::wstring text;
        std::string_view bytes;
    } lacking[] = {
        {1252, L"a\u03A9\u65E5\u0080z", "a???z"},
        {1252, L"\U0001F600", sizeof(wchar_t) == 2 ? "??" : "?"},
        {28591, L"\u20AC", "?"},
        {932, L"a\u00E4z", "a?z"},
        {500, L"A\u65E5", "\xC1\x6F"},
        {65001, {L'a', wchar_t(0xD800)}, "a\xEF\xBF\xBD"},
    };
    for (const auto& c : lacking) {
        SCOPED_TRACE(testing::Message() << c.page << ": " << c.bytes);
        const CodePage page(c.page);
        EXPECT_EQ(Narrow(c.text), c.bytes);
    }
    const struct
    {
        std::string_view bytes;
        std::wstring_view text;
    } invalid[] = {
        {"a\xFFz", L"a\uFFFDz"},
        {"\xC0\x80", L"\uFFFD\uFFFD"},
        {"\xE2\x82"
         "a",
         L"\uFFFD"
         L"a"},
        {"\xE2\x82", L"\uFFFD"},
        {"\x80", L"\uFFFD"},
        {"\xED\xA0\x80", L"\uFFFD\uFFFD\uFFFD"},
        {"\xE0\x9F\xBF", L"\uFFFD\uFFFD\uFFFD"},
        {"\xF4\x90\x80\x80", L"\uFFFD\uFFFD\uFFFD\uFFFD"},
    };
    const CodePage utf8(65001);
    for (const auto& c : invalid)
        EXPECT_EQ(dcm::Widen(c.bytes), c.text) << testing::PrintToString(c.bytes);
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
    for (const UINT first : {UINT{CFile::modeRead}, UINT{CFile::modeWrite}}) {
        for (const UINT second : {UINT{CFile::modeRead}, UINT{CFile::modeReadWrite}, kCreate}) {
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
            EXPECT_TRUE(other.Open(path, CFile::modeRead));
        }
    }
    EXPECT_EQ(ReadBytes(path), "kept");
}

TEST(File, SaysWhyItCannotBeOpened)
{
    const Folder folder;
    const struct
    {
        CString path;
        UINT flags;
        CFileException::Cause cause;
    } cases[] = {
        {folder / L"missing", CFile::modeRead, CFileException::fileNotFound},
        {folder / L"missing", CFile::modeWrite, CFileException::fileNotFound},
        {folder / L"", CFile::modeRead, CFileException::accessDenied},
        {folder / L"", kCreate, CFileException::accessDenied},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::PrintToString(c.path));
        CFileException record;
        EXPECT_FALSE(CFile().Open(c.path, c.flags, &record));
        EXPECT_EQ(record.m_cause, c.cause);
        EXPECT_FALSE(CFile().Open(c.path, c.flags));
        try {
            const CFile file(c.path, c.flags);
            ADD_FAILURE() << "opened";
        } catch (const CFileException& error) {
            EXPECT_EQ(error.m_cause, c.cause);
            EXPECT_EQ(error.m_strFileName, c.path);
            EXPECT_NE(std::string(error.what()).find(dcm::ToUtf8(c.path)), std::string::npos);
        }
    }
    EXPECT_THROW(CFile(folder / L"no/such/folder", kCreate), CFileException);
    EXPECT_THROW(CFile(L"", CFile::modeRead), CFileException);
}

TEST(File, ReadsAndWritesWhatItsFlagsSay)
{
    const Folder folder;
    const CString path = folder / L"file";
    CFile file(path, kCreate);
    file.Write("abcdef", 6);
    EXPECT_TRUE(file.Open(path, CFile::modeWrite)) << "the file held open before must be closed";
    file.Write("XY", 2);
    EXPECT_TRUE(file.Open(path, CFile::modeReadWrite));
    char bytes[8] = {};
    EXPECT_EQ(file.Read(bytes, 3), 3U);
    EXPECT_EQ(file.Read(bytes + 3, 5), 3U);
    EXPECT_STREQ(bytes, "XYcdef");
    file.Write("g", 1);
    CFileStatus status;
    EXPECT_TRUE(file.GetStatus(status));
    EXPECT_EQ(status.m_size, 7U);
    EXPECT_TRUE(file.Open(path, kCreate));
    EXPECT_EQ(file.GetLength(), 0U);
    EXPECT_THROW(file.Read(bytes, 1), CFileException);
    file.Close();
    file.Close();
    EXPECT_THROW(file.GetLength(), CFileException);
    EXPECT_THROW(file.Read(bytes, 1), CFileException);
    EXPECT_THROW(file.Write(bytes, 1), CFileException);
}

TEST(Modules, StandInTheListWhileTheyAreLoaded)
{
    CDynLinkLibrary* const before = CDynLinkLibrary::Last();
    AFX_EXTENSION_MODULE one;
    AFX_EXTENSION_MODULE two;
    int handle = 0;
    EXPECT_TRUE(AfxInitExtensionModule(one, &handle));
    EXPECT_FALSE(AfxInitExtensionModule(one, nullptr));
    EXPECT_EQ(one.hModule, &handle);
    EXPECT_TRUE(AfxInitExtensionModule(two, nullptr));
    auto* const first = new CDynLinkLibrary(one);
    auto* const second = new CDynLinkLibrary(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), second);
    EXPECT_EQ(second->Previous(), first);
    EXPECT_EQ(&first->Module(), &one);
    AfxTermExtensionModule(one);
    EXPECT_FALSE(one.bInitialized);
    EXPECT_EQ(second->Previous(), before);
    AfxTermExtensionModule(two);
    EXPECT_EQ(CDynLinkLibrary::Last(), before);
}
