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

// The window that has the keyboard focus (or PointerRoot / None): without a
// window manager, the toolkit gives it to the top-level window itself.
Window Focused(Display* display)
{
    Window focus = 0;
    int revert = 0;
    XGetInputFocus(display, &focus, &revert);
    return focus;
}

TEST(InstalledTest, AnInstallToAnyPrefixAndTheUnpackedDebianPackageRunWithoutALibraryPath)
{
    programtest::Sandbox box;
    ASSERT_TRUE(box.Ready());
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
    // What running the copies does not show: the menu entry and its icons, the
    // folder icon, the inspection tool and the copyright (the libraries, the
    // configuration and the catalogs the copies need to come up in German).
    for (const fs::path& root : {prefix, unpacked / "usr"})
        for (const char* file :
             {"bin/wyx-inspect", "share/wyxprogress/wyx_folder.ico", "share/doc/wyxprogress/copyright",
              "share/applications/wyxprogress.desktop", "share/icons/hicolor/scalable/apps/wyxprogress.svg",
              "share/icons/hicolor/256x256/apps/wyxprogress.png"})
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
            // The user works elsewhere: the window no longer has the focus.
            const std::unique_ptr<Display, int (*)(Display*)> display(XOpenDisplay(nullptr), XCloseDisplay);
            XSetInputFocus(display.get(), PointerRoot, RevertToPointerRoot, CurrentTime);
            EXPECT_NE(Focused(display.get()), window);
            Program second(program, box.environment);
            EXPECT_EQ(box.x.WaitForWindow(second), 0u) << "the second copy opened a window";
            EXPECT_TRUE(WIFEXITED(second.Wait())) << second.Outcome();
            // The knock is handled on the first copy's main loop.
            WaitUntil([&] { return Focused(display.get()) == window || first.HasEnded(); });
            EXPECT_EQ(Focused(display.get()), window) << "the first copy " << first.Outcome();
            box.Close(first, window);
        }
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        fs::create_directories(box.folder.Path() / "root/dev/shm");
        const std::string job = "7\t/srv/in\t/srv/in/a.pdf\tPRN-01\t1383035055\tSaving...\t4096\tPDF";
        EXPECT_EQ(box.Run((bin / "wyx-journal").string(), {"status", "add", job}), 0);
        EXPECT_EQ(box.Run((bin / "wyx-simulator").string(), {"--help"}), 0);
    };

    // German from the user's file, with the shipped configuration and catalogs.
    box.folder.Write("home/.config/Corvane Quillet/current.lang", "de_DE\n");
    expectProgramsRun(unpacked / "usr/bin");
    // German from the server's file: only if the configuration beside the
    // program (first in the lookup order) is read over the shipped one, which
    // says 3.3; and the catalogs only through the install path in the registry.
    fs::remove_all(prefix / "share/wyxprogress/LocalizedStrings");
    box.folder.Write("prefix with space/bin/WyxConfig.cfg",
                     "<Configuration><WyxConfiguration><Entry "
                     "key=\"APP_WYX_VERSION\" value=\"3.1\"/></WyxConfiguration></Configuration>");
    box.folder.Write("root/etc/kelvo/registry.ini",
                     "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" +
                         fs::path(WYX_CATALOG_DIR).parent_path().string() + "\n");
    box.folder.Write("root/srv/kelvo/server/lcdstr/current.lang", "serverlang=de\n");
    expectProgramsRun(prefix / "bin");
}

} // namespace
