#pragma once

#include <wx/string.h>

namespace wyxos
{

// Machine-wide paths (/var/lib, /etc, /dev/shm, /srv) are taken relative to
// WYX_SYSTEM_ROOT, "/" when unset or empty, so that tests, the demo and an
// unprivileged user can run everything inside a temporary folder.
wxString SystemRoot();

// absolutePath is a machine-wide path such as "/var/lib"; the result is the same
// path below the system root, without a trailing separator unless given one.
wxString UnderSystemRoot(const wxString& absolutePath);

} // namespace wyxos
