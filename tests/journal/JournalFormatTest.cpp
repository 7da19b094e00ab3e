// The journal format as the producer command writes it and the reader sees it.
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "JournalTestSupport.h"
#include "data/JobReadWriter.h"

namespace journaltest
{
namespace
{

using Lines = std::vector<std::string>;

std::string NumberedLines(std::size_t count, const std::string& end = "\r\n")
{
    std::string text;
    for (std::size_t i = 1; i <= count; ++i)
        text += std::to_string(i) + "\tC:\\Hot\tjob" + std::to_string(i) + ".pdf\tSRV\t1234\tDone\tx\tADDED" +
                end;
    return text;
}

class JournalFormat : public JournalTest
{
};

// --- trimming of the log journal ---------------------------------------------

struct TrimCase
{
    const char* journal; // "log" or "status"
    std::size_t linesBefore;
    std::size_t linesAfter;
    std::size_t firstKeptKey; // key of the first line after the append
};

class JournalTrim : public JournalTest, public ::testing::WithParamInterface<TrimCase>
{
};

TEST_P(JournalTrim, AppendTrimsOnlyAFullLogJournal)
{
    const TrimCase& c = GetParam();
    const std::string path = std::string(c.journal) == "log" ? LogJournal() : StatusJournal();
    WriteBytes(path, NumberedLines(c.linesBefore));

    const ToolRun run = RunTool({c.journal, "add", "new\tC:\\Hot\tnew.pdf\tSRV\t1\tDone\tx"});
    ASSERT_EQ(run.status, 0);

    const Lines lines = ReadLines(path);
    ASSERT_EQ(lines.size(), c.linesAfter);
    EXPECT_EQ(lines.front().substr(0, lines.front().find('\t')), std::to_string(c.firstKeptKey));
    EXPECT_EQ(lines.back(), "new\tC:\\Hot\tnew.pdf\tSRV\t1\tDone\tx\tADDED");
    EXPECT_EQ(lines[lines.size() - 2].substr(0, lines[lines.size() - 2].find('\t')),
              std::to_string(c.linesBefore));
}

INSTANTIATE_TEST_SUITE_P(Journals, JournalTrim,
                         ::testing::Values(TrimCase{"log", 10000, 7001, 3001},
                                           TrimCase{"log", 9999, 10000, 1},
                                           TrimCase{"log", 12000, 9001, 3001},
                                           TrimCase{"status", 10000, 10001, 1},
                                           TrimCase{"status", 15000, 15001, 1}));

// --- key comparison --------------------------------------------------------------

struct KeyCase
{
    const char* storedKey;
    const char* argument;
    bool matches;
};

class JournalKeys : public JournalTest, public ::testing::WithParamInterface<KeyCase>
{
protected:
    std::string Stored() const { return std::string(GetParam().storedKey) + "\tC:\\Hot\ta.pdf\tSRV\tADDED"; }
    static constexpr const char* kOther = "other\tC:\\Hot\tb.pdf\tSRV\tADDED";
};

TEST_P(JournalKeys, DeleteMatchesExactlyButForTrailingBlanks)
{
    WriteBytes(StatusJournal(), Stored() + "\r\n" + kOther + "\r\n");
    ASSERT_EQ(RunTool({"status", "delete", GetParam().argument}).status, 0);
    EXPECT_EQ(ReadLines(StatusJournal()), (GetParam().matches ? Lines{kOther} : Lines{Stored(), kOther}));
}

TEST_P(JournalKeys, CommitMatchesLikeDelete)
{
    WriteBytes(StatusJournal(), Stored() + "\r\n" + kOther + "\r\n");
    ASSERT_EQ(RunTool({"status", "commit", GetParam().argument}).status, 0);
    const std::string committed = std::string(GetParam().storedKey) + "\tC:\\Hot\ta.pdf\tSRV\tCOMMIT";
    EXPECT_EQ(ReadLines(StatusJournal()), (Lines{GetParam().matches ? committed : Stored(), kOther}));
}

TEST_P(JournalKeys, ModifyMatchesByTheKeyOfTheNewLine)
{
    WriteBytes(StatusJournal(), Stored() + "\r\n" + kOther + "\r\n");
    const std::string line = std::string(GetParam().argument) + "\tD:\\New\tz.pdf\tSRV2";
    ASSERT_EQ(RunTool({"status", "modify", line}).status, 0);
    EXPECT_EQ(ReadLines(StatusJournal()),
              (Lines{GetParam().matches ? line + "\tMODIFIED" : Stored(), kOther}));
}

INSTANTIATE_TEST_SUITE_P(Keys, JournalKeys,
                         ::testing::Values(KeyCase{"42", "42", true}, KeyCase{"42", "42 ", true},
                                           KeyCase{"42   ", "42", true}, KeyCase{"42", "042", false},
                                           KeyCase{"042", "42", false}, KeyCase{"JobA", "joba", false},
                                           KeyCase{"42", "4", false}, KeyCase{"4", "42", false},
                                           KeyCase{" 42", "42", false}));

// --- the operations' own rules -----------------------------------------------------

TEST_F(JournalFormat, CommitLeavesALineHoldingDeleteAlone)
{
    WriteBytes(StatusJournal(), "42\tC:\\Hot\ta.pdf\tSRV\tADDED\r\n"
                                "42\tC:\\Hot\tDELETE\tSRV\tADDED\r\n"
                                "43\tC:\\Hot\tc.pdf\tSRV\tMODIFIED\r\n");
    ASSERT_EQ(RunTool({"status", "commit", "42"}).status, 0);
    EXPECT_EQ(ReadLines(StatusJournal()),
              (Lines{"42\tC:\\Hot\ta.pdf\tSRV\tCOMMIT", "42\tC:\\Hot\tDELETE\tSRV\tADDED",
                     "43\tC:\\Hot\tc.pdf\tSRV\tMODIFIED"}));
}

TEST_F(JournalFormat, ModifyReplacesTheLineWhereItStands)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n2\tb\tADDED\n3\tc\tADDED\r\n");
    ASSERT_EQ(RunTool({"status", "modify", "2\tb2\tSaving..."}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n2\tb2\tSaving...\tMODIFIED\n3\tc\tADDED\r\n");
}

TEST_F(JournalFormat, ModifyOfAnUnknownKeyAddsNothing)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    ASSERT_EQ(RunTool({"status", "modify", "9\tz"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n");
}

TEST_F(JournalFormat, DeleteAndRemoveTakeEveryLineOfTheKey)
{
    for (const char* operation : {"delete", "remove"})
    {
        WriteBytes(StatusJournal(), "7\ta\tADDED\r\n8\tb\tADDED\r\n7\tc\tCOMMIT\r\n");
        ASSERT_EQ(RunTool({"status", operation, "7"}).status, 0) << operation;
        EXPECT_EQ(ReadBytes(StatusJournal()), "8\tb\tADDED\r\n") << operation;
    }
}

TEST_F(JournalFormat, ClearKeepsAnEmptyFile)
{
    WriteBytes(LogJournal(), NumberedLines(20));
    ASSERT_EQ(RunTool({"log", "clear"}).status, 0);
    ASSERT_TRUE(Exists(LogJournal()));
    EXPECT_EQ(ReadBytes(LogJournal()), "");
    EXPECT_EQ(ReadLines(LogJournal()), Lines{});
}

TEST_F(JournalFormat, ReadPrintsTheLinesAsStoredEmptyOnesIncluded)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n\r\n2\tb\tADDED\n\n3\tc");
    const ToolRun run = RunTool({"status", "read"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "1\ta\tADDED\n\n2\tb\tADDED\n\n3\tc\n");
    EXPECT_EQ(ReadLines(StatusJournal()), (Lines{"1\ta\tADDED", "", "2\tb\tADDED", "", "3\tc"}));
}

TEST_F(JournalFormat, OutputThatCannotBeWrittenIsReported)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    for (const std::vector<std::string>& arguments :
         {std::vector<std::string>{"status", "read"}, std::vector<std::string>{"--help"}})
        EXPECT_EQ(RunTool(arguments, "exec > /dev/full;").status, 4) << arguments.front();
}

TEST_F(JournalFormat, AppendKeepsExistingLineEndsAndEndsNewLinesWithCrLf)
{
    // The last line has no line break of its own: it gets one rather than
    // running into the appended line.
    WriteBytes(StatusJournal(), "1\ta\r\n2\tb\n3\tc\r4\td");
    ASSERT_EQ(RunTool({"status", "add", "5\te"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\r\n2\tb\n3\tc\r4\td\r\n5\te\tADDED\r\n");
    EXPECT_EQ(ReadLines(StatusJournal()), (Lines{"1\ta", "2\tb", "3\tc", "4\td", "5\te\tADDED"}));
}

TEST_F(JournalFormat, RewriteKeepsAMissingFinalLineBreakMissing)
{
    WriteBytes(StatusJournal(), "1\ta\n2\tb\r\n3\tc");
    ASSERT_EQ(RunTool({"status", "delete", "2"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\n3\tc");
}

TEST_F(JournalFormat, AddOfAnEmptyLineWritesNothing)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED");
    ASSERT_EQ(RunTool({"status", "add", ""}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED");
}

TEST_F(JournalFormat, AddTagsTheCallersLine)
{
    WriteBytes(StatusJournal(), "");
    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    wxString line = "5\tC:\\Hot\ta.pdf";
    ASSERT_EQ(journal.AddJob(line), wyx::JobOk);
    EXPECT_EQ(Utf8(line), "5\tC:\\Hot\ta.pdf\tADDED");
    EXPECT_EQ(ReadBytes(StatusJournal()), "5\tC:\\Hot\ta.pdf\tADDED\r\n");
}

TEST_F(JournalFormat, AnEmptyKeyMatchesNoLine)
{
    WriteBytes(StatusJournal(), "\r\n\tx\tADDED\r\n1\ta\tADDED\r\n");
    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    EXPECT_EQ(journal.DeleteJob(""), wyx::JobOk);
    EXPECT_EQ(journal.CommitJob("  "), wyx::JobOk);
    EXPECT_EQ(ReadBytes(StatusJournal()), "\r\n\tx\tADDED\r\n1\ta\tADDED\r\n");
}

TEST_F(JournalFormat, DataDirectoryJournalsAndPathsAreBothAccepted)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    WriteBytes(Root() + "/elsewhere.txt", "2\tb\tADDED\r\n");
    EXPECT_EQ(RunTool({"status", "read"}).out, "1\ta\tADDED\n");
    EXPECT_EQ(RunTool({Root() + "/elsewhere.txt", "read"}).out, "2\tb\tADDED\n");
}

// --- results -------------------------------------------------------------------------

using Operation = int (*)(wyx::IJobReadWriter&);
const std::vector<std::pair<const char*, Operation>> kOperations = {
    {"ReadJobs",
     [](wyx::IJobReadWriter& j)
     {
         wxArrayString lines;
         return j.ReadJobs(lines);
     }},
    {"AddJob",
     [](wyx::IJobReadWriter& j)
     {
         wxString line = "1\ta";
         return j.AddJob(line);
     }},
    {"ModifyJob", [](wyx::IJobReadWriter& j) { return j.ModifyJob("1\tb"); }},
    {"DeleteJob", [](wyx::IJobReadWriter& j) { return j.DeleteJob("1"); }},
    {"RemoveJob", [](wyx::IJobReadWriter& j) { return j.RemoveJob("1"); }},
    {"ClearJobs", [](wyx::IJobReadWriter& j) { return j.ClearJobs(); }},
    {"CommitJob", [](wyx::IJobReadWriter& j) { return j.CommitJob("1"); }},
};

TEST_F(JournalFormat, NoOperationCreatesAMissingJournal)
{
    for (const auto& [name, operation] : kOperations)
    {
        wyx::JobsFileReadWriter journal = Journal(StatusJournal());
        EXPECT_EQ(operation(journal), wyx::JobFileMissing) << name;
        EXPECT_FALSE(Exists(StatusJournal())) << name;
    }
    EXPECT_EQ(RunTool({"status", "add", "1\ta"}).status, wyx::JobFileMissing);
    EXPECT_FALSE(Exists(StatusJournal()));
}

TEST_F(JournalFormat, AFolderAtTheJournalsPathCannotBeRead)
{
    ASSERT_TRUE(std::filesystem::create_directory(StatusJournal()));
    for (const auto& [name, operation] : kOperations)
    {
        wyx::JobsFileReadWriter journal = Journal(StatusJournal());
        EXPECT_EQ(operation(journal), wyx::JobFileMissing) << name;
    }
}

TEST_F(JournalFormat, AReaderWithoutPathDoesNothing)
{
    std::unique_ptr<wyx::IJobReadWriter> journal(CreateJobReadWriter(kJobsFileReadWriterKind));
    ASSERT_NE(journal, nullptr);
    EXPECT_EQ(static_cast<wyx::JobsFileReadWriter&>(*journal).GetPath(), wxString());
    for (const auto& [name, operation] : kOperations)
        EXPECT_EQ(operation(*journal), wyx::JobOk) << name;
    EXPECT_EQ(journal->Reserved1(), wyx::JobOk);
    EXPECT_EQ(journal->Reserved2(), wyx::JobOk);
    EXPECT_TRUE(FolderEntries(DataDirectory()).empty());
    EXPECT_FALSE(Exists(Root() + "/dev/shm"));
}

TEST(JournalFactory, OnlyKind4001MakesAReader)
{
    for (int kind : {0, 1, 4000, 4002, -4001})
        EXPECT_EQ(std::unique_ptr<wyx::IJobReadWriter>(CreateJobReadWriter(kind)), nullptr) << kind;
    EXPECT_NE(std::unique_ptr<wyx::IJobReadWriter>(CreateJobReadWriter(4001)), nullptr);
}

// --- the command's own checks --------------------------------------------------------

struct UsageCase
{
    std::vector<std::string> arguments;
};

class JournalUsage : public JournalTest, public ::testing::WithParamInterface<UsageCase>
{
};

TEST_P(JournalUsage, IsRefusedWithStatus2AndNothingChanges)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    const ToolRun run = RunTool(GetParam().arguments);
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n");
}

INSTANTIATE_TEST_SUITE_P(
    Arguments, JournalUsage,
    ::testing::Values(UsageCase{{}}, UsageCase{{"status"}}, UsageCase{{"journal", "read"}},
                      UsageCase{{"status", "rename", "1"}}, UsageCase{{"status", "read", "1"}},
                      UsageCase{{"status", "add"}}, UsageCase{{"status", "add", "1\ta", "extra"}},
                      UsageCase{{"status", "add", "1\ta\n2\tb"}}, UsageCase{{"status", "modify", "1\ta\rb"}},
                      UsageCase{{"status", "delete", ""}}, UsageCase{{"status", "add", "1\t\xff"}},
                      UsageCase{{"status", "clear", "now"}}));

} // namespace
} // namespace journaltest
