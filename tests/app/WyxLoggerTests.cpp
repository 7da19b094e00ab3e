#include <gtest/gtest.h>

#include "TempFolder.h"
#include "platform/services/WyxLogger.h"

namespace
{

struct LoggerCase
{
    const char* title;
    const char* stateHome; // nullptr: unset
    const char* home;      // nullptr: unset
    const char* name;
    const char* expected;
};

void PrintTo(const LoggerCase& c, std::ostream* out)
{
    *out << c.title;
}

class LogDirectory : public ::testing::TestWithParam<LoggerCase>
{
};

TEST_P(LogDirectory, ResolvesUnderTheStateFolder)
{
    const LoggerCase& c = GetParam();
    ScopedEnv state("XDG_STATE_HOME", "");
    ScopedEnv home("HOME", "");
    if (c.stateHome == nullptr)
        ::unsetenv("XDG_STATE_HOME");
    else
        ::setenv("XDG_STATE_HOME", c.stateHome, 1);
    if (c.home == nullptr)
        ::unsetenv("HOME");
    else
        ::setenv("HOME", c.home, 1);

    WyxLogger::SetLogDirectory("previous");
    WyxLogger::SetLogDirectory(c.name);
    EXPECT_EQ(WyxLogger::GetLogDirectory(), c.expected);
}

INSTANTIATE_TEST_SUITE_P(
    Cases, LogDirectory,
    ::testing::Values(LoggerCase{"state home", "/state", "/home/u", "WyxProgress", "/state/WyxProgress"},
                      LoggerCase{"state home with trailing slash", "/state/", "/home/u", "WyxProgress",
                                 "/state/WyxProgress"},
                      LoggerCase{"home fallback", nullptr, "/home/u", "WyxProgress",
                                 "/home/u/.local/state/WyxProgress"},
                      LoggerCase{"relative state home is ignored", "state", "/home/u", "WyxProgress",
                                 "/home/u/.local/state/WyxProgress"},
                      LoggerCase{"root as home", nullptr, "/", "WyxProgress", "/.local/state/WyxProgress"},
                      LoggerCase{"no home at all", nullptr, nullptr, "WyxProgress", ""},
                      LoggerCase{"relative home", nullptr, "home", "WyxProgress", ""},
                      LoggerCase{"empty name", "/state", "/home/u", "", ""},
                      LoggerCase{"parent folder", "/state", "/home/u", "..", ""},
                      LoggerCase{"current folder", "/state", "/home/u", ".", ""},
                      LoggerCase{"nested path", "/state", "/home/u", "a/b", ""},
                      LoggerCase{"absolute path", "/state", "/home/u", "/etc", ""}));

TEST(LogDirectorySetting, CreatesNothingAndNeverFails)
{
    TempFolder folder;
    ScopedEnv state("XDG_STATE_HOME", (folder.Path() / "read-only").string());
    WyxLogger::SetLogDirectory("WyxProgress");
    EXPECT_EQ(WyxLogger::GetLogDirectory(), wxString((folder.Path() / "read-only" / "WyxProgress").string()));
    EXPECT_FALSE(std::filesystem::exists(folder.Path() / "read-only"));
}

} // namespace
