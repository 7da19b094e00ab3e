#include "views/LogRows.h"

#include "views/ViewRules.h"

#include <wx/wxcrt.h>

namespace logrows
{

const wxString kSucceeded = wxS("Transferred Successfully");

bool IsFailed(const JobRecord& record)
{
    // Compared in place: asked for every record of a relisting.
    const wxString& status = record[LogField::Status];
    std::size_t end = status.length();
    while (end > 0 && wxIsspace(status[end - 1]))
        --end;
    return end != kSucceeded.length() || status.compare(0, end, kSucceeded) != 0;
}

bool LogFilter::Shows(const JobRecord& record) const
{
    if (errorsOnly && !IsFailed(record))
        return false;
    return !byFolder ||
           viewrules::SameFilterText(viewrules::LastPathComponent(record[LogField::HotFolderPath]), folder);
}

void MakeRowCopy(JobRecord& record)
{
    wxString name = viewrules::LastPathComponent(record[LogField::FilePath]);
    record[LogField::FilePath].swap(name);
}

void SwapRecords(JobRecord& a, JobRecord& b)
{
    for (std::size_t field = 0; field < a.size(); ++field)
        a[field].swap(b[field]);
}

StatusTexts::StatusTexts(std::function<wxString(const wxString&)> translate) : translate(std::move(translate))
{
}

const wxString& StatusTexts::Translated(const wxString& status)
{
    const auto found = known.find(status);
    if (found != known.end())
        return found->second;
    return known.emplace(status, translate(viewrules::TrimmedRight(status))).first->second;
}

void FillCells(const JobRecord& row, StatusTexts& statuses, LogRowCells& cells)
{
    cells.warning = IsFailed(row);
    cells.texts[WarningColumn].clear();
    // Swapped in: each text is built once, never copied again.
    wxString title = viewrules::FileTitle(row[LogField::FilePath]);
    cells.texts[FileNameColumn].swap(title);
    wxString folder = viewrules::LastPathComponent(row[LogField::HotFolderPath]);
    cells.texts[HotFolderColumn].swap(folder);
    cells.texts[ServerColumn] = row[LogField::Server];
    cells.texts[StartTimeColumn] = row[LogField::TimeText];
    cells.texts[StatusColumn] = statuses.Translated(row[LogField::Status]);
}

void FoldersToAcknowledge::Note(const JobRecord& record)
{
    const wxString& folder = record[LogField::HotFolderPath];
    if (filter.byFolder)
    {
        if (folders.empty() && viewrules::SameFilterText(viewrules::LastPathComponent(folder), filter.folder))
            folders.push_back(folder);
        return;
    }
    if (seen.insert(folder).second)
        folders.push_back(folder);
}

std::vector<std::size_t> SortOrder(const std::deque<JobRecord>& rows, int column, bool descending)
{
    static constexpr std::size_t kFieldOfColumn[kLogColumnCount] = {
        LogField::FilePath, LogField::FilePath, LogField::HotFolderPath,
        LogField::Server,   LogField::DosTime,  LogField::Status};
    if (column < FileNameColumn || column >= kLogColumnCount)
        return {};
    const std::size_t field = kFieldOfColumn[column];
    const viewrules::SortKind kind =
        column == StartTimeColumn ? viewrules::SortKind::Number : viewrules::SortKind::Text;
    const viewrules::SortKeys keys(rows.size(), kind,
                                   [&](std::size_t i) -> const wxString& { return rows[i][field]; });
    return keys.Order(descending);
}

void Reorder(std::deque<JobRecord>& rows, const std::vector<std::size_t>& order)
{
    if (order.size() != rows.size())
        return;
    std::deque<JobRecord> sorted;
    for (const std::size_t from : order)
        SwapRecords(sorted.emplace_back(), rows[from]);
    rows.swap(sorted);
}

} // namespace logrows
