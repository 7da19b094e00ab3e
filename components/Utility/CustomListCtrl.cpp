#include "components/Utility/CustomListCtrl.h"

#include <wx/intl.h>

namespace
{
// Display-row field shown in each column; column 0 is the row number.
constexpr std::size_t kFieldOfColumn[] = {0, 1, 5, 2, 3, 4, 6, 7};
constexpr long kColumnCount = sizeof(kFieldOfColumn) / sizeof(kFieldOfColumn[0]);
// About ten pages of rows.
constexpr std::size_t kMadeRowsKept = 512;
} // namespace

CustomListCtrl::CustomListCtrl()
    : inProgressTexts{_("Converting file type"), _("Transferring to server"), _("Saving...")}
{
}

CustomListCtrl::CustomListCtrl(const headerStyle* style, wxWindow* parent, wxWindowID id, const wxPoint& pos,
                               const wxSize& size, long listStyle, const wxValidator& validator,
                               const wxString& name)
    : CustomListCtrl()
{
    Create(style, parent, id, pos, size, listStyle, validator, name);
}

void CustomListCtrl::SetRecords(const std::vector<JobRecord>& rows)
{
    rowSource.reset();
    madeRows.clear();
    records = rows;
}

void CustomListCtrl::SetRowSource(std::shared_ptr<const JobRowSource> source)
{
    records.clear();
    records.shrink_to_fit();
    madeRows.clear();
    rowSource = std::move(source);
}

void CustomListCtrl::SetStatusImage(std::int32_t image)
{
    statusImage = image;
}

std::size_t CustomListCtrl::GetRowCount() const
{
    return rowSource ? rowSource->GetRowCount() : records.size();
}

const JobRecord* CustomListCtrl::GetRow(long item) const
{
    if (item < 0 || static_cast<std::size_t>(item) >= GetRowCount())
        return nullptr;
    const auto index = static_cast<std::size_t>(item);
    if (!rowSource)
        return &records[index];
    auto made = madeRows.find(index);
    if (made == madeRows.end())
    {
        if (madeRows.size() >= kMadeRowsKept)
            madeRows.clear();
        made = madeRows.try_emplace(index).first;
        rowSource->MakeRow(index, made->second);
    }
    return &made->second;
}

wxString CustomListCtrl::OnGetItemText(long item, long column) const
{
    const JobRecord* row = GetRow(item);
    if (!row || column < 0 || column >= kColumnCount)
        return wxString();
    if (column == 0)
        return wxString::Format(wxS("%ld"), item + 1);
    return (*row)[kFieldOfColumn[column]];
}

int CustomListCtrl::OnGetItemImage(long item, long column) const
{
    if (column != kStatusColumn)
        return kCellImageNone;
    return IsRowInProgress(item) ? statusImage : kCellImageNone;
}

bool CustomListCtrl::IsRowInProgress(long item) const
{
    const JobRecord* row = GetRow(item);
    return row && IsInProgress((*row)[StatusField::Status]);
}

bool CustomListCtrl::IsInProgress(const wxString& status) const
{
    for (const wxString& text : inProgressTexts)
    {
        if (status == text)
            return true;
    }
    return false;
}
