#include "views/dialog/dialogstrings.h"

UTranslatedString strOK("OK");
UTranslatedString strYes("Yes");
UTranslatedString strNo("No");
UTranslatedString strCancel("Cancel");
UTranslatedString stringExportWarnings("Export Warnings");
