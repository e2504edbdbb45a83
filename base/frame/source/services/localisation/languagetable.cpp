#include "services/localisation/ulocale.h"

const char16* const gLanguageTable[kLanguageCount] = {
    u"English",    u"German",     u"French",     u"Japanese",   u"Spanish",
    u"Italian",    u"Arabic",     u"Bulgarian",  u"Catalan",    u"Chinese",
    u"Czech",      u"Danish",     u"Greek",      u"Finnish",    u"Hebrew",
    u"Hungarian",  u"Icelandic",  u"Korean",     u"Dutch",      u"Norwegian",
    u"Polish",     u"Portuguese", u"Romanian",   u"Russian",    u"Croatian",
    u"Serbian",    u"Slovak",     u"Albanian",   u"Swedish",    u"Thai",
    u"Turkish",    u"Urdu",       u"Indonesian", u"Ukrainian",  u"Belarusian",
    u"Slovenian",  u"Estonian",   u"Latvian",    u"Lithuanian", u"Farsi",
    u"Vietnamese", u"Armenian",   u"Azeri",      u"Basque",     u"Macedonian",
    u"Afrikaans",  u"Faeroese",   u"Hindi",      u"Malay",      u"Brazilian Portuguese",
};

const char* const gLanguageCodeTable[kLanguageCount] = {
    "us", "de", "fr", "jp", "es", "it", "ar", "bg", "ca", "zh", "cs", "da", "el", "fi", "he", "hu", "is",
    "ko", "nl", "no", "pl", "pt", "ro", "ru", "hr", "sr", "sk", "sq", "sv", "th", "tr", "ur", "id", "uk",
    "be", "sl", "et", "lv", "lt", "fa", "vi", "hy", "az", "eu", "mk", "af", "fo", "hi", "ms", "bp",
};
