#include <gtest/gtest.h>

#include <sys/stat.h>

#include <cstdlib>
#include <cstring>

#include <wx/dir.h>
#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>

#include "platform/datasource/WyxDataSource.h"

namespace
{

struct ParseCase
{
    const char* text;
    std::vector<const char*> hotFolders;
    std::vector<const char*> servers;
};

class DataSourceFile : public testing::TestWithParam<ParseCase>
{
};

std::vector<wxString> AsVector(const wxArrayString& array)
{
    return std::vector<wxString>(array.begin(), array.end());
}

std::vector<wxString> AsVector(const std::vector<const char*>& texts)
{
    std::vector<wxString> out;
    for (const char* text : texts)
        out.push_back(wxString::FromUTF8(text));
    return out;
}

TEST_P(DataSourceFile, GivesTheEntriesOfEachSection)
{
    const ParseCase& c = GetParam();
    wxArrayString hotFolders;
    wxArrayString servers;
    hotFolders.Add("stale");
    WyxDataSource::ParseConfiguration(wxString::FromUTF8(c.text), hotFolders, servers);
    EXPECT_EQ(AsVector(hotFolders), AsVector(c.hotFolders)) << c.text;
    EXPECT_EQ(AsVector(servers), AsVector(c.servers)) << c.text;
}

INSTANTIATE_TEST_SUITE_P(
    Texts, DataSourceFile,
    testing::Values(
        ParseCase{"", {}, {}}, ParseCase{"/orphan\n[Servers]\nPRN-1\n", {}, {"PRN-1"}},
        ParseCase{"[HotFolders]\n/srv/a\n/srv/b c\n[Servers]\nPRN-1\nPRN 2\n",
                  {"/srv/a", "/srv/b c"},
                  {"PRN-1", "PRN 2"}},
        ParseCase{"[hotfolders]\r\n  /srv/a  \r\n\r\n; /srv/commented\r\n# also\r\n[ SERVERS ]\r\nX\r\n",
                  {"/srv/a"},
                  {"X"}},
        ParseCase{
            "[HotFolders]\n/srv/a\n[Other]\n/srv/ignored\n[HotFolders]\n/srv/b", {"/srv/a", "/srv/b"}, {}},
        ParseCase{"[Servers]\nSt\xC3\xBCttgart-01\n[HotFolders]\n/srv/\xE6\x97\xA5\xE6\x9C\xAC\n",
                  {"/srv/\xE6\x97\xA5\xE6\x9C\xAC"},
                  {"St\xC3\xBCttgart-01"}},
        ParseCase{"[Servers\nA\n", {}, {}}));

// The instance reads the file below WYX_SYSTEM_ROOT at every call.
class DataSourceInstance : public testing::Test
{
protected:
    void SetUp() override
    {
        char pattern[] = "/tmp/wyx-datasource-XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        m_root = pattern;
        setenv("WYX_SYSTEM_ROOT", pattern, 1);
        m_dataDir = m_root + "/var/lib/Corvane/HotFolders/";
        ASSERT_TRUE(wxFileName::Mkdir(m_dataDir, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL));
    }
    void TearDown() override
    {
        unsetenv("WYX_SYSTEM_ROOT");
        wxFileName::Rmdir(m_root, wxPATH_RMDIR_RECURSIVE);
    }
    void WriteConfiguration(const char* text)
    {
        wxFFile file(m_dataDir + "HotFolders.ini", "wb");
        ASSERT_TRUE(file.IsOpened());
        ASSERT_TRUE(file.Write(text, std::strlen(text)));
    }

    wxString m_root;
    wxString m_dataDir;
};

TEST_F(DataSourceInstance, AnAbsentFileGivesEmptyLists)
{
    wxArrayString servers;
    wxArrayString hotFolders;
    servers.Add("stale");
    EXPECT_EQ(WyxDataSource::GetInstance().GetServersList(servers), 0);
    EXPECT_EQ(WyxDataSource::GetInstance().GetHotFoldersList(hotFolders), 0);
    EXPECT_TRUE(servers.empty());
    EXPECT_TRUE(hotFolders.empty());
}

TEST_F(DataSourceInstance, ReadsTheFileAnewAtEachCall)
{
    WriteConfiguration("[HotFolders]\n/srv/a\n[Servers]\nPRN-1\n");
    wxArrayString servers;
    EXPECT_EQ(WyxDataSource::GetInstance().GetServersList(servers), 1);
    EXPECT_EQ(AsVector(servers), AsVector({"PRN-1"}));

    WriteConfiguration("[HotFolders]\n/srv/a\n/srv/b\n[Servers]\nPRN-2\n");
    wxArrayString hotFolders;
    EXPECT_EQ(WyxDataSource::GetInstance().GetHotFoldersList(hotFolders), 2);
    EXPECT_EQ(AsVector(hotFolders), AsVector({"/srv/a", "/srv/b"}));
    EXPECT_EQ(WyxDataSource::GetInstance().GetServersList(servers), 1);
    EXPECT_EQ(AsVector(servers), AsVector({"PRN-2"}));
}

TEST_F(DataSourceInstance, AStrayByteCostsOnlyItsOwnLineAndAFifoIsNotWaitedOn)
{
    WriteConfiguration("[HotFolders]\n/srv/Z\xC3\xBCrich\n/srv/M\xFCnchen\n[Servers]\nPRN-1\n");
    wxArrayString hotFolders, servers;
    EXPECT_EQ(WyxDataSource::GetInstance().GetHotFoldersList(hotFolders), 2);
    EXPECT_EQ(AsVector(hotFolders), (std::vector<wxString>{wxString::FromUTF8("/srv/Z\xC3\xBCrich"),
                                                           wxString::FromUTF8("/srv/M\xC3\xBCnchen")}));
    EXPECT_EQ(WyxDataSource::GetInstance().GetServersList(servers), 1);

    wxRemoveFile(m_dataDir + "HotFolders.ini");
    ASSERT_EQ(::mkfifo((m_dataDir + "HotFolders.ini").utf8_str(), 0666), 0);
    EXPECT_EQ(WyxDataSource::GetInstance().GetServersList(servers), 0);
}

TEST_F(DataSourceInstance, RecordsEachIconChangeInMemoryAndInTheLog)
{
    WyxDataSource& source = WyxDataSource::GetInstance();
    const size_t before = source.GetIconChanges().size();
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/b b", true), 0);
    EXPECT_EQ(source.ChangeHotfolderIcon("", false), 1);

    const auto changes = source.GetIconChanges();
    ASSERT_EQ(changes.size(), before + 2);
    EXPECT_EQ(changes[before].hotFolderPath, "/srv/a");
    EXPECT_FALSE(changes[before].errorState);
    EXPECT_EQ(changes[before + 1].hotFolderPath, "/srv/b b");
    EXPECT_TRUE(changes[before + 1].errorState);

    wxFFile log(WyxDataSource::IconLogPath(), "rb");
    wxString text;
    ASSERT_TRUE(log.IsOpened());
    ASSERT_TRUE(log.ReadAll(&text, wxConvUTF8));
    EXPECT_EQ(text, "/srv/a\t0\n/srv/b b\t1\n");
}

TEST_F(DataSourceInstance, AMissingDataFolderStillRecordsTheCall)
{
    wxFileName::Rmdir(m_dataDir, wxPATH_RMDIR_RECURSIVE);
    WyxDataSource& source = WyxDataSource::GetInstance();
    const size_t before = source.GetIconChanges().size();
    EXPECT_EQ(source.ChangeHotfolderIcon("/srv/a", false), 0);
    EXPECT_EQ(source.GetIconChanges().size(), before + 1);
}

} // namespace
