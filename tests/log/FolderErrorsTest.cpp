#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/FolderErrors.h"
#include "data/JobLogManager.h"
#include "platform/datasource/WyxDataSource.h"
#include "platform/os/ShellNotify.h"

using logtest::LogLine;
using logtest::SystemRoot;

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

struct MarkerPathCase
{
    const char* folder;
    const char* marker;
};

class ErrorMarkerPaths : public ::testing::TestWithParam<MarkerPathCase>
{
};

TEST_P(ErrorMarkerPaths, LieInTheHotFoldersOwnSubfolder)
{
    EXPECT_EQ(GetParam().marker, ErrorMarkerPath(GetParam().folder));
}

INSTANTIATE_TEST_SUITE_P(
    Folders, ErrorMarkerPaths,
    ::testing::Values(MarkerPathCase{"/jobs/In", "/jobs/In/[_KELVO_HotFolder_]/Error.er"},
                      MarkerPathCase{"/jobs/In/", "/jobs/In/[_KELVO_HotFolder_]/Error.er"},
                      MarkerPathCase{"/srv/PDF Proofs", "/srv/PDF Proofs/[_KELVO_HotFolder_]/Error.er"}));

TEST(IconRefreshModes, OnlyExactValuesSelectARefresh)
{
    EXPECT_EQ(IconRefreshMode::ShellNotification, IconRefreshModeFromSetting("1"));
    EXPECT_EQ(IconRefreshMode::FolderIcons, IconRefreshModeFromSetting("0"));
    for (const char* other : {"2", "", " 1", "1 ", "01", "true", "O"})
        EXPECT_EQ(IconRefreshMode::None, IconRefreshModeFromSetting(other)) << other;
}

// A system root with three hot folders, each marked with an error, and a log
// model whose journal names failed jobs in two of them.
class FolderErrors : public ::testing::Test
{
protected:
    FolderErrors()
    {
        wyxos::ResetShellNotifications();
        m_iconCallsBefore = WyxDataSource::GetInstance().GetIconChanges().size();
        m_folders = m_root.MakeHotFolders(logtest::Strings({"In", "PDF Proofs", "Tiffs"}));
        for (const wxString& folder : m_folders)
            MarkFolder(folder);
        SystemRoot::WriteFile(m_root.JournalPath(),
                              LogLine("1", "ADDED", "Transfer failed", m_folders[2]) +
                                  LogLine("2", "ADDED", "Transferred Successfully", m_folders[0]) +
                                  LogLine("3", "ADDED", "Disk full", m_folders[1]));
        EXPECT_EQ(1, m_model.Parse());
    }

    static void MarkFolder(const wxString& folder)
    {
        SystemRoot::WriteFile(ErrorMarkerPath(folder), "error");
    }
    static bool IsMarked(const wxString& folder) { return wxFileName::Exists(ErrorMarkerPath(folder)); }

    void UseSetting(const wxString& setting)
    {
        m_model.SetIconRefreshSettingSource([setting] { return setting; });
    }

    std::vector<WyxDataSource::IconChange> IconCalls() const
    {
        std::vector<WyxDataSource::IconChange> all = WyxDataSource::GetInstance().GetIconChanges();
        return std::vector<WyxDataSource::IconChange>(
            all.begin() + static_cast<std::ptrdiff_t>(m_iconCallsBefore), all.end());
    }
    std::vector<wxString> IconCallFolders() const
    {
        std::vector<wxString> folders;
        for (const WyxDataSource::IconChange& call : IconCalls())
        {
            EXPECT_FALSE(call.errorState);
            folders.push_back(call.hotFolderPath);
        }
        return folders;
    }

    SystemRoot m_root;
    JobLogManager m_model{m_root.JournalPath()};
    wxArrayString m_folders;
    std::size_t m_iconCallsBefore = 0;
};

TEST_F(FolderErrors, HotFolderNamesAreTheLastPathComponents)
{
    wxArrayString names = logtest::Strings({"stale"});
    EXPECT_EQ(1, m_model.GetHotFolderNames(names));
    EXPECT_EQ((std::vector<wxString>{"In", "PDF Proofs", "Tiffs"}),
              std::vector<wxString>(names.begin(), names.end()));
}

TEST_F(FolderErrors, ShellModeClearsEveryMarkerAndNotifiesOnce)
{
    UseSetting("1");
    m_model.ClearLog();

    for (const wxString& folder : m_folders)
        EXPECT_FALSE(IsMarked(folder)) << folder;
    EXPECT_EQ(1u, wyxos::ShellNotificationCount());
    EXPECT_TRUE(IconCalls().empty());
    EXPECT_EQ(2u, m_model.GetErrorFolders().size());
}

TEST_F(FolderErrors, FolderModeRefreshesEachErrorFolderOnceAndForgetsThem)
{
    UseSetting("0");
    m_model.ClearLog();

    for (const wxString& folder : m_folders)
        EXPECT_FALSE(IsMarked(folder)) << folder;
    EXPECT_EQ((std::vector<wxString>{m_folders[2], m_folders[1]}), IconCallFolders());
    EXPECT_EQ(0u, wyxos::ShellNotificationCount());
    EXPECT_TRUE(m_model.GetErrorFolders().empty());

    // Nothing failed since: the next reset refreshes no icon.
    MarkFolder(m_folders[0]);
    m_model.ResetAllFolderErrors();
    EXPECT_FALSE(IsMarked(m_folders[0]));
    EXPECT_EQ(2u, IconCalls().size());
}

TEST_F(FolderErrors, OtherModesClearMarkersAndRefreshNothing)
{
    UseSetting("2");
    m_model.ClearLog();

    for (const wxString& folder : m_folders)
        EXPECT_FALSE(IsMarked(folder)) << folder;
    EXPECT_EQ(0u, wyxos::ShellNotificationCount());
    EXPECT_TRUE(IconCalls().empty());
    EXPECT_EQ(2u, m_model.GetErrorFolders().size());
}

TEST_F(FolderErrors, AcknowledgingAnUnmarkedFolderDoesNothing)
{
    for (const char* setting : {"0", "1"})
    {
        UseSetting(setting);
        EXPECT_EQ(NoErrorMarker, m_model.AcknowledgeFolderErrors(m_root.Path() + "/srv/hotfolders/Unknown"));
        wxRemoveFile(ErrorMarkerPath(m_folders[0]));
        EXPECT_EQ(NoErrorMarker, m_model.AcknowledgeFolderErrors(m_folders[0]));
    }
    EXPECT_EQ(0u, wyxos::ShellNotificationCount());
    EXPECT_TRUE(IconCalls().empty());
}

TEST_F(FolderErrors, AcknowledgingAMarkedFolderClearsItAndRefreshesItAlone)
{
    UseSetting("0");
    EXPECT_EQ(ErrorMarkerRemoved, m_model.AcknowledgeFolderErrors(m_folders[1]));
    EXPECT_FALSE(IsMarked(m_folders[1]));
    EXPECT_TRUE(IsMarked(m_folders[0]));
    EXPECT_EQ((std::vector<wxString>{m_folders[1]}), IconCallFolders());
    EXPECT_EQ(2u, m_model.GetErrorFolders().size());

    UseSetting("1");
    EXPECT_EQ(ErrorMarkerRemoved, m_model.AcknowledgeFolderErrors(m_folders[0]));
    EXPECT_EQ(1u, wyxos::ShellNotificationCount());
    EXPECT_EQ(1u, IconCalls().size());
}

// A marker the program cannot remove: a folder of that name with something in it.
TEST_F(FolderErrors, MarkerThatCannotBeRemovedIsLeftAndTheRefreshStillHappens)
{
    const wxString stuck = ErrorMarkerPath(m_folders[1]);
    wxRemoveFile(stuck);
    ASSERT_TRUE(wxFileName::Mkdir(stuck));
    SystemRoot::WriteFile(stuck + "/inside", "x");

    UseSetting("0");
    EXPECT_EQ(ErrorMarkerKept, m_model.AcknowledgeFolderErrors(m_folders[1]));
    EXPECT_TRUE(IsMarked(m_folders[1]));
    EXPECT_EQ((std::vector<wxString>{m_folders[1]}), IconCallFolders());

    UseSetting("1");
    m_model.ClearLog();
    EXPECT_TRUE(IsMarked(m_folders[1]));
    EXPECT_FALSE(IsMarked(m_folders[0]));
    EXPECT_FALSE(IsMarked(m_folders[2]));
    EXPECT_EQ(1u, wyxos::ShellNotificationCount());
}

} // namespace
