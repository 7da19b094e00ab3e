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
