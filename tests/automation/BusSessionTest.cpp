// The program as an outside tool meets it: started on its own session bus and
// display (the test runs under dbus-run-session and xvfb-run), found on the
// accessibility bus by its process id, and read by wyx-inspect, a separate
// Python process, while another process writes the journals.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <sstream>
#include <string>
#include <vector>

#include "ProgramSandbox.h"

namespace
{

using Row = std::vector<std::string>;

// One table as wyx-inspect prints it: its header line, headings, cells and
// the screen place (x, y, width, height) of each row.
struct Table
{
    Row table, headings;
    std::vector<Row> cells;
    std::vector<std::vector<int>> places;
    std::string Selected() const { return table.size() > 5 ? table[5] : ""; }
};

Table ParseTable(const std::string& text)
{
    Table result;
    std::stringstream in(text);
    for (std::string line; std::getline(in, line);)
    {
        Row fields;
        std::stringstream fieldsIn(line);
        for (std::string field; std::getline(fieldsIn, field, '\t');)
            fields.push_back(field);
        if (!line.empty() && line.back() == '\t')
            fields.emplace_back();
        const std::string kind = fields.empty() ? "" : fields[0];
        if (kind == "table")
            result.table = fields;
        else if (kind == "heading")
            result.headings.assign(fields.begin() + 1, fields.end());
        else if (kind == "row" && fields.size() >= 2)
            result.cells.emplace_back(fields.begin() + 2, fields.end());
        else if (kind == "place" && fields.size() == 6)
            result.places.push_back(
                {std::stoi(fields[2]), std::stoi(fields[3]), std::stoi(fields[4]), std::stoi(fields[5])});
    }
    return result;
}

// A shell command's standard output; a failure when it did not succeed.
std::string RunCommand(const std::string& command)
{
    std::string output;
    FILE* pipe = ::popen(command.c_str(), "r");
    char buffer[4096];
    for (size_t got = 0; pipe && (got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0;)
        output.append(buffer, got);
    if (!pipe || ::pclose(pipe) != 0)
        ADD_FAILURE() << command << " failed; it printed:\n" << output;
    return output;
}

class BusSessionTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_TRUE(box.Ready());
        ASSERT_NE(::getenv("DBUS_SESSION_BUS_ADDRESS"), nullptr)
            << "no session bus: run under dbus-run-session";
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt", "");
        box.folder.Write("root/var/lib/Corvane/HotFolders/TiveraJobsLogFile.txt", "");
    }
    void TearDown() override
    {
        if (program && window != 0 && !program->HasEnded())
            box.Close(*program, window);
    }

    void Journal(const std::string& journal, const std::string& line)
    {
        ASSERT_EQ(box.Run(WYX_JOURNAL, {journal, "add", line}), 0) << journal << " add " << line;
    }
    void StartProgram()
    {
        program = std::make_unique<programtest::Program>(WYX_PROGRAM, box.environment);
        window = box.WaitForWindow(*program);
        ASSERT_NE(window, 0u);
    }
    // The table as the tool reads it, once it holds `rows` rows.
    Table Inspect(const std::string& id, int rows = -1)
    {
        return ParseTable(RunCommand("/usr/bin/python3 '" + std::string(WYX_INSPECT) +
                                     "' --places --wait 30 --pid " + std::to_string(program->Pid()) +
                                     " --only " + id +
                                     (rows >= 0 ? " --wait-rows " + std::to_string(rows) : "")));
    }
    // A user's click in the middle of a row's first cell; the table read
    // until that row is its selection, a bounded number of times.
    Table ClickRow(Table table, const std::string& id, size_t row)
    {
        for (int attempt = 0; attempt < 50 && (table.places.size() <= row || table.places[row][0] < 0);
             ++attempt)
            table = Inspect(id);
        if (table.places.size() <= row || table.places[row][0] < 0 || table.places[row][2] <= 0)
        {
            ADD_FAILURE() << "row " << row << " is not on the screen";
            return table;
        }
        const std::vector<int>& place = table.places[row];
        RunCommand("xdotool mousemove --sync " + std::to_string(place[0] + place[2] / 2) + " " +
                   std::to_string(place[1] + place[3] / 2) + " click 1");
        for (int attempt = 0; attempt < 50 && table.Selected() != "selected=" + std::to_string(row);
             ++attempt)
            table = Inspect(id);
        EXPECT_FALSE(program->HasEnded());
        return table;
    }

    programtest::Sandbox box{true};
    std::unique_ptr<programtest::Program> program;
    Window window = 0;
};

TEST_F(BusSessionTest, TheStatusTableReadsAsWrittenAndShowsTheSelectedRow)
{
    for (const char* line :
         {"41\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF",
          "42\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tSaving...\t8192\tPostScript",
          "43\t/srv/in/Proofs\t/srv/in/Proofs/c \u00e9t\u00e9.tif\tPRN-01\t1383035055\tConverting file "
          "type\t2048\tTIFF"})
        Journal("status", line);
    StartProgram();

    const Table table = Inspect("jobStatusList", 3);
    EXPECT_EQ(table.table,
              (Row{"table", "jobStatusList", "Jobs in progress", "rows=3", "columns=8", "selected=-"}));
    EXPECT_EQ(table.headings,
              (Row{"No.", "File Name", "Format", "Hot Folder", "Server", "Size", "Time", "Status"}));
    // Each job's row, whatever the order: the file's title, its format, folder, server and status, and
    // the row's number.
    const Row shown[] = {{"a", "PDF", "Proofs", "PRN-01", "Queued"},
                         {"b", "PostScript", "Books", "PRN-02", "Saving..."},
                         {"c \u00e9t\u00e9", "TIFF", "Proofs", "PRN-01", "Converting file type"}};
    ASSERT_EQ(table.cells.size(), 3u);
    for (const Row& job : shown)
    {
        const auto row =
            std::find_if(table.cells.begin(), table.cells.end(),
                         [&](const Row& cells) { return cells.size() >= 8 && cells[1] == job[0]; });
        ASSERT_NE(row, table.cells.end()) << "no row for " << job[0];
        EXPECT_EQ((Row{(*row)[1], (*row)[2], (*row)[3], (*row)[4], (*row)[7]}), job);
        EXPECT_EQ((*row)[0], std::to_string(row - table.cells.begin() + 1));
    }
    EXPECT_EQ(ClickRow(table, "jobStatusList", 1).Selected(), "selected=1");
}

TEST_F(BusSessionTest, TheLogTableReadsAsWrittenAndShowsTheSelectedRow)
{
    Journal("log",
            "7\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok");
    Journal("log",
            "8\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tFailed\tThe server refused the job");
    StartProgram();

    const Table table = Inspect("jobLogList", 2);
    EXPECT_EQ(table.table,
              (Row{"table", "jobLogList", "Finished jobs", "rows=2", "columns=6", "selected=-"}));
    EXPECT_EQ(table.headings, (Row{" ", "File Name", "Hot Folder", "Server", "Start Time", "Status"}));
    const Row shown[] = {{"a", "Proofs", "PRN-01", "Transferred Successfully"},
                         {"b", "Books", "PRN-02", "Failed"}};
    ASSERT_EQ(table.cells.size(), 2u);
    for (size_t row = 0; row < 2; ++row)
    {
        const Row& cells = table.cells[row];
        ASSERT_GE(cells.size(), 6u);
        EXPECT_EQ((Row{cells[1], cells[2], cells[3], cells[5]}), shown[row]);
    }

    // To the Log tab as a user goes there from the keyboard; its rows come on the screen.
    const XWindowAttributes frame = box.x.Attributes(window);
    RunCommand("xdotool mousemove --sync " + std::to_string(frame.x + frame.width / 2) + " " +
               std::to_string(frame.y + frame.height / 2) + " click 1 key ctrl+Next");
    EXPECT_EQ(ClickRow(table, "jobLogList", 0).Selected(), "selected=0");
}

} // namespace
