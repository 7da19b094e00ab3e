#pragma once

#include "data/JobRecord.h"

#include <wx/string.h>

#include <cstdint>
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

// The Status tab's jobs without windows: the view's own copy of the model's
// records, their order for the sorted column, and the display rows built from
// them. Columns are counted as the table shows them: 1 "File Name" to 7 "Status".
class StatusTable
{
public:
    // Takes the jobs and their start times by swapping; the arguments are left empty.
    void Replace(std::vector<JobRecord>& jobs, std::vector<std::uint64_t>& startTimes);

    // File Name, Hot Folder, Server, Size, Format and Status compare as texts
    // ignoring case (File Name and Hot Folder by the whole path, Size and Status
    // as stored), Time by when the job started. Equal keys keep journal order.
    void Sort(int column, bool descending);

    // Display rows of the jobs in sort order; with a filter, only the jobs whose
    // server matches it (ignoring case and trailing white space).
    std::vector<JobRecord> BuildRows(bool filterActive, const wxString& serverFilter);

    std::size_t Size() const { return jobs.size(); }
    // The job at a position of the sort order.
    const JobRecord& SortedJob(std::size_t position) const { return jobs[order[position]]; }

    // A display row: key, file title, hot folder name, server, size, format,
    // time and translated status.
    static void MakeDisplayRow(const JobRecord& job, TranslationMemo& translations, JobRecord& row);

private:
    std::vector<JobRecord> jobs;
    std::vector<std::uint64_t> startTimes;
    std::vector<std::size_t> order;
    TranslationMemo translations;
};
