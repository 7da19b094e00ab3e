#pragma once

#include <wx/translation.h>

namespace uilanguage
{

// Statuses the hot-folder service writes into the journals. The views pass
// whatever status a journal holds through the translation call; listing the
// ones the service is known to write puts them into the catalogs. A status not
// listed here is shown as the service wrote it.
inline constexpr const char* kServiceStatuses[] = {
    wxTRANSLATE("Queued"),
    wxTRANSLATE("Converting file type"),
    wxTRANSLATE("Saving..."),
    wxTRANSLATE("Transferring to server"),
    wxTRANSLATE("Transferred Successfully"),
    wxTRANSLATE("Conversion failed"),
    wxTRANSLATE("Unsupported file format"),
    wxTRANSLATE("Saving failed"),
    wxTRANSLATE("Transfer failed"),
    wxTRANSLATE("Server not available"),
};

} // namespace uilanguage
