// The program where an install puts it: cmake --install into a temporary
// prefix, and the Debian package unpacked into a temporary folder. Each copy
// must start from there with its own libraries, files and catalogs.
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "InstalledProgram.h"

namespace
{

using installtest::Environment;
using installtest::FindOnPath;
using installtest::RunToEnd;
using programtest::Program;
using programtest::XSession;

const std::string kProgramName = std::filesystem::path(WYX_PROGRAM).filename().string();

class InstalledTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_FALSE(folder.Path().empty());
        ASSERT_TRUE(x.IsOpen()) << "no X display: run the tests under xvfb-run -a";
        environment = Environment(folder.Path());
    }

    // Starts the program at bin (in German, so that the title shows the
    // shipped catalogs were found), checks its window and closes it.
    void ExpectWindowOpens(const std::filesystem::path& program)
    {
        folder.Write("home/.config/Corvane Quillet/current.lang", "de_DE\n");
        Program copy(program.string(), environment);
        const Window window = x.WaitForWindow(copy);
        ASSERT_NE(window, 0u) << "no window: " << program << " " << copy.Outcome();
        EXPECT_EQ(x.Title(window), "Kelvo Duv Ureruve - Status & Protokoll");
        x.RequestClose(window);
        const int status = copy.Wait();
        EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << copy.Outcome();
    }

    // wyx-journal writes and reads a journal below the system root; the
    // simulator answers --help. Both exit 127 when a library is not found.
    void ExpectToolsRun(const std::filesystem::path& bin)
    {
        folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        std::filesystem::create_directories(folder.Path() / "root/dev/shm");
        const std::string journal = (bin / "wyx-journal").string();
        EXPECT_EQ(
            RunToEnd(journal,
                     {"status", "add", "7\t/srv/in\t/srv/in/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF"},
                     environment),
            0);
        EXPECT_EQ(RunToEnd(journal, {"status", "read"}, environment), 0);
        EXPECT_EQ(RunToEnd((bin / "wyx-simulator").string(), {"--help"}, environment), 0);
    }

    TempFolder folder;
    XSession x;
    std::vector<std::string> environment;
};

TEST_F(InstalledTest, AnInstallToAnyPrefixRunsWithoutALibraryPath)
{
    const std::filesystem::path prefix = folder.Path() / "prefix with space";
    ASSERT_EQ(RunToEnd(WYX_CMAKE, {"--install", WYX_BUILD_DIR, "--prefix", prefix.string()}, environment), 0);

    for (const char* file :
         {"bin/wyx-journal", "bin/wyx-simulator", "bin/wyx-inspect", "share/wyxprogress/WyxConfig.cfg",
          "share/wyxprogress/wyx_folder.ico", "share/wyxprogress/LocalizedStrings/de_DE/wyx3.mo",
          "share/applications/wyxprogress.desktop", "share/icons/hicolor/scalable/apps/wyxprogress.svg"})
        EXPECT_TRUE(std::filesystem::is_regular_file(prefix / file)) << file;
    for (int size : {16, 32, 48, 64, 128, 256})
    {
        const std::string size_ = std::to_string(size);
        EXPECT_TRUE(std::filesystem::is_regular_file(prefix / "share/icons/hicolor" / (size_ + "x" + size_) /
                                                     "apps/wyxprogress.png"))
            << size;
    }
    // Every library the build made is installed beside the others.
    for (const auto& entry :
         std::filesystem::directory_iterator(std::filesystem::path(WYX_PROGRAM).parent_path()))
        if (entry.path().extension() == ".so" && entry.path().filename().string().rfind("lib", 0) == 0)
            EXPECT_TRUE(std::filesystem::exists(prefix / "lib/wyxprogress" / entry.path().filename()))
                << entry.path().filename();

    ExpectWindowOpens(prefix / "bin" / kProgramName);
    ExpectToolsRun(prefix / "bin");
}

TEST_F(InstalledTest, TheDebianPackageRunsWhereItIsUnpacked)
{
    const std::string dpkgDeb = FindOnPath("dpkg-deb");
    if (dpkgDeb.empty())
        GTEST_SKIP() << "dpkg-deb is not installed: the Debian package cannot be unpacked here";
    const std::filesystem::path packages = folder.Path() / "packages";
    ASSERT_EQ(RunToEnd(WYX_CPACK,
                       {"--config", std::string(WYX_BUILD_DIR) + "/CPackConfig.cmake", "-G", "DEB", "-B",
                        packages.string()},
                       environment),
              0);
    std::filesystem::path package;
    for (const auto& entry : std::filesystem::directory_iterator(packages))
        if (entry.path().extension() == ".deb")
            package = entry.path();
    ASSERT_FALSE(package.empty()) << "cpack made no .deb in " << packages;
    EXPECT_EQ(package.filename().string().rfind("wyxprogress_", 0), 0u) << package;

    const std::filesystem::path unpacked = folder.Path() / "unpacked";
    ASSERT_EQ(RunToEnd(dpkgDeb, {"-x", package.string(), unpacked.string()}, environment), 0);
    for (const char* file :
         {"usr/share/applications/wyxprogress.desktop",
          "usr/share/icons/hicolor/256x256/apps/wyxprogress.png", "usr/share/wyxprogress/WyxConfig.cfg",
          "usr/lib/wyxprogress/libwyx_os.so", "usr/share/doc/wyxprogress/copyright"})
        EXPECT_TRUE(std::filesystem::is_regular_file(unpacked / file)) << file;

    ExpectWindowOpens(unpacked / "usr/bin" / kProgramName);
    ExpectToolsRun(unpacked / "usr/bin");
}

} // namespace
