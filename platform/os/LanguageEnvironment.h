#pragma once

#include <wx/string.h>

namespace wyxos
{

// A path from the environment (HOME, an XDG variable) without trailing
// separators; empty when unset or relative, which XDG says to ignore.
wxString AbsolutePathFrom(const char* value);

// The user's configuration folder as XDG places it: $XDG_CONFIG_HOME when that
// is an absolute path, else .config in the home folder; empty when the user has
// no home folder. No trailing separator.
wxString UserConfigFolder();

// The name of the locale the user's messages are shown in, as the C library
// resolves it from the environment (LC_ALL, else LC_MESSAGES, else LANG), for
// example "de_DE.UTF-8"; "C" when none is set.
wxString UserMessagesLocaleName();

} // namespace wyxos
