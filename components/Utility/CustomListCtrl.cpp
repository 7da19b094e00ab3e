#include "components/Utility/CustomListCtrl.h"

#include <wx/intl.h>

namespace
{
// Display-row field shown in each column; column 0 is the row number.
constexpr std::size_t kFieldOfColumn[] = {0, 1, 5, 2, 3, 4, 6, 7};
constexpr long kColumnCount = sizeof(kFieldOfColumn) / sizeof(kFieldOfColumn[0]);
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
    records = rows;
}

void CustomListCtrl::SetRecords(std::vector<JobRecord>&& rows)
{
    records.swap(rows);
    rows.clear();
}

void CustomListCtrl::SetStatusImage(std::int32_t image)
{
    statusImage = image;
}

wxString CustomListCtrl::OnGetItemText(long item, long column) const
{
    if (item < 0 || static_cast<std::size_t>(item) >= records.size() || column < 0 || column >= kColumnCount)
        return wxString();
    if (column == 0)
        return wxString::Format(wxS("%ld"), item + 1);
    return records[item][kFieldOfColumn[column]];
}

int CustomListCtrl::OnGetItemImage(long item, long column) const
{
    if (column != kStatusColumn || item < 0 || static_cast<std::size_t>(item) >= records.size())
        return kCellImageNone;
    return IsRowInProgress(item) ? statusImage : kCellImageNone;
}

bool CustomListCtrl::IsRowInProgress(long item) const
{
    return item >= 0 && static_cast<std::size_t>(item) < records.size() &&
           IsInProgress(records[item][StatusField::Status]);
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
