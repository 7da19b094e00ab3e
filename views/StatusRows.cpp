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
// `trimmedFilter` has none. Compares in place: the filter runs once per job.
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

StatusRows::StatusRows(std::shared_ptr<const std::vector<JobRecord>> jobs, std::vector<std::size_t> shown)
    : jobs(std::move(jobs)), shown(std::move(shown))
{
}

void StatusRows::MakeRow(std::size_t index, JobRecord& row) const
{
    MakeDisplayRow((*jobs)[shown[index]], translations, row);
}

long StatusRows::FindKey(const wxString& key) const
{
    for (std::size_t index = 0; index < shown.size(); ++index)
    {
        if (KeyAt(index) == key)
            return static_cast<long>(index);
    }
    return -1;
}

const wxString& StatusRows::KeyAt(std::size_t index) const
{
    return (*jobs)[shown[index]][StatusField::Key];
}

void StatusRows::MakeDisplayRow(const JobRecord& job, TranslationMemo& translations, JobRecord& row)
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

void StatusTable::Replace(std::shared_ptr<const JobSnapshot> read)
{
    snapshot = read ? std::move(read) : std::make_shared<JobSnapshot>();
    jobs = std::shared_ptr<const std::vector<JobRecord>>(snapshot, &snapshot->jobs);
    order.resize(jobs->size());
    std::iota(order.begin(), order.end(), std::size_t{0});
}

void StatusTable::Sort(int column, bool descending)
{
    if (column < 1 || column > static_cast<int>(std::size(kSortField)))
        return;
    if (column == kTimeColumn)
    {
        // A read without times orders Time by journal order alone.
        std::vector<std::uint64_t> started = snapshot->startTimes;
        started.resize(jobs->size(), 0);
        order = viewrules::SortKeys(std::move(started)).Order(descending);
        return;
    }
    const std::size_t field = kSortField[column - 1];
    const std::vector<JobRecord>& records = *jobs;
    const viewrules::SortKeys keys(records.size(), viewrules::SortKind::Text,
                                   [&](std::size_t i) -> const wxString& { return records[i][field]; });
    order = keys.Order(descending);
}

std::shared_ptr<const StatusRows> StatusTable::Rows(bool filterActive, const wxString& serverFilter) const
{
    if (!filterActive)
        return std::make_shared<StatusRows>(jobs, order);
    const wxString filter = viewrules::TrimmedRight(serverFilter);
    std::vector<std::size_t> shown;
    for (const std::size_t index : order)
    {
        if (ServerMatches((*jobs)[index][StatusField::Server], filter))
            shown.push_back(index);
    }
    return std::make_shared<StatusRows>(jobs, std::move(shown));
}
