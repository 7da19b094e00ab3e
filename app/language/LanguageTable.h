#pragma once

#include <wx/string.h>

namespace uilanguage
{

// A language as Windows numbers it: a primary language id and a sub-language
// id (a country or script), packed into a language id as primary | sub << 10.
// The product's servers and installers speak in these numbers; wxWidgets keeps
// them only in its Windows builds, so the program carries its own table.
struct WindowsLanguage
{
    const char* canonicalName; // locale name, e.g. "pt_BR"
    unsigned primary;
    unsigned sub;
    const char* description;
};

// The whole table, in its order.
const WindowsLanguage* WindowsLanguagesBegin();
const WindowsLanguage* WindowsLanguagesEnd();

// The first row, in table order, with both ids equal; null when none has them.
// Some ids appear on several rows (4/1: "Chinese", "Chinese (Traditional)",
// "Chinese (Taiwan)"); the first row names the language.
const WindowsLanguage* FindWindowsLanguage(unsigned primary, unsigned sub);

// The Windows language id of a locale name as the environment gives it
// ("de_DE.UTF-8", "sr_RS@latin", "fr"): the codeset is ignored, the modifier
// counts when the table knows it, and a bare language takes its first row.
// 0 for "C", "POSIX" and names the table does not know.
unsigned WindowsLanguageIdOfLocale(const wxString& localeName);

// Halves of a language id.
inline unsigned PrimaryLanguageOf(unsigned languageId)
{
    return languageId & 0x3FF;
}
inline unsigned SubLanguageOf(unsigned languageId)
{
    return (languageId >> 10) & 0x3F;
}

} // namespace uilanguage
