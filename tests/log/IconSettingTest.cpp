#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/DataLocations.h"
#include "data/FolderErrors.h"
#include "data/JobLogManager.h"
#include "platform/datasource/WyxDataSource.h"
#include "platform/os/ShellNotify.h"

// A binary of its own: the configuration store keeps the first value it meets
// for a key for the whole process.
namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

// Runs before anything is loaded from a test file: the setting is then the
// shipped file's "0", or "0" by default where there is none.
TEST(IconRefreshSetting, WithoutAChoiceEachErrorFolderGetsItsIconRefreshed)
{
    logtest::SystemRoot root;
    const wxArrayString folders = root.MakeHotFolders(logtest::Strings({"In", "Out", "Proofs"}));
    logtest::SystemRoot::WriteFile(root.JournalPath(),
                                   logtest::LogLine("1", "ADDED", "Failed", folders[2]) +
                                       logtest::LogLine("2", "ADDED", "Failed", folders[0]));
    EXPECT_EQ("0", ReadIconRefreshSetting());

    wyxos::ResetShellNotifications();
    const std::size_t iconCalls = WyxDataSource::GetInstance().GetIconChanges().size();
    JobLogManager model(root.JournalPath());
    ASSERT_EQ(1, model.Parse());
    model.ClearLog();

    const std::vector<WyxDataSource::IconChange> calls = WyxDataSource::GetInstance().GetIconChanges();
    ASSERT_EQ(iconCalls + 2, calls.size());
    EXPECT_EQ(folders[2], calls[iconCalls].hotFolderPath);
    EXPECT_EQ(folders[0], calls[iconCalls + 1].hotFolderPath);
    EXPECT_EQ(0u, wyxos::ShellNotificationCount());
    EXPECT_TRUE(model.GetErrorFolders().empty());
}

TEST(IconRefreshSetting, ComesFromTheConfigurationOnEveryUse)
{
    logtest::SystemRoot root;
    const wxArrayString folders = root.MakeHotFolders(logtest::Strings({"In", "Out"}));
    for (const wxString& folder : folders)
        logtest::SystemRoot::WriteFile(ErrorMarkerPath(folder), "");
    logtest::SystemRoot::WriteFile(root.JournalPath(), logtest::LogLine("1", "ADDED", "Failed", folders[0]));

    const wxString config = root.Path() + "/WyxConfig.cfg";
    logtest::SystemRoot::WriteFile(config, "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                           "<Configuration><WyxConfiguration>"
                                           "<Entry key=\"ICON_SHELL_NOTIFY\" value=\"1\"/>"
                                           "</WyxConfiguration></Configuration>\n");
    ASSERT_TRUE(ConfigStore::Instance().LoadFile(config));
    EXPECT_EQ("1", ReadIconRefreshSetting());

    wyxos::ResetShellNotifications();
    const std::size_t iconCalls = WyxDataSource::GetInstance().GetIconChanges().size();
    JobLogManager model(root.JournalPath());
    ASSERT_EQ(1, model.Parse());
    EXPECT_EQ(0, model.ClearLog());

    EXPECT_EQ(1u, wyxos::ShellNotificationCount());
    EXPECT_EQ(iconCalls, WyxDataSource::GetInstance().GetIconChanges().size());
    for (const wxString& folder : folders)
        EXPECT_FALSE(wxFileName::Exists(ErrorMarkerPath(folder))) << folder;
}

} // namespace
