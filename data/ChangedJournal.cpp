#include "data/ChangedJournal.h"

#include <ctime>
#include <typeinfo>

#include <wx/filename.h>

#include "data/NamedMutex.h"

std::unique_ptr<wyx::IJobReadWriter> MakeJournalFileReader(const wxString& path, const std::atomic<bool>& running)
{
    std::unique_ptr<wyx::IJobReadWriter> reader(CreateJobReadWriter(kJobsFileReadWriterKind));
    if (auto* file = dynamic_cast<wyx::JobsFileReadWriter*>(reader.get()))
    {
        file->SetPath(path);
        file->SetKeepWaiting(&running);
    }
    return reader;
}

ChangedJournal::ChangedJournal(const wxString& path, wyx::IJobReadWriter* reader)
    : path(path), lockName(wxFileName(path).GetName()), reader(reader)
{
}

ChangedJournal::Outcome ChangedJournal::Poll(wxArrayString& lines, wyxos::FileStamp& stamp)
{
    const wyxos::FileStamp seenNow = wyxos::StatFile(path);
    if (!reader || !seenNow.exists || seenNow == lastSeen)
        return Outcome::Unchanged;
    return Note(ReadUnderLock(lines, stamp));
}

ChangedJournal::Outcome ChangedJournal::ReadUnderLock(wxArrayString& lines, wyxos::FileStamp& stamp)
{
    named_mutex_lock lock(lockName);
    if (!lock.usable())
        return Outcome::Unreadable;
    if (!lock.try_lock())
        return Outcome::Busy;
    // The producer holds the lock while it writes: a stamp taken under it is
    // the stamp of a whole file, and the read happens under the same lock.
    stamp = wyxos::StatFile(path);
    if (!stamp.exists || stamp == lastSeen)
        return Outcome::Unchanged;

    int result;
    if (typeid(*reader) == typeid(wyx::JobsFileReadWriter))
    {
        result = static_cast<wyx::JobsFileReadWriter&>(*reader).ReadJobsHoldingLock(lines);
    }
    else
    {
        // A reader of another kind (a scripted one in the tests) takes the lock itself.
        lock.unlock();
        result = reader->ReadJobs(lines);
        if (result == wyx::JobLockFailed)
            return Outcome::Busy;
    }
    if (result != wyx::JobOk)
    {
        // Wait for the next change rather than fail again every second.
        lastSeen = stamp;
        return Outcome::Unreadable;
    }
    return Outcome::Read;
}

ChangedJournal::Outcome ChangedJournal::Note(Outcome outcome)
{
    const std::time_t now = std::time(nullptr);
    bool news = false;
    switch (outcome)
    {
    case Outcome::Busy:
        news = watch.NoteBusy(now);
        break;
    case Outcome::Unreadable:
        news = watch.NoteUnreadable(now);
        break;
    case Outcome::Read:
        news = watch.NoteRead(now);
        break;
    case Outcome::Unchanged:
        break;
    }
    if (news)
        reportNews = true;
    return outcome;
}
