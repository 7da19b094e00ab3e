#pragma once

#include <functional>

#include <wx/app.h>
#include <wx/evtloop.h>
#include <wx/utils.h>

// Helpers for tests that run against a real display (Xvfb in CI).
namespace guitest
{

// Delivers events until the condition holds; false when it still does not after the
// limit. The limit is generous on purpose: it only ends a test that would hang.
inline bool PumpUntil(const std::function<bool()>& done, int limitMilliseconds = 10000)
{
    for (const wxLongLong end = wxGetLocalTimeMillis() + limitMilliseconds;; wxMilliSleep(5))
    {
        wxTheApp->ProcessPendingEvents();
        wxYield();
        if (done())
            return true;
        if (wxGetLocalTimeMillis() >= end)
            return false;
    }
}

// Delivers queued events and lets the toolkit paint, for the given time.
inline void Pump(int milliseconds = 50)
{
    PumpUntil([] { return false; }, milliseconds);
}

} // namespace guitest
