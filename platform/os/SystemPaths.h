#pragma once

#include <wx/string.h>

namespace wyxos
{

// Machine-wide paths (/var/lib, /etc, /dev/shm, /srv) are taken relative to
// WYX_SYSTEM_ROOT, "/" when unset or empty, so that tests, the demo and an
// unprivileged user can run everything inside a temporary folder.
wxString SystemRoot();

// Makes a relative WYX_SYSTEM_ROOT absolute, against the working folder at the
// time of the call. Every program calls it first thing: the program later
// changes its working folder, and it and the tools must mean the same folder.
void ResolveSystemRoot();

// absolutePath is a machine-wide path such as "/var/lib"; the result is the same
// path below the system root, without a trailing separator unless given one.
wxString UnderSystemRoot(const wxString& absolutePath);

} // namespace wyxos
