// The program as a user starts it, with the product's language files in
// place: the window's title, read from the display, is in the chosen language.
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "ProgramSession.h"
#include "TempFolder.h"

namespace
{

using programtest::Program;
using programtest::XSession;

struct StartCase
{
    const char* name;
    const char* version;
    std::optional<std::string> userFile;
    std::optional<std::string> serverFile;
    const char* expectedTitle;
};

const char* const kGermanTitle = "Kelvo Duv Ureruve - Status & Protokoll";
const char* const kEnglishTitle = "Kelvo Duv Ureruve - Status & Log";

const StartCase kCases[] = {
    {"UserFileGerman", "3.3", "de_DE\n", std::nullopt, kGermanTitle},
    {"ServerFileGerman", "3.1", std::nullopt, "serverlang=de\n", kGermanTitle},
    {"UnknownVersionStaysEnglish", "4.0", "de_DE\n", "serverlang=de\n", kEnglishTitle},
};

class LanguageProgramTest : public ::testing::TestWithParam<StartCase>
{
protected:
    void SetUp() override
    {
        ASSERT_FALSE(folder.Path().empty());
        ASSERT_TRUE(x.IsOpen()) << "no X display: run the tests under xvfb-run -a";
    }

    // The program, its libraries and its icon in a folder of its own, with a
    // configuration that names the case's version.
    std::filesystem::path ProgramCopy(const std::string& version)
    {
        const std::filesystem::path built = WYX_PROGRAM;
        const std::filesystem::path bin = folder.Path() / "bin";
        std::filesystem::create_directories(bin);
        for (const auto& entry : std::filesystem::directory_iterator(built.parent_path()))
        {
            const std::string name = entry.path().filename().string();
            if (entry.is_regular_file() &&
                (entry.path() == built || name.find(".so") != std::string::npos || name == "wyx_folder.ico"))
                std::filesystem::copy_file(entry.path(), bin / name);
        }
        folder.Write("bin/WyxConfig.cfg",
                     "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<Configuration>\n"
                     "  <WyxConfiguration>\n    <Entry key=\"APP_WYX_VERSION\" value=\"" +
                         version + "\"/>\n  </WyxConfiguration>\n</Configuration>\n");
        return bin / built.filename();
    }

    std::vector<std::string> Environment()
    {
        const std::filesystem::path home = folder.Path() / "home";
        std::filesystem::create_directories(home / "run");
        ::chmod((home / "run").c_str(), 0700);
        std::vector<std::string> environment = {
            "HOME=" + home.string(),
            "WYX_SYSTEM_ROOT=" + (folder.Path() / "root").string(),
            "XDG_CONFIG_HOME=" + (home / ".config").string(),
            "XDG_STATE_HOME=" + (home / ".local/state").string(),
            "XDG_RUNTIME_DIR=" + (home / "run").string(),
            "NO_AT_BRIDGE=1",
            "GDK_BACKEND=x11",
            "LANG=C.UTF-8",
        };
        for (const char* name : {"DISPLAY", "PATH", "XAUTHORITY"})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
        return environment;
    }

    TempFolder folder;
    XSession x;
};

TEST_P(LanguageProgramTest, TheWindowSpeaksTheChosenLanguage)
{
    const StartCase& c = GetParam();
    // The catalogs where the build put them, named as the install folder.
    const std::string installFolder = std::filesystem::path(WYX_CATALOG_DIR).parent_path().string();
    folder.Write("root/etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" + installFolder + "\n");
    if (c.userFile)
        folder.Write("home/.config/Corvane Quillet/current.lang", *c.userFile);
    if (c.serverFile)
        folder.Write("root/srv/kelvo/server/lcdstr/current.lang", *c.serverFile);

    Program program(ProgramCopy(c.version).string(), Environment());
    const Window window = x.WaitForWindow(program);
    ASSERT_NE(window, 0u) << "no window: the program " << program.Outcome();
    EXPECT_EQ(x.Title(window), c.expectedTitle);

    x.RequestClose(window);
    const int status = program.Wait();
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << program.Outcome();
}

INSTANTIATE_TEST_SUITE_P(Cases, LanguageProgramTest, ::testing::ValuesIn(kCases),
                         [](const ::testing::TestParamInfo<StartCase>& info) { return info.param.name; });

} // namespace
