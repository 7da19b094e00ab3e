#include <fstream>
#include <sstream>

#include <gtest/gtest.h>

#include "TempFolder.h"
#include "app/CrashReporterLoader.h"

namespace
{

class CrashReporter : public ::testing::Test
{
protected:
    std::string Calls() const
    {
        std::ifstream file(logPath);
        std::stringstream text;
        text << file.rdbuf();
        return text.str();
    }

    TempFolder folder;
    std::string logPath = (folder.Path() / "calls.log").string();
    ScopedEnv log{"WYX_TEST_CRASH_LOG", logPath};
};

TEST_F(CrashReporter, ALibraryWithBothEntriesIsInstalledAndUninstalled)
{
    {
        CrashReporterLoader loader;
        EXPECT_FALSE(loader.IsLoaded());
        ASSERT_TRUE(loader.LoadFrom(WYX_FULL_REPORTER));
        EXPECT_TRUE(loader.IsLoaded());
        EXPECT_EQ(Calls(), "") << "loading alone calls nothing";
        loader.Install();
        loader.Uninstall();
    }
    EXPECT_EQ(Calls(), "install\nuninstall\n");
}

TEST_F(CrashReporter, ALibraryLackingAnEntryIsUnloadedAndNeverCalled)
{
    CrashReporterLoader loader;
    EXPECT_FALSE(loader.LoadFrom(WYX_PARTIAL_REPORTER));
    EXPECT_FALSE(loader.IsLoaded());
    loader.Install();
    loader.Uninstall();
    EXPECT_EQ(Calls(), "");
}

TEST_F(CrashReporter, MissingOrBrokenFilesAreNoReporter)
{
    const auto notALibrary = folder.Write("lib/crashreport.so", "not an ELF file");
    for (const std::string& path : {std::string(), (folder.Path() / "absent.so").string(),
                                    notALibrary.string(), folder.Path().string()})
    {
        SCOPED_TRACE(path);
        CrashReporterLoader loader;
        EXPECT_FALSE(loader.LoadFrom(path));
        EXPECT_FALSE(loader.IsLoaded());
        loader.Install();
    }
    EXPECT_EQ(Calls(), "");
}

TEST_F(CrashReporter, TheLibraryIsCrashreportInTheFolderTheRegistryNames)
{
    ScopedEnv root("WYX_SYSTEM_ROOT", folder.Path().string());
    EXPECT_EQ(CrashReporterLibraryPath(), "");
    folder.Write("etc/kelvo/registry.ini", "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=\n");
    EXPECT_EQ(CrashReporterLibraryPath(), "");
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/opt/kelvo/crash\n");
    EXPECT_EQ(CrashReporterLibraryPath(), "/opt/kelvo/crash/crashreport.so");
}

TEST_F(CrashReporter, LoadFindsTheLibraryThroughTheRegistry)
{
    ScopedEnv root("WYX_SYSTEM_ROOT", folder.Path().string());
    const std::string libraryFolder = std::filesystem::path(WYX_FULL_REPORTER).parent_path().string();
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=" + libraryFolder + "\n");
    CrashReporterLoader loader;
    ASSERT_TRUE(loader.Load());
    loader.Install();
    EXPECT_EQ(Calls(), "install\n");
}

} // namespace
