// The program where an install puts it: cmake --install into a temporary
// prefix, and the Debian package unpacked into a temporary folder. Each copy
// must start from there with its own libraries, files and catalogs, and a
// second launch, as from the menu while the window is open behind others,
// brings the first window to the front.
#include <gtest/gtest.h>

#include <string>

#include "ProgramSandbox.h"

namespace
{

namespace fs = std::filesystem;
using programtest::Program;

// The top-level window (a child of the root) that has the keyboard focus, or PointerRoot / None.
Window FocusedTopLevel(Display* display)
{
    Window focus = 0, root = DefaultRootWindow(display), parent = 0, *children = nullptr;
    int revert = 0;
    unsigned int count = 0;
    XGetInputFocus(display, &focus, &revert);
    for (; focus > PointerRoot && XQueryTree(display, focus, &root, &parent, &children, &count);
         focus = parent)
        if (XFree(children), parent == root)
            return focus;
    return focus;
}

class InstalledTest : public ::testing::Test
{
protected:
    void SetUp() override { ASSERT_TRUE(box.Ready()); }

    // What running the copies does not show: the menu entry and its icons, the
    // folder icon and the inspection tool. The libraries, the configuration
    // and the catalogs the copies need to come up in German.
    static void ExpectLayout(const fs::path& prefix)
    {
        for (const char* file :
             {"bin/wyx-inspect", "share/wyxprogress/wyx_folder.ico", "share/applications/wyxprogress.desktop",
              "share/icons/hicolor/scalable/apps/wyxprogress.svg",
              "share/icons/hicolor/16x16/apps/wyxprogress.png",
              "share/icons/hicolor/256x256/apps/wyxprogress.png"})
            EXPECT_TRUE(fs::is_regular_file(prefix / file)) << prefix / file;
    }

    // Starts the program, which the caller set up to come in German (the title
    // shows a catalog was found), and a second copy, which must end without a
    // window after bringing the first one's to the front; wyx-journal writes a
    // journal below the system root and the simulator answers --help. A tool
    // exits 127 when a library is missing.
    void ExpectProgramsRun(const fs::path& bin)
    {
        const std::string program = (bin / fs::path(WYX_PROGRAM).filename()).string();
        Program first(program, box.environment);
        if (const Window window = box.WaitForWindow(first))
        {
            EXPECT_EQ(box.x.Title(window), "Kelvo Duv Ureruve - Status & Protokoll");
            // The user works elsewhere: the window no longer has the focus.
            const std::unique_ptr<Display, int (*)(Display*)> display(XOpenDisplay(nullptr), XCloseDisplay);
            XSetInputFocus(display.get(), PointerRoot, RevertToPointerRoot, CurrentTime);
            EXPECT_NE(FocusedTopLevel(display.get()), window);
            Program second(program, box.environment);
            EXPECT_EQ(box.x.WaitForWindow(second), 0u) << "the second copy opened a window";
            EXPECT_TRUE(WIFEXITED(second.Wait())) << second.Outcome();
            // The knock is handled on the first copy's main loop.
            while (FocusedTopLevel(display.get()) != window && !first.HasEnded())
                ::usleep(20000);
            EXPECT_EQ(FocusedTopLevel(display.get()), window) << "the first copy " << first.Outcome();
            box.Close(first, window);
        }
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        fs::create_directories(box.folder.Path() / "root/dev/shm");
        EXPECT_EQ(
            box.Run((bin / "wyx-journal").string(),
                    {"status", "add", "7\t/srv/in\t/srv/in/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF"}),
            0);
        EXPECT_EQ(box.Run((bin / "wyx-simulator").string(), {"--help"}), 0);
    }

    programtest::Sandbox box;
};

TEST_F(InstalledTest, AnInstallToAnyPrefixAndTheUnpackedDebianPackageRunWithoutALibraryPath)
{
    const fs::path prefix = box.folder.Path() / "prefix with space",
                   packages = box.folder.Path() / "packages", unpacked = box.folder.Path() / "unpacked";
    ASSERT_EQ(box.Run(WYX_CMAKE, {"--install", WYX_BUILD_DIR, "--prefix", prefix.string()}), 0);
    ASSERT_EQ(box.Run(WYX_CPACK, {"--config", std::string(WYX_BUILD_DIR) + "/CPackConfig.cmake", "-G", "DEB",
                                  "-B", packages.string()}),
              0);
    fs::path package;
    for (const auto& entry : fs::directory_iterator(packages))
        package = entry.path().extension() == ".deb" ? entry.path() : package;
    EXPECT_EQ(package.filename().string().rfind("wyxprogress_", 0), 0u) << "no .deb in " << packages;
    ASSERT_EQ(box.Run("/usr/bin/dpkg-deb", {"-x", package.string(), unpacked.string()}), 0);
    ExpectLayout(prefix);
    ExpectLayout(unpacked / "usr");
    EXPECT_TRUE(fs::is_regular_file(unpacked / "usr/share/doc/wyxprogress/copyright"));

    // German from the user's file, with the shipped configuration and catalogs.
    box.folder.Write("home/.config/Corvane Quillet/current.lang", "de_DE\n");
    ExpectProgramsRun(unpacked / "usr/bin");
    // German from the server's file: only if the configuration beside the
    // program (first in the lookup order) is read over the shipped one, which
    // says 3.3; and the catalogs only through the install path in the registry.
    fs::remove_all(prefix / "share/wyxprogress/LocalizedStrings");
    box.folder.Write(
        "prefix with space/bin/WyxConfig.cfg",
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<Configuration>\n  <WyxConfiguration>\n"
        "    <Entry key=\"APP_WYX_VERSION\" value=\"3.1\"/>\n  </WyxConfiguration>\n</Configuration>\n");
    box.folder.Write("root/etc/kelvo/registry.ini",
                     "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" +
                         fs::path(WYX_CATALOG_DIR).parent_path().string() + "\n");
    box.folder.Write("root/srv/kelvo/server/lcdstr/current.lang", "serverlang=de\n");
    ExpectProgramsRun(prefix / "bin");
}

} // namespace
