#include "benchmarks/contestant.h"

#include "dcm/elements/number.h"
#include "dcm/library/dcm.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/word.h"

#include <array>
#include <stdexcept>
#include <string>

namespace dcm::bench {
namespace {

void AddPoints(Checksum& checksum, const std::vector<CComVariant>& points)
{
    for (const CComVariant& point : points)
        checksum.Add(point.dblVal);
}

std::uint64_t ChecksumOf(const DCMConverter& document)
{
    Checksum checksum;
    std::vector<CComVariant> points;
    CComVariant value;
    for (const DCMFestwert& block : document.GetFestwerte()) {
        block.GetValue(&value);
        checksum.Add(value.dblVal);
    }
    for (const DCMFestwerteblock& block : document.GetFestwerteblock()) {
        for (const double number : block.GetDoubleValues())
            checksum.Add(number);
    }
    for (const DCMStuetzstellenverteilung& block : document.GetStuetzstellenverteilung()) {
        block.GetValues(points);
        AddPoints(checksum, points);
    }
    const auto addCurves = [&](const auto& curves) {
        for (const DCMKennlinie& block : curves) {
            block.GetAxis(points);
            AddPoints(checksum, points);
            block.GetValues(points);
            AddPoints(checksum, points);
        }
    };
    addCurves(document.GetKennlinie());
    addCurves(document.GetFestkennlinie());
    addCurves(document.GetGruppenkennlinie());
    const auto addMaps = [&](const auto& maps) {
        for (const DCMKennfeld& block : maps) {
            block.GetAxis_X(points);
            AddPoints(checksum, points);
            block.GetAxis_Y(points);
            AddPoints(checksum, points);
            block.GetValues(points);
            AddPoints(checksum, points);
        }
    };
    addMaps(document.GetKennfeld());
    addMaps(document.GetFestkennfeld());
    addMaps(document.GetGruppenkennfeld());
    return checksum.Value();
}

const TakesPart kImport("import/dcm", [](const Stage& stage) {
    Outcome outcome;
    DCMConverter document;
    const CString path(stage.dcmFile.c_str());
    if (Timed(outcome.seconds, [&] { return document.Import(path); }) != S_OK)
        throw std::runtime_error("import failed");
    outcome.checksum = ChecksumOf(document);
    return outcome;
});

const TakesPart kImportWithReport("import/report", [](const Stage& stage) {
    Outcome outcome;
    DCMConverter document;
    dcm::Report report;
    const CString path(stage.dcmFile.c_str());
    if (Timed(outcome.seconds, [&] { return Import(document, path, report); }) != S_OK ||
        report.Count(dcm::Severity::kError) + report.Count(dcm::Severity::kWarning) != 0)
        throw std::runtime_error("the file is not clean");
    outcome.checksum = ChecksumOf(document);
    return outcome;
});

const TakesPart kExport("export/dcm", [](const Stage& stage) {
    Outcome outcome;
    const CString path(stage.outputFile.c_str());
    if (Timed(outcome.seconds, [&] { return stage.document.Export(path); }) != S_OK)
        throw std::runtime_error("export failed");
    return outcome;
});

const TakesPart kNumberText("text/dcm", [](const Stage& stage) {
    return TimedNumberTexts<char>(
        stage, [](double number, char* to) { return WriteNumber(number, 17, to); });
});

const TakesPart kNumberToken("token/dcm", [](const Stage& stage) {
    Outcome outcome;
    const std::string padded = stage.someTexts + std::string(kReadAhead, ' ');
    const std::string_view texts(padded.data(), stage.someTexts.size());
    std::vector<double> values;
    values.reserve(stage.someNumbers.size());
    Timed(outcome.seconds, [&] {
        for (std::size_t i = Repetitions(stage); i > 0; --i) {
            values.clear();
            ReadNumbers(texts, nullptr, values);
            benchmark::DoNotOptimize(values.data());
            benchmark::ClobberMemory();
        }
    });
    return outcome;
});

} // namespace
} // namespace dcm::bench
