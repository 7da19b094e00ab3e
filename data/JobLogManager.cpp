#include "data/JobLogManager.h"

#include <algorithm>
#include <locale>
#include <stdexcept>

#include <wx/file.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/utils.h>

#include "data/DataLocations.h"
#include "data/DosTime.h"
#include "data/FolderErrors.h"
#include "data/JobReadWriter.h"
#include "data/NamedMutex.h"
#include "platform/datasource/WyxDataSource.h"
#include "pump/CustomEvents.h"
#include "pump/EventBus.h"

namespace
{

constexpr std::size_t kLogLinePieces = 8;
constexpr int kLogChannel = 1;

// ClearLog runs on the GUI thread: a producer that keeps the journal locked
// longer than this is not waited for.
constexpr int kClearLockWaitMs = 2000;
constexpr int kClearLockRetryMs = 10;

bool IsFailedJob(const JobRecord& record)
{
    return !record[LogField::Status].IsSameAs("Transferred Successfully", false);
}

const std::locale& KeyFoldingLocale()
{
    static const std::locale locale = []
    {
        try
        {
            return std::locale("C.UTF-8");
        }
        catch (const std::runtime_error&)
        {
            return std::locale::classic();
        }
    }();
    return locale;
}

bool LockWithin(named_mutex_lock& lock, int milliseconds)
{
    for (int waited = 0;; waited += kClearLockRetryMs)
    {
        if (lock.try_lock())
            return true;
        if (waited >= milliseconds)
            return false;
        wxMilliSleep(kClearLockRetryMs);
    }
}

} // namespace

bool SplitLogLine(const wxString& line, JobRecord& record, wxString& action)
{
    std::array<wxString, kLogLinePieces> pieces;
    std::size_t count = 0;
    const std::size_t length = line.length();
    std::size_t start = 0;
    while (start < length)
    {
        std::size_t tab = line.find('\t', start);
        if (tab == wxString::npos)
            tab = length;
        if (tab > start)
        {
            if (count == kLogLinePieces)
                return false;
            pieces[count++] = line.substr(start, tab - start);
        }
        start = tab + 1;
    }
    if (count != kLogLinePieces)
        return false;

    record[LogField::Key] = std::move(pieces[0]);
    record[LogField::HotFolderPath] = std::move(pieces[1]);
    record[LogField::FilePath] = std::move(pieces[2]);
    record[LogField::Server] = std::move(pieces[3]);
    record[LogField::DosTime] = std::move(pieces[4]);
    record[LogField::Status] = std::move(pieces[5]);
    record[LogField::Detail] = std::move(pieces[6]);
    record[LogField::TimeText].clear();
    action = std::move(pieces[7]);
    return true;
}

std::wstring FoldedJobKey(const wxString& key)
{
    // A fixed UTF-8 locale rather than the process's: keys must fold alike
    // whatever locale the program runs under ("C" folds only ASCII).
    static const std::ctype<wchar_t>& folding = std::use_facet<std::ctype<wchar_t>>(KeyFoldingLocale());
    std::wstring folded = key.ToStdWstring();
    if (!folded.empty())
        folding.tolower(&folded[0], &folded[0] + folded.size());
    return folded;
}

JobLogManager& JobLogManager::GetInstance()
{
    static JobLogManager instance(GetDataDirectory() + "TiveraJobsLogFile.txt");
    return instance;
}

JobLogManager::JobLogManager(const wxString& journalPath, std::unique_ptr<wyx::IJobReadWriter> reader)
    : m_journalPath(journalPath), m_lockName(wxFileName(journalPath).GetName()), m_reader(std::move(reader)),
      m_iconRefreshSetting(&ReadIconRefreshSetting)
{
    if (!m_reader)
    {
        auto fileReader = std::unique_ptr<wyx::IJobReadWriter>(CreateJobReadWriter(kJobsFileReadWriterKind));
        if (auto* journal = dynamic_cast<wyx::JobsFileReadWriter*>(fileReader.get()))
        {
            journal->SetPath(m_journalPath);
            // A read waiting for the producer gives up when the program stops.
            journal->SetKeepWaiting(&m_running);
        }
        m_reader = std::move(fileReader);
    }
}

JobLogManager::~JobLogManager() = default;

void JobLogManager::SetRunning(bool running)
{
    m_running.store(running);
}

void JobLogManager::SetIconRefreshSettingSource(std::function<wxString()> source)
{
    m_iconRefreshSetting = std::move(source);
}

int JobLogManager::Refresh()
{
    if (Parse() != 1)
        return 0;
    wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, 0);
    EventBus::Get().Publish(ChannelKey(kLogChannel), update);
    return 1;
}

int JobLogManager::Parse()
{
    std::lock_guard<std::mutex> parsing(m_parseLock);

    std::uint64_t clearGeneration = 0;
    bool firstRead = false;
    {
        std::lock_guard<std::mutex> guard(m_lock);
        m_newRecords.clear();
        clearGeneration = m_clearGeneration;
        firstRead = m_firstRead;
    }
    if (!m_running.load() || !m_reader)
        return 0;

    std::vector<ReadLine> read;
    wyxos::FileStamp stamp;
    if (!ReadChangedJournal(read, firstRead, stamp))
        return 0;
    bool tookIn = false;
    if (TakeIn(read, clearGeneration, tookIn))
        m_lastSeen = stamp;
    return tookIn && m_running.load() ? 1 : 0;
}

// Reads the journal when it changed since the last read. Its stamp is stored as
// seen only once the content behind it has been taken in, so a change that the
// producer's lock kept us from reading is read at a later poll.
bool JobLogManager::ReadChangedJournal(std::vector<ReadLine>& read, bool formatTimes, wyxos::FileStamp& stamp)
{
    if (!wyxos::StatFile(m_journalPath).exists)
        return false;
    {
        named_mutex_lock journalLock(m_lockName);
        if (!journalLock.try_lock())
            return false;
        // Taken under the lock, so no write is half done; taken before reading,
        // so a write that slips in before ReadJobs is seen again next time.
        stamp = wyxos::StatFile(m_journalPath);
        if (!stamp.exists || stamp == m_lastSeen)
            return false;
    }

    wxArrayString lines;
    const int result = m_reader->ReadJobs(lines);
    if (result == wyx::JobLockFailed)
        return false;
    if (result != wyx::JobOk)
    {
        // Unreadable: wait for the next change rather than retry every second.
        m_lastSeen = stamp;
        return false;
    }

    read.reserve(lines.size());
    wxString action;
    for (const wxString& line : lines)
    {
        if (!m_running.load())
            break;
        ReadLine parsed;
        if (!SplitLogLine(line, parsed.record, action))
            continue;
        parsed.added = action.IsSameAs("ADDED", false);
        if (formatTimes)
            parsed.record[LogField::TimeText] = FormatDosTime(parsed.record[LogField::DosTime]);
        read.push_back(std::move(parsed));
    }
    return true;
}

bool JobLogManager::TakeIn(std::vector<ReadLine>& read, std::uint64_t clearGeneration, bool& tookIn)
{
    {
        std::lock_guard<std::mutex> guard(m_lock);
        // Cleared while we read: what we read may be the journal before it was
        // emptied. Leave the stamp as it was so the next poll reads the new one.
        if (m_clearGeneration != clearGeneration)
            return false;

        for (ReadLine& line : read)
        {
            if (!m_running.load())
                break;
            JobRecord& record = line.record;
            NoteErrorFolder(record);

            std::wstring key = FoldedJobKey(record[LogField::Key]);
            if (!m_firstRead && (!line.added || m_keys.count(key) != 0))
                continue;
            if (record[LogField::TimeText].empty())
                record[LogField::TimeText] = FormatDosTime(record[LogField::DosTime]);
            m_keys.insert(std::move(key));
            m_newRecords.push_back(record);
            m_records.push_back(std::move(record));
            tookIn = true;
        }
        m_firstRead = false;
    }
    return true;
}

void JobLogManager::NoteErrorFolder(const JobRecord& record)
{
    if (!IsFailedJob(record))
        return;
    const wxString& folder = record[LogField::HotFolderPath];
    if (m_errorFolderSet.insert(folder.ToStdWstring()).second)
        m_errorFolders.Add(folder);
}

std::size_t JobLogManager::GetRecordCount() const
{
    std::lock_guard<std::mutex> guard(m_lock);
    return m_records.size();
}

int JobLogManager::GetAllRecords(std::vector<JobRecord>& records) const
{
    std::lock_guard<std::mutex> guard(m_lock);
    records.insert(records.end(), m_records.begin(), m_records.end());
    return 0;
}

int JobLogManager::GetNewRecords(std::vector<JobRecord>& records) const
{
    std::lock_guard<std::mutex> guard(m_lock);
    records.insert(records.end(), m_newRecords.begin(), m_newRecords.end());
    return 0;
}

std::size_t JobLogManager::GetRecordsSince(std::uint64_t& cursor, std::vector<JobRecord>& records) const
{
    std::lock_guard<std::mutex> guard(m_lock);
    const std::uint64_t end = m_firstSequence + m_records.size();
    const std::uint64_t from = std::min(std::max(cursor, m_firstSequence), end);
    const auto first = m_records.begin() + static_cast<std::ptrdiff_t>(from - m_firstSequence);
    records.insert(records.end(), first, m_records.end());
    cursor = end;
    return static_cast<std::size_t>(end - from);
}

int JobLogManager::GetHotFolderNames(wxArrayString& names) const
{
    names.clear();
    wxArrayString folders;
    WyxDataSource::GetInstance().GetHotFoldersList(folders);
    for (wxString folder : folders)
    {
        // "/jobs/In/" names the folder "In", not "".
        while (folder.length() > 1 && wxFileName::IsPathSeparator(folder.Last()))
            folder.RemoveLast();
        names.Add(folder.AfterLast(wxFileName::GetPathSeparator()));
    }
    return 1;
}

wxArrayString JobLogManager::GetErrorFolders() const
{
    std::lock_guard<std::mutex> guard(m_lock);
    return m_errorFolders;
}

int JobLogManager::ClearLog()
{
    bool replaced = false;
    {
        // Held across delete and create, so that a producer's append lands
        // either before (and is cleared) or after (in the new file), and never
        // writes the old lines back.
        named_mutex_lock journalLock(m_lockName);
        const bool locked = LockWithin(journalLock, kClearLockWaitMs);
        {
            std::lock_guard<std::mutex> guard(m_lock);
            m_firstSequence += m_records.size();
            m_records.clear();
            m_records.shrink_to_fit();
            m_keys.clear();
            ++m_clearGeneration;
        }
        if (locked)
            replaced = ReplaceJournalWithEmptyFile();
    }
    ResetAllFolderErrors();
    return replaced ? 0 : 1;
}

bool JobLogManager::ReplaceJournalWithEmptyFile()
{
    if (wxFileName::Exists(m_journalPath, wxFILE_EXISTS_ANY) && !wxRemoveFile(m_journalPath))
        return false;
    wxFile created;
    return created.Create(m_journalPath, false);
}

void JobLogManager::ResetAllFolderErrors()
{
    wxArrayString folders;
    WyxDataSource::GetInstance().GetHotFoldersList(folders);
    for (const wxString& folder : folders)
        RemoveErrorMarker(folder);

    const IconRefreshMode mode = IconRefreshModeFromSetting(m_iconRefreshSetting());
    if (mode == IconRefreshMode::ShellNotification)
    {
        RefreshFolderIcon(mode, wxString());
    }
    else if (mode == IconRefreshMode::FolderIcons)
    {
        wxArrayString errorFolders;
        {
            std::lock_guard<std::mutex> guard(m_lock);
            errorFolders.swap(m_errorFolders);
            m_errorFolderSet.clear();
        }
        for (const wxString& folder : errorFolders)
            RefreshFolderIcon(mode, folder);
    }
}

int JobLogManager::AcknowledgeFolderErrors(const wxString& hotFolderPath)
{
    const MarkerRemoval removal = RemoveErrorMarker(hotFolderPath);
    if (removal == MarkerRemoval::NoMarker)
        return NoErrorMarker;
    RefreshFolderIcon(IconRefreshModeFromSetting(m_iconRefreshSetting()), hotFolderPath);
    return removal == MarkerRemoval::Removed ? ErrorMarkerRemoved : ErrorMarkerKept;
}
