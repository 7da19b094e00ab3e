#include <gtest/gtest.h>

#include "TempFolder.h"
#include "app/InstallPath.h"

namespace
{

class InstallPath : public ::testing::Test
{
protected:
    void WriteRegistry(const std::string& body)
    {
        folder.Write("etc/kelvo/registry.ini", "[SOFTWARE\\Kelvo Systems\\Corvane Duv Ureruve]\n" + body);
    }

    TempFolder folder;
    ScopedEnv root{"WYX_SYSTEM_ROOT", folder.Path().string()};
};

TEST_F(InstallPath, IsTheRegistryValue)
{
    WriteRegistry("InstallPath=/opt/kelvo/Corvane\n");
    EXPECT_EQ(ReadInstallPath(), "/opt/kelvo/Corvane");
}

TEST_F(InstallPath, IsEmptyWithoutFileKeyOrValue)
{
    EXPECT_EQ(ReadInstallPath(), "");
    folder.Write("etc/kelvo/registry.ini",
                 "[SOFTWARE\\Kelvo Systems\\CrashReporter]\nInstallPath=/opt/crash\n");
    EXPECT_EQ(ReadInstallPath(), "");
    WriteRegistry("Version=3\n");
    EXPECT_EQ(ReadInstallPath(), "");
}

TEST_F(InstallPath, MustFitTheValueBuffer)
{
    // 517 bytes hold 257 UTF-16 units and the terminator.
    const std::string longest = "/" + std::string(256, 'a');
    WriteRegistry("InstallPath=" + longest + "\n");
    EXPECT_EQ(ReadInstallPath(), wxString(longest));
    WriteRegistry("InstallPath=" + longest + "b\n");
    EXPECT_EQ(ReadInstallPath(), "");
}

TEST_F(InstallPath, CharactersBeyondTheBasicPlaneTakeTwoUnits)
{
    // U+1F5A8 (printer) is two UTF-16 units: 255 + 2 fits, 256 + 2 does not.
    const std::string printer = "\xF0\x9F\x96\xA8";
    WriteRegistry("InstallPath=/" + std::string(254, 'a') + printer + "\n");
    EXPECT_EQ(ReadInstallPath().length(), 256u);
    WriteRegistry("InstallPath=/" + std::string(255, 'a') + printer + "\n");
    EXPECT_EQ(ReadInstallPath(), "");
}

} // namespace
