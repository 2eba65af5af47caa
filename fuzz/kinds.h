#pragma once

#include "dcm/converter/dcmconverter.h"

#include <type_traits>

/// Calls `visit` with each kind's keyword, with what gets its blocks from a document and with what
/// adds one.
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
