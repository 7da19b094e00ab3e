#include "data/JobLogManager.h"

#include <algorithm>
#include <chrono>
#include <ctime>
#include <typeinfo>
#include <locale>
#include <stdexcept>
#include <thread>

#include <wx/file.h>
#include <wx/filefn.h>
#include <wx/filename.h>

#include "data/DataLocations.h"
#include "data/DosTime.h"
#include "data/FolderErrors.h"
#include "data/JobReadWriter.h"
#include "data/NamedMutex.h"
#include "platform/datasource/WyxDataSource.h"
#include "platform/os/FileContents.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

// Lines are examined in place through wc_str(), which is a pointer into the
// string only where wxString holds wide characters.
static_assert(wxUSE_UNICODE_WCHAR, "journal lines are read in place as wide characters");

namespace
{

constexpr std::size_t kLogLinePieces = 8;
constexpr int kLogChannel = 1;

// A producer that keeps the journal locked longer than this makes a clear fail.
constexpr std::chrono::milliseconds kClearLockLimit{3000};
// Short enough to find the gaps between a busy producer's appends.
constexpr std::chrono::milliseconds kClearLockAttemptPause{5};

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

// A fixed UTF-8 locale rather than the process's: texts must fold alike
// whatever locale the program runs under ("C" folds only ASCII).
const std::ctype<wchar_t>& Folding()
{
    static const std::ctype<wchar_t>& folding = std::use_facet<std::ctype<wchar_t>>(KeyFoldingLocale());
    return folding;
}

void FoldInto(const wchar_t* text, std::size_t length, std::wstring& folded)
{
    folded.assign(text, length);
    if (length != 0)
        Folding().tolower(&folded[0], &folded[0] + length);
}

struct PieceSpan
{
    std::size_t start = 0;
    std::size_t length = 0;
};

using LogPieces = std::array<PieceSpan, kLogLinePieces>;

// Journal field order: key, hot folder, file, server, time, status, detail, tag.
enum LogPiece : std::size_t
{
    KeyPiece = 0,
    HotFolderPiece,
    FilePiece,
    ServerPiece,
    DosTimePiece,
    StatusPiece,
    DetailPiece,
    ActionPiece
};

// Splits on TAB, empty pieces dropped; false unless there are exactly eight.
bool FindLogPieces(const wxString& line, LogPieces& pieces)
{
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
            pieces[count++] = PieceSpan{start, tab - start};
        }
        start = tab + 1;
    }
    return count == kLogLinePieces;
}

wxString PieceText(const wxString& line, const PieceSpan& piece)
{
    return line.substr(piece.start, piece.length);
}

bool PieceIsNoCase(const wchar_t* line, const PieceSpan& piece, const std::wstring& text)
{
    if (piece.length != text.length())
        return false;
    const std::ctype<wchar_t>& folding = Folding();
    for (std::size_t i = 0; i < piece.length; ++i)
    {
        if (folding.tolower(line[piece.start + i]) != folding.tolower(text[i]))
            return false;
    }
    return true;
}

const std::wstring kSucceeded = L"Transferred Successfully";
const std::wstring kAdded = L"ADDED";

// Tries the journal's lock until it is free or the limit has passed. Clear
// All runs on a worker thread, so the window stays responsive meanwhile; the
// attempts never block, so nothing is left waiting for the lock afterwards.
class BoundedJournalLock
{
public:
    BoundedJournalLock(const wxString& name, std::chrono::milliseconds limit) : m_lock(name)
    {
        const auto until = std::chrono::steady_clock::now() + limit;
        while (m_lock.usable() && !(m_locked = m_lock.try_lock()) && std::chrono::steady_clock::now() < until)
            std::this_thread::sleep_for(kClearLockAttemptPause);
    }

    bool IsLocked() const { return m_locked; }

private:
    named_mutex_lock m_lock;
    bool m_locked = false;
};

} // namespace

struct JobLogManager::LineLayout
{
    std::size_t line = 0;
    LogPieces pieces;
    bool added = false;
};

bool SplitLogLine(const wxString& line, JobRecord& record, wxString& action)
{
    LogPieces pieces;
    if (!FindLogPieces(line, pieces))
        return false;
    record[LogField::Key] = PieceText(line, pieces[KeyPiece]);
    record[LogField::HotFolderPath] = PieceText(line, pieces[HotFolderPiece]);
    record[LogField::FilePath] = PieceText(line, pieces[FilePiece]);
    record[LogField::Server] = PieceText(line, pieces[ServerPiece]);
    record[LogField::DosTime] = PieceText(line, pieces[DosTimePiece]);
    record[LogField::Status] = PieceText(line, pieces[StatusPiece]);
    record[LogField::Detail] = PieceText(line, pieces[DetailPiece]);
    record[LogField::TimeText].clear();
    action = PieceText(line, pieces[ActionPiece]);
    return true;
}

std::wstring FoldedJobKey(const wxString& key)
{
    std::wstring folded;
    FoldInto(key.wc_str(), key.length(), folded);
    return folded;
}

JobLogManager& JobLogManager::GetInstance()
{
    static JobLogManager instance(GetDataDirectory() + "TiveraJobsLogFile.txt");
    return instance;
}

JobLogManager::JobLogManager(const wxString& journalPath, std::unique_ptr<wyx::IJobReadWriter> reader)
    : m_journalPath(journalPath),
      m_reader(reader ? std::move(reader) : MakeJournalFileReader(journalPath, m_running)),
      m_iconRefreshSetting(&ReadIconRefreshSetting), m_journal(journalPath, m_reader.get())
{
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
    const int parsed = Parse();
    // A journal that turned busy or unreadable is news too: the view says so.
    if (!m_journal.TakeReportNews() && parsed != 1)
        return 0;
    wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, 0);
    EventBus::Get().Publish(ChannelKey(kLogChannel), update);
    return parsed;
}

int JobLogManager::Parse()
{
    std::lock_guard<std::mutex> parsing(m_parseLock);

    std::uint64_t clearGeneration = 0;
    bool firstRead = false;
    {
        std::lock_guard<std::mutex> guard(m_lock);
        m_newFirst = m_newEnd = m_firstSequence + m_records.size();
        clearGeneration = m_clearGeneration;
        firstRead = m_firstRead;
    }
    if (!m_running.load() || !m_reader)
        return 0;

    wxArrayString lines;
    wyxos::FileStamp stamp;
    if (m_journal.Poll(lines, stamp) != ChangedJournal::Outcome::Read)
        return 0;
    std::vector<LineLayout> layouts;
    std::vector<wxString> times;
    LayOutLines(lines, firstRead, layouts, times);
    bool tookIn = false;
    if (TakeIn(lines, layouts, times, clearGeneration, tookIn))
        m_journal.Accept(stamp);
    return tookIn && m_running.load() ? 1 : 0;
}

// Outside the lock: finds the pieces of every line, and on the first read, when
// every line is taken in, formats the times as well.
void JobLogManager::LayOutLines(const wxArrayString& lines, bool formatTimes,
                                std::vector<LineLayout>& layouts, std::vector<wxString>& times) const
{
    layouts.reserve(lines.size());
    // Reserved in full: a growing vector of wxString copies every text it moves.
    if (formatTimes)
        times.reserve(lines.size());
    for (std::size_t i = 0; i < lines.size(); ++i)
    {
        if (!m_running.load())
            break;
        LineLayout layout;
        layout.line = i;
        if (!FindLogPieces(lines[i], layout.pieces))
            continue;
        layout.added = PieceIsNoCase(lines[i].wc_str(), layout.pieces[ActionPiece], kAdded);
        if (formatTimes)
        {
            // Swapped in: wxString has no move, and a pushed text is a copied text.
            const PieceSpan& time = layout.pieces[DosTimePiece];
            wxString formatted = FormatDosTime(lines[i].wc_str() + time.start, time.length);
            times.emplace_back();
            times.back().swap(formatted);
        }
        layouts.push_back(layout);
    }
}

bool JobLogManager::TakeIn(const wxArrayString& lines, const std::vector<LineLayout>& layouts,
                           std::vector<wxString>& times, std::uint64_t clearGeneration, bool& tookIn)
{
    std::lock_guard<std::mutex> guard(m_lock);
    // Cleared while we read: what we read may be the journal before it was
    // emptied. Leave the stamp as it was so the next poll reads the new one.
    if (m_clearGeneration != clearGeneration)
        return false;

    m_newFirst = m_firstSequence + m_records.size();
    if (m_firstRead)
        m_keys.reserve(m_keys.size() + layouts.size());
    std::wstring key;
    std::wstring scratch;
    for (std::size_t i = 0; i < layouts.size(); ++i)
    {
        if (!m_running.load())
            break;
        const LineLayout& layout = layouts[i];
        const wxString& line = lines[layout.line];
        const wchar_t* text = line.wc_str();
        const LogPieces& pieces = layout.pieces;

        if (!PieceIsNoCase(text, pieces[StatusPiece], kSucceeded))
            NoteErrorFolder(text + pieces[HotFolderPiece].start, pieces[HotFolderPiece].length, scratch);

        FoldInto(text + pieces[KeyPiece].start, pieces[KeyPiece].length, key);
        if (!m_firstRead && (!layout.added || m_keys.count(key) != 0))
            continue;
        m_keys.insert(key);

        // Assigned from the line in place: one allocation per field, where a
        // temporary would be copied (wxString has no move).
        JobRecord& record = m_records.emplace_back();
        auto take = [&](std::size_t field, std::size_t piece)
        { record[field].assign(text + pieces[piece].start, pieces[piece].length); };
        take(LogField::Key, KeyPiece);
        take(LogField::FilePath, FilePiece);
        take(LogField::HotFolderPath, HotFolderPiece);
        take(LogField::Server, ServerPiece);
        take(LogField::Status, StatusPiece);
        take(LogField::Detail, DetailPiece);
        take(LogField::DosTime, DosTimePiece);
        if (i < times.size())
            record[LogField::TimeText].swap(times[i]);
        else
        {
            wxString formatted = FormatDosTime(record[LogField::DosTime]);
            record[LogField::TimeText].swap(formatted);
        }
        tookIn = true;
    }
    m_newEnd = m_firstSequence + m_records.size();
    m_firstRead = false;
    return true;
}

void JobLogManager::NoteErrorFolder(const wchar_t* folder, std::size_t length, std::wstring& scratch)
{
    scratch.assign(folder, length);
    if (m_errorFolderSet.insert(scratch).second)
        m_errorFolders.Add(wxString(folder, length));
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
    const std::uint64_t end = m_firstSequence + m_records.size();
    const std::uint64_t from = std::min(std::max(m_newFirst, m_firstSequence), end);
    const std::uint64_t to = std::min(std::max(m_newEnd, from), end);
    records.insert(records.end(), m_records.begin() + static_cast<std::ptrdiff_t>(from - m_firstSequence),
                   m_records.begin() + static_cast<std::ptrdiff_t>(to - m_firstSequence));
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

std::size_t JobLogManager::GetRecordsSince(std::uint64_t& cursor, std::vector<JobRecord>& records,
                                           const std::function<bool(const JobRecord&)>& take) const
{
    std::lock_guard<std::mutex> guard(m_lock);
    const std::uint64_t end = m_firstSequence + m_records.size();
    const std::uint64_t from = std::min(std::max(cursor, m_firstSequence), end);
    // Chosen first and copied after: reserved in full, the vector never copies
    // a record twice (wxString has no move).
    std::vector<std::size_t> chosen;
    for (std::size_t i = static_cast<std::size_t>(from - m_firstSequence); i < m_records.size(); ++i)
    {
        if (take(m_records[i]))
            chosen.push_back(i);
    }
    records.reserve(records.size() + chosen.size());
    for (const std::size_t i : chosen)
        records.push_back(m_records[i]);
    cursor = end;
    return chosen.size();
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
    if (ClearJournalAndRecords() != 0)
        return 1;
    ResetAllFolderErrors();
    return 0;
}

int JobLogManager::ClearJournalAndRecords()
{
    // Held across the replacement and the emptying of the list, so that a
    // producer's append lands either before (and is cleared) or after (in the
    // new file), and a poll never takes the old lines in again.
    const BoundedJournalLock journalLock(m_journal.GetLockName(), kClearLockLimit);
    if (!journalLock.IsLocked() || !ReplaceJournalWithEmptyFile())
        return 1;
    std::lock_guard<std::mutex> guard(m_lock);
    m_firstSequence += m_records.size();
    m_records.clear();
    m_records.shrink_to_fit();
    m_keys.clear();
    ++m_clearGeneration;
    return 0;
}

// Written like every other change of a journal: the producer's group, mode and
// owner stay, and a failure leaves the old journal whole.
bool JobLogManager::ReplaceJournalWithEmptyFile()
{
    if (wyxos::StatFile(m_journalPath).exists)
        return wyxos::ReplaceFileContents(m_journalPath, std::string());
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
