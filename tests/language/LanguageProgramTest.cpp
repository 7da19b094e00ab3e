// The program as a user starts it, with the product's language files in
// place: the window's title, read from the display, is in the chosen language.
#include <gtest/gtest.h>

#include <optional>
#include <string>

#include "ProgramSandbox.h"

namespace
{

struct StartCase
{
    const char* name;
    const char* version;
    std::optional<std::string> userFile;
    std::optional<std::string> serverFile;
    const char* expectedTitle;
};

const StartCase kCases[] = {
    {"UserFileGerman", "3.3", "de_DE\n", std::nullopt, "Kelvo Duv Ureruve - Status & Protokoll"},
    {"ServerFileGerman", "3.1", std::nullopt, "serverlang=de\n", "Kelvo Duv Ureruve - Status & Protokoll"},
    {"UnknownVersionStaysEnglish", "4.0", "de_DE\n", "serverlang=de\n", "Kelvo Duv Ureruve - Status & Log"},
};

class LanguageProgramTest : public ::testing::TestWithParam<StartCase>
{
};

TEST_P(LanguageProgramTest, TheWindowSpeaksTheChosenLanguage)
{
    const StartCase& c = GetParam();
    programtest::Sandbox box;
    ASSERT_TRUE(box.Ready());
    // The program, its libraries and its icon in a folder of its own, with a
    // configuration beside it that names the case's version.
    const std::filesystem::path built = WYX_PROGRAM, bin = box.folder.Path() / "bin";
    std::filesystem::create_directories(bin);
    for (const auto& entry : std::filesystem::directory_iterator(built.parent_path()))
    {
        const std::string name = entry.path().filename().string();
        if (entry.is_regular_file() &&
            (entry.path() == built || name.find(".so") != std::string::npos || name == "wyx_folder.ico"))
            std::filesystem::copy_file(entry.path(), bin / name);
    }
    box.folder.Write("bin/WyxConfig.cfg",
                     std::string("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<Configuration>\n"
                                 "  <WyxConfiguration>\n    <Entry key=\"APP_WYX_VERSION\" value=\"") +
                         c.version + "\"/>\n  </WyxConfiguration>\n</Configuration>\n");
    // The catalogs where the build put them, named as the install folder.
    box.folder.Write("root/etc/kelvo/registry.ini",
                     "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\nInstallPath=" +
                         std::filesystem::path(WYX_CATALOG_DIR).parent_path().string() + "\n");
    if (c.userFile)
        box.folder.Write("home/.config/Corvane Quillet/current.lang", *c.userFile);
    if (c.serverFile)
        box.folder.Write("root/srv/kelvo/server/lcdstr/current.lang", *c.serverFile);

    programtest::Program program((bin / built.filename()).string(), box.environment);
    const Window window = box.WaitForWindow(program);
    ASSERT_NE(window, 0u);
    EXPECT_EQ(box.x.Title(window), c.expectedTitle);
    box.Close(program, window);
}

INSTANTIATE_TEST_SUITE_P(Cases, LanguageProgramTest, ::testing::ValuesIn(kCases),
                         [](const ::testing::TestParamInfo<StartCase>& info) { return info.param.name; });

} // namespace
