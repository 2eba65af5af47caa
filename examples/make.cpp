// make OUT.dcm
// Makes a DCM file from values: a number, a text, a curve, and a map over an axis that it shares.
#include "dcm/library/dcm.h"

#include <cstdio>
#include <vector>

int main(int argc, char** argv)
{
    if (argc != 2) {
        std::fprintf(stderr, "usage: make OUT.dcm\n");
        return 2;
    }

    dcm::Parameter idle;
    idle.kind = dcm::Kind::kFestwert;
    idle.name = L"IdleSpeed";
    idle.langname = L"Idle speed of the warm engine";
    idle.unit = L"1/min";
    idle.values = {780};

    dcm::Parameter variant;
    variant.kind = dcm::Kind::kTextstring;
    variant.name = L"Variant";
    variant.values = {L"Prototype 7"};

    dcm::Parameter sensor;
    sensor.kind = dcm::Kind::kKennlinie;
    sensor.name = L"SensorCurve";
    sensor.unit = L"\u00B0C";
    sensor.x.unit = L"V";
    sensor.x.points = {0.5, 2.25, 4.5};
    sensor.values = {140, 60, -40};

    // The points of an axis that maps share. Each of them holds the points too, and names it.
    dcm::Parameter speed;
    speed.kind = dcm::Kind::kStuetzstellenverteilung;
    speed.name = L"SpeedAxis";
    speed.x.unit = L"1/min";
    speed.x.points = {800, 2400, 6000};

    dcm::Parameter ignition;
    ignition.kind = dcm::Kind::kGruppenkennfeld;
    ignition.name = L"IgnitionMap";
    ignition.unit = L"\u00B0KW";
    ignition.x = speed.x;
    ignition.x.distribution = speed.name;
    ignition.y.unit = L"%";
    ignition.y.points = {20, 80};
    ignition.values = {
        12.5, 24,   31, // at 20 %
        8,    19.5, 26, // at 80 %
    };

    DCMConverter document;
    document.SetHeader(dcm::HeaderOfComment(L"Made from values"));
    for (const dcm::Parameter& parameter : {idle, variant, sensor, speed, ignition})
        dcm::Add(document, parameter);

    // The file is replaced when the new one is whole.
    dcm::Report report;
    if (FAILED(dcm::Save(document, dcm::FromUtf8(argv[1]), report))) {
        for (const dcm::Finding& finding : report.Findings())
            std::fprintf(stderr, "make: %s\n", dcm::ToUtf8(finding.message).c_str());
        return 1;
    }
}
