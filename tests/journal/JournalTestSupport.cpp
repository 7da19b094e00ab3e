#include "JournalTestSupport.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <thread>

#include <sys/stat.h>
#include <sys/wait.h>

namespace journaltest
{

namespace fs = std::filesystem;

void JournalTest::SetUp()
{
    std::string pattern = (fs::temp_directory_path() / "wyx-journal-test.XXXXXX").string();
    ASSERT_NE(::mkdtemp(&pattern[0]), nullptr);
    m_root = pattern;
    ::setenv("WYX_SYSTEM_ROOT", m_root.c_str(), 1);
    fs::create_directories(m_root + "/var/lib/Corvane/HotFolders");
}

void JournalTest::TearDown()
{
    std::error_code ignored;
    fs::remove_all(m_root, ignored);
    ::unsetenv("WYX_SYSTEM_ROOT");
}

std::string JournalTest::DataDirectory() const
{
    return m_root + "/var/lib/Corvane/HotFolders/";
}

void WriteBytes(const std::string& path, const std::string& bytes)
{
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    ASSERT_TRUE(file.good()) << path;
}

std::string ReadBytes(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream content;
    content << file.rdbuf();
    return content.str();
}

bool Exists(const std::string& path)
{
    std::error_code ignored;
    return fs::exists(fs::symlink_status(path, ignored));
}

std::vector<std::string> FolderEntries(const std::string& folder)
{
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    return names;
}

std::string Utf8(const wxString& text)
{
    const wxScopedCharBuffer buffer = text.utf8_str();
    return std::string(buffer.data(), buffer.length());
}

wxString FromUtf8(const std::string& text)
{
    return wxString::FromUTF8(text.data(), text.size());
}

std::vector<std::string> Utf8Lines(const wxArrayString& lines)
{
    std::vector<std::string> result;
    for (const wxString& line : lines)
        result.push_back(Utf8(line));
    return result;
}

wyx::JobsFileReadWriter Journal(const std::string& path)
{
    wyx::JobsFileReadWriter journal;
    journal.SetPath(FromUtf8(path));
    return journal;
}

std::vector<std::string> ReadLines(const std::string& path)
{
    wyx::JobsFileReadWriter journal = Journal(path);
    wxArrayString lines;
    EXPECT_EQ(journal.ReadJobs(lines), wyx::JobOk) << path;
    return Utf8Lines(lines);
}

std::string ShellQuoted(const std::string& text)
{
    std::string quoted = "'";
    for (char c : text)
        quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + "'";
}

namespace
{

ToolRun RunCommand(std::string command, const std::vector<std::string>& arguments)
{
    for (const std::string& argument : arguments)
        command += " " + ShellQuoted(argument);
    ToolRun run;
    std::FILE* process = ::popen(command.c_str(), "r");
    if (process == nullptr)
        return run;
    char block[4096];
    std::size_t got;
    while ((got = std::fread(block, 1, sizeof block, process)) > 0)
        run.out.append(block, got);
    const int status = ::pclose(process);
    run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return run;
}

} // namespace

ToolRun RunTool(const std::vector<std::string>& arguments, const std::string& prefix)
{
    return RunCommand(prefix + " exec " + ShellQuoted(WYX_JOURNAL_TOOL), arguments);
}

ToolRun RunToolAs(unsigned uid, const std::vector<std::string>& arguments)
{
    const std::string id = std::to_string(uid);
    return RunCommand("exec setpriv --reuid=" + id + " --regid=" + id + " --clear-groups " +
                          ShellQuoted(WYX_JOURNAL_TOOL),
                      arguments);
}

bool WaitUntilBlockedOn(const std::string& lockFile, const std::function<bool()>& finished)
{
    struct stat info;
    if (::stat(lockFile.c_str(), &info) != 0)
        return false;
    // A waiter's line reads "N: -> FLOCK ADVISORY WRITE <pid> <maj:min:inode> 0 EOF".
    const std::string inode = ":" + std::to_string(info.st_ino) + " ";
    for (;;)
    {
        std::ifstream locks("/proc/locks");
        for (std::string line; std::getline(locks, line);)
            if (line.find("->") != std::string::npos && line.find(inode) != std::string::npos)
                return true;
        if (finished())
            return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
}

ExternalLockHolder::ExternalLockHolder(const std::string& lockFile) : m_releaseFifo(lockFile + ".release")
{
    fs::create_directories(fs::path(lockFile).parent_path());
    if (::mkfifo(m_releaseFifo.c_str(), 0600) != 0)
        return;
    // "held" is printed only once flock has the lock; the holder then waits
    // for a line on the FIFO, so the test decides when the lock goes.
    const std::string command = "exec flock " + ShellQuoted(lockFile) + " sh -c " +
                                ShellQuoted("echo held; read line < " + ShellQuoted(m_releaseFifo));
    m_process = ::popen(command.c_str(), "r");
    if (m_process == nullptr)
        return;
    char answer[16] = {};
    m_holding = std::fgets(answer, sizeof answer, m_process) != nullptr && std::string(answer) == "held\n";
}

ExternalLockHolder::~ExternalLockHolder()
{
    Release();
    ::unlink(m_releaseFifo.c_str());
}

void ExternalLockHolder::Release()
{
    if (m_process == nullptr)
        return;
    if (m_holding)
    {
        std::ofstream release(m_releaseFifo);
        release << "go" << std::endl;
    }
    ::pclose(m_process);
    m_process = nullptr;
    m_holding = false;
}

} // namespace journaltest
