#include "data/JobStatusManager.h"

#include <ctime>

#include <wx/event.h>
#include <wx/filename.h>

#include "data/DataLocations.h"
#include "data/JobReadWriter.h"
#include "data/NamedMutex.h"
#include "data/StatusLine.h"
#include "platform/datasource/WyxDataSource.h"
#include "pump/CustomEvents.h"
#include "pump/EventBus.h"

namespace
{

constexpr int kStatusChannel = 2;

std::unique_ptr<wyx::IJobReadWriter> MakeFileReader(const wxString& path, const std::atomic<bool>& running)
{
    std::unique_ptr<wyx::IJobReadWriter> reader(CreateJobReadWriter(kJobsFileReadWriterKind));
    if (auto* file = dynamic_cast<wyx::JobsFileReadWriter*>(reader.get()))
    {
        file->SetPath(path);
        file->SetKeepWaiting(&running);
    }
    return reader;
}

} // namespace

JobStatusManager& JobStatusManager::GetInstance()
{
    static JobStatusManager instance(GetDataDirectory() + "TiveraJobsStatusFile.txt");
    return instance;
}

JobStatusManager::JobStatusManager(const wxString& journalPath, std::unique_ptr<wyx::IJobReadWriter> reader)
    : m_journalPath(journalPath), m_lockName(wxFileName(journalPath).GetName()),
      m_reader(reader ? std::move(reader) : MakeFileReader(journalPath, m_running))
{
}

JobStatusManager::~JobStatusManager()
{
    std::lock_guard<std::mutex> guard(m_lock);
    m_snapshot.reset();
    m_previous.reset();
}

void JobStatusManager::SetRunning(bool running)
{
    m_running = running;
}

JobStatusManager::ReadOutcome JobStatusManager::ReadChangedJournal(wxArrayString& lines,
                                                                   wyxos::FileStamp& readStamp)
{
    // An unchanged stamp needs no lock: an idle poll is one stat.
    if (!m_reader)
        return ReadOutcome::Unchanged;
    const wyxos::FileStamp seenNow = wyxos::StatFile(m_journalPath);
    if (!seenNow.exists || seenNow == m_lastSeen)
        return ReadOutcome::Unchanged;

    // The producer holds the lock while it writes: a stamp taken under it is
    // the stamp of a whole file, and the read happens under the same lock.
    named_mutex_lock lock(m_lockName);
    if (!lock.usable())
        return ReadOutcome::Unreadable;
    if (!lock.try_lock())
        return ReadOutcome::Busy;
    const wyxos::FileStamp stamp = wyxos::StatFile(m_journalPath);
    if (!stamp.exists || stamp == m_lastSeen)
        return ReadOutcome::Unchanged;

    int result;
    if (auto* file = dynamic_cast<wyx::JobsFileReadWriter*>(m_reader.get()))
    {
        result = file->ReadJobsHoldingLock(lines);
    }
    else
    {
        // A reader of another kind takes the lock itself.
        lock.unlock();
        result = m_reader->ReadJobs(lines);
        if (result == wyx::JobLockFailed)
            return ReadOutcome::Busy;
    }
    readStamp = stamp;
    return result == wyx::JobOk ? ReadOutcome::Read : ReadOutcome::Unreadable;
}

int JobStatusManager::Parse()
{
    std::lock_guard<std::mutex> parseGuard(m_parseLock);
    wxArrayString lines;
    wyxos::FileStamp stamp;
    const ReadOutcome outcome = ReadChangedJournal(lines, stamp);
    if (outcome == ReadOutcome::Unreadable)
        m_lastSeen = stamp; // wait for the next change
    const std::time_t now = std::time(nullptr);
    if (outcome == ReadOutcome::Busy && m_watch.NoteBusy(now))
        m_watchChanged = true;
    else if (outcome == ReadOutcome::Unreadable && m_watch.NoteUnreadable(now))
        m_watchChanged = true;
    if (outcome != ReadOutcome::Read)
        return 0;
    if (m_watch.NoteRead(now))
        m_watchChanged = true;

    auto fresh = std::make_shared<JobSnapshot>();
    std::vector<JobRecord>& jobs = fresh->jobs;
    std::vector<std::uint64_t>& startTimes = fresh->startTimes;
    jobs.reserve(lines.size());
    startTimes.reserve(lines.size());
    for (const wxString& line : lines)
    {
        if (!m_running)
            break;
        // Parsed where it is kept: a JobRecord moved is a JobRecord copied.
        jobs.emplace_back();
        std::uint64_t started = 0;
        if (ParseStatusLine(line, jobs.back(), &started))
            startTimes.push_back(started);
        else
            jobs.pop_back();
    }

    // A read cut short by a stop keeps what it has, and is read whole next time.
    if (m_running)
        m_lastSeen = stamp;

    std::shared_ptr<const JobSnapshot> released;
    {
        std::lock_guard<std::mutex> guard(m_lock);
        released = std::move(m_previous);
        m_previous = std::move(m_snapshot);
        m_snapshot = std::move(fresh);
        ++m_generation;
    }
    // Freed here, outside the lock, unless a view still shows that read.
    released.reset();
    return 1;
}

int JobStatusManager::Refresh()
{
    const int parsed = Parse();
    // A journal that turned busy or unreadable is news too: the view says so.
    if (!m_watchChanged.exchange(false) && parsed != 1)
        return 0;
    wxCommandEvent event(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, 0);
    EventBus::Get().Publish(ChannelKey(kStatusChannel), event);
    return parsed;
}

int JobStatusManager::GetJobs(std::vector<JobRecord>& jobs, std::vector<std::uint64_t>* startTimes) const
{
    const std::shared_ptr<const JobSnapshot> snapshot = GetSnapshot();
    jobs.insert(jobs.end(), snapshot->jobs.begin(), snapshot->jobs.end());
    if (startTimes)
        startTimes->insert(startTimes->end(), snapshot->startTimes.begin(), snapshot->startTimes.end());
    return 0;
}

std::shared_ptr<const JobSnapshot> JobStatusManager::GetSnapshot() const
{
    std::lock_guard<std::mutex> guard(m_lock);
    return m_snapshot;
}

long JobStatusManager::GetServers(wxArrayString& names) const
{
    return WyxDataSource::GetInstance().GetServersList(names);
}
