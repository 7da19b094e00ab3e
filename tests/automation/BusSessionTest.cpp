// The program as an outside tool meets it: started on its own session bus and
// display (the test runs under dbus-run-session and xvfb-run), found on the
// accessibility bus by its process id, and read by wyx-inspect, a separate
// Python process, while another process writes the journals.
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "../app/TempFolder.h"
#include "ProgramSession.h"

namespace
{

using programtest::Program;
using programtest::XSession;

struct Place
{
    int x = 0;
    int y = 0;
    int width = 0;
    int height = 0;
};

// One table as wyx-inspect prints it.
struct Table
{
    std::string id;
    std::string name;
    int rows = -1;
    int columns = -1;
    std::string selected;
    std::vector<std::string> headings;
    std::vector<std::vector<std::string>> cells;
    std::vector<Place> places;
};

std::vector<std::string> Split(const std::string& line)
{
    std::vector<std::string> fields;
    std::stringstream in(line);
    std::string field;
    while (std::getline(in, field, '\t'))
        fields.push_back(field);
    if (!line.empty() && line.back() == '\t')
        fields.emplace_back();
    return fields;
}

std::string After(const std::string& field, const std::string& prefix)
{
    return field.rfind(prefix, 0) == 0 ? field.substr(prefix.size()) : std::string();
}

Table ParseTable(const std::string& text)
{
    Table table;
    std::stringstream in(text);
    std::string line;
    while (std::getline(in, line))
    {
        const std::vector<std::string> fields = Split(line);
        if (fields.empty())
            continue;
        if (fields[0] == "table" && fields.size() >= 6)
        {
            table.id = fields[1];
            table.name = fields[2];
            table.rows = std::stoi(After(fields[3], "rows="));
            table.columns = std::stoi(After(fields[4], "columns="));
            table.selected = After(fields[5], "selected=");
        }
        else if (fields[0] == "heading")
        {
            table.headings.assign(fields.begin() + 1, fields.end());
        }
        else if (fields[0] == "row" && fields.size() >= 2)
        {
            table.cells.emplace_back(fields.begin() + 2, fields.end());
        }
        else if (fields[0] == "place" && fields.size() == 6)
        {
            table.places.push_back(Place{std::stoi(fields[2]), std::stoi(fields[3]), std::stoi(fields[4]),
                                         std::stoi(fields[5])});
        }
    }
    return table;
}

// A command's standard output and whether it succeeded.
bool RunCommand(const std::string& command, std::string& output)
{
    output.clear();
    FILE* pipe = ::popen(command.c_str(), "r");
    if (!pipe)
        return false;
    char buffer[4096];
    size_t got = 0;
    while ((got = std::fread(buffer, 1, sizeof buffer, pipe)) > 0)
        output.append(buffer, got);
    return ::pclose(pipe) == 0;
}

std::string Quote(const std::string& text)
{
    std::string quoted = "'";
    for (char c : text)
        quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + "'";
}

class BusSessionTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_FALSE(folder.Path().empty());
        ASSERT_TRUE(x.IsOpen()) << "no X display: run under xvfb-run -a";
        ASSERT_NE(::getenv("DBUS_SESSION_BUS_ADDRESS"), nullptr)
            << "no session bus: run under dbus-run-session";
        std::filesystem::create_directories(data);
        std::ofstream(data / "TiveraJobsStatusFile.txt").flush();
        std::ofstream(data / "TiveraJobsLogFile.txt").flush();
    }

    // As a user's session starts it: the accessibility bridge left on.
    std::vector<std::string> Environment()
    {
        const std::filesystem::path home = folder.Path() / "home";
        std::filesystem::create_directories(home / "run");
        ::chmod((home / "run").c_str(), 0700);
        std::vector<std::string> environment = {
            "HOME=" + home.string(),
            "WYX_SYSTEM_ROOT=" + (folder.Path() / "root").string(),
            "XDG_CONFIG_HOME=" + (home / ".config").string(),
            "XDG_STATE_HOME=" + (home / ".local/state").string(),
            "XDG_RUNTIME_DIR=" + (home / "run").string(),
            "GDK_BACKEND=x11",
            "LANG=C.UTF-8",
        };
        for (const char* name : {"DISPLAY", "PATH", "XAUTHORITY", "DBUS_SESSION_BUS_ADDRESS"})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
        return environment;
    }

    void Journal(const std::string& journal, const std::string& line)
    {
        Program tool(WYX_JOURNAL, Environment(), std::nullopt, {journal, "add", line});
        const int status = tool.Wait();
        ASSERT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << journal << " add " << line;
    }

    // The table as the tool reads it; empty when the tool failed.
    Table Inspect(const std::string& id, int waitRows = -1)
    {
        std::string command = "/usr/bin/python3 " + Quote(WYX_INSPECT) + " --places --wait 30 --pid " +
                              std::to_string(program->Pid()) + " --only " + id;
        if (waitRows >= 0)
            command += " --wait-rows " + std::to_string(waitRows);
        std::string output;
        if (!RunCommand(command, output))
            ADD_FAILURE() << "wyx-inspect failed; it printed:\n" << output;
        return ParseTable(output);
    }

    // Reads the table until its selection is `rows`, a bounded number of times.
    Table InspectUntilSelected(const std::string& id, const std::string& rows)
    {
        Table table = Inspect(id);
        for (int attempt = 0; attempt < 50 && table.selected != rows; ++attempt)
            table = Inspect(id);
        return table;
    }

    void Xdotool(const std::string& arguments)
    {
        std::string output;
        ASSERT_TRUE(RunCommand("xdotool " + arguments, output)) << "xdotool " << arguments;
    }

    // A user's click in the middle of a row's first cell.
    void ClickRow(const Table& table, size_t row)
    {
        ASSERT_LT(row, table.places.size());
        const Place& place = table.places[row];
        ASSERT_TRUE(place.x >= 0 && place.width > 0) << "the row is not on the screen";
        Xdotool("mousemove --sync " + std::to_string(place.x + place.width / 2) + " " +
                std::to_string(place.y + place.height / 2) + " click 1");
    }

    void StartProgram()
    {
        program = std::make_unique<Program>(WYX_PROGRAM, Environment());
        window = x.WaitForWindow(*program);
        ASSERT_NE(window, 0u) << "no window: the program " << program->Outcome();
    }

    void TearDown() override
    {
        if (program && window != 0 && !program->HasEnded())
        {
            x.RequestClose(window);
            const int status = program->Wait();
            EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << "wait status " << status;
        }
    }

    TempFolder folder;
    std::filesystem::path data = folder.Path() / "root/var/lib/Corvane/HotFolders";
    XSession x;
    std::unique_ptr<Program> program;
    Window window = 0;
};

TEST_F(BusSessionTest, TheStatusTableReadsAsWrittenAndShowsTheSelectedRow)
{
    const std::vector<std::vector<std::string>> jobs = {
        {"41", "/srv/in/Proofs", "/srv/in/Proofs/a.pdf", "PRN-01", "1383035055", "Queued", "4096", "PDF"},
        {"42", "/srv/in/Books", "/srv/in/Books/b.ps", "PRN-02", "1383035055", "Saving...", "8192",
         "PostScript"},
        {"43", "/srv/in/Proofs", "/srv/in/Proofs/c \u00e9t\u00e9.tif", "PRN-01", "1383035055",
         "Converting file type", "2048", "TIFF"},
    };
    for (const auto& job : jobs)
    {
        std::string line;
        for (const std::string& field : job)
            line += (line.empty() ? "" : "\t") + field;
        Journal("status", line);
    }
    StartProgram();

    const Table table = Inspect("jobStatusList", 3);
    EXPECT_EQ(table.name, "Jobs in progress");
    ASSERT_EQ(table.rows, 3);
    ASSERT_EQ(table.columns, 8);
    EXPECT_EQ(table.headings, (std::vector<std::string>{"No.", "File Name", "Format", "Hot Folder", "Server",
                                                        "Size", "Time", "Status"}));
    ASSERT_EQ(table.cells.size(), 3u);
    // Each job's row, whatever the order: the file's title, its format, folder, server and status.
    const struct
    {
        const char* title;
        const char* folder;
    } shown[] = {{"a", "Proofs"}, {"b", "Books"}, {"c \u00e9t\u00e9", "Proofs"}};
    for (size_t job = 0; job < jobs.size(); ++job)
    {
        size_t row = 0;
        while (row < table.cells.size() &&
               (table.cells[row].size() < 8 || table.cells[row][1] != shown[job].title))
            ++row;
        ASSERT_LT(row, table.cells.size()) << "no row for " << shown[job].title;
        const std::vector<std::string>& cells = table.cells[row];
        EXPECT_EQ(cells[0], std::to_string(row + 1));
        EXPECT_EQ(cells[2], jobs[job][7]);
        EXPECT_EQ(cells[3], shown[job].folder);
        EXPECT_EQ(cells[4], jobs[job][3]);
        EXPECT_EQ(cells[7], jobs[job][5]);
    }
    EXPECT_EQ(table.selected, "-");

    ClickRow(table, 1);
    const Table selected = InspectUntilSelected("jobStatusList", "1");
    EXPECT_EQ(selected.selected, "1");
    EXPECT_FALSE(program->HasEnded());
}

TEST_F(BusSessionTest, TheLogTableReadsAsWrittenAndShowsTheSelectedRow)
{
    Journal("log",
            "7\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tTransferred Successfully\tok");
    Journal("log",
            "8\t/srv/in/Books\t/srv/in/Books/b.ps\tPRN-02\t1383035055\tFailed\tThe server refused the job");
    StartProgram();

    Table table = Inspect("jobLogList", 2);
    EXPECT_EQ(table.name, "Finished jobs");
    ASSERT_EQ(table.rows, 2);
    ASSERT_EQ(table.columns, 6);
    EXPECT_EQ(table.headings,
              (std::vector<std::string>{" ", "File Name", "Hot Folder", "Server", "Start Time", "Status"}));
    ASSERT_EQ(table.cells.size(), 2u);
    EXPECT_EQ(table.cells[0][1], "a");
    EXPECT_EQ(table.cells[0][2], "Proofs");
    EXPECT_EQ(table.cells[0][3], "PRN-01");
    EXPECT_EQ(table.cells[0][5], "Transferred Successfully");
    EXPECT_EQ(table.cells[1][1], "b");
    EXPECT_EQ(table.cells[1][2], "Books");
    EXPECT_EQ(table.cells[1][3], "PRN-02");
    EXPECT_EQ(table.cells[1][5], "Failed");

    // To the Log tab as a user goes there from the keyboard; its rows come on the screen.
    const XWindowAttributes frame = x.Attributes(window);
    Xdotool("mousemove --sync " + std::to_string(frame.x + frame.width / 2) + " " +
            std::to_string(frame.y + frame.height / 2) + " click 1 key ctrl+Next");
    for (int attempt = 0; attempt < 50 && (table.places.empty() || table.places[0].x < 0); ++attempt)
        table = Inspect("jobLogList");
    ClickRow(table, 0);
    const Table selected = InspectUntilSelected("jobLogList", "0");
    EXPECT_EQ(selected.selected, "0");
    EXPECT_FALSE(program->HasEnded());
}

} // namespace
