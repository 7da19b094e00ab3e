#pragma once

#include <wx/string.h>

// The services library's logger. The program itself writes no log: it only
// names the directory that the library's log would use.
//
// On Linux the name is one path component resolved under the XDG state folder:
// $XDG_STATE_HOME/<name> when XDG_STATE_HOME is an absolute path, otherwise
// $HOME/.local/state/<name>. Nothing is created and nothing can fail: without
// a usable home or with a name that is not a single plain component ("", ".",
// "..", anything with '/'), there is no log directory.
class WyxLogger
{
public:
    static void SetLogDirectory(const wxString& name);

    // The resolved folder of the last SetLogDirectory call, or empty.
    static wxString GetLogDirectory();
};
