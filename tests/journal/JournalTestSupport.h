#pragma once

#include <cstdio>
#include <functional>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <wx/arrstr.h>
#include <wx/string.h>

#include "data/JobReadWriter.h"

namespace journaltest
{

// A fresh system root for one test: WYX_SYSTEM_ROOT points into a new
// temporary folder, which holds the data directory and the lock folder.
class JournalTest : public ::testing::Test
{
protected:
    void SetUp() override;
    void TearDown() override;

    std::string Root() const { return m_root; }
    // The data directory below the root, created.
    std::string DataDirectory() const;
    std::string StatusJournal() const { return DataDirectory() + "TiveraJobsStatusFile.txt"; }
    std::string LogJournal() const { return DataDirectory() + "TiveraJobsLogFile.txt"; }
    std::string LockFile(const std::string& name) const { return m_root + "/dev/shm/" + name + ".lock"; }

private:
    std::string m_root;
};

void WriteBytes(const std::string& path, const std::string& bytes);
std::string ReadBytes(const std::string& path);
bool Exists(const std::string& path);
// Names in a folder other than "." and "..".
std::vector<std::string> FolderEntries(const std::string& folder);

std::string Utf8(const wxString& text);
wxString FromUtf8(const std::string& text);
std::vector<std::string> Utf8Lines(const wxArrayString& lines);

// A reader-writer of the given journal, as the models and the tool make it.
wyx::JobsFileReadWriter Journal(const std::string& path);
// ReadJobs as UTF-8 strings; fails the test when the result is not JobOk.
std::vector<std::string> ReadLines(const std::string& path);

struct ToolRun
{
    int status = -1;
    std::string out;
};
// Runs wyx-journal with the arguments through sh; prefix is shell text put
// before the command (ulimit, trap).
ToolRun RunTool(const std::vector<std::string>& arguments, const std::string& prefix = std::string());
// RunTool as another user (root only: through util-linux setpriv).
ToolRun RunToolAs(unsigned uid, const std::vector<std::string>& arguments);
std::string ShellQuoted(const std::string& text);

// Polls the kernel's lock table until some process or thread is blocked
// waiting for the lock file (true), or until finished() says the candidate
// waiter has already returned without waiting (false).
bool WaitUntilBlockedOn(const std::string& lockFile, const std::function<bool()>& finished);

// Another process (util-linux flock) holding a lock file until Release.
class ExternalLockHolder
{
public:
    // Returns once the other process holds the lock.
    explicit ExternalLockHolder(const std::string& lockFile);
    ~ExternalLockHolder();
    ExternalLockHolder(const ExternalLockHolder&) = delete;
    ExternalLockHolder& operator=(const ExternalLockHolder&) = delete;

    bool Holding() const { return m_holding; }
    // Lets the other process end; its lock goes with it.
    void Release();

private:
    std::string m_releaseFifo;
    std::FILE* m_process = nullptr;
    bool m_holding = false;
};

} // namespace journaltest
