#pragma once

#include "foundation/text/utranslatedstring.h"

extern UTranslatedString strOK;
extern UTranslatedString strYes;
extern UTranslatedString strNo;
extern UTranslatedString strCancel;
extern UTranslatedString stringExportWarnings;
