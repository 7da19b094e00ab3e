// WYX_SYSTEM_ROOT as every program reads it: a relative root means the folder
// it named when the program started, whatever the program's working folder later.
#include <gtest/gtest.h>

#include <stdlib.h>
#include <unistd.h>

#include "TempFolder.h"
#include "platform/os/SystemPaths.h"

TEST(SystemRoot, ARelativeRootIsResolvedOnceAgainstTheStartingFolder)
{
    TempFolder folder;
    char* started = ::getcwd(nullptr, 0);
    ASSERT_EQ(::chdir(folder.Path().c_str()), 0);
    struct Case
    {
        const char* given; // null: unset
        std::string root;
    };
    for (const Case& c : {Case{"demo/root", folder.Path().string() + "/demo/root"}, Case{"/srv/abs", "/srv/abs"},
                          Case{"", "/"}, Case{nullptr, "/"}})
    {
        if (c.given)
            ::setenv("WYX_SYSTEM_ROOT", c.given, 1);
        else
            ::unsetenv("WYX_SYSTEM_ROOT");
        wyxos::ResolveSystemRoot();
        ASSERT_EQ(::chdir("/"), 0); // as the program does, to its own folder
        EXPECT_EQ(wyxos::SystemRoot(), c.root) << (c.given ? c.given : "unset");
        ASSERT_EQ(::chdir(folder.Path().c_str()), 0);
    }
    ::unsetenv("WYX_SYSTEM_ROOT");
    EXPECT_EQ(::chdir(started), 0);
    ::free(started);
}
