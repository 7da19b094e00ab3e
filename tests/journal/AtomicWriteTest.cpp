// A rewrite replaces the journal whole or not at all.
#include <filesystem>
#include <string>

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "JournalTestSupport.h"

namespace journaltest
{
namespace
{

class AtomicWrite : public JournalTest
{
protected:
    struct stat Stat(const std::string& path)
    {
        struct stat info = {};
        EXPECT_EQ(::stat(path.c_str(), &info), 0) << path;
        return info;
    }
};

TEST_F(AtomicWrite, TheJournalKeepsItsPermissionsAndOwner)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0640), 0);
    const bool root = ::geteuid() == 0;
    if (root)
    {
        ASSERT_EQ(::chown(StatusJournal().c_str(), 4321, 4322), 0);
    }
    const ino_t before = Stat(StatusJournal()).st_ino;

    ASSERT_EQ(RunTool({"status", "add", "2\tb"}).status, 0);

    const struct stat after = Stat(StatusJournal());
    EXPECT_NE(after.st_ino, before); // a new file took the old one's place
    EXPECT_EQ(after.st_mode & 07777, 0640u);
    if (root)
    {
        EXPECT_EQ(after.st_uid, 4321u);
        EXPECT_EQ(after.st_gid, 4322u);
    }
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n2\tb\tADDED\r\n");
    EXPECT_EQ(FolderEntries(DataDirectory()), std::vector<std::string>{"TiveraJobsStatusFile.txt"});
}

TEST_F(AtomicWrite, ALinkedJournalStaysALink)
{
    const std::string target = Root() + "/real-status.txt";
    WriteBytes(target, "1\ta\tADDED\r\n");
    std::filesystem::create_symlink(target, StatusJournal());

    ASSERT_EQ(RunTool({"status", "commit", "1"}).status, 0);
    EXPECT_TRUE(std::filesystem::is_symlink(StatusJournal()));
    EXPECT_EQ(ReadBytes(target), "1\ta\tCOMMIT\r\n");
}

TEST_F(AtomicWrite, AFileTooLargeForTheProcessLeavesTheJournalIntact)
{
    // The file size limit (set in the shell that starts the tool) makes the
    // new file's write fail as a full disk would, even for root; the signal
    // that comes with it must not end the tool beside its temporary file.
    std::string original;
    for (int i = 0; i < 40; ++i)
        original += std::to_string(i) + "\tC:\\Hot\\some-long-file-name.pdf\tSERVER\tADDED\r\n";
    ASSERT_GT(original.size(), 1024u);
    WriteBytes(LogJournal(), original);

    const ToolRun run = RunTool({"log", "add", "new\tC:\\Hot\\n.pdf\tSERVER"}, "ulimit -f 1;");
    EXPECT_EQ(run.status, wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(LogJournal()), original);
    EXPECT_EQ(FolderEntries(DataDirectory()), std::vector<std::string>{"TiveraJobsLogFile.txt"});
}

TEST_F(AtomicWrite, ATemporaryFileThatCannotBeMadeLeavesTheJournalIntact)
{
    // A journal name at the file system's limit leaves no room for the name
    // of the temporary file beside it.
    const std::string name = std::string(250, 'j') + ".txt";
    const std::string path = DataDirectory() + name;
    WriteBytes(path, "1\ta\tADDED\r\n");
    ASSERT_EQ(ReadBytes(path), "1\ta\tADDED\r\n");

    wyx::JobsFileReadWriter journal = Journal(path);
    wxString line = "2\tb";
    EXPECT_EQ(journal.AddJob(line), wyx::JobWriteFailed);
    EXPECT_EQ(journal.DeleteJob("1"), wyx::JobWriteFailed);
    EXPECT_EQ(journal.ClearJobs(), wyx::JobWriteFailed);
    EXPECT_EQ(ReadBytes(path), "1\ta\tADDED\r\n");
    EXPECT_EQ(FolderEntries(DataDirectory()), std::vector<std::string>{name});
    wxArrayString lines;
    EXPECT_EQ(journal.ReadJobs(lines), wyx::JobOk);
}

} // namespace
} // namespace journaltest
