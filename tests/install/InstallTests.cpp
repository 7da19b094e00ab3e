// The program where an install puts it: cmake --install into a temporary
// prefix, and the Debian package unpacked into a temporary folder. Each copy
// must start from there with its own libraries, files and catalogs. Also the
// second launch, as from the menu while the window is open behind others.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ProgramSandbox.h"

namespace
{

using programtest::Program;

const std::string kProgramName = std::filesystem::path(WYX_PROGRAM).filename().string();

class InstalledTest : public ::testing::Test
{
protected:
    void SetUp() override { ASSERT_TRUE(box.Ready()); }

    // Starts the program, which the case set up to come in German (the title
    // shows a catalog was found); wyx-journal writes and reads a journal below
    // the system root and the simulator answers --help. A tool exits 127 when a
    // library is missing.
    void ExpectProgramsRun(const std::filesystem::path& bin)
    {
        Program copy((bin / kProgramName).string(), box.environment);
        if (const Window window = box.WaitForWindow(copy))
        {
            EXPECT_EQ(box.x.Title(window), "Kelvo Duv Ureruve - Status & Protokoll");
            box.Close(copy, window);
        }
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        std::filesystem::create_directories(box.folder.Path() / "root/dev/shm");
        const std::string journal = (bin / "wyx-journal").string();
        EXPECT_EQ(box.Run(journal, {"status", "add",
                                    "7\t/srv/in\t/srv/in/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF"}),
                  0);
        EXPECT_EQ(box.Run(journal, {"status", "read"}), 0);
        EXPECT_EQ(box.Run((bin / "wyx-simulator").string(), {"--help"}), 0);
    }

    programtest::Sandbox box;
};

TEST_F(InstalledTest, AnInstallToAnyPrefixRunsWithoutALibraryPath)
{
    const std::filesystem::path prefix = box.folder.Path() / "prefix with space";
    ASSERT_EQ(box.Run(WYX_CMAKE, {"--install", WYX_BUILD_DIR, "--prefix", prefix.string()}), 0);
    std::vector<std::string> files = {"bin/wyx-journal",
                                      "bin/wyx-simulator",
                                      "bin/wyx-inspect",
                                      "share/wyxprogress/WyxConfig.cfg",
                                      "share/wyxprogress/wyx_folder.ico",
                                      "share/wyxprogress/LocalizedStrings/de_DE/wyx3.mo",
                                      "share/applications/wyxprogress.desktop",
                                      "share/icons/hicolor/scalable/apps/wyxprogress.svg"};
    for (const char* size : {"16", "32", "48", "64", "128", "256"})
        files.push_back(std::string("share/icons/hicolor/") + size + "x" + size + "/apps/wyxprogress.png");
    for (const std::string& file : files)
        EXPECT_TRUE(std::filesystem::is_regular_file(prefix / file)) << file;
    // Every library the build made is installed beside the others.
    for (const auto& entry :
         std::filesystem::directory_iterator(std::filesystem::path(WYX_PROGRAM).parent_path()))
    {
        const std::string name = entry.path().filename().string();
        EXPECT_TRUE(entry.path().extension() != ".so" || name.rfind("lib", 0) != 0 ||
                    std::filesystem::exists(prefix / "lib/wyxprogress" / name))
            << name;
    }
    // German from the server's file: only if the configuration beside the
    // program (first in the lookup order) is read over the shipped one, which
    // says 3.3; and the catalogs only through the install path in the registry.
    std::filesystem::remove_all(prefix / "share/wyxprogress/LocalizedStrings");
    box.folder.Write(
        "prefix with space/bin/WyxConfig.cfg",
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<Configuration>\n  <WyxConfiguration>\n"
        "    <Entry key=\"APP_WYX_VERSION\" value=\"3.1\"/>\n  </WyxConfiguration>\n</Configuration>\n");
    box.folder.Write("root/etc/kelvo/registry.ini",
                     "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" +
                         std::filesystem::path(WYX_CATALOG_DIR).parent_path().string() + "\n");
    box.folder.Write("root/srv/kelvo/server/lcdstr/current.lang", "serverlang=de\n");
    ExpectProgramsRun(prefix / "bin");
}

TEST_F(InstalledTest, TheDebianPackageRunsWhereItIsUnpacked)
{
    const std::string dpkgDeb = "/usr/bin/dpkg-deb";
    if (!std::filesystem::exists(dpkgDeb))
        GTEST_SKIP() << "dpkg-deb is not installed: the Debian package cannot be unpacked here";
    const std::filesystem::path packages = box.folder.Path() / "packages";
    ASSERT_EQ(box.Run(WYX_CPACK, {"--config", std::string(WYX_BUILD_DIR) + "/CPackConfig.cmake", "-G", "DEB",
                                  "-B", packages.string()}),
              0);
    std::filesystem::path package;
    for (const auto& entry : std::filesystem::directory_iterator(packages))
        if (entry.path().extension() == ".deb")
            package = entry.path();
    ASSERT_FALSE(package.empty()) << "cpack made no .deb in " << packages;
    EXPECT_EQ(package.filename().string().rfind("wyxprogress_", 0), 0u) << package;

    const std::filesystem::path unpacked = box.folder.Path() / "unpacked";
    ASSERT_EQ(box.Run(dpkgDeb, {"-x", package.string(), unpacked.string()}), 0);
    for (const char* file :
         {"usr/share/applications/wyxprogress.desktop",
          "usr/share/icons/hicolor/256x256/apps/wyxprogress.png", "usr/share/wyxprogress/WyxConfig.cfg",
          "usr/lib/wyxprogress/libwyx_os.so", "usr/share/doc/wyxprogress/copyright"})
        EXPECT_TRUE(std::filesystem::is_regular_file(unpacked / file)) << file;
    // German from the user's file, with the shipped configuration and catalogs.
    box.folder.Write("home/.config/Corvane Quillet/current.lang", "de_DE\n");
    ExpectProgramsRun(unpacked / "usr/bin");
}

// The window that has the keyboard focus, as the top-level child of the root
// window it belongs to (or PointerRoot / None).
Window FocusedTopLevel(Display* display)
{
    Window focus = 0, root = DefaultRootWindow(display), rootOfTree = 0, parent = 0;
    int revert = 0;
    XGetInputFocus(display, &focus, &revert);
    for (; focus != 0 && focus != PointerRoot && focus != root; focus = parent)
    {
        Window* children = nullptr;
        unsigned int count = 0;
        if (!XQueryTree(display, focus, &rootOfTree, &parent, &children, &count))
            return 0;
        if (children != nullptr)
            XFree(children);
        if (parent == root)
            return focus;
    }
    return focus;
}

// The first copy's window comes to the front and takes the keyboard focus;
// the second copy ends without a window of its own.
TEST_F(InstalledTest, ASecondLaunchBringsTheFirstWindowToTheFrontAndEnds)
{
    Display* display = XOpenDisplay(nullptr);
    ASSERT_NE(display, nullptr);
    Program first(WYX_PROGRAM, box.environment);
    const Window window = box.WaitForWindow(first);
    ASSERT_NE(window, 0u);
    // The user works elsewhere: the window no longer has the focus.
    XSetInputFocus(display, PointerRoot, RevertToPointerRoot, CurrentTime);
    XSync(display, False);
    ASSERT_NE(FocusedTopLevel(display), window);

    Program second(WYX_PROGRAM, box.environment);
    EXPECT_EQ(box.x.WaitForWindow(second), 0u) << "the second copy opened a window";
    EXPECT_TRUE(WIFEXITED(second.Wait())) << second.Outcome();

    // The knock is handled on the first copy's main loop: wait until its
    // window has the focus (or the first copy ended, which fails below).
    XSelectInput(display, window, FocusChangeMask);
    while (FocusedTopLevel(display) != window && !first.HasEnded())
    {
        pollfd connection{ConnectionNumber(display), POLLIN, 0};
        ::poll(&connection, 1, 100); // only lets the loop notice a program that ended
        for (XEvent event; XPending(display) > 0;)
            XNextEvent(display, &event);
    }
    EXPECT_EQ(FocusedTopLevel(display), window) << "the first copy " << first.Outcome();
    XCloseDisplay(display);
    box.Close(first, window);
}

} // namespace
