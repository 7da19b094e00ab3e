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

// Three hot folders, each marked with an error, and a log model whose journal
// names failed jobs in the third and the second.
struct Scene
{
    Scene()
    {
        wyxos::ResetShellNotifications();
        iconCallsBefore = WyxDataSource::GetInstance().GetIconChanges().size();
        for (const wxString& folder : folders)
            Mark(folder);
        SystemRoot::WriteFile(root.JournalPath(),
                              LogLine("1", "ADDED", "Transfer failed", folders[2]) +
                                  LogLine("2", "ADDED", "Transferred Successfully", folders[0]) +
                                  LogLine("3", "ADDED", "Disk full", folders[1]));
        EXPECT_EQ(1, model.Parse());
    }
    static void Mark(const wxString& folder) { SystemRoot::WriteFile(ErrorMarkerPath(folder), "error"); }
    static bool IsMarked(const wxString& folder) { return wxFileName::Exists(ErrorMarkerPath(folder)); }
    // The folders whose icons were refreshed since the scene began, by index; '!' after one
    // refreshed to an error icon, which never should be.
    wxString IconCalls() const
    {
        wxString calls;
        const std::vector<WyxDataSource::IconChange> all = WyxDataSource::GetInstance().GetIconChanges();
        for (std::size_t i = iconCallsBefore; i < all.size(); ++i)
            calls << folders.Index(all[i].hotFolderPath) << (all[i].errorState ? "!" : "");
        return calls;
    }

    SystemRoot root;
    JobLogManager model{root.JournalPath()};
    const wxArrayString folders = root.MakeHotFolders(logtest::Strings({"In", "PDF Proofs", "Tiffs"}));
    std::size_t iconCallsBefore = 0;
};

// Runs before any configuration is loaded (the store keeps the first value it
// meets for a key): without a choice the setting is "0". The marker of
// folders[1] cannot be removed: a folder of that name with something in it.
TEST(FolderErrors, AcknowledgingAndClearLogRemoveTheMarkersAndRefreshAsTheSettingSays)
{
    EXPECT_EQ("/jobs/In/[_KELVO_HotFolder_]/Error.er", ErrorMarkerPath("/jobs/In/"));
    // No setting of its own: the configuration's, and only then are folder icons refreshed.
    for (const char* setting : {static_cast<const char*>(nullptr), "1", "2"})
    {
        SCOPED_TRACE(setting ? setting : "default");
        const bool folderIcons = setting == nullptr; // else the error folders stay known
        const bool shellNotification = setting != nullptr && *setting == '1';
        Scene scene;
        if (setting != nullptr)
            scene.model.SetIconRefreshSettingSource([setting] { return wxString(setting); });
        const wxString stuck = ErrorMarkerPath(scene.folders[1]);
        wxRemoveFile(stuck);
        ASSERT_TRUE(wxFileName::Mkdir(stuck));
        SystemRoot::WriteFile(stuck + "/inside", "x");
        wxArrayString names = logtest::Strings({"stale"});
        EXPECT_EQ(1, scene.model.GetHotFolderNames(names));
        EXPECT_EQ("In|PDF Proofs|Tiffs", wxJoin(names, '|', 0)) << "the last path components";
        EXPECT_EQ(ErrorMarkerRemoved, scene.model.AcknowledgeFolderErrors(scene.folders[2]));
        EXPECT_EQ(ErrorMarkerKept, scene.model.AcknowledgeFolderErrors(scene.folders[1]));
        EXPECT_TRUE(Scene::IsMarked(scene.folders[0]) && Scene::IsMarked(scene.folders[1]));
        EXPECT_FALSE(Scene::IsMarked(scene.folders[2]));
        EXPECT_EQ(folderIcons ? "21" : "", scene.IconCalls());
        EXPECT_EQ(shellNotification ? 2u : 0u, wyxos::ShellNotificationCount());

        scene.model.ClearLog();
        EXPECT_FALSE(Scene::IsMarked(scene.folders[0]) || Scene::IsMarked(scene.folders[2]));
        EXPECT_TRUE(Scene::IsMarked(scene.folders[1]));
        EXPECT_EQ(shellNotification ? 3u : 0u, wyxos::ShellNotificationCount());
        EXPECT_EQ(folderIcons ? "2121" : "", scene.IconCalls()) << "the error folders refreshed again";
        EXPECT_EQ(folderIcons ? 0u : 2u, scene.model.GetErrorFolders().size());
    }
}

} // namespace
