#pragma once

#include <wx/log.h>

// The program's log target: every message the library logs is formatted and
// then dropped, so the library never shows an error or warning box.
class NoLog : public wxLog
{
public:
    void Flush() override {}

protected:
    // The base class complains when a target does not take the text itself.
    void DoLogText(const wxString& message) override {}
};
