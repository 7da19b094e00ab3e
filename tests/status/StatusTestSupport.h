#pragma once

#include <gtest/gtest.h>

#include <memory>

#include <wx/app.h>
#include <wx/event.h>
#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/string.h>
#include <wx/utils.h>

#include "data/DataLocations.h"
#include "pump/CustomEvents.h"
#include "pump/EventBus.h"

namespace statustest
{

// Event queues need an application object; the unit tests have no window.
class WxEnvironment : public ::testing::Environment
{
public:
    void SetUp() override { m_init = std::make_unique<wxInitializer>(); }
    void TearDown() override { m_init.reset(); }

private:
    std::unique_ptr<wxInitializer> m_init;
};

// A fresh system root per test: journals and locks of one test never meet
// another's, also when several test processes run at once.
class SystemRoot
{
public:
    SystemRoot()
    {
        const wxString base = wxFileName::CreateTempFileName("wyx-status");
        wxRemoveFile(base);
        m_root = base;
        wxFileName::Mkdir(m_root, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
        wxSetEnv("WYX_SYSTEM_ROOT", m_root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
    }
    ~SystemRoot()
    {
        wxFileName::Rmdir(m_root, wxPATH_RMDIR_RECURSIVE);
        wxUnsetEnv("WYX_SYSTEM_ROOT");
    }

    const wxString& Path() const { return m_root; }
    wxString JournalPath() const { return GetDataDirectory() + "TiveraJobsStatusFile.txt"; }
    wxString LockPath() const { return m_root + "/dev/shm/TiveraJobsStatusFile.lock"; }

private:
    wxString m_root;
};

inline void WriteFile(const wxString& path, const wxString& text)
{
    wxFFile file(path, "wb");
    ASSERT_TRUE(file.IsOpened()) << path;
    ASSERT_TRUE(file.Write(text, wxConvUTF8));
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
