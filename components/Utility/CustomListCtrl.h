#pragma once

#include "components/Utility/JobRowSource.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "data/JobRecord.h"

#include <array>
#include <cstdint>
#include <memory>
#include <unordered_map>
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

    // Replace the rows; the caller refreshes and sets the item count after.
    void SetRecords(const std::vector<JobRecord>& rows);
    // Rows made on demand from the source, which the list shares and keeps.
    void SetRowSource(std::shared_ptr<const JobRowSource> source);
    // The small-image index shown for rows in progress; no repaint.
    void SetStatusImage(std::int32_t image);

    wxString OnGetItemText(long item, long column) const override;
    int OnGetItemImage(long item, long column) const override;

    // Whether the row shows the busy wheel: its status is one of the in-progress texts.
    bool IsRowInProgress(long item) const;
    // The display row, or null for an item that is not a row.
    const JobRecord* GetRow(long item) const;
    std::size_t GetRowCount() const;

    std::int32_t GetStatusImage() const { return statusImage; }

private:
    bool IsInProgress(const wxString& status) const;

    std::vector<JobRecord> records;
    std::shared_ptr<const JobRowSource> rowSource;
    // Rows made from the source since it was set; forgotten when they grow
    // past a few pages, so a scroll through every row holds no copy of them all.
    mutable std::unordered_map<std::size_t, JobRecord> madeRows;
    std::int32_t statusImage = 0;
    // The translated in-progress texts, looked up once when the list is made.
    std::array<wxString, 3> inProgressTexts;
};
