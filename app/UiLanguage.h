#pragma once

// The language of the user interface, a wxLanguage value, chosen as the
// product's configured version says (see app/language/LanguageChoice.h) from
// this machine's language files and locale. reload re-reads the configuration
// file first.
int ChooseUiLanguage(bool reload);
