// One pass of the registered notifier reaches both models, and stopping the
// listeners reaches them too: the wiring between the pump and the data layer.
#include <gtest/gtest.h>

#include <wx/log.h>

#include "../log/LogTestSupport.h"
#include "../status/StatusTestSupport.h"
#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "pump/JobsProgressNotify.h"
#include "pump/ServerEventListner.h"

namespace
{

const auto* const kWx = testing::AddGlobalTestEnvironment(new wyxtest::WxEnvironment);

// Both models are process-wide and bind their journal paths when first used:
// this one test makes all of its checks in one system root.
TEST(JobsProgressNotify, OnePassRefreshesBothModelsAndStoppingReachesBoth)
{
    wxLog::EnableLogging(false);
    wyxtest::SystemRoot root;
    const wxString logJournal = GetDataDirectory() + "TiveraJobsLogFile.txt";
    wyxtest::SystemRoot::WriteFile(GetDataDirectory() + "TiveraJobsStatusFile.txt",
                                   statustest::StatusLine("7", "ADDED") + "\r\n");
    wyxtest::SystemRoot::WriteFile(logJournal,
                                   logtest::LogLine("5", "ADDED") + logtest::LogLine("6", "ADDED", "Failed"));

    int logUpdates = 0;
    int statusUpdates = 0;
    wxEvtHandler views;
    views.Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG),
               [&](wxCommandEvent&) { ++logUpdates; });
    views.Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS),
               [&](wxCommandEvent&) { ++statusUpdates; });
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &views));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), &views));
    const auto pass = [&](ServerEventListner& listener)
    {
        listener.Notify();
        wxAppConsole::GetInstance()->ProcessPendingEvents();
    };

    ServerEventListner listener;
    JobsProgressNotify notifier;
    ASSERT_TRUE(listener.AddListener("OnNewData", &notifier));
    pass(listener);
    EXPECT_EQ(logUpdates, 1);
    EXPECT_EQ(statusUpdates, 1);
    std::vector<JobRecord> jobs;
    JobStatusManager::GetInstance().GetJobs(jobs);
    ASSERT_EQ(jobs.size(), 1u);
    EXPECT_EQ(jobs[0][StatusField::Key], "7");
    EXPECT_EQ(JobLogManager::GetInstance().GetRecordCount(), 2u);

    // An unchanged pass publishes nothing.
    pass(listener);
    EXPECT_EQ(logUpdates, 1);
    EXPECT_EQ(statusUpdates, 1);

    // Once stopped, the log model takes nothing in, though its journal grew.
    listener.SetRunning(false);
    wyxtest::SystemRoot::AppendFile(logJournal, logtest::LogLine("8", "ADDED", "Failed"));
    pass(listener);
    EXPECT_EQ(JobLogManager::GetInstance().GetRecordCount(), 2u);
    EXPECT_EQ(logUpdates, 1);

    EXPECT_EQ(listener.RemoveListener("OnNewData"), &notifier);
    EventBus::Get().Unsubscribe(&views);
}

} // namespace
