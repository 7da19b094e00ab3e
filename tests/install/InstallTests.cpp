// The program where an install puts it: cmake --install into a temporary
// prefix, and the Debian package unpacked into a temporary folder. Each copy
// must start from there with its own libraries, files and catalogs, and a
// second launch, as from the menu while the window is open behind others,
// brings the first window to the front.
#include <gtest/gtest.h>

#include "ProgramSandbox.h"
#include "WaitUntil.h"

namespace
{

namespace fs = std::filesystem;
using programtest::Program;

TEST(InstalledTest, AnInstallToAnyPrefixAndTheUnpackedDebianPackageRunWithoutALibraryPath)
{
    programtest::Sandbox box;
    ASSERT_TRUE(box.Ready()) << "run the tests under xvfb-run -a";
    const fs::path prefix = box.folder.Path() / "prefix with space",
                   packages = box.folder.Path() / "packages", unpacked = box.folder.Path() / "unpacked";
    ASSERT_EQ(box.Run(WYX_CMAKE, {"--install", WYX_BUILD_DIR, "--prefix", prefix.string()}), 0);
    ASSERT_EQ(box.Run(WYX_CPACK, {"--config", std::string(WYX_BUILD_DIR) + "/CPackConfig.cmake", "-G", "DEB",
                                  "-B", packages.string()}),
              0);
    fs::path package;
    for (const auto& entry : fs::directory_iterator(packages))
        package = entry.path().extension() == ".deb" ? entry.path() : package;
    ASSERT_EQ(box.Run("/usr/bin/dpkg-deb", {"-x", package.string(), unpacked.string()}), 0) << packages;
    // What running the copies does not show: the menu entry and its icon.
    for (const fs::path& root : {prefix, unpacked / "usr"})
        for (const char* file :
             {"share/applications/wyxprogress.desktop", "share/icons/hicolor/scalable/apps/wyxprogress.svg"})
            EXPECT_TRUE(fs::is_regular_file(root / file)) << root / file;

    // Starts the program, which the caller set up to come in German (the title
    // shows a catalog was found), and a second copy, which must end without a
    // window after bringing the first one's to the front; wyx-journal writes a
    // journal below the system root and the simulator answers --help. A tool
    // exits 127 when a library is missing.
    const auto expectProgramsRun = [&box](const fs::path& bin)
    {
        const std::string program = (bin / fs::path(WYX_PROGRAM).filename()).string();
        Program first(program, box.environment);
        if (const Window window = box.WaitForWindow(first))
        {
            EXPECT_EQ(box.x.Title(window), "Kelvo Duv Ureruve - Status & Protokoll");
            // The user works elsewhere: the window no longer has the focus. Without a window
            // manager, the toolkit gives the focus to the top-level window itself.
            const std::unique_ptr<Display, int (*)(Display*)> display(XOpenDisplay(nullptr), XCloseDisplay);
            const auto focused = [&]
            {
                Window focus = 0;
                int revert = 0;
                XGetInputFocus(display.get(), &focus, &revert);
                return focus;
            };
            XSetInputFocus(display.get(), PointerRoot, RevertToPointerRoot, CurrentTime);
            EXPECT_NE(focused(), window);
            Program second(program, box.environment);
            EXPECT_EQ(box.x.WaitForWindow(second), 0u) << "the second copy opened a window";
            EXPECT_TRUE(WIFEXITED(second.Wait()));
            // The knock is handled on the first copy's main loop.
            EXPECT_TRUE(WaitUntil([&] { return focused() == window; }))
                << "the first copy ended: " << first.HasEnded();
            box.Close(first, window);
        }
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        const std::string job = "7\t/srv/in\t/srv/in/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF";
        EXPECT_EQ(box.Run((bin / "wyx-journal").string(), {"status", "add", job}), 0);
        EXPECT_EQ(box.Run((bin / "wyx-simulator").string(), {"--help"}), 0);
    };

    // German from the user's file, with the shipped configuration and catalogs.
    box.folder.Write("home/.config/Corvane Quillet/current.lang", "de_DE\n");
    expectProgramsRun(unpacked / "usr/bin");
    // The catalogs only through the install path in the registry.
    fs::remove_all(prefix / "share/wyxprogress/LocalizedStrings");
    box.folder.Write("root/etc/kelvo/registry.ini",
                     "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" +
                         fs::path(WYX_CATALOG_DIR).parent_path().string() + "\n");
    expectProgramsRun(prefix / "bin");
}

} // namespace
