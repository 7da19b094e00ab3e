#pragma once

#include <atomic>
#include <memory>

#include <wx/arrstr.h>
#include <wx/string.h>

#include "data/JobReadWriter.h"
#include "data/JournalWatch.h"
#include "platform/os/FileStamp.h"

// The reader a model uses unless it is given one: the journal file itself,
// giving up any wait for its lock once `running` reads false.
std::unique_ptr<wyx::IJobReadWriter> MakeJournalFileReader(const wxString& path, const std::atomic<bool>& running);

// How a model polls its journal: read only when the file's stamp changed (an
// idle poll is one stat and never touches the producer's lock), read under the
// lock the poll tried and never wait for it, and note what each poll came to.
//
// Poll and Accept run on the polling thread; the watch is read on the GUI thread.
class ChangedJournal
{
public:
    enum class Outcome
    {
        Unchanged,  // missing or unchanged: look again next time
        Busy,       // changed, but its lock is held: look again next time
        Unreadable, // changed but could not be read (or its lock cannot be used): wait for the next change
        Read
    };

    // reader: reads the journal at `path`; not owned.
    ChangedJournal(const wxString& path, wyx::IJobReadWriter* reader);

    // On Read, `stamp` is that of what was read: Accept it once the lines are
    // taken in, so that a read the model drops is read again at the next poll.
    Outcome Poll(wxArrayString& lines, wyxos::FileStamp& stamp);
    void Accept(const wyxos::FileStamp& stamp) { lastSeen = stamp; }

    JournalWatch::Report GetReport() const { return watch.Get(); }
    // Whether the report changed since the last call: the views need telling.
    bool TakeReportNews() { return reportNews.exchange(false); }

    const wxString& GetLockName() const { return lockName; }

private:
    Outcome ReadUnderLock(wxArrayString& lines, wyxos::FileStamp& stamp);
    Outcome Note(Outcome outcome);

    const wxString path;
    const wxString lockName;
    wyx::IJobReadWriter* const reader;
    wyxos::FileStamp lastSeen; // none at first: an existing journal is read at the first poll
    JournalWatch watch;
    std::atomic<bool> reportNews{false};
};
