#include <gtest/gtest.h>

#include <sys/stat.h>

#include <fstream>

#include "SystemRoot.h"
#include "platform/datasource/WyxDataSource.h"

namespace
{

// The instance reads the file below WYX_SYSTEM_ROOT at every call; each file
// text (raw bytes: a stray one costs only its own line) gives the hot folders
// and the servers, each list joined by '|'.
TEST(DataSource, ReadsEachSectionAnewAtEachCallLineByLineAndWaitsOnNoFifo)
{
    wyxtest::SystemRoot root;
    const wxString ini = GetDataDirectory() + "HotFolders.ini";
    const auto lists = [] // what the data source gives, "stale" entries left in the arrays would show
    {
        wxArrayString hotFolders(1, "stale"), servers(1, "stale");
        WyxDataSource& source = WyxDataSource::GetInstance();
        const long count = source.GetHotFoldersList(hotFolders) + source.GetServersList(servers);
        EXPECT_EQ(count, static_cast<long>(hotFolders.size() + servers.size()));
        return wxJoin(hotFolders, '|', 0) + " " + wxJoin(servers, '|', 0);
    };
    EXPECT_EQ(lists(), " ") << "no file";
    for (const auto& [text, expected] : std::vector<std::pair<const char*, const char*>>{
             {"/orphan\n[Servers]\nPRN-1\n", " PRN-1"},
             {"[HotFolders]\n/srv/a\n/srv/b c\n[Servers]\nPRN-1\nPRN 2\n", "/srv/a|/srv/b c PRN-1|PRN 2"},
             {"[hotfolders]\r\n  /srv/a  \r\n\r\n; /srv/commented\r\n# also\r\n[ SERVERS ]\r\nX\r\n",
              "/srv/a X"},
             {"[HotFolders]\n/srv/a\n[Other]\n/srv/ignored\n[HotFolders]\n/srv/b", "/srv/a|/srv/b "},
             {"[Servers]\nSt\xC3\xBCttgart-01\n[HotFolders]\n/srv/\xE6\x97\xA5\n",
              "/srv/\xE6\x97\xA5 St\xC3\xBCttgart-01"},
             {"[HotFolders]\n/srv/Z\xC3\xBCrich\n/srv/M\xFCnchen\n[Servers]\nPRN-1\n",
              "/srv/Z\xC3\xBCrich|/srv/M\xC3\xBCnchen PRN-1"}})
    {
        std::ofstream(ini.utf8_string(), std::ios::binary) << text;
        EXPECT_EQ(lists(), wxString::FromUTF8(expected)) << text;
    }
    wxRemoveFile(ini);
    ASSERT_EQ(::mkfifo(ini.utf8_str(), 0666), 0);
    EXPECT_EQ(lists(), " ");
}

} // namespace
