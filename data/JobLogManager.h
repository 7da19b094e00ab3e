#pragma once

#include <atomic>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

#include "data/JobReadWriter.h"
#include "data/JobRecord.h"
#include "data/ChangedJournal.h"
#include "platform/os/FileStamp.h"

// A log journal line as a record: false unless it has exactly eight
// TAB-separated pieces (empty pieces do not count). Everything but TimeText is
// filled; action receives the line's tag.
bool SplitLogLine(const wxString& line, JobRecord& record, wxString& action);

// The key as the duplicate check compares it: each character lower-cased by
// Unicode's simple mapping, the same in every locale.
std::wstring FoldedJobKey(const wxString& key);

// Results of AcknowledgeFolderErrors.
enum AcknowledgeResult : int
{
    ErrorMarkerRemoved = 0,
    NoErrorMarker = 1,
    ErrorMarkerKept = 2 // a marker is there but could not be removed
};

// The history of finished jobs read from the log journal. The first read takes
// every line; later reads take only "ADDED" lines of jobs not seen before, so
// records stay after the producer trims the journal, until ClearLog.
//
// Parse and Refresh run on the polling thread, one call at a time; everything
// else on the GUI thread. The lists are guarded by one mutex, held while they
// change or are copied; the journal is read outside it.
class JobLogManager
{
public:
    static JobLogManager& GetInstance();

    // reader: how the journal is read; null gives a JobsFileReadWriter on journalPath.
    explicit JobLogManager(const wxString& journalPath,
                           std::unique_ptr<wyx::IJobReadWriter> reader = nullptr);
    virtual ~JobLogManager();

    // 1 when records were taken in (and, for Refresh, the log views were told).
    // Refresh also tells the views, with 0, when the journal turned busy,
    // unreadable or readable again.
    int Refresh();
    int Parse();

    std::size_t GetRecordCount() const;
    // Both append copies; GetNewRecords gives the records of the latest read
    // that are still held (none once the log was cleared).
    int GetAllRecords(std::vector<JobRecord>& records) const;
    int GetNewRecords(std::vector<JobRecord>& records) const;

    // Appends every record taken in since the cursor, moves the cursor past them
    // and returns how many were appended. A view that starts at 0 gets the whole
    // list; after ClearLog it gets only what came in since. Unlike GetNewRecords,
    // nothing is missed when the view handles an update after further reads.
    std::size_t GetRecordsSince(std::uint64_t& cursor, std::vector<JobRecord>& records) const;
    // The same, but copies only the records `take` accepts; `take` sees every
    // record since the cursor, in order, under the model's lock. Returns how
    // many were copied. A view relisting 100,000 records under a filter copies
    // only those it lists.
    std::size_t GetRecordsSince(std::uint64_t& cursor, std::vector<JobRecord>& records,
                                const std::function<bool(const JobRecord&)>& take) const;

    // The display name (last path component) of every configured hot folder; returns 1.
    int GetHotFolderNames(wxArrayString& names) const;
    // Hot folders with failed jobs, in the order first seen.
    wxArrayString GetErrorFolders() const;

    // Replaces the journal by an empty file under the journal's lock, then
    // empties the list and resets every folder's error signal. 1 when the
    // journal could not be replaced (its lock stayed held, or the file system
    // refused): then nothing at all has changed.
    int ClearLog();
    // The first half of ClearLog, without the error signals: waits for the
    // journal's lock (up to seconds), so it may run away from the GUI thread,
    // which then calls ResetAllFolderErrors when it returned 0.
    int ClearJournalAndRecords();
    void ResetAllFolderErrors();
    // See AcknowledgeResult.
    int AcknowledgeFolderErrors(const wxString& hotFolderPath);

    // Whether the latest polls could read the journal, for the view to say so.
    JournalWatch::Report GetJournalReport() const { return m_journal.GetReport(); }

    // False stops a read under way at the next line and makes later reads take nothing.
    void SetRunning(bool running);

    // Where the icon refresh mode comes from; by default the configuration.
    void SetIconRefreshSettingSource(std::function<wxString()> source);

private:
    struct LineLayout;

    void LayOutLines(const wxArrayString& lines, bool formatTimes, std::vector<LineLayout>& layouts,
                     std::vector<wxString>& times) const;
    // False when the list was cleared meanwhile and what was read is dropped.
    bool TakeIn(const wxArrayString& lines, const std::vector<LineLayout>& layouts,
                std::vector<wxString>& times, std::uint64_t clearGeneration, bool& tookIn);
    void NoteErrorFolder(const wchar_t* folder, std::size_t length, std::wstring& scratch);
    bool ReplaceJournalWithEmptyFile();

    const wxString m_journalPath;
    std::atomic<bool> m_running{true};
    std::unique_ptr<wyx::IJobReadWriter> m_reader;
    std::function<wxString()> m_iconRefreshSetting;

    // Polling thread only.
    std::mutex m_parseLock;
    ChangedJournal m_journal;

    mutable std::mutex m_lock;
    // A deque, as wxString has no move: a growing vector would copy every record.
    std::deque<JobRecord> m_records;
    std::unordered_set<std::wstring> m_keys;
    // Records are numbered as taken in; numbers go on across ClearLog, so a
    // view's cursor stays meaningful. The latest read's records are [newFirst, newEnd).
    std::uint64_t m_firstSequence = 0; // number of m_records.front()
    std::uint64_t m_newFirst = 0;
    std::uint64_t m_newEnd = 0;
    std::uint64_t m_clearGeneration = 0;
    bool m_firstRead = true;
    wxArrayString m_errorFolders;
    std::unordered_set<std::wstring> m_errorFolderSet;
};
