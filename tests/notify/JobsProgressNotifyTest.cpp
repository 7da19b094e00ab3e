// One pass of the registered notifier reaches both models, and stopping the
// listeners reaches them too: the wiring between the pump and the data layer.
#include <tuple>

#include <gtest/gtest.h>

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
    wyxtest::SystemRoot root;
    const wxString logJournal = GetDataDirectory() + "TiveraJobsLogFile.txt";
    const wxString statusJournal = GetDataDirectory() + "TiveraJobsStatusFile.txt";
    wyxtest::SystemRoot::WriteFile(statusJournal, statustest::StatusLine("7", "ADDED") + "\r\n");
    wyxtest::SystemRoot::WriteFile(logJournal,
                                   logtest::LogLine("5", "ADDED") + logtest::LogLine("6", "ADDED", "Failed"));

    int logUpdates = 0, statusUpdates = 0;
    const auto count = [](int& updates) { return [&updates](wxCommandEvent&) { ++updates; }; };
    wxEvtHandler views;
    views.Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG), count(logUpdates));
    views.Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS), count(statusUpdates));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &views));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), &views));
    ServerEventListner listener;
    JobsProgressNotify notifier;
    ASSERT_TRUE(listener.AddListener("OnNewData", &notifier));
    // After one pass: the log's records, the status list's jobs, and the updates published so far.
    const auto pass = [&]
    {
        listener.Notify();
        wxAppConsole::GetInstance()->ProcessPendingEvents();
        return std::make_tuple(JobLogManager::GetInstance().GetRecordCount(),
                               JobStatusManager::GetInstance().GetSnapshot()->jobs.size(), logUpdates,
                               statusUpdates);
    };
    using Counts = std::tuple<std::size_t, std::size_t, int, int>;
    EXPECT_EQ(pass(), Counts(2, 1, 1, 1));
    EXPECT_EQ(pass(), Counts(2, 1, 1, 1)) << "an unchanged pass publishes nothing";

    // Once stopped, neither model takes in what its journal gained: the log
    // model reads nothing, the status model's read stops at its first line and
    // keeps what it has.
    listener.SetRunning(false);
    wyxtest::SystemRoot::AppendFile(logJournal, logtest::LogLine("8", "ADDED", "Failed"));
    wyxtest::SystemRoot::AppendFile(statusJournal, statustest::StatusLine("9", "ADDED") + "\r\n");
    EXPECT_EQ(pass(), Counts(2, 0, 1, 2));
}

} // namespace
