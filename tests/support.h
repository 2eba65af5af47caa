#pragma once

#include "dcm/library/dcm.h"
#include "dcm/platform/thread_code_page.h"
#include "dcm/textfile/file_text_builder.h"

#include <charconv>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <ostream>
#include <random>
#include <sstream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <system_error>
#include <type_traits>
#include <utility>
#include <vector>

/// How a failed comparison shows a text.
inline void PrintTo(const CString& text, std::ostream* out)
{
    *out << '"' << dcm::ToUtf8(text) << '"';
}

namespace test {

inline constexpr UINT kRead = CFile::modeRead;
inline constexpr UINT kCreate = CFile::modeCreate | CFile::modeWrite;

/// Chooses the code page for the thread. Returns false where the system has no converters and the
/// page is not built in: what needs it is left out there.
inline bool ChoosePage(unsigned page)
{
    const bool chosen = dcm::SetThreadCodePage(page);
#ifdef DCM_TEST_NO_CONVERTERS
    return chosen;
#else
    if (!chosen)
        throw std::runtime_error("There is no code page " + std::to_string(page) + '.');
    return true;
#endif
}

/// A new folder. The destructor removes it with all that is in it.
class Folder
{
public:
    Folder() { std::filesystem::create_directory(m_path); }
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;
    ~Folder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_path, ignored);
    }

    CString operator/(const CString& name) const { return CString(m_path.wstring()) + L"/" + name; }

private:
    const std::filesystem::path m_path =
        std::filesystem::temp_directory_path() / ("dcm" + std::to_string(std::random_device()()));
};

inline std::filesystem::path PathOf(const CString& path)
{
    const std::string utf8 = dcm::ToUtf8(path);
    return std::filesystem::path(std::u8string(utf8.begin(), utf8.end()));
}

inline std::string ReadBytes(const CString& path)
{
    std::ifstream file(PathOf(path), std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

inline void WriteBytes(const CString& path, std::string_view bytes)
{
    // A new file: some file systems wait for the disk when one is emptied and written again.
    std::filesystem::remove(PathOf(path));
    std::ofstream(PathOf(path), std::ios::binary) << bytes;
}

/// Why the file cannot be opened, or none.
inline CFileException::Cause CauseOf(const CString& path, UINT flags)
{
    CFileException error;
    return CFile().Open(path, flags, &error) ? CFileException::none : error.m_cause;
}

/// Every `from` in `text` as `to`.
inline std::string Replaced(std::string text, std::string_view from, std::string_view to)
{
    for (std::size_t at = text.find(from); at != text.npos; at = text.find(from, at + to.size()))
        text.replace(at, from.size(), to);
    return text;
}

/// Replaces the marks in a text of a file in data/: a middle dot by a blank, an arrow by a tab, an
/// arrow down by a vertical tab, a pilcrow by a carriage return.
inline std::string Unmarked(std::string text)
{
    for (const auto& [mark, meant] :
         {std::pair("\u00B7", " "), {"\u2192", "\t"}, {"\u2193", "\v"}, {"\u00B6", "\r"}})
        text = Replaced(text, mark, meant);
    return text;
}

/// The words of each line of a file in data/; two single quotes are an empty word. Lines that begin
/// with # are comments.
inline std::vector<std::vector<std::string>> Rows(const CString& path)
{
    std::istringstream lines(ReadBytes(path));
    std::vector<std::vector<std::string>> rows;
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::vector<std::string> row;
        for (std::string word; words >> word;)
            row.push_back(word == "''" ? "" : Unmarked(word));
        if (!row.empty() && row[0] != "#")
            rows.push_back(row);
    }
    return rows;
}

/// `text` in the thread's code page, its lines ended by CR LF.
inline std::string Narrow(std::wstring_view text)
{
    auto builder = dcm::FileTextBuilder::ForFile();
    std::string converted;
    return std::string(builder.Append(text).BytesOfFile(converted));
}

/// What a block writes, with single line feeds. An export may change `block`.
template <class Block>
std::string Written(Block&& block, const CString& path = Folder() / L"block")
{
    PravFile file(path, kCreate);
    if (block.Export(file) != S_OK)
        return "failed";
    file.Close();
    return Replaced(ReadBytes(path), "\r\n", "\n");
}

/// Imports a file of these bytes.
inline HRESULT ImportBytes(DCMConverter& document, std::string_view bytes,
                           const CString& path = Folder() / L"in.dcm")
{
    WriteBytes(path, bytes);
    return document.Import(path);
}

/// The bytes of the document's file.
inline std::string ExportBytes(const DCMConverter& document,
                               const CString& path = Folder() / L"out.dcm")
{
    return document.Export(path) == S_OK ? ReadBytes(path) : "failed";
}

/// Calls `visit` for each kind: with its keyword, the member of the document that gets its blocks
/// and the one that adds a block.
template <class Visitor>
void ForEachKind(Visitor visit)
{
    using Document = DCMConverter;
    visit("FESTWERT", &Document::GetFestwerte, &Document::AddFestwert);
    visit("TEXTSTRING", &Document::GetTextstring, &Document::AddTextstring);
    visit("FESTWERTEBLOCK", &Document::GetFestwerteblock, &Document::AddFestwerteblock);
    visit("STUETZSTELLENVERTEILUNG", &Document::GetStuetzstellenverteilung,
          &Document::AddStuetzstellenverteilung);
    visit("KENNLINIE", &Document::GetKennlinie, &Document::AddKennlinie);
    visit("FESTKENNLINIE", &Document::GetFestkennlinie, &Document::AddFestkennlinie);
    visit("GRUPPENKENNLINIE", &Document::GetGruppenkennlinie, &Document::AddGruppenkennlinie);
    visit("KENNFELD", &Document::GetKennfeld, &Document::AddKennfeld);
    visit("FESTKENNFELD", &Document::GetFestkennfeld, &Document::AddFestkennfeld);
    visit("GRUPPENKENNFELD", &Document::GetGruppenkennfeld, &Document::AddGruppenkennfeld);
}

/// The class of the blocks that `Get` gets.
template <class Get>
using BlockOf = typename std::invoke_result_t<Get, const DCMConverter&>::value_type;

inline std::string Show(const CString& text)
{
    return "'" + dcm::ToUtf8(text) + "'";
}

/// The shortest text of a number, whatever the locale.
inline std::string Show(double value)
{
    char text[32];
    return {text, std::to_chars(text, text + sizeof text, value).ptr};
}

/// A number as it is, a text in single quotes ("-" when it is null), any other value as its tag in
/// brackets, followed by "=" unless the value is 0.
inline std::string Show(const VARIANT& value)
{
    if (value.vt == VT_R8)
        return Show(value.dblVal);
    if (value.vt != VT_BSTR)
        return "[" + std::to_string(value.vt) + (value.llVal == 0 ? "]" : "]=");
    return value.bstrVal == nullptr ? "-" : Show(CString(CComVariant::TextOf(value)));
}

/// The items of a list, separated by blanks.
template <class List>
std::string ShowAll(const List& items)
{
    std::string all;
    for (const auto& item : items)
        all += (all.empty() ? "" : " ") + Show(item);
    return all;
}

/// The items that a getter stores in an array, which had other content before.
template <class Block, class Getter>
std::string Points(const Block& block, Getter getter)
{
    std::vector<CComVariant> points{L"before", 1.0};
    return (block.*getter)(points) == S_OK ? ShowAll(points) : "failed";
}

/// The type of a getter of points, to choose it among functions of the same name.
using PointsOfCurve = HRESULT (DCMKennlinie::*)(std::vector<CComVariant>&) const;

} // namespace test
