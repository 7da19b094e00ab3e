#pragma once

// The language of the user interface, a wxLanguage value. reload re-reads the
// configuration file first.
int ChooseUiLanguage(bool reload);
