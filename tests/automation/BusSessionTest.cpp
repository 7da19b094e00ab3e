// The program as an outside tool meets it: started on its own session bus and
// display (the test runs under dbus-run-session and xvfb-run), found on the
// accessibility bus by its process id, and read by wyx-inspect, a separate
// Python process, while another process writes the journals.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "ProgramSandbox.h"

namespace
{

using Row = std::vector<std::string>;
using Lines = std::map<std::string, std::vector<Row>>;

// A shell command's standard output, as wyx-inspect prints a table: TAB-separated
// fields by the kind each line starts with (table, heading, row, place); a failure
// when the command did not succeed.
Lines Command(const std::string& command)
{
    std::string output;
    FILE* pipe = ::popen(command.c_str(), "r");
    char buffer[4096];
    for (size_t got = 0; pipe && (got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
        output.append(buffer, got);
    if (!pipe || ::pclose(pipe) != 0)
        ADD_FAILURE() << command << " failed; it printed:\n" << output;
    Lines lines;
    std::stringstream in(output);
    for (std::string line; std::getline(in, line);)
    {
        std::stringstream fieldsIn(line + '\t');
        Row& fields = lines[line.substr(0, line.find('\t'))].emplace_back();
        for (std::string field; std::getline(fieldsIn, field, '\t');)
            fields.push_back(field);
    }
    return lines;
}

// The program started (on a bus of its own: the test runs under dbus-run-session) on a journal
// holding `lines`, and its table `id` as the tool reads it once it holds them all: the columns
// `shown` of each row, in the table's order unless `anyOrder`. The row `click`, if any, is then
// clicked in its middle; the table read until that row is its selection (a bounded number of
// times) is the result.
class BusSessionTest : public ::testing::Test
{
protected:
    Lines Check(const char* journal, const std::vector<std::string>& lines, const std::string& id,
                const std::vector<size_t>& shown, const std::vector<Row>& expected, size_t click,
                bool anyOrder)
    {
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsLogFile.txt", "");
        for (const std::string& line : lines)
            EXPECT_EQ(box.Run(WYX_JOURNAL, {journal, "add", line}), 0) << line;
        program = std::make_unique<programtest::Program>(WYX_PROGRAM, box.environment);
        window = box.WaitForWindow(*program);
        const auto inspect = [&](const std::string& wait)
        {
            return Command("/usr/bin/python3 '" WYX_INSPECT "' --places --wait 30 --pid " +
                           std::to_string(program->Pid()) + " --only " + id + wait);
        };
        Lines table = inspect(" --wait-rows " + std::to_string(lines.size()));
        std::vector<Row> seen;
        for (const Row& row : table["row"])
        {
            seen.emplace_back();
            for (size_t column : shown)
                seen.back().push_back(row.at(column + 2));
        }
        if (anyOrder)
            std::sort(seen.begin(), seen.end());
        EXPECT_EQ(seen, expected);
        if (click == std::string::npos)
            return table;
        const auto placed = [&]
        {
            return table["place"].size() > click && table["place"][click].size() == 6 &&
                   std::stoi(table["place"][click][2]) >= 0 && std::stoi(table["place"][click][4]) > 0;
        };
        for (int attempt = 0; attempt < 50 && !placed(); ++attempt)
            table = inspect("");
        if (!placed())
            return ADD_FAILURE() << "row " << click << " is not on the screen", table;
        const Row& place = table["place"][click];
        Command("xdotool mousemove --sync " + std::to_string(std::stoi(place[2]) + std::stoi(place[4]) / 2) +
                " " + std::to_string(std::stoi(place[3]) + std::stoi(place[5]) / 2) + " click 1");
        for (int attempt = 0;
             attempt < 50 && table["table"].at(0).at(5) != "selected=" + std::to_string(click); ++attempt)
            table = inspect("");
        EXPECT_FALSE(program->HasEnded());
        return table;
    }
    void TearDown() override
    {
        if (program && window != 0 && !program->HasEnded())
            box.Close(*program, window);
    }

    programtest::Sandbox box{true};
    std::unique_ptr<programtest::Program> program;
    Window window = 0;
};

TEST_F(BusSessionTest, TheStatusTableReadsAsWrittenAndShowsTheSelectedRow)
{
    ASSERT_TRUE(box.Ready());
    Lines table =
        Check("status",
              {"41\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF",
               "42\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tSaving...\t8192\tPostScript",
               "43\t/srv/in/Proofs\t/srv/in/Proofs/c \u00e9t\u00e9.tif\tPRN-01\t1383035055\tConverting file "
               "type\t2048\tTIFF"},
              "jobStatusList", {1, 2, 3, 4, 7},
              {{"a", "PDF", "Proofs", "PRN-01", "Queued"},
               {"b", "PostScript", "Books", "PRN-02", "Saving..."},
               {"c \u00e9t\u00e9", "TIFF", "Proofs", "PRN-01", "Converting file type"}},
              1, true);
    EXPECT_EQ(table["table"], (std::vector<Row>{{"table", "jobStatusList", "Jobs in progress", "rows=3",
                                                 "columns=8", "selected=1"}}));
    EXPECT_EQ(table["heading"], (std::vector<Row>{{"heading", "No.", "File Name", "Format", "Hot Folder",
                                                   "Server", "Size", "Time", "Status"}}));
}

TEST_F(BusSessionTest, TheLogTableReadsAsWrittenInOrder)
{
    ASSERT_TRUE(box.Ready());
    Lines table = Check(
        "log",
        {"7\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok",
         "8\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tFailed\tThe server refused the job"},
        "jobLogList", {1, 2, 3, 5},
        {{"a", "Proofs", "PRN-01", "Transferred Successfully"}, {"b", "Books", "PRN-02", "Failed"}},
        std::string::npos, false);
    EXPECT_EQ(table["table"], (std::vector<Row>{{"table", "jobLogList", "Finished jobs", "rows=2",
                                                 "columns=6", "selected=-"}}));
    EXPECT_EQ(table["heading"], (std::vector<Row>{{"heading", " ", "File Name", "Hot Folder", "Server",
                                                   "Start Time", "Status"}}));
}

} // namespace
