#pragma once

#include <wx/app.h>
#include <wx/event.h>

#include "SystemRoot.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace statustest
{

using wyxtest::WxEnvironment;

class SystemRoot : public wyxtest::SystemRoot
{
public:
    wxString JournalPath() const { return GetDataDirectory() + "TiveraJobsStatusFile.txt"; }
    wxString LockPath() const { return Path() + "/dev/shm/TiveraJobsStatusFile.lock"; }
};

inline void WriteFile(const wxString& path, const wxString& text)
{
    wyxtest::SystemRoot::WriteFile(path, text);
}

// A status journal line of nine fields; its DosTime is 15 March 2021, 14:05:30.
inline wxString StatusLine(const wxString& key, const wxString& tag, const wxString& status = "Saving...")
{
    return key + "\t/srv/hotfolders/Proofs\t/srv/hotfolders/Proofs/" + key + ".pdf\tPRN-01\t1383035055\t" +
           status + "\t48213\tPDF\t" + tag;
}

// Counts the status updates the bus delivers to it.
class UpdateCounter : public wxEvtHandler
{
public:
    UpdateCounter()
    {
        Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS),
             [this](wxCommandEvent& event)
             {
                 ++m_count;
                 m_lastId = event.GetId();
             });
        EventBus::Get().Subscribe(ChannelKey(2), this);
    }
    ~UpdateCounter() override { EventBus::Get().Unsubscribe(this); }

    // Delivers what was queued and returns how many updates arrived in all.
    int Delivered()
    {
        // A handler delivers one event per call; the application drains them
        // all. A console application: wxTheApp would take it for a GUI one.
        wxAppConsole::GetInstance()->ProcessPendingEvents();
        return m_count;
    }
    int LastId() const { return m_lastId; }

private:
    int m_count = 0;
    int m_lastId = -1;
};

} // namespace statustest
