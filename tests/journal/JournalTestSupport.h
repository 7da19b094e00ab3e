#pragma once

// What the journal tests share: a private system root, file helpers, the
// producer command and a view of the kernel's lock table.
#include <sys/stat.h>
#include <sys/wait.h>

#include <chrono>
#include <fstream>
#include <functional>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <wx/arrstr.h>
#include <wx/string.h>

#include "TempFolder.h"
#include "data/JobReadWriter.h"

namespace journaltest
{

namespace fs = std::filesystem;
using Lines = std::vector<std::string>;
using Arguments = std::vector<std::string>;

// A fresh system root for one test: WYX_SYSTEM_ROOT names a new temporary
// folder, which holds the data directory and the lock folder.
class JournalTest : public ::testing::Test
{
protected:
    void SetUp() override { fs::create_directories(DataDirectory()); }

    std::string Root() const { return folder.Path().string(); }
    std::string DataDirectory() const { return Root() + "/var/lib/Corvane/HotFolders/"; }
    std::string StatusJournal() const { return DataDirectory() + "TiveraJobsStatusFile.txt"; }
    std::string LogJournal() const { return DataDirectory() + "TiveraJobsLogFile.txt"; }
    std::string LockFile(const std::string& name) const { return Root() + "/dev/shm/" + name + ".lock"; }

public:
    static void WriteBytes(const std::string& path, const std::string& bytes)
    {
        ASSERT_TRUE((std::ofstream(path, std::ios::binary | std::ios::trunc) << bytes).good()) << path;
    }
    static std::string ReadBytes(const std::string& path)
    {
        std::ostringstream content;
        content << std::ifstream(path, std::ios::binary).rdbuf();
        return content.str();
    }
    static Lines FolderEntries(const std::string& folder)
    {
        Lines names;
        for (const auto& entry : fs::directory_iterator(folder))
            names.push_back(entry.path().filename().string());
        return names;
    }

    // A reader-writer of the journal, as the models and the tool make it.
    static wyx::JobsFileReadWriter Journal(const std::string& path)
    {
        wyx::JobsFileReadWriter journal;
        journal.SetPath(wxString::FromUTF8(path));
        return journal;
    }
    // ReadJobs as UTF-8; fails the test unless the result is JobOk.
    static Lines ReadLines(const std::string& path)
    {
        wxArrayString lines;
        EXPECT_EQ(Journal(path).ReadJobs(lines), wyx::JobOk) << path;
        Lines result;
        for (const wxString& line : lines)
            result.push_back(line.utf8_string());
        return result;
    }

    static std::string Quoted(const std::string& text)
    {
        std::string quoted = "'";
        for (char c : text)
            quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
        return quoted + "'";
    }
    // Runs a command through sh with the arguments quoted; its exit status and output.
    static std::pair<int, std::string> Run(std::string command, const Arguments& arguments)
    {
        for (const std::string& argument : arguments)
            command += " " + Quoted(argument);
        std::string out;
        std::FILE* process = ::popen(command.c_str(), "r");
        char block[4096];
        for (std::size_t got; process && (got = std::fread(block, 1, sizeof block, process)) > 0;)
            out.append(block, got);
        const int status = process ? ::pclose(process) : -1;
        return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, out};
    }
    // wyx-journal's exit status; prefix is shell text put before it (ulimit, redirections).
    static int RunTool(const Arguments& arguments, const std::string& prefix = "")
    {
        return Run(prefix + " exec " + Quoted(WYX_JOURNAL_TOOL), arguments).first;
    }

    // Polls the kernel's lock table until someone is blocked waiting for the
    // lock file (true), or until finished() says the candidate returned (false).
    static bool WaitUntilBlockedOn(const std::string& lockFile, const std::function<bool()>& finished)
    {
        struct stat info;
        // A waiter's line reads "N: -> FLOCK ADVISORY WRITE <pid> <maj:min:inode> 0 EOF".
        const std::string inode =
            ::stat(lockFile.c_str(), &info) == 0 ? ":" + std::to_string(info.st_ino) + " " : "";
        while (!inode.empty() && !finished())
        {
            std::ifstream locks("/proc/locks");
            for (std::string line; std::getline(locks, line);)
                if (line.find("->") != std::string::npos && line.find(inode) != std::string::npos)
                    return true;
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        return false;
    }

    TempFolder folder;
    ScopedEnv root{"WYX_SYSTEM_ROOT", folder.Path().string()};
};

} // namespace journaltest
