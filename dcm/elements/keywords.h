#pragma once

#include "dcm/platform/cstring.h"

/// The keywords and fixed tokens of the format, each written once.
namespace dcm::keyword {

inline constinit TextConstant kKonservierungFormat{L"KONSERVIERUNG_FORMAT"};
inline constinit TextConstant kComment{L"*"};

inline constinit TextConstant kFestwert{L"FESTWERT"};
inline constinit TextConstant kTextstring{L"TEXTSTRING"};
inline constinit TextConstant kFestwerteblock{L"FESTWERTEBLOCK"};
inline constinit TextConstant kStuetzstellenverteilung{L"STUETZSTELLENVERTEILUNG"};
inline constinit TextConstant kKennlinie{L"KENNLINIE"};
inline constinit TextConstant kFestkennlinie{L"FESTKENNLINIE"};
inline constinit TextConstant kGruppenkennlinie{L"GRUPPENKENNLINIE"};
inline constinit TextConstant kKennfeld{L"KENNFELD"};
inline constinit TextConstant kFestkennfeld{L"FESTKENNFELD"};
inline constinit TextConstant kGruppenkennfeld{L"GRUPPENKENNFELD"};

inline constinit TextConstant kLangname{L"LANGNAME"};
inline constinit TextConstant kDisplayname{L"DISPLAYNAME"};
inline constinit TextConstant kFunktion{L"FUNKTION"};

inline constinit TextConstant kEinheitX{L"EINHEIT_X"};
inline constinit TextConstant kEinheitY{L"EINHEIT_Y"};
inline constinit TextConstant kEinheitW{L"EINHEIT_W"};

/// Values as numbers and as quoted texts.
inline constinit TextConstant kWert{L"WERT"};
inline constinit TextConstant kText{L"TEXT"};

/// Axis points as numbers and as quoted texts.
inline constinit TextConstant kStX{L"ST/X"};
inline constinit TextConstant kStY{L"ST/Y"};
inline constinit TextConstant kStTxX{L"ST_TX/X"};
inline constinit TextConstant kStTxY{L"ST_TX/Y"};

/// The mark of a distribution, and the distributions that the axes of a curve or map share.
inline constinit TextConstant kSst{L"*SST"};
inline constinit TextConstant kSstX{L"*SSTX"};
inline constinit TextConstant kSstY{L"*SSTY"};

inline constinit TextConstant kEnd{L"END"};

} // namespace dcm::keyword
