#pragma once

#include <string>

#include <wx/string.h>

namespace wyxos
{

// A small configuration text as people edit it: a UTF-8 byte-order mark is
// skipped, each line that is valid UTF-8 is read as UTF-8, and any other line
// as Latin-1, so a stray byte costs at most its own line.
wxString DecodeConfigurationText(const std::string& bytes);

} // namespace wyxos
