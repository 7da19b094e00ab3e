#pragma once

#include <wx/app.h>
#include <wx/event.h>

#include "SystemRoot.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace statustest
{

struct SystemRoot : wyxtest::SystemRoot
{
    wxString JournalPath() const { return GetDataDirectory() + "TiveraJobsStatusFile.txt"; }
};

// A status journal line of nine fields; its DosTime is 15 March 2021, 14:05:30.
inline wxString StatusLine(const wxString& key, const wxString& tag, const wxString& status = "Saving...")
{
    return key + "\t/srv/hotfolders/Proofs\t/srv/hotfolders/Proofs/" + key + ".pdf\tPRN-01\t1383035055\t" +
           status + "\t48213\tPDF\t" + tag;
}

} // namespace statustest
