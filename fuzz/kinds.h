#pragma once

#include "dcm/converter/dcmconverter.h"

/// Calls `visit` with what gets the blocks of a kind from a document and what adds one, for each
/// kind in the order of the file.
template <class Visitor>
void ForEachKind(Visitor visit)
{
    using Document = DCMConverter;
    visit(&Document::GetFestwerte, &Document::AddFestwert);
    visit(&Document::GetFestwerteblock, &Document::AddFestwerteblock);
    visit(&Document::GetStuetzstellenverteilung, &Document::AddStuetzstellenverteilung);
    visit(&Document::GetKennlinie, &Document::AddKennlinie);
    visit(&Document::GetFestkennlinie, &Document::AddFestkennlinie);
    visit(&Document::GetGruppenkennlinie, &Document::AddGruppenkennlinie);
    visit(&Document::GetKennfeld, &Document::AddKennfeld);
    visit(&Document::GetFestkennfeld, &Document::AddFestkennfeld);
    visit(&Document::GetGruppenkennfeld, &Document::AddGruppenkennfeld);
    visit(&Document::GetTextstring, &Document::AddTextstring);
}
