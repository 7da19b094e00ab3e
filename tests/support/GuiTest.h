#pragma once

#include <functional>

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

// Delivers events until the condition holds; false when it still does not after the
// limit. The limit is generous on purpose: it only ends a test that would hang.
inline bool PumpUntil(const std::function<bool()>& done, int limitMilliseconds = 10000)
{
    const wxLongLong end = wxGetLocalTimeMillis() + limitMilliseconds;
    for (;;)
    {
        wxTheApp->ProcessPendingEvents();
        wxYield();
        if (done())
            return true;
        if (wxGetLocalTimeMillis() >= end)
            return false;
        wxMilliSleep(5);
    }
}

} // namespace guitest
