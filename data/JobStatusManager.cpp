#include "data/JobStatusManager.h"

#include <wx/event.h>
#include <wx/filename.h>

#include "data/DataLocations.h"
#include "data/JobReadWriter.h"
#include "data/StatusLine.h"
#include "platform/datasource/WyxDataSource.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace
{
constexpr int kStatusChannel = 2;
} // namespace

JobStatusManager& JobStatusManager::GetInstance()
{
    static JobStatusManager instance(GetDataDirectory() + "TiveraJobsStatusFile.txt");
    return instance;
}

JobStatusManager::JobStatusManager(const wxString& journalPath, std::unique_ptr<wyx::IJobReadWriter> reader)
    : m_journalPath(journalPath), m_reader(reader ? std::move(reader) : MakeJournalFileReader(journalPath, m_running)),
      m_journal(journalPath, m_reader.get())
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

int JobStatusManager::Parse()
{
    std::lock_guard<std::mutex> parseGuard(m_parseLock);
    ReleasePreviousOnceUnused();
    wxArrayString lines;
    wyxos::FileStamp stamp;
    if (m_journal.Poll(lines, stamp) != ChangedJournal::Outcome::Read)
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

    // A read cut short by a stop keeps what it has, and is read whole next time.
    if (m_running)
        m_journal.Accept(stamp);

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

void JobStatusManager::ReleasePreviousOnceUnused()
{
    std::shared_ptr<const JobSnapshot> released;
    {
        std::lock_guard<std::mutex> guard(m_lock);
        // Nobody can take a new share of it, so one owner means only us: the
        // views have moved on, and a journal that stays as it is must not keep
        // the read before alive (it may be a huge one).
        if (m_previous.use_count() == 1)
            released = std::move(m_previous);
    }
}

int JobStatusManager::Refresh()
{
    const int parsed = Parse();
    // A journal that turned busy or unreadable is news too: the view says so.
    if (!m_journal.TakeReportNews() && parsed != 1)
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
