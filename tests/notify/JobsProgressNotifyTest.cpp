// One pass of the registered notifier reaches both models, and stopping the
// listeners reaches them too: the wiring between the pump and the data layer.
#include <gtest/gtest.h>

#include <memory>

#include <wx/app.h>
#include <wx/event.h>
#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/log.h>
#include <wx/utils.h>

#include "data/DataLocations.h"
#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"
#include "pump/JobsProgressNotify.h"
#include "pump/ServerEventListner.h"

namespace
{

class UpdateCounter : public wxEvtHandler
{
public:
    UpdateCounter()
    {
        Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG),
             [this](wxCommandEvent&) { ++logUpdates; });
        Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS),
             [this](wxCommandEvent&) { ++statusUpdates; });
    }
    ~UpdateCounter() override { EventBus::Get().Unsubscribe(this); }

    // A handler's own ProcessPendingEvents handles one event a call; the
    // application delivers all of them, as the program's event loop does.
    void Deliver() { wxAppConsole::GetInstance()->ProcessPendingEvents(); }

    int logUpdates = 0;
    int statusUpdates = 0;
};

void WriteUtf8(const wxString& path, const wxString& text)
{
    wxFFile file(path, "wb");
    ASSERT_TRUE(file.IsOpened()) << path;
    ASSERT_TRUE(file.Write(text, wxConvUTF8));
}

// Both models are process-wide and bind their journal paths when first used,
// so the whole binary runs in one temporary system root set up before that.
class NotifyTest : public ::testing::Test
{
protected:
    static void SetUpTestSuite()
    {
        s_init = std::make_unique<wxInitializer>();
        wxLog::EnableLogging(false);
        const wxString base = wxFileName::CreateTempFileName("wyx-notify");
        wxRemoveFile(base);
        s_root = base;
        wxFileName::Mkdir(s_root, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
        wxSetEnv("WYX_SYSTEM_ROOT", s_root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
    }
    static void TearDownTestSuite()
    {
        wxFileName::Rmdir(s_root, wxPATH_RMDIR_RECURSIVE);
        wxUnsetEnv("WYX_SYSTEM_ROOT");
        s_init.reset();
    }

    static std::unique_ptr<wxInitializer> s_init;
    static wxString s_root;
};

std::unique_ptr<wxInitializer> NotifyTest::s_init;
wxString NotifyTest::s_root;

TEST_F(NotifyTest, OnePassRefreshesBothModelsAndStoppingReachesBoth)
{
    const wxString dir = GetDataDirectory();
    WriteUtf8(dir + "TiveraJobsStatusFile.txt",
              "7\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF\tADDED\r\n");
    WriteUtf8(
        dir + "TiveraJobsLogFile.txt",
        "5\t/srv/in/Proofs\t/srv/in/Proofs/b.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok\tADDED\r\n"
        "6\t/srv/in/Proofs\t/srv/in/Proofs/c.pdf\tPRN-02\t1383035055\tFailed\tno paper\tADDED\r\n");

    UpdateCounter views;
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &views));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), &views));

    ServerEventListner listener;
    JobsProgressNotify notifier;
    ASSERT_TRUE(listener.AddListener("OnNewData", &notifier));

    listener.Notify();
    views.Deliver();
    EXPECT_EQ(views.logUpdates, 1);
    EXPECT_EQ(views.statusUpdates, 1);

    std::vector<JobRecord> jobs;
    JobStatusManager::GetInstance().GetJobs(jobs);
    ASSERT_EQ(jobs.size(), 1u);
    EXPECT_EQ(jobs[0][StatusField::Key], "7");
    EXPECT_EQ(JobLogManager::GetInstance().GetRecordCount(), 2u);

    // An unchanged pass publishes nothing.
    listener.Notify();
    views.Deliver();
    EXPECT_EQ(views.logUpdates, 1);
    EXPECT_EQ(views.statusUpdates, 1);

    // Once stopped, the log model takes nothing in, though its journal grew.
    listener.SetRunning(false);
    WriteUtf8(
        dir + "TiveraJobsLogFile.txt",
        "5\t/srv/in/Proofs\t/srv/in/Proofs/b.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok\tADDED\r\n"
        "6\t/srv/in/Proofs\t/srv/in/Proofs/c.pdf\tPRN-02\t1383035055\tFailed\tno paper\tADDED\r\n"
        "8\t/srv/in/Proofs\t/srv/in/Proofs/d.pdf\tPRN-02\t1383035055\tFailed\tjammed\tADDED\r\n");
    listener.Notify();
    views.Deliver();
    EXPECT_EQ(JobLogManager::GetInstance().GetRecordCount(), 2u);
    EXPECT_EQ(views.logUpdates, 1);

    EXPECT_EQ(listener.RemoveListener("OnNewData"), &notifier);
}

} // namespace
