#include "data/JobStatusManager.h"

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

JobStatusManager::ReadOutcome JobStatusManager::ReadChangedJournal(wxArrayString& lines)
{
    // An unchanged stamp needs no lock: an idle poll is one stat.
    if (!m_reader)
        return ReadOutcome::Unchanged;
    const wyxos::FileStamp seenNow = wyxos::StatFile(m_journalPath);
    if (!seenNow.exists || seenNow == m_lastSeen)
        return ReadOutcome::Unchanged;

    wyxos::FileStamp stamp;
    {
        // The producer holds the lock while it writes: a stamp taken under it
        // is the stamp of a whole file.
        named_mutex_lock lock(m_lockName);
        if (!lock.try_lock())
            return ReadOutcome::Unchanged;
        stamp = wyxos::StatFile(m_journalPath);
        if (!stamp.exists || stamp == m_lastSeen)
            return ReadOutcome::Unchanged;
    }

    // A write between the check and the read only makes the next poll read once
    // more: the stamp kept is never newer than the content read.
    const int result = m_reader->ReadJobs(lines);
    if (result == wyx::JobLockFailed)
        return ReadOutcome::Unchanged;
    m_lastSeen = stamp;
    return result == wyx::JobOk ? ReadOutcome::Read : ReadOutcome::Unreadable;
}

int JobStatusManager::Parse()
{
    std::lock_guard<std::mutex> parseGuard(m_parseLock);
    wxArrayString lines;
    if (ReadChangedJournal(lines) != ReadOutcome::Read)
        return 0;

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
    if (Parse() != 1)
        return 0;
    wxCommandEvent event(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, 0);
    EventBus::Get().Publish(ChannelKey(kStatusChannel), event);
    return 1;
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
