#pragma once

#include <wx/app.h>
#include <wx/evtloop.h>
#include <wx/utils.h>

// Helpers for tests that run against a real display (Xvfb in CI).
namespace guitest
{

// Delivers queued events and lets the toolkit paint, for up to the given time.
inline void Pump(int milliseconds = 50)
{
    const wxLongLong end = wxGetLocalTimeMillis() + milliseconds;
    do
    {
        wxTheApp->ProcessPendingEvents();
        wxYield();
        wxMilliSleep(5);
    } while (wxGetLocalTimeMillis() < end);
    wxTheApp->ProcessPendingEvents();
    wxYield();
}

} // namespace guitest
