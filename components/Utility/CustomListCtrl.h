#pragma once

#include "components/Utility/profilescustomlistctrl.h"
#include "data/JobRecord.h"

#include <array>
#include <cstdint>
#include <vector>

// The virtual job table of the Status tab: serves each cell from its own copy
// of the display rows, so a model refresh never touches the rows window.
class CustomListCtrl : public ProfilesKelvoProfilesListCtrl
{
public:
    // Column of the status text and of the busy-wheel image.
    static constexpr long kStatusColumn = 7;

    CustomListCtrl();
    CustomListCtrl(const headerStyle* style, wxWindow* parent, wxWindowID id = wxID_ANY,
                   const wxPoint& pos = wxDefaultPosition, const wxSize& size = wxDefaultSize,
                   long listStyle = wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES,
                   const wxValidator& validator = wxDefaultValidator,
                   const wxString& name = wxListCtrlNameStr);

    // Replaces the rows; the caller refreshes and sets the item count after.
    void SetRecords(const std::vector<JobRecord>& rows);
    // The same without a copy: the rows are taken over and `rows` is left empty.
    void SetRecords(std::vector<JobRecord>&& rows);
    // The small-image index shown for rows in progress; no repaint.
    void SetStatusImage(std::int32_t image);

    wxString OnGetItemText(long item, long column) const override;
    int OnGetItemImage(long item, long column) const override;

    // Whether the row shows the busy wheel: its status is one of the in-progress texts.
    bool IsRowInProgress(long item) const;

    const std::vector<JobRecord>& GetRecords() const { return records; }
    std::int32_t GetStatusImage() const { return statusImage; }

private:
    bool IsInProgress(const wxString& status) const;

    std::vector<JobRecord> records;
    std::int32_t statusImage = 0;
    // The translated in-progress texts, looked up once when the list is made.
    std::array<wxString, 3> inProgressTexts;
};
