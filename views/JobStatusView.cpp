#include "views/JobStatusView.h"

#include "components/Utility/CustomComboBox.h"
#include "components/Utility/CustomListCtrl.h"
#include "data/JobStatusManager.h"
#include "platform/themer/Themer.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"
#include "views/ViewImages.h"
#include "views/ViewMetrics.h"

#include <wx/intl.h>
#include <wx/sizer.h>
#include <wx/stattext.h>
#include <wx/statusbr.h>
#include <wx/utils.h>

#include <algorithm>

namespace
{
constexpr int kStatusChannel = 2;
constexpr int kQuietChannel = 0;
constexpr int kWheelFrames = 12;
constexpr int kTimerMilliseconds = 1000;

using viewmetrics::ThemeOf;

// Headings and widths at the original platform's default font.
constexpr viewmetrics::ColumnSpec kColumns[] = {
    {wxTRANSLATE("No."), 40},         {wxTRANSLATE("File Name"), 120}, {wxTRANSLATE("Format"), 65},
    {wxTRANSLATE("Hot Folder"), 120}, {wxTRANSLATE("Server"), 130},    {wxTRANSLATE("Size"), 65},
    {wxTRANSLATE("Time"), 100},       {wxTRANSLATE("Status"), 145}};

wxString AllServersEntry()
{
    return _("All Servers") + wxS("      ");
}
} // namespace

// clang-format off
wxBEGIN_EVENT_TABLE(JobStatusView, wxPanel)
    EVT_SIZE(JobStatusView::OnSize)
    EVT_COMBOBOX(JobStatusView::kServerBoxId, JobStatusView::OnServerSelected)
    wx__DECLARE_EVT0(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, wxCommandEventHandler(JobStatusView::OnUpdateJobStatus))
    wx__DECLARE_EVT0(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK, wxCommandEventHandler(JobStatusView::OnComboClick))
    EVT_TIMER(wxID_ANY, JobStatusView::OnTimer)
    EVT_LIST_COL_CLICK(wxID_ANY, JobStatusView::OnColumnClick)
wxEND_EVENT_TABLE()
// clang-format on

JobStatusView::JobStatusView(wxWindow* parent, wxWindowID id, JobStatusManager& model)
    : wxPanel(parent, id, wxDefaultPosition, wxDefaultSize, wxTAB_TRAVERSAL | wxBORDER_NONE), model(model),
      busyImages(viewimages::MakeBusyWheel()), sortImages(viewimages::MakeSortMarks())
{
    SetBackgroundColour(ThemeOf("Default").backgroundColour);
    mainSizer = new wxBoxSizer(wxVERTICAL);
    BuildFilterRow();
    BuildList();
    BuildFooter();
    SetSizer(mainSizer);
    mainSizer->SetSizeHints(this);
    UpdateFooter();

    EventBus::Get().Subscribe(ChannelKey(kStatusChannel), this);
    EventBus::Get().Subscribe(ChannelKey(kQuietChannel), this);

    // Keeps the wheel's tick away from the polling thread's pass.
    animationFrame = 0;
    wxMilliSleep(200);
    refreshTimer.SetOwner(this);
    refreshTimer.Start(kTimerMilliseconds);
}

JobStatusView::~JobStatusView()
{
    EventBus::Get().Unsubscribe(this);
    refreshTimer.Stop();
    // The list outlives these members by a moment (children go last).
    jobList->SetImageList(nullptr, wxIMAGE_LIST_SMALL);
    jobList->SetImageList(nullptr, kHeaderImageList);
}

void JobStatusView::BuildFilterRow()
{
    // The panel keeps the filter row's colour; the list and footer have their own.
    SetBackgroundColour(ThemeOf("Notebook").panelColour);
    auto* row = new wxFlexGridSizer(1, 2, 0, 0);
    row->Add(new wxStaticText(this, wxID_ANY, _("Show for:"), wxDefaultPosition, wxDefaultSize, 0), 0,
             wxALIGN_CENTER_VERTICAL | wxALL, 5);
    serverBox = new CustomComboBox;
    serverBox->Create(this, kServerBoxId, wxDefaultPosition, wxSize(viewmetrics::ScaledWidth(this, 100), -1));
    serverBox->SetName("serverFilter");
    serverBox->Append(AllServersEntry());
    // Wide enough for its first entry whatever the font and language.
    const int entryWidth = serverBox->GetTextExtent(AllServersEntry()).x + serverBox->GetButtonSize().x + 12;
    serverBox->SetInitialSize(wxSize(std::max(serverBox->GetSize().x, entryWidth), -1));
    serverBox->SetSelection(0);
    serverBox->SetShowTooltip(true);
    row->Add(serverBox, 0, wxALIGN_CENTER_VERTICAL | wxALL, 1);
    // No vertical alignment beside wxEXPAND: wx 3.2 rejects the pair in a vertical box.
    mainSizer->Add(row, 0, wxEXPAND | wxALL, 2);
}

void JobStatusView::BuildList()
{
    auto* box = new wxBoxSizer(wxVERTICAL);
    const headerStyle header = viewimages::MakeHeaderStyle();
    jobList = new CustomListCtrl(&header, this, wxID_ANY, wxDefaultPosition, wxDefaultSize,
                                 wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES);
    // How accessibility tools and scripts name and find the table.
    jobList->SetName("jobStatusList");
    jobList->SetAccessibleName(_("Jobs in progress"));
    jobList->SetAlternateRowColour(ThemeOf("ListControl").alternateRowColour);
    jobList->SetImageList(busyImages.get(), wxIMAGE_LIST_SMALL);
    jobList->SetImageList(sortImages.get(), kHeaderImageList);

    viewmetrics::AddColumns(*jobList, kColumns, static_cast<int>(std::size(kColumns)));
    MarkSortColumn();
    box->Add(jobList, 1, wxEXPAND | wxALL, 0);
    mainSizer->Add(box, 1, wxEXPAND | wxALL, 1);
}

void JobStatusView::BuildFooter()
{
    statusBar = new wxStatusBar(this, wxID_ANY, wxSTB_DEFAULT_STYLE);
    statusBar->SetBackgroundColour(ThemeOf("FooterView").backgroundColour);
    statusBar->SetFieldsCount(1);
    mainSizer->Add(statusBar, 0, wxEXPAND, 0);
}

void JobStatusView::OnSize(wxSizeEvent& event)
{
    Layout();
    event.Skip();
}

void JobStatusView::OnUpdateJobStatus(wxCommandEvent&)
{
    wxCriticalSectionLocker guard(lock);
    // Nothing new to list: the journal only turned busy, unreadable or readable again.
    if (!shownOnce || model.GetGeneration() != shownGeneration)
        RefreshFromModel();
    UpdateFooter();
}

void JobStatusView::RefreshFromModel()
{
    wxCriticalSectionLocker guard(lock);
    // Read before the copy: a swap in between only makes the next event copy again.
    shownGeneration = model.GetGeneration();
    shownOnce = true;
    sortedJobs.Replace(model.GetSnapshot());
    SortJobs();
    BuildRows();
}

void JobStatusView::SortJobs()
{
    sortedJobs.Sort(sortState.Column(), sortState.Descending());
    MarkSortColumn();
}

void JobStatusView::MarkSortColumn()
{
    wxCriticalSectionLocker guard(lock);
    for (int col = 1; col < jobList->GetColumnCount(); ++col)
    {
        const int image = col != sortState.Column() ? -1 : sortState.Descending() ? 1 : 0;
        wxListItem info;
        // Unchanged marks are left alone: every update would repaint the header.
        if (jobList->GetColumn(col, info) && info.GetImage() == image)
            continue;
        info.SetMask(wxLIST_MASK_IMAGE);
        info.SetImage(image);
        jobList->SetColumn(col, info);
    }
}

void JobStatusView::BuildRows()
{
    wxCriticalSectionLocker guard(lock);
    const wxString selectedKey = SelectedKey();
    shownRows = sortedJobs.Rows(serverFilterActive, serverFilter);
    const long count = static_cast<long>(shownRows->GetRowCount());
    jobList->SetRowSource(shownRows);
    jobList->RefreshItems(0, std::max(0L, count - 1));
    jobList->SetItemCount(count);
    SelectKey(selectedKey);
}

wxString JobStatusView::SelectedKey() const
{
    const long selected = jobList->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED);
    if (!shownRows || selected < 0 || static_cast<std::size_t>(selected) >= shownRows->GetRowCount())
        return wxString();
    return shownRows->KeyAt(static_cast<std::size_t>(selected));
}

void JobStatusView::SelectKey(const wxString& key)
{
    const long selected = jobList->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED);
    const long found = key.empty() || !shownRows ? -1 : shownRows->FindKey(key);
    if (found == selected)
        return;
    if (selected >= 0)
        jobList->SetItemState(selected, 0, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
    if (found >= 0)
        jobList->SetItemState(found, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                              wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
}

void JobStatusView::OnColumnClick(wxListEvent& event)
{
    wxCriticalSectionLocker guard(lock);
    // Column 0 and the strip right of the last column (negative) sort nothing.
    if (!sortState.Click(event.GetColumn()))
        return;
    SortJobs();
    BuildRows();
}

void JobStatusView::OnServerSelected(wxCommandEvent&)
{
    wxCriticalSectionLocker guard(lock);
    const int selection = serverBox->GetSelection();
    if (selection == wxNOT_FOUND)
        return;
    serverFilterActive = selection != 0;
    const wxString text = viewrules::TrimmedRight(serverBox->GetString(selection));
    if (text.CmpNoCase(serverFilter) == 0)
        return;
    serverFilter = text;
    const wxString selectedKey = SelectedKey();
    jobList->DeleteAllItems();
    RefreshFromModel();
    SelectKey(selectedKey);
    const long selected = jobList->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED);
    if (selected >= 0)
        jobList->EnsureVisible(selected);
    UpdateFooter();
}

void JobStatusView::OnComboClick(wxCommandEvent&)
{
    wxCriticalSectionLocker guard(lock);
    RefreshServerList();
}

void JobStatusView::RefreshServerList()
{
    if (!serverBox)
        return;
    wxArrayString names;
    model.GetServers(names);
    const wxArrayString entries = serverBox->GetStrings();
    const wxArrayString merged = viewrules::MergeFilterEntries(entries, names, AllServersEntry());
    if (merged == entries)
        return;
    const int selection = serverBox->GetSelection();
    const wxString selected = selection == wxNOT_FOUND ? wxString() : serverBox->GetString(selection);
    serverBox->Set(merged);
    const int kept = merged.Index(selected, true);
    serverBox->SetSelection(kept == wxNOT_FOUND ? 0 : kept);
    // The chosen server is gone: show what the box now shows, every server.
    if (kept == wxNOT_FOUND && serverFilterActive)
    {
        wxCommandEvent reselect(wxEVT_COMBOBOX, kServerBoxId);
        OnServerSelected(reselect);
    }
}

void JobStatusView::OnTimer(wxTimerEvent&)
{
    if (animationFrame >= kWheelFrames)
        animationFrame = 0;
    wxCriticalSectionLocker guard(lock);
    jobList->SetStatusImage(animationFrame);
    // Only the rows on screen can show the wheel turn.
    const long count = jobList->GetItemCount();
    const long top = jobList->GetTopItem();
    const long last = std::min(count - 1, top + jobList->GetCountPerPage());
    for (long item = top; item <= last; ++item)
    {
        if (jobList->IsRowInProgress(item))
            jobList->RefreshItem(item);
    }
    ++animationFrame;
}

void JobStatusView::UpdateFooter()
{
    wxCriticalSectionLocker guard(lock);
    const wxString notice = viewrules::JournalNotice(
        model.GetJournalReport(), {_("Status journal busy since %s"), _("Status journal cannot be read"),
                                   _("Status journal readable again since %s")});
    statusBar->SetStatusText(viewrules::CountFooter(jobList->GetItemCount()) +
                                 (notice.empty() ? wxString() : wxS(" - ") + notice),
                             0);
}
