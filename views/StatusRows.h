#pragma once

#include "components/Utility/JobRowSource.h"
#include "data/JobRecord.h"
#include "data/JobStatusManager.h"

#include <wx/string.h>

#include <cstdint>
#include <memory>
#include <utility>
#include <vector>

// Translations of the few texts a column repeats on every row (statuses,
// units), looked up once per text instead of once per row.
class TranslationMemo
{
public:
    const wxString& Translate(const wxString& english);

private:
    std::vector<std::pair<wxString, wxString>> known;
};

// The rows the Status table shows: positions into one copy of the jobs, in
// sort order, filtered; each display row is made when it is first shown.
class StatusRows : public JobRowSource
{
public:
    StatusRows(std::shared_ptr<const std::vector<JobRecord>> jobs, std::vector<std::size_t> shown);

    std::size_t GetRowCount() const override { return shown.size(); }
    void MakeRow(std::size_t index, JobRecord& row) const override;

    // The row of the job with this key, or -1.
    long FindKey(const wxString& key) const;
    const wxString& KeyAt(std::size_t index) const;

    // A display row: key, file title, hot folder name, server, size, format,
    // time and translated status.
    static void MakeDisplayRow(const JobRecord& job, TranslationMemo& translations, JobRecord& row);

private:
    std::shared_ptr<const std::vector<JobRecord>> jobs;
    std::vector<std::size_t> shown;
    mutable TranslationMemo translations;
};

// The Status tab's jobs without windows: the view's own copy of the model's
// records and their order for the sorted column. Columns are counted as the
// table shows them: 1 "File Name" to 7 "Status".
class StatusTable
{
public:
    // Shows this read of the journal from now on, in journal order until sorted.
    void Replace(std::shared_ptr<const JobSnapshot> snapshot);

    // File Name, Hot Folder, Server, Size, Format and Status compare as texts
    // ignoring case (File Name and Hot Folder by the whole path, Size and Status
    // as stored), Time by when the job started. Equal keys keep journal order.
    void Sort(int column, bool descending);

    // The jobs in sort order; with a filter, only those whose server matches it
    // (ignoring case and trailing white space).
    std::shared_ptr<const StatusRows> Rows(bool filterActive, const wxString& serverFilter) const;

    std::size_t Size() const { return jobs->size(); }
    // The job at a position of the sort order.
    const JobRecord& SortedJob(std::size_t position) const { return (*jobs)[order[position]]; }

private:
    std::shared_ptr<const JobSnapshot> snapshot = std::make_shared<JobSnapshot>();
    // The same jobs, for the rows handed out.
    std::shared_ptr<const std::vector<JobRecord>> jobs{snapshot, &snapshot->jobs};
    std::vector<std::size_t> order;
};
