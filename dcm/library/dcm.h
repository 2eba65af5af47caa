#pragma once

/// @file
/// The interface of the library: the document, the block classes, the text file and what a host
/// needs in order to call them.
#include "dcm/converter/dcmconverter.h"
#include "dcm/converter/dcmheader.h"
#include "dcm/elements/basetype.h"
#include "dcm/elements/festwert.h"
#include "dcm/elements/festwerteblock.h"
#include "dcm/elements/kennfeld.h"
#include "dcm/elements/kennlinie.h"
#include "dcm/elements/konservierungsformat.h"
#include "dcm/elements/stuetzstellenverteilung.h"
#include "dcm/library/difference.h"
#include "dcm/library/export.h"
#include "dcm/library/parameter.h"
#include "dcm/library/report.h"
#include "dcm/library/version.h"
#include "dcm/platform/automation.h"
#include "dcm/platform/cfile.h"
#include "dcm/platform/codepage.h"
#include "dcm/platform/cstring.h"
#include "dcm/platform/exception.h"
#include "dcm/platform/module.h"
#include "dcm/platform/variant.h"
#include "dcm/textfile/finding.h"
#include "dcm/textfile/pravfile.h"
