// What one read may hold: a journal too large for it cannot be read, and the
// reader's caller keeps what it had.
#include <functional>
#include <string>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include "JournalTestSupport.h"
#include "data/JournalText.h"

namespace journaltest
{
namespace
{

// A sparse file of the given size (its holes read as NUL bytes) with a line
// feed every `spacing` bytes, so that it costs the disk next to nothing.
void WriteSparse(const std::string& path, off_t size, off_t spacing)
{
    const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    ASSERT_GE(fd, 0) << path;
    bool written = ::ftruncate(fd, size) == 0;
    for (off_t at = spacing - 1; written && at < size; at += spacing)
        written = ::pwrite(fd, "\n", 1, at) == 1;
    ::close(fd);
    ASSERT_TRUE(written) << path;
}

constexpr off_t kJournalBytes = static_cast<off_t>(wyx::kMaxJournalBytes);
constexpr off_t kLineLength = static_cast<off_t>(wyx::kMaxJournalLineLength);
constexpr off_t kLines = static_cast<off_t>(wyx::kMaxJournalLines);

struct BoundCase
{
    const char* name;
    off_t size;
    off_t spacing; // bytes from one line feed to the next, the line feed included
    bool readable;
};

class JournalBounds : public JournalTest, public ::testing::WithParamInterface<BoundCase>
{
};

TEST_P(JournalBounds, AreKeptByEveryRead)
{
    WriteSparse(StatusJournal(), GetParam().size, GetParam().spacing);
    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    wxArrayString lines;
    lines.Add("held before");

    const int result = journal.ReadJobs(lines);
    if (GetParam().readable)
    {
        EXPECT_EQ(result, wyx::JobOk);
        EXPECT_EQ(static_cast<off_t>(lines.size()), GetParam().size / GetParam().spacing);
        return;
    }
    EXPECT_EQ(result, wyx::JobFileMissing);
    EXPECT_EQ(Utf8Lines(lines), std::vector<std::string>{"held before"});
    lines.Clear();
    EXPECT_EQ(journal.ReadJobsHoldingLock(lines), wyx::JobFileMissing);

    // An edit cannot read it either, and leaves it as it is.
    wxString line = "1\ta";
    EXPECT_EQ(journal.AddJob(line), wyx::JobFileMissing);
    EXPECT_EQ(journal.DeleteJob("1"), wyx::JobFileMissing);
    struct stat info = {};
    ASSERT_EQ(::stat(StatusJournal().c_str(), &info), 0);
    EXPECT_EQ(info.st_size, GetParam().size);
}

INSTANTIATE_TEST_SUITE_P(Journals, JournalBounds,
                         ::testing::Values(
                             // Lines of half a mebibyte, so that only the journal's size counts.
                             BoundCase{"LargestJournal", kJournalBytes, kLineLength / 2, true},
                             BoundCase{"JournalOneByteTooLarge", kJournalBytes + 1, kLineLength / 2, false},
                             BoundCase{"JournalFarTooLarge", 4 * kJournalBytes, kLineLength / 2, false},
                             BoundCase{"LongestLine", 2 * (kLineLength + 1), kLineLength + 1, true},
                             BoundCase{"LineOneByteTooLong", 2 * (kLineLength + 2), kLineLength + 2, false},
                             BoundCase{"MostLines", kLines, 1, true},
                             BoundCase{"OneLineTooMany", kLines + 1, 1, false}),
                         [](const ::testing::TestParamInfo<BoundCase>& info)
                         { return std::string(info.param.name); });

TEST_F(JournalBounds, AJournalTooLargeToReadCanStillBeCleared)
{
    WriteSparse(StatusJournal(), 2 * kJournalBytes, kLineLength / 2);
    EXPECT_EQ(Journal(StatusJournal()).ClearJobs(), wyx::JobOk);
    EXPECT_EQ(ReadBytes(StatusJournal()), "");
}

} // namespace
} // namespace journaltest
