#include "tests/support.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <stdexcept>

using namespace test;
using dcm::Kind;
using dcm::Parameter;

namespace {

using test::Show;

std::string Show(const dcm::Axis& axis)
{
    return Show(axis.unit) + "@" + Show(axis.distribution) + "[" + ShowAll(axis.points) + "]";
}

/// All that a parameter holds.
std::string Show(const Parameter& p)
{
    return dcm::ToUtf8(dcm::KeywordOf(p.kind)) + " " +
           ShowAll(std::vector{p.name, p.langname, p.displayname, p.function}) + " x" + Show(p.x) +
           " y" + Show(p.y) + " w" + Show(p.unit) + "[" + ShowAll(p.values) + "]/" +
           std::to_string(p.columns) + " " + std::to_string(p.countX) + "@" +
           std::to_string(p.countY);
}

/// The lines of a file that name distributions, and all others.
std::pair<std::string, std::string> WithoutDistributions(const std::string& bytes)
{
    std::pair<std::string, std::string> parts;
    std::istringstream lines(bytes);
    for (std::string line; std::getline(lines, line);) {
        (line.starts_with("*SSTX ") || line.starts_with("*SSTY ") ? parts.first : parts.second) +=
            line + "\n";
    }
    return parts;
}

DCMConverter Imported(std::string_view bytes)
{
    DCMConverter document;
    ImportBytes(document, bytes);
    return document;
}

/// Adds the document's parameters to an empty one in each way that there is; what is exported then
/// is what the document itself exports.
void ExpectThereAndBack(const DCMConverter& document)
{
    const auto [names, expected] = WithoutDistributions(ExportBytes(document));
    const std::vector<Parameter> parameters = dcm::ParametersOf(document);
    DCMConverter copied, moved, taken;
    for (const Parameter& parameter : parameters)
        dcm::Add(copied, parameter);
    for (Parameter parameter : parameters)
        dcm::Add(moved, std::move(parameter));
    DCMConverter source(document);
    for (const Parameter& parameter : dcm::ParametersOf(std::move(source)))
        dcm::Add(taken, parameter);
    const std::string bytes = ExportBytes(copied);
    EXPECT_EQ(WithoutDistributions(bytes).second, expected);
    EXPECT_EQ(ExportBytes(moved), bytes);
    EXPECT_EQ(ExportBytes(taken), bytes);
    EXPECT_TRUE(dcm::Differences(parameters, dcm::ParametersOf(copied)).empty());
}

} // namespace

TEST(Parameter, HasAKindOfItsKeyword)
{
    for (const Kind kind : dcm::kKinds)
        EXPECT_EQ(dcm::KindOf(dcm::KeywordOf(kind)), kind);
    EXPECT_EQ(dcm::KeywordOf(Kind::kGruppenkennfeld), L"GRUPPENKENNFELD");
    EXPECT_EQ(dcm::KeywordOf(static_cast<Kind>(std::size(dcm::kKinds))), L"");
    EXPECT_EQ(dcm::KindOf(L"fESTWERTEBLOCK"), Kind::kFestwerteblock);
    for (const wchar_t* const word : {L"", L"FESTWERTE", L"FESTWER", L"FUNKTIONEN", L"*SSTX"})
        EXPECT_FALSE(dcm::KindOf(word)) << dcm::ToUtf8(word);
}

TEST(Parameter, HoldsWhatABlockHolds)
{
    const struct
    {
        const char* block;
        const char* shown;
    } cases[] = {
        {"FESTWERT n\n LANGNAME \"l\"\n DISPLAYNAME d\n FUNKTION f\n EINHEIT_W \"u\"\n WERT 1.5\n",
         "FESTWERT 'n' 'l' 'd' 'f' x''@''[] y''@''[] w'u'[1.5]/1 0@0"},
        {"FESTWERT n\n", "FESTWERT 'n' '' '' '' x''@''[] y''@''[] w''[]/0 0@0"},
        {"TEXTSTRING n\n TEXT \"t\"\n", "TEXTSTRING 'n' '' '' '' x''@''[] y''@''[] w''['t']/1 0@0"},
        {"FESTWERTEBLOCK n 3\n WERT 1 2 3\n TEXT \"a\"\n",
         "FESTWERTEBLOCK 'n' '' '' '' x''@''[] y''@''[] w''[1 2 3 'a']/4 0@0"},
        {"FESTWERTEBLOCK n 2 @ 3\n WERT 1 2\n WERT 3\n",
         "FESTWERTEBLOCK 'n' '' '' '' x''@''[] y''@''[] w''[1 2 3]/2 2@3"},
        {"STUETZSTELLENVERTEILUNG n 3\n*SST\n EINHEIT_X \"u\"\n ST/X 1 2 3\n",
         "STUETZSTELLENVERTEILUNG 'n' '' '' '' x'u'@''[1 2 3] y''@''[] w''[]/0 0@0"},
        {"FESTKENNLINIE n 3\n EINHEIT_X \"ux\"\n EINHEIT_W \"uw\"\n ST_TX/X \"a\" \"b\"\n"
         " WERT 1 2 3\n",
         "FESTKENNLINIE 'n' '' '' '' x'ux'@''['a' 'b'] y''@''[] w'uw'[1 2 3]/3 3@0"},
        {"GRUPPENKENNLINIE n 2\n*SSTX dist\n ST/X 1\n TEXT \"a\"\n WERT 1\n",
         "GRUPPENKENNLINIE 'n' '' '' '' x''@'dist'[1] y''@''[] w''['a' [0]]/2 2@0"},
        {"GRUPPENKENNFELD n 2 7\n EINHEIT_X \"ux\"\n EINHEIT_Y \"uy\"\n EINHEIT_W \"uw\"\n*SSTX "
         "dx\n"
         "*SSTY dy\n ST/X 1 2\n ST/Y 5\n WERT 10 20\n ST/Y 6\n WERT 30\n",
         "GRUPPENKENNFELD 'n' '' '' '' x'ux'@'dx'[1 2] y'uy'@'dy'[5 6] w'uw'[10 20 30]/2 2@7"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.block);
        const auto parameters = dcm::ParametersOf(Imported(c.block + std::string("END\n\n")));
        ASSERT_EQ(parameters.size(), 1U);
        EXPECT_EQ(Show(parameters[0]), c.shown);
    }
}

TEST(Parameter, ComesBackAsTheSameBytes)
{
    std::vector<std::filesystem::path> files{DCM_SAMPLE, DCM_TEST_DATA "/all_kinds.dcm"};
    for (const auto& entry : std::filesystem::directory_iterator(DCM_CORPUS "/roundtrip"))
        files.push_back(entry.path());
    for (const std::filesystem::path& file : files) {
        SCOPED_TRACE(file.string());
        ExpectThereAndBack(Imported(ReadBytes(CString(file.wstring()))));
    }
}

TEST(Parameter, OfADocumentMadeByHandComesBackAsTheSameBytes)
{
    std::vector<CComVariant> odd;
    for (const VARTYPE tag : {VT_EMPTY, VT_NULL, VT_ERROR, VT_VARIANT}) {
        odd.emplace_back();
        odd.back().vt = tag;
    }
    odd.insert(odd.end(), {1.5, -0.0, 2.5F, 7, true, std::int64_t{1} << 60, L"text", L"",
                           static_cast<const wchar_t*>(nullptr)});
    // Each array begins with each of them: the first decides which of the others are kept.
    for (std::size_t first = 0; first < odd.size(); ++first) {
        SCOPED_TRACE(first);
        DCMConverter document;
        DCMStuetzstellenverteilung distribution;
        DCMGruppenkennlinie curve;
        DCMGruppenkennfeld map;
        DCMFestwert value;
        value.SetValue(odd[first]);
        DCMTextstring text;
        text.SetUnit(L" ");
        text.SetValue(odd[first]);
        for (std::size_t i = 0; i < odd.size(); ++i) {
            const CComVariant& item = odd[(first + i) % odd.size()];
            distribution.AddValue(item);
            curve.AddAxis(item);
            curve.AddValue(i < 2 ? odd[first] : item);
            map.AddAxisX(odd[first]);
            map.AddValue(odd[first]);
        }
        map.AddAxisY(CComVariant(1.0));
        curve.SetAxisLenghtX(-3);
        curve.SetSharedAxisUniqueName(L"set");
        map.SetAxisLenghtY(9);
        DCMFestwerteblock rows;
        rows.AddValue(0.1);
        rows.SetXValueCount(-1);
        rows.SetYValueCount(2);
        document.AddFestwert(value);
        document.AddTextstring(text);
        document.AddStuetzstellenverteilung(distribution);
        document.AddGruppenkennlinie(curve);
        document.AddGruppenkennfeld(map);
        document.AddFestwerteblock(rows);
        document.SetHeader(L"");
        ExpectThereAndBack(document);
    }
}

TEST(Parameter, HasTheKindThatItsBlockWrites)
{
    // A list holds what was added to it, under the keyword that each block brought along.
    DCMConverter document;
    document.AddFestwert(DCMTextstring());
    document.AddKennlinie(DCMGruppenkennlinie());
    document.AddKennfeld(DCMFestkennfeld());
    std::vector<Kind> kinds;
    for (const Parameter& parameter : dcm::ParametersOf(document))
        kinds.push_back(parameter.kind);
    EXPECT_EQ(kinds,
              (std::vector{Kind::kTextstring, Kind::kGruppenkennlinie, Kind::kFestkennfeld}));
}

TEST(Parameter, MadeByAHostIsWritten)
{
    // Integers, as a host writes them down, are numbers; text and number do not mix in an array.
    Parameter curve;
    curve.kind = Kind::kGruppenkennlinie;
    curve.name = L"Curve";
    curve.x = {L"1/min", L"Speed", {800, 1600.5F}};
    curve.values = {true, L"no"};
    Parameter list;
    list.kind = Kind::kFestwerteblock;
    list.name = L"List";
    list.values = {1, CComVariant()};
    Parameter texts = list;
    texts.values = {L"a", L"b"};
    DCMConverter document;
    for (const Parameter& parameter : {curve, list, texts})
        dcm::Add(document, parameter);
    EXPECT_EQ(Replaced(ExportBytes(document), "\r\n", "\n"),
              "\n\nKONSERVIERUNG_FORMAT 2.0\n\n"
              "FESTWERTEBLOCK List 2\n    LANGNAME \"\"\n    WERT 1.0    0.0   \nEND\n\n"
              "FESTWERTEBLOCK List 2\n    LANGNAME \"\"\n    TEXT \"a\"    \"b\"   \nEND\n\n"
              "GRUPPENKENNLINIE Curve 2\n    LANGNAME \"\"\n    EINHEIT_X \"1/min\"\n*SSTX Speed\n"
              "    ST/X 800.0    1600.5   \n    WERT 1.0   \nEND\n\n");
}

TEST(ForEach, VisitsTheBlocksInTheOrderOfExport)
{
    const DCMConverter document = Imported(ReadBytes(CString(DCM_ALL_KINDS)));
    std::string names;
    std::set<const void*> blocks;
    dcm::ForEach(document, [&](const auto& block) {
        names += Show(block.GetName()) + "\n";
        blocks.insert(&block);
    });
    std::string expected;
    for (const Parameter& parameter : dcm::ParametersOf(document))
        expected += Show(parameter.name) + "\n";
    EXPECT_EQ(names, expected);
    // The blocks are the document's own: they are there the second time.
    dcm::ForEach(document, [&](const auto& block) { EXPECT_EQ(blocks.erase(&block), 1U); });

    struct Maps : dcm::BlockVisitor
    {
        using BlockVisitor::Visit;
        void Visit(const DCMFestkennfeld& map) override { found += Show(map.GetName()); }
        void Visit(const DCMTextstring&) override { throw std::runtime_error("seen enough"); }
        std::string found;
    } maps;
    EXPECT_THROW(dcm::ForEach(document, maps), std::runtime_error);
    EXPECT_EQ(maps.found, Show(document.GetFestkennfeld().front().GetName()));
}

TEST(HeaderOfComment, IsReadAsTheSameComment)
{
    const struct
    {
        const wchar_t* comment;
        const wchar_t* header;
    } cases[] = {
        {L"", L""},
        {L"one\ntwo\n", L"* one\n* two"},
        {L"\n  indented\n\nlast\n", L"* \n*   indented\n* \n* last"},
        {L"****\n*\n****\nend*\n", L"* ****\n*\n****\n* end*"},
        {L"a * b\n* c\n** d\n", L"* a **  b\n* **  c\n* ***  d"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(dcm::ToUtf8(c.comment));
        const CString header = dcm::HeaderOfComment(c.comment);
        EXPECT_EQ(header, c.header);
        DCMConverter document;
        document.SetHeader(header);
        EXPECT_EQ(Imported(ExportBytes(document)).GetComment(), c.comment);
    }
    EXPECT_EQ(dcm::HeaderOfComment(L"no line end"), L"* no line end");
}
