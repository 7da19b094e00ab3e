#pragma once

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

#include "data/JobReadWriter.h"
#include "data/JobRecord.h"
#include "data/ChangedJournal.h"
#include "platform/os/FileStamp.h"

// One read of the status journal: the jobs in journal order and, beside them,
// when each started (a DOS date-time number). Never changed once made.
struct JobSnapshot
{
    std::vector<JobRecord> jobs;
    std::vector<std::uint64_t> startTimes;
};

// The jobs in progress, as the status journal lists them. The polling thread
// calls Refresh once a second; a changed journal is read whole, its shown lines
// replace the list and the status views are told on bus channel 2.
//
// Refresh and Parse run on the polling thread, one call at a time; GetJobs and
// GetServers on the GUI thread. The list is guarded by one mutex, held only
// while it is swapped or copied; the journal is read outside it.
class JobStatusManager
{
public:
    static JobStatusManager& GetInstance();

    // reader: how the journal is read; null gives a JobsFileReadWriter on journalPath.
    explicit JobStatusManager(const wxString& journalPath,
                              std::unique_ptr<wyx::IJobReadWriter> reader = nullptr);
    virtual ~JobStatusManager();

    JobStatusManager(const JobStatusManager&) = delete;
    JobStatusManager& operator=(const JobStatusManager&) = delete;

    // 1 when the list was replaced and the views were told, else 0. The views
    // are also told, with 0, when the journal turned busy, unreadable or readable again.
    int Refresh();
    // 1 when the list was replaced (also by an equal one), else 0.
    int Parse();

    // Appends a copy of every job in journal order; returns 0. startTimes, when
    // given, receives each job's start as a DOS date-time number, in the same order.
    int GetJobs(std::vector<JobRecord>& jobs, std::vector<std::uint64_t>* startTimes = nullptr) const;
    // The latest read itself, shared rather than copied: it is never changed, so
    // holding it is as safe as holding a copy, and costs nothing at 100,000 jobs.
    std::shared_ptr<const JobSnapshot> GetSnapshot() const;
    // Counts the replacements of the list: a view that has shown generation g
    // has nothing to do while the count is still g.
    std::uint64_t GetGeneration() const { return m_generation; }
    // The configured print servers, from the data source.
    long GetServers(wxArrayString& names) const;

    // False makes a read under way stop at the next line and keep what it has,
    // and gives up waiting for the journal's lock.
    void SetRunning(bool running);

    const wxString& GetJournalPath() const { return m_journalPath; }
    // Whether the latest polls could read the journal, for the view to say so.
    JournalWatch::Report GetJournalReport() const { return m_journal.GetReport(); }

private:
    void ReleasePreviousOnceUnused();
    const wxString m_journalPath;
    std::atomic<bool> m_running{true};
    std::unique_ptr<wyx::IJobReadWriter> m_reader;
    // Polling thread only.
    ChangedJournal m_journal;

    std::mutex m_parseLock;

    mutable std::mutex m_lock;
    std::shared_ptr<const JobSnapshot> m_snapshot = std::make_shared<JobSnapshot>();
    // The read before, kept until the next one: by then the views have let go
    // of it, so the polling thread frees it, not the GUI thread.
    std::shared_ptr<const JobSnapshot> m_previous;
    std::atomic<std::uint64_t> m_generation{0};
};
