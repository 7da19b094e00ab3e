#pragma once

#include <wx/string.h>

namespace wyxos
{

// The machine-wide application data folder (ProgramData on Windows): /var/lib
// below the system root, as a full path without a trailing separator.
wxString CommonAppDataFolder();

// Creates the folder and its missing parents. The last folder gets mode
// finalMode even under a restrictive umask when this call created it.
bool MakeFolders(const wxString& path, unsigned finalMode);

} // namespace wyxos
