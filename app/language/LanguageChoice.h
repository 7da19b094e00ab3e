#pragma once

#include <wx/string.h>

namespace uilanguage
{
class LanguageSources;
}

// Which source decides the window's language follows the product's version
// (APP_WYX_VERSION): "3.3" the per-user file, "3.1" the print server's file
// and then the system's locale, "3.0" or none the system's default
// (wxLANGUAGE_DEFAULT); any other version gives wxLANGUAGE_UNKNOWN, which leaves
// the window in English. Results are wxLanguage values.
int ChooseUiLanguageFor(const wxString& version, const uilanguage::LanguageSources& sources);

// The user file's language; without a file, a known code or a language the
// library knows, the system's language unless it is written right to left
// (the window is laid out left to right), and then English (U.S.).
int LanguageFromUserFile(const uilanguage::LanguageSources& sources);

// True when the server file names a supported language: language is then that
// language, or wxLANGUAGE_UNKNOWN when the library does not know it. False when
// the file is missing or names none; language is then wxLANGUAGE_UNKNOWN.
bool LanguageFromServerFile(const uilanguage::LanguageSources& sources, int& language);

// The language of the first row of the program's table with the system locale's
// Windows primary and sub-language ids; wxLANGUAGE_UNKNOWN when none has them.
int LanguageFromSystemLocale(const uilanguage::LanguageSources& sources);
