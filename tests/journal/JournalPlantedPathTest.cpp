// What other users of a shared data folder may put where a journal belongs,
// and what a writer may not do to a journal.
#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "JournalTestSupport.h"

namespace journaltest
{
namespace
{

namespace fs = std::filesystem;
using Arguments = std::vector<std::string>;

constexpr uid_t kOtherUser = 4321;
constexpr uid_t kUnprivilegedUser = 65534;

const std::vector<Arguments> kWritingOperations = {
    {"add", "2\tb"}, {"modify", "1\tz"}, {"delete", "1"}, {"remove", "1"}, {"commit", "1"}, {"clear"},
};

Arguments On(const std::string& journal, const Arguments& operation)
{
    Arguments arguments{journal};
    arguments.insert(arguments.end(), operation.begin(), operation.end());
    return arguments;
}

// Entries of the folder whose names start with the prefix.
std::vector<std::string> EntriesStartingWith(const std::string& folder, const std::string& prefix)
{
    std::vector<std::string> found;
    for (const std::string& name : FolderEntries(folder))
        if (name.compare(0, prefix.size(), prefix) == 0)
            found.push_back(name);
    return found;
}

// --- symbolic links ------------------------------------------------------------------

struct LinkCase
{
    const char* name;
    // Owners of the links from the journal's path on; the last points at the file.
    std::vector<bool> ownedByOther;
};

class JournalLink : public JournalTest, public ::testing::WithParamInterface<LinkCase>
{
protected:
    void SetUp() override
    {
        JournalTest::SetUp();
        if (::geteuid() != 0)
            GTEST_SKIP() << "only root can give a link to another user";
    }

    std::string Target() const { return Root() + "/own-file.txt"; }

    // The chain of links from the journal's path to Target().
    void Plant()
    {
        WriteBytes(Target(), "1\ta\tADDED\r\n");
        const std::vector<bool>& owners = GetParam().ownedByOther;
        for (std::size_t i = 0; i < owners.size(); ++i)
        {
            const std::string link = i == 0 ? StatusJournal() : Root() + "/link" + std::to_string(i);
            const std::string to =
                i + 1 == owners.size() ? Target() : Root() + "/link" + std::to_string(i + 1);
            fs::create_symlink(to, link);
            if (owners[i])
            {
                ASSERT_EQ(::lchown(link.c_str(), kOtherUser, kOtherUser), 0) << link;
            }
        }
    }

    bool Followed() const
    {
        for (bool other : GetParam().ownedByOther)
            if (other)
                return false;
        return true;
    }
};

TEST_P(JournalLink, IsWrittenThroughOnlyWhenEveryLinkIsTheWritersOwn)
{
    for (const Arguments& operation : kWritingOperations)
    {
        Plant();
        const ToolRun run = RunTool(On("status", operation));
        if (Followed())
        {
            EXPECT_EQ(run.status, 0) << operation[0];
            EXPECT_NE(ReadBytes(Target()), "1\ta\tADDED\r\n") << operation[0];
        }
        else
        {
            EXPECT_EQ(run.status, wyx::JobWriteFailed) << operation[0];
            EXPECT_EQ(ReadBytes(Target()), "1\ta\tADDED\r\n") << operation[0];
        }
        EXPECT_TRUE(fs::is_symlink(StatusJournal())) << operation[0];
        EXPECT_EQ(EntriesStartingWith(Root(), ".own-file"), std::vector<std::string>{}) << operation[0];
        fs::remove(StatusJournal());
        for (std::size_t i = 1; i < GetParam().ownedByOther.size(); ++i)
            fs::remove(Root() + "/link" + std::to_string(i));
    }
}

INSTANTIATE_TEST_SUITE_P(Chains, JournalLink,
                         ::testing::Values(LinkCase{"Own", {false}}, LinkCase{"Others", {true}},
                                           LinkCase{"OwnThenOthers", {false, true}},
                                           LinkCase{"OthersThenOwn", {true, false}},
                                           LinkCase{"OwnThenOwn", {false, false}}),
                         [](const ::testing::TestParamInfo<LinkCase>& info)
                         { return std::string(info.param.name); });

// --- things that are no file ------------------------------------------------------------

struct PlantCase
{
    const char* name;
    void (*plant)(const std::string& journal);
};

class JournalPlant : public JournalTest, public ::testing::WithParamInterface<PlantCase>
{
};

TEST_P(JournalPlant, CannotBeReadNorWrittenAndNothingWaits)
{
    GetParam().plant(StatusJournal());
    std::vector<Arguments> operations = kWritingOperations;
    operations.push_back({"read"});
    for (const Arguments& operation : operations)
    {
        const ToolRun run = RunTool(On("status", operation));
        EXPECT_EQ(run.status, wyx::JobFileMissing) << operation[0];
        EXPECT_EQ(run.out, "") << operation[0];
    }
    EXPECT_EQ(FolderEntries(DataDirectory()), std::vector<std::string>{"TiveraJobsStatusFile.txt"});
}

INSTANTIATE_TEST_SUITE_P(Kinds, JournalPlant,
                         ::testing::Values(PlantCase{"Fifo", [](const std::string& journal)
                                                     { ASSERT_EQ(::mkfifo(journal.c_str(), 0666), 0); }},
                                           PlantCase{"Folder", [](const std::string& journal)
                                                     { fs::create_directory(journal); }},
                                           PlantCase{"LinkToADevice", [](const std::string& journal)
                                                     { fs::create_symlink("/dev/zero", journal); }},
                                           PlantCase{"DanglingLink", [](const std::string& journal)
                                                     { fs::create_symlink(journal + ".gone", journal); }}),
                         [](const ::testing::TestParamInfo<PlantCase>& info)
                         { return std::string(info.param.name); });

// --- a journal the writer may not write -----------------------------------------------------

class JournalPermission : public JournalTest
{
protected:
    // The data folder writable by everyone, as a 1777 folder is.
    void OpenFolders()
    {
        fs::permissions(Root(), fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec |
                                    fs::perms::others_read | fs::perms::others_exec);
        fs::permissions(DataDirectory(), fs::perms::all | fs::perms::sticky_bit);
        fs::create_directories(Root() + "/dev/shm");
        fs::permissions(Root() + "/dev/shm", fs::perms::all | fs::perms::sticky_bit);
    }
};

TEST_F(JournalPermission, AReadOnlyJournalIsNotReplacedBehindItsOwnersBack)
{
    const std::string original = "1\ta\tADDED\r\n";
    OpenFolders();
    for (const Arguments& operation : kWritingOperations)
    {
        WriteBytes(StatusJournal(), original);
        ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
        ToolRun run;
        if (::geteuid() == 0)
        {
            ASSERT_EQ(::chown(StatusJournal().c_str(), kUnprivilegedUser, kUnprivilegedUser), 0);
            run = RunToolAs(kUnprivilegedUser, On(StatusJournal(), operation));
        }
        else
        {
            run = RunTool(On(StatusJournal(), operation));
        }
        EXPECT_EQ(run.status, wyx::JobWriteFailed) << operation[0];
        EXPECT_EQ(ReadBytes(StatusJournal()), original) << operation[0];
        EXPECT_EQ(FolderEntries(DataDirectory()), std::vector<std::string>{"TiveraJobsStatusFile.txt"});
        ::unlink(StatusJournal().c_str());
    }
}

TEST_F(JournalPermission, RootWritesAReadOnlyJournalAsItWouldInPlace)
{
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root";
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    ASSERT_EQ(::chmod(StatusJournal().c_str(), 0444), 0);
    ASSERT_EQ(RunTool({"status", "commit", "1"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tCOMMIT\r\n");
}

} // namespace
} // namespace journaltest
