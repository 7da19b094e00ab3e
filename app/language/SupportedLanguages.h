#pragma once

#include <cstddef>

#include <wx/string.h>

namespace uilanguage
{

// One language the product ships texts for, with the codes the two language
// files use for it.
struct SupportedLanguage
{
    const char* userCode;      // per-user file, e.g. "pt_BR"
    const char* serverCode;    // print server's file, e.g. "pt"
    const char* canonicalName; // locale name; also the catalog folder's name
};

// All of them, in the order codes are compared.
const SupportedLanguage* SupportedLanguagesBegin();
const SupportedLanguage* SupportedLanguagesEnd();

// The first language whose code equals `code` without regard to case, or null.
const SupportedLanguage* FindByUserCode(const wxString& code);
const SupportedLanguage* FindByServerCode(const wxString& code);

// wxWidgets' identifier of a locale name (a wxLanguage value), looked up in the
// library's own language database; wxLANGUAGE_UNKNOWN when it has no such
// language. The name, not a description or a number, is what stays the same
// from one release of the library to the next.
int LanguageOfLocaleName(const wxString& canonicalName);

} // namespace uilanguage
