#pragma once

#include "data/JobRecord.h"

#include <wx/string.h>

#include <array>
#include <deque>
#include <functional>
#include <unordered_map>
#include <unordered_set>
#include <vector>

// What the Log tab makes of log records, free of windows: which records it
// lists, the cells of a row, the folders whose errors it acknowledges and the
// order of a sorted column.
namespace logrows
{

// The status of a job that went through; never translated.
extern const wxString kSucceeded;

// A job failed unless its status, without trailing white space, is exactly
// (case included) "Transferred Successfully".
bool IsFailed(const JobRecord& record);

// The two filters of the tab: the complete or the error log, and all hot
// folders or the one whose name (last path component) is `folder`.
struct LogFilter
{
    bool errorsOnly = false;
    bool byFolder = false;
    wxString folder;

    bool Shows(const JobRecord& record) const;
};

// Turns a model record into the copy a row keeps: the file path becomes the
// file name with its extension. A row copy gives the same cells again.
void MakeRowCopy(JobRecord& record);

// Exchanges every field; wxString has no move, so this is the cheap way to
// hand a record over.
void SwapRecords(JobRecord& a, JobRecord& b);

enum LogColumn : int
{
    WarningColumn = 0,
    FileNameColumn,
    HotFolderColumn,
    ServerColumn,
    StartTimeColumn,
    StatusColumn,
    kLogColumnCount
};

// Translations of the few distinct statuses, looked up once each rather than
// once per row.
class StatusTexts
{
public:
    explicit StatusTexts(std::function<wxString(const wxString&)> translate);

    // The translation of the status without trailing white space.
    const wxString& Translated(const wxString& status);

private:
    std::function<wxString(const wxString&)> translate;
    std::unordered_map<wxString, wxString> known;
};

struct LogRowCells
{
    bool warning = false;
    std::array<wxString, kLogColumnCount> texts;
};

// The cells of a row from a record or a row copy: no text in the warning
// column, the file title, the hot folder's name, server, start time and the
// translated status.
void FillCells(const JobRecord& row, StatusTexts& statuses, LogRowCells& cells);

// The hot folders whose errors the error log acknowledges, from the records
// as they come: every distinct folder (case-sensitive) in first-seen order, or
// with a folder filter only the first folder of that name.
class FoldersToAcknowledge
{
public:
    explicit FoldersToAcknowledge(const LogFilter& filter) : filter(filter) {}

    void Note(const JobRecord& record);
    const std::vector<wxString>& Folders() const { return folders; }

private:
    const LogFilter& filter;
    std::vector<wxString> folders;
    std::unordered_set<wxString> seen;
};

// The order of the rows sorted by a list column (1 to 5): texts ignoring case,
// "Start Time" by its MS-DOS time. Ties keep their order.
std::vector<std::size_t> SortOrder(const std::deque<JobRecord>& rows, int column, bool descending);
void Reorder(std::deque<JobRecord>& rows, const std::vector<std::size_t>& order);

} // namespace logrows
