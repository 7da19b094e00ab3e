#pragma once

#include <wx/string.h>

// The product's install folder from the registry, or an empty text when the
// key or the value is missing or the value does not fit the 517-byte buffer
// the value is read into (257 UTF-16 units and the terminator).
wxString ReadInstallPath();
