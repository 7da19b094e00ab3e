#pragma once

#include <atomic>
#include <cstddef>

#include <wx/arrstr.h>
#include <wx/string.h>

namespace wyx
{

// The largest journal one read takes in: a hundred thousand jobs take about
// 15 MiB. A larger file reads as JobFileMissing and the caller keeps what it
// had, rather than one planted or runaway file taking the process's memory.
constexpr std::size_t kMaxJournalBytes = std::size_t(64) << 20;

// Results of the journal operations.
enum JobResult : int
{
    JobOk = 0,          // done; also an empty path, where nothing is done
    JobFileMissing = 1, // the journal does not exist or cannot be opened or read
    JobLockFailed = 2,  // the journal's lock was not obtained: nothing was read or changed
    JobWriteFailed = 3, // the new content could not be written; the journal is unchanged
};

// Access to one TAB-separated journal under its named lock. Every operation
// reads the whole file, and a writing operation replaces it atomically.
class IJobReadWriter
{
public:
    virtual int ReadJobs(wxArrayString& lines) = 0;
    virtual int AddJob(wxString& line) = 0;
    virtual int ModifyJob(wxString line) = 0;
    virtual int DeleteJob(wxString key) = 0;
    virtual int RemoveJob(wxString key) = 0;
    virtual int ClearJobs() = 0;
    virtual int CommitJob(wxString key) = 0;
    virtual int Reserved1() = 0;
    virtual int Reserved2() = 0;
    virtual ~IJobReadWriter() = default;
};

class JobsFileReadWriter : public IJobReadWriter
{
public:
    int ReadJobs(wxArrayString& lines) override;
    int AddJob(wxString& line) override;
    int ModifyJob(wxString line) override;
    int DeleteJob(wxString key) override;
    int RemoveJob(wxString key) override;
    int ClearJobs() override;
    int CommitJob(wxString key) override;
    int Reserved1() override { return JobOk; }
    int Reserved2() override { return JobOk; }

    void SetPath(const wxString& path) { m_path = path; }
    const wxString& GetPath() const { return m_path; }

    // A reader that must stay responsive (the models on the polling thread)
    // passes its running flag: while the flag is false, waiting for the lock
    // gives up with JobLockFailed instead of blocking. Null: wait for ever.
    void SetKeepWaiting(const std::atomic<bool>* keepWaiting) { m_keepWaiting = keepWaiting; }

    // ReadJobs for a caller that already holds the journal's lock: it reads
    // without taking the lock again, which would wait on the caller's own.
    int ReadJobsHoldingLock(wxArrayString& lines);

private:
    wxString m_path;
    const std::atomic<bool>* m_keepWaiting = nullptr;
};

} // namespace wyx

constexpr int kJobsFileReadWriterKind = 4001;

// Kind 4001 gives a new JobsFileReadWriter with an empty path; any other kind
// gives none. The caller owns the result.
wyx::IJobReadWriter* CreateJobReadWriter(int kind);
