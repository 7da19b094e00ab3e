#include <gtest/gtest.h>

#include <sys/stat.h>

#include <cstring>

#include "SystemRoot.h"
#include "platform/datasource/WyxDataSource.h"

namespace
{

// The entries joined by '|', to compare a whole list at once.
wxString Joined(const wxArrayString& entries)
{
    return wxJoin(entries, '|', 0);
}

TEST(DataSourceFile, GivesTheEntriesOfEachSection)
{
    struct Case
    {
        const char* text;
        const char* hotFolders;
        const char* servers;
    };
    for (const Case& c : std::vector<Case>{
             {"", "", ""},
             {"/orphan\n[Servers]\nPRN-1\n", "", "PRN-1"},
             {"[HotFolders]\n/srv/a\n/srv/b c\n[Servers]\nPRN-1\nPRN 2\n", "/srv/a|/srv/b c", "PRN-1|PRN 2"},
             {"[hotfolders]\r\n  /srv/a  \r\n\r\n; /srv/commented\r\n# also\r\n[ SERVERS ]\r\nX\r\n",
              "/srv/a", "X"},
             {"[HotFolders]\n/srv/a\n[Other]\n/srv/ignored\n[HotFolders]\n/srv/b", "/srv/a|/srv/b", ""},
             {"[Servers]\nSt\xC3\xBCttgart-01\n[HotFolders]\n/srv/\xE6\x97\xA5\n", "/srv/\xE6\x97\xA5",
              "St\xC3\xBCttgart-01"},
             {"[Servers\nA\n", "", ""}})
    {
        wxArrayString hotFolders(1, "stale");
        wxArrayString servers;
        WyxDataSource::ParseConfiguration(wxString::FromUTF8(c.text), hotFolders, servers);
        EXPECT_EQ(Joined(hotFolders), wxString::FromUTF8(c.hotFolders)) << c.text;
        EXPECT_EQ(Joined(servers), wxString::FromUTF8(c.servers)) << c.text;
    }
}

// The instance reads the file below WYX_SYSTEM_ROOT at every call.
TEST(DataSourceInstance, ReadsTheFileAnewAtEachCallLineByLineAndWaitsOnNoFifo)
{
    wyxtest::SystemRoot root;
    const wxString ini = GetDataDirectory() + "HotFolders.ini";
    WyxDataSource& source = WyxDataSource::GetInstance();
    const auto list = [&source](bool servers)
    {
        wxArrayString entries(1, "stale");
        const long count = servers ? source.GetServersList(entries) : source.GetHotFoldersList(entries);
        EXPECT_EQ(count, static_cast<long>(entries.size()));
        return Joined(entries);
    };
    const auto configure = [&ini](const char* text) // raw bytes: a stray one stays as it is
    {
        wxFFile file(ini, "wb");
        ASSERT_TRUE(file.Write(text, std::strlen(text)));
    };
    EXPECT_EQ(list(true) + list(false), "");
    configure("[HotFolders]\n/srv/a\n[Servers]\nPRN-1\n");
    EXPECT_EQ(list(true), "PRN-1");
    configure("[HotFolders]\n/srv/a\n/srv/b\n[Servers]\nPRN-2\n");
    EXPECT_EQ(list(false), "/srv/a|/srv/b");
    EXPECT_EQ(list(true), "PRN-2");
    // A stray byte costs only its own line.
    configure("[HotFolders]\n/srv/Z\xC3\xBCrich\n/srv/M\xFCnchen\n[Servers]\nPRN-1\n");
    EXPECT_EQ(list(false), wxString::FromUTF8("/srv/Z\xC3\xBCrich|/srv/M\xC3\xBCnchen"));
    EXPECT_EQ(list(true), "PRN-1");
    wxRemoveFile(ini);
    ASSERT_EQ(::mkfifo(ini.utf8_str(), 0666), 0);
    EXPECT_EQ(list(true), "");
}

TEST(DataSourceInstance, RecordsEachIconChangeInMemoryAndInTheLogEvenWithoutADataFolder)
{
    wyxtest::SystemRoot root;
    WyxDataSource& source = WyxDataSource::GetInstance();
    const size_t before = source.GetIconChanges().size();
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/b b", true), 0);
    EXPECT_EQ(source.ChangeHotfolderIcon("", false), 1);
    const auto changes = source.GetIconChanges();
    ASSERT_EQ(changes.size(), before + 2);
    EXPECT_EQ(changes[before].hotFolderPath + (changes[before].errorState ? "+" : "-") +
                  changes[before + 1].hotFolderPath + (changes[before + 1].errorState ? "+" : "-"),
              "/srv/a-/srv/b b+");
    wxFFile log(WyxDataSource::IconLogPath(), "rb");
    wxString text;
    ASSERT_TRUE(log.IsOpened() && log.ReadAll(&text, wxConvUTF8));
    EXPECT_EQ(text, "/srv/a\t0\n/srv/b b\t1\n");
    wxFileName::Rmdir(GetDataDirectory(), wxPATH_RMDIR_RECURSIVE);
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(source.GetIconChanges().size(), before + 3);
}

} // namespace
