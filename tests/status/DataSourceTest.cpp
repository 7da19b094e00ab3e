#include <gtest/gtest.h>

#include <sys/stat.h>

#include <cstring>

#include "SystemRoot.h"
#include "platform/datasource/WyxDataSource.h"

namespace
{

using Texts = std::vector<wxString>;

Texts Utf8(const std::vector<const char*>& texts)
{
    Texts out;
    for (const char* text : texts)
        out.push_back(wxString::FromUTF8(text));
    return out;
}

TEST(DataSourceFile, GivesTheEntriesOfEachSection)
{
    struct Case
    {
        const char* text;
        std::vector<const char*> hotFolders;
        std::vector<const char*> servers;
    };
    for (const Case& c : std::vector<Case>{
             {"", {}, {}},
             {"/orphan\n[Servers]\nPRN-1\n", {}, {"PRN-1"}},
             {"[HotFolders]\n/srv/a\n/srv/b c\n[Servers]\nPRN-1\nPRN 2\n",
              {"/srv/a", "/srv/b c"},
              {"PRN-1", "PRN 2"}},
             {"[hotfolders]\r\n  /srv/a  \r\n\r\n; /srv/commented\r\n# also\r\n[ SERVERS ]\r\nX\r\n",
              {"/srv/a"},
              {"X"}},
             {"[HotFolders]\n/srv/a\n[Other]\n/srv/ignored\n[HotFolders]\n/srv/b", {"/srv/a", "/srv/b"}, {}},
             {"[Servers]\nSt\xC3\xBCttgart-01\n[HotFolders]\n/srv/\xE6\x97\xA5\n",
              {"/srv/\xE6\x97\xA5"},
              {"St\xC3\xBCttgart-01"}},
             {"[Servers\nA\n", {}, {}}})
    {
        wxArrayString hotFolders;
        wxArrayString servers;
        hotFolders.Add("stale");
        WyxDataSource::ParseConfiguration(wxString::FromUTF8(c.text), hotFolders, servers);
        EXPECT_EQ(Texts(hotFolders.begin(), hotFolders.end()), Utf8(c.hotFolders)) << c.text;
        EXPECT_EQ(Texts(servers.begin(), servers.end()), Utf8(c.servers)) << c.text;
    }
}

// The instance reads the file below WYX_SYSTEM_ROOT at every call.
class DataSourceInstance : public testing::Test
{
protected:
    Texts Servers()
    {
        wxArrayString servers = Strings("stale");
        const long count = m_source.GetServersList(servers);
        EXPECT_EQ(count, static_cast<long>(servers.size()));
        return Texts(servers.begin(), servers.end());
    }
    Texts HotFolders()
    {
        wxArrayString hotFolders = Strings("stale");
        const long count = m_source.GetHotFoldersList(hotFolders);
        EXPECT_EQ(count, static_cast<long>(hotFolders.size()));
        return Texts(hotFolders.begin(), hotFolders.end());
    }
    static wxArrayString Strings(const char* text) { return wxArrayString(1, &text); }
    void Configure(const char* text) // raw bytes: a stray one stays as it is
    {
        wxFFile file(m_ini, "wb");
        ASSERT_TRUE(file.Write(text, std::strlen(text)));
    }

    wyxtest::SystemRoot m_root;
    const wxString m_ini = GetDataDirectory() + "HotFolders.ini";
    WyxDataSource& m_source = WyxDataSource::GetInstance();
};

TEST_F(DataSourceInstance, ReadsTheFileAnewAtEachCallLineByLineAndWaitsOnNoFifo)
{
    EXPECT_EQ(Servers(), Texts{});
    EXPECT_EQ(HotFolders(), Texts{});
    Configure("[HotFolders]\n/srv/a\n[Servers]\nPRN-1\n");
    EXPECT_EQ(Servers(), Texts{"PRN-1"});
    Configure("[HotFolders]\n/srv/a\n/srv/b\n[Servers]\nPRN-2\n");
    EXPECT_EQ(HotFolders(), (Texts{"/srv/a", "/srv/b"}));
    EXPECT_EQ(Servers(), Texts{"PRN-2"});

    // A stray byte costs only its own line.
    Configure("[HotFolders]\n/srv/Z\xC3\xBCrich\n/srv/M\xFCnchen\n[Servers]\nPRN-1\n");
    EXPECT_EQ(HotFolders(), Utf8({"/srv/Z\xC3\xBCrich", "/srv/M\xC3\xBCnchen"}));
    EXPECT_EQ(Servers(), Texts{"PRN-1"});

    wxRemoveFile(m_ini);
    ASSERT_EQ(::mkfifo(m_ini.utf8_str(), 0666), 0);
    EXPECT_EQ(Servers(), Texts{});
}

TEST_F(DataSourceInstance, RecordsEachIconChangeInMemoryAndInTheLogEvenWithoutADataFolder)
{
    const size_t before = m_source.GetIconChanges().size();
    EXPECT_EQ(m_source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(m_source.ChangeHotfolderIcon("/srv/b b", true), 0);
    EXPECT_EQ(m_source.ChangeHotfolderIcon("", false), 1);
    const auto changes = m_source.GetIconChanges();
    ASSERT_EQ(changes.size(), before + 2);
    EXPECT_EQ(changes[before].hotFolderPath, "/srv/a");
    EXPECT_FALSE(changes[before].errorState);
    EXPECT_EQ(changes[before + 1].hotFolderPath, "/srv/b b");
    EXPECT_TRUE(changes[before + 1].errorState);
    wxFFile log(WyxDataSource::IconLogPath(), "rb");
    wxString text;
    ASSERT_TRUE(log.IsOpened() && log.ReadAll(&text, wxConvUTF8));
    EXPECT_EQ(text, "/srv/a\t0\n/srv/b b\t1\n");

    wxFileName::Rmdir(GetDataDirectory(), wxPATH_RMDIR_RECURSIVE);
    EXPECT_EQ(m_source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(m_source.GetIconChanges().size(), before + 3);
}

} // namespace
