// The program as an outside tool meets it: started on its own session bus and
// display (the test runs under dbus-run-session and xvfb-run), found on the
// accessibility bus by its process id, and read by wyx-inspect, a separate
// Python process, while another process writes the journals.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <sstream>

#include "ProgramSandbox.h"

namespace
{

class BusSessionTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_TRUE(box.Ready()) << "run the test under dbus-run-session and xvfb-run -a";
    }
    // A program that ended before (as on a crash) fails here by its wait status.
    void TearDown() override
    {
        if (program && window != 0)
            box.Close(*program, window);
    }

    // The program's table `id` once it shows the `lines` written into the journal after it started,
    // as wyx-inspect prints it: the table, its headings and its rows, TAB-separated; a failure when
    // the tool did not succeed.
    std::vector<std::string> Table(const char* journal, const std::vector<std::string>& lines,
                                   const std::string& id)
    {
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsLogFile.txt", "");
        program = std::make_unique<programtest::Program>(WYX_PROGRAM, box.environment);
        window = box.WaitForWindow(*program);
        for (const std::string& line : lines)
            EXPECT_EQ(box.Run(WYX_JOURNAL, {journal, "add", line}), 0) << line;
        const std::string command = "/usr/bin/python3 '" WYX_INSPECT "' --wait 30 --pid " +
                                    std::to_string(program->Pid()) + " --only " + id + " --wait-rows " +
                                    std::to_string(lines.size());
        std::string output;
        FILE* pipe = ::popen(command.c_str(), "r");
        char buffer[4096];
        for (size_t got = 0; pipe && (got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
            output.append(buffer, got);
        if (!pipe || ::pclose(pipe) != 0)
            ADD_FAILURE() << command << " failed; it printed:\n" << output;
        std::vector<std::string> table;
        std::stringstream in(output);
        for (std::string line; std::getline(in, line);)
            // A row's cells after the first (the row's number, or the log's icon).
            table.push_back(line.rfind("row\t", 0) != 0
                                ? line
                                : line.substr(line.find('\t', line.find('\t', 4) + 1) + 1));
        return table;
    }

    programtest::Sandbox box{true};
    std::unique_ptr<programtest::Program> program;
    Window window = 0;
};

// The journals' DOS time, the same in every time zone.
const std::string kTime = "\t03/15/21, 14:05:30\t";

// The rows in any order (the table's sorting is the view tests').
TEST_F(BusSessionTest, TheStatusTableReadsAsWritten)
{
    std::vector<std::string> table =
        Table("status",
              {"41\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF",
               "42\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tSaving...\t8192\tPostScript",
               "43\t/srv/in/Proofs\t/srv/in/Proofs/c \u00e9t\u00e9.tif\tPRN-01\t1383035055\tConverting "
               "file type\t2048\tTIFF"},
              "jobStatusList");
    ASSERT_EQ(table.size(), 5u);
    std::sort(table.begin() + 2, table.end());
    EXPECT_EQ(table, (std::vector<std::string>{
                         "table\tjobStatusList\tJobs in progress\trows=3\tcolumns=8\tselected=-",
                         "heading\tNo.\tFile Name\tFormat\tHot Folder\tServer\tSize\tTime\tStatus",
                         "a\tPDF\tProofs\tPRN-01\t4.00KB" + kTime + "Queued",
                         "b\tPostScript\tBooks\tPRN-02\t8.00KB" + kTime + "Saving...",
                         "c \u00e9t\u00e9\tTIFF\tProofs\tPRN-01\t2.00KB" + kTime + "Converting file type"}));
}

TEST_F(BusSessionTest, TheLogTableReadsAsWrittenInOrder)
{
    EXPECT_EQ(
        Table(
            "log",
            {"7\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok",
             "8\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tFailed\tThe server refused the job"},
            "jobLogList"),
        (std::vector<std::string>{"table\tjobLogList\tFinished jobs\trows=2\tcolumns=6\tselected=-",
                                  "heading\t \tFile Name\tHot Folder\tServer\tStart Time\tStatus",
                                  "a\tProofs\tPRN-01" + kTime + "Transferred Successfully",
                                  "b\tBooks\tPRN-02" + kTime + "Failed"}));
}

} // namespace
