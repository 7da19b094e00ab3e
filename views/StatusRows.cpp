#include "views/StatusRows.h"

#include "views/ViewRules.h"

#include <wx/intl.h>

#include <numeric>

namespace
{
// Beyond this many distinct texts a column is not worth remembering.
constexpr std::size_t kMemoLimit = 32;

// The record field each sortable column compares, columns 1 to 7.
constexpr std::size_t kSortField[] = {StatusField::FilePath, StatusField::Format, StatusField::HotFolderPath,
                                      StatusField::Server,   StatusField::Size,   StatusField::TimeText,
                                      StatusField::Status};
constexpr int kTimeColumn = 6;

// Equal ignoring case once trailing white space is gone from `text`;
// `trimmedFilter` has none. Compares in place: the filter runs once per row.
bool ServerMatches(const wxString& text, const wxString& trimmedFilter)
{
    std::size_t length = text.length();
    while (length > 0 && wxIsspace(text[length - 1]))
        --length;
    if (length != trimmedFilter.length())
        return false;
    const wchar_t* a = text.wc_str();
    const wchar_t* b = trimmedFilter.wc_str();
    for (std::size_t i = 0; i < length; ++i)
    {
        if (a[i] != b[i] && wxTolower(a[i]) != wxTolower(b[i]))
            return false;
    }
    return true;
}
} // namespace

const wxString& TranslationMemo::Translate(const wxString& english)
{
    for (const auto& entry : known)
    {
        if (entry.first == english)
            return entry.second;
    }
    if (known.size() == kMemoLimit)
        known.pop_back();
    known.emplace_back(english, wxGetTranslation(english));
    return known.back().second;
}

void StatusTable::Replace(std::vector<JobRecord>& newJobs, std::vector<std::uint64_t>& newStartTimes)
{
    jobs.swap(newJobs);
    startTimes.swap(newStartTimes);
    newJobs.clear();
    newStartTimes.clear();
    // A model without times orders Time by journal order alone.
    startTimes.resize(jobs.size(), 0);
    order.resize(jobs.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
}

void StatusTable::Sort(int column, bool descending)
{
    if (column < 1 || column > static_cast<int>(std::size(kSortField)))
        return;
    if (column == kTimeColumn)
    {
        order = viewrules::SortKeys(startTimes).Order(descending);
        return;
    }
    const std::size_t field = kSortField[column - 1];
    const viewrules::SortKeys keys(jobs.size(), viewrules::SortKind::Text,
                                   [&](std::size_t i) -> const wxString& { return jobs[i][field]; });
    order = keys.Order(descending);
}

std::vector<JobRecord> StatusTable::BuildRows(bool filterActive, const wxString& serverFilter)
{
    const wxString filter = viewrules::TrimmedRight(serverFilter);
    std::vector<JobRecord> rows;
    rows.reserve(order.size());
    for (const std::size_t index : order)
    {
        const JobRecord& job = jobs[index];
        if (filterActive && !ServerMatches(job[StatusField::Server], filter))
            continue;
        // Built where it is kept: a JobRecord moved is a JobRecord copied.
        rows.emplace_back();
        MakeDisplayRow(job, translations, rows.back());
    }
    return rows;
}

void StatusTable::MakeDisplayRow(const JobRecord& job, TranslationMemo& translations, JobRecord& row)
{
    row[0] = job[StatusField::Key];
    row[1] = viewrules::FileTitle(job[StatusField::FilePath]);
    row[2] = viewrules::LastPathComponent(job[StatusField::HotFolderPath]);
    row[3] = job[StatusField::Server];
    row[4] = viewrules::FormatSize(job[StatusField::Size]);
    row[5] = job[StatusField::Format];
    row[6] = job[StatusField::TimeText];
    row[7] = translations.Translate(job[StatusField::Status]);
}
