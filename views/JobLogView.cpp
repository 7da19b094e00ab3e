#include "views/JobLogView.h"

#include "components/Utility/CustomComboBox.h"
#include "components/Utility/ImageTextButton.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "data/JobLogManager.h"
#include "platform/themer/Themer.h"
#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"
#include "views/ErrorWndBkgLog.h"
#include "views/LogClearTask.h"
#include "views/ViewImages.h"
#include "views/ViewMetrics.h"

#include <wx/intl.h>
#include <wx/msgdlg.h>
#include <wx/radiobut.h>
#include <wx/sizer.h>
#include <wx/stattext.h>
#include <wx/statusbr.h>
#include <wx/utils.h>

namespace
{
constexpr int kLogChannel = 1;
constexpr int kSpareChannel = 3;
constexpr int kSortableColumns = 5;
constexpr int kWarningImage = 0;
constexpr int kAscendingMark = 0;
constexpr int kDescendingMark = 1;

using viewmetrics::ThemeOf;

// Headings and widths at the original platform's default font.
const viewmetrics::ColumnSpec kColumns[logrows::kLogColumnCount] = {{" ", 25},
                                                                    {wxTRANSLATE("File Name"), 160},
                                                                    {wxTRANSLATE("Hot Folder"), 160},
                                                                    {wxTRANSLATE("Server"), 155},
                                                                    {wxTRANSLATE("Start Time"), 125},
                                                                    {wxTRANSLATE("Status"), 150}};

wxString AllFoldersEntry()
{
    return _("All Duv Ureruve");
}
} // namespace

JobLogView::JobLogView(wxWindow* parent, wxWindowID id) : JobLogView(parent, id, JobLogManager::GetInstance())
{
}

JobLogView::JobLogView(wxWindow* parent, wxWindowID id, JobLogManager& model)
    : wxPanel(parent, id, wxDefaultPosition, wxDefaultSize, wxTAB_TRAVERSAL | wxBORDER_NONE), model(model),
      statusTexts([](const wxString& status) { return wxGetTranslation(status); }),
      sortState(kSortableColumns, 0, true), clearTask(std::make_unique<LogClearTask>(*this))
{
    CreateImages();
    SetBackgroundColour(ThemeOf("Default").backgroundColour);
    mainSizer = new wxBoxSizer(wxVERTICAL);
    CreateFilterRow();
    CreateList();
    CreateErrorPanel();
    CreateFooter();
    SetSizer(mainSizer);
    mainSizer->SetSizeHints(this);

    completeLogButton->SetValue(true);
    errorLogButton->SetValue(false);
    UpdateFooter();
    ShowErrorPanel(false);

    EventBus::Get().Subscribe(ChannelKey(kLogChannel), this);
    EventBus::Get().Subscribe(ChannelKey(kSpareChannel), this);
}

JobLogView::~JobLogView()
{
    EventBus::Get().Unsubscribe(this);
    // Waits for a clear under way; its result then dies with our queue.
    clearTask.reset();
    // The list draws with our image lists: it goes first.
    DestroyChildren();
}

bool JobLogView::IsClearing() const
{
    return clearTask->IsRunning();
}

// ---------------------------------------------------------------- construction

void JobLogView::CreateImages()
{
    rowImages = viewimages::MakeWarningImages();
    sortImages = viewimages::MakeSortMarks();
}

// Alignment flags that wx ignores in a direction (vertical ones in a vertical
// box, horizontal ones beside wxEXPAND) are left out: wx 3.2 asserts on them.
void JobLogView::CreateFilterRow()
{
    const Theme& notebook = ThemeOf("Notebook");
    SetBackgroundColour(notebook.panelColour);

    auto* outer = new wxFlexGridSizer(1, 2, 0, 0);
    outer->AddGrowableCol(1);
    auto* left = new wxFlexGridSizer(1, 4, 0, 0);
    auto* right = new wxFlexGridSizer(1, 3, 0, 0);
    for (int column = 0; column < 3; ++column)
        right->AddGrowableCol(column);

    const int centred = wxALIGN_CENTER_VERTICAL | wxALIGN_CENTER_HORIZONTAL | wxALL;
    left->Add(new wxStaticText(this, wxID_ANY, _("Show for:"), wxDefaultPosition, wxDefaultSize, 0), 0,
              wxALIGN_CENTER_VERTICAL | wxALL, 1);

    folderBox = new CustomComboBox;
    folderBox->Create(this, kFolderBoxId, wxDefaultPosition, wxSize(viewmetrics::ScaledWidth(this, 110), -1));
    folderBox->SetName("folderFilter");
    folderBox->Append(AllFoldersEntry());
    folderBox->SetSelection(0);
    folderBox->SetShowTooltip(true);
    left->Add(folderBox, 0, centred, 5);

    // One group: GTK cannot turn off a radio button that is alone in its
    // group, so two groups would both stay on. The handlers still turn the
    // other button off, which the group has then already done.
    completeLogButton = new wxRadioButton(this, kCompleteLogId, _("Complete Log"), wxDefaultPosition,
                                          wxDefaultSize, wxRB_GROUP);
    left->Add(completeLogButton, 0, centred, 5);
    errorLogButton = new wxRadioButton(this, kErrorLogId, _("Error Log"));
    left->Add(errorLogButton, 0, centred, 5);
    errorLogButton->SetValue(false);
    outer->Add(left, 0, wxALIGN_CENTER_VERTICAL | wxALL, 2);

    const int atRight = wxALIGN_CENTER_VERTICAL | wxALIGN_RIGHT | wxALL;
    separatorButton = new ImageTextButton(this, wxID_ANY, wxDefaultPosition, wxSize(1, 20), wxTAB_TRAVERSAL,
                                          wxS("ImageTextButton"));
    separatorButton->SetSeparator();
    right->Add(separatorButton, 0, atRight, 2);

    clearAllButton = new ImageTextButton(this, kClearAllId, wxDefaultPosition, wxSize(115, 20),
                                         wxTAB_TRAVERSAL, wxS("ImageTextButton"));
    clearAllButton->SetButtonBackground(GetBackgroundColour());
    clearAllButton->SetTextColour(notebook.textColour);
    clearAllButton->SetText(_("Clear All"));
    clearAllButton->SetLabel(_("Clear All"));
    clearAllButton->SetBitmap(viewimages::ClearAllBitmap(), ImageTextButton::kImageFirst);
    right->Add(clearAllButton, 0, atRight, 2);

    outer->Add(right, 0, atRight, 2);
    mainSizer->Add(outer, 0, wxEXPAND | wxALL, 2);
}

void JobLogView::CreateList()
{
    auto* box = new wxBoxSizer(wxVERTICAL);
    const headerStyle style = viewimages::MakeHeaderStyle();
    logList = new ProfilesKelvoProfilesListCtrl(&style, this, kLogListId, wxDefaultPosition, wxDefaultSize,
                                                wxLC_SINGLE_SEL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES);
    // How accessibility tools and scripts name and find the table.
    logList->SetName("jobLogList");
    logList->SetAccessibleName(_("Finished jobs"));
    logList->SetAlternateRowColour(ThemeOf("ListControl").alternateRowColour);
    logList->SetImageList(rowImages.get(), wxIMAGE_LIST_SMALL);
    logList->SetImageList(sortImages.get(), kHeaderImageList);
    AddColumns();
    box->Add(logList, 1, wxEXPAND | wxALL, 0);
    mainSizer->Add(box, 1, wxEXPAND | wxALL, 1);
}

void JobLogView::AddColumns()
{
    viewmetrics::AddColumns(*logList, kColumns, logrows::kLogColumnCount);
}

void JobLogView::CreateErrorPanel()
{
    errorPanel = new CErrorWndBkgLog(this, wxID_ANY, wxDefaultPosition, wxSize(80, 48));
    errorPanel->SetBackgroundColour(ThemeOf("Error").backgroundColour);
    mainSizer->Add(errorPanel, 0, wxEXPAND | wxALL, 0);
}

void JobLogView::CreateFooter()
{
    statusBar = new wxStatusBar(this, wxID_ANY, wxSTB_DEFAULT_STYLE);
    statusBar->SetFieldsCount(1);
    statusBar->SetBackgroundColour(ThemeOf("FooterView").backgroundColour);
    mainSizer->Add(statusBar, 0, wxEXPAND, 0);
}

// ---------------------------------------------------------------- rows

std::size_t JobLogView::AppendRows(std::vector<JobRecord>& records)
{
    std::vector<ProfilesKelvoListLineData> lines;
    // Room for later appends, so they rarely move the rows.
    lines.reserve(records.size() + records.size() / 4);
    long index = logList->GetItemCount();
    for (JobRecord& record : records)
    {
        if (!filter.Shows(record))
            continue;
        logrows::MakeRowCopy(record);
        lines.push_back(MakeLine(record, index++));
        logrows::SwapRecords(rowRecords.emplace_back(), record);
    }
    const std::size_t added = lines.size();
    if (added != 0)
        logList->InsertItems(logList->GetItemCount(), std::move(lines));
    return added;
}

ProfilesKelvoListLineData JobLogView::MakeLine(const JobRecord& row, long index)
{
    logrows::LogRowCells cells;
    logrows::FillCells(row, statusTexts, cells);
    ProfilesKelvoListLineData line(logrows::kLogColumnCount);
    line.SetData(static_cast<wxUIntPtr>(index));
    for (int column = 0; column < logrows::kLogColumnCount; ++column)
        line.Cell(column).text.swap(cells.texts[column]);
    line.Cell(logrows::WarningColumn).image = cells.warning ? kWarningImage : kCellImageNone;
    return line;
}

void JobLogView::Reload(bool acknowledge)
{
    logList->DeleteAllItems();
    rowRecords.clear();
    std::vector<JobRecord> records;
    logrows::FoldersToAcknowledge folders(filter);
    // From the start, so the cursor and the rows agree: an update queued
    // meanwhile brings only what came in after this. Only listed records are
    // copied; the folders to acknowledge are noted from all of them.
    cursor = 0;
    model.GetRecordsSince(cursor, records,
                          [&](const JobRecord& record)
                          {
                              if (acknowledge)
                                  folders.Note(record);
                              return filter.Shows(record);
                          });
    if (acknowledge)
        AcknowledgeShownFolders(folders.Folders());
    AppendRows(records);
    ShowErrorPanel(false);
    UpdateFooterWithSelection();
    Layout();
    Refresh();
}

void JobLogView::AcknowledgeShownFolders(const std::vector<wxString>& folders)
{
    for (const wxString& folder : folders)
        model.AcknowledgeFolderErrors(folder);
}

// ---------------------------------------------------------------- handlers

void JobLogView::OnSize(wxSizeEvent& event)
{
    Layout();
    event.Skip();
}

void JobLogView::OnUpdateJobLog(wxCommandEvent&)
{
    std::vector<JobRecord> records;
    // A second queued update finds nothing: the first took it all. An update
    // may also only say that the journal turned busy, unreadable or readable.
    if (model.GetRecordsSince(cursor, records) != 0)
    {
        // The list repaints only the rows it gains; the rest of the tab stays,
        // the detail of a selected failed job included: on a busy service jobs
        // finish every few seconds, and the user is still reading it.
        AppendRows(records);
    }
    UpdateFooterWithSelection();
}

void JobLogView::OnCompleteLog(wxCommandEvent&)
{
    errorLogButton->SetValue(false);
    if (!filter.errorsOnly)
        return;
    filter.errorsOnly = false;
    Reload(false);
}

void JobLogView::OnErrorLog(wxCommandEvent&)
{
    completeLogButton->SetValue(false);
    if (filter.errorsOnly)
        return;
    filter.errorsOnly = true;
    Reload(true);
}

// Reloads also when the entry did not change: choosing it again is how the
// user acknowledges new errors of the folder.
void JobLogView::OnFolderSelected(wxCommandEvent&)
{
    const int selection = folderBox->GetSelection();
    filter.byFolder = selection > 0;
    filter.folder = selection >= 0 ? viewrules::TrimmedRight(folderBox->GetString(selection)) : wxString();
    Reload(filter.errorsOnly);
}

void JobLogView::OnColumnClick(wxListEvent& event)
{
    const int column = event.GetColumn();
    if (sortState.Click(column))
    {
        logrows::Reorder(rowRecords, logrows::SortOrder(rowRecords, column, sortState.Descending()));
        logList->DeleteAllItems();
        ShowSortMark(column, sortState.Descending());
        std::vector<ProfilesKelvoListLineData> lines;
        lines.reserve(rowRecords.size() + rowRecords.size() / 4);
        long index = 0;
        for (const JobRecord& row : rowRecords)
            lines.push_back(MakeLine(row, index++));
        logList->InsertItems(0, std::move(lines));
    }
    ShowErrorPanel(false);
    UpdateFooterWithSelection();
    Layout();
}

void JobLogView::ShowSortMark(int column, bool descending)
{
    for (int other = 1; other < logList->GetColumnCount(); ++other)
    {
        wxListItem item;
        item.SetMask(wxLIST_MASK_IMAGE);
        item.SetImage(other != column ? kCellImageNone : descending ? kDescendingMark : kAscendingMark);
        logList->SetColumn(other, item);
    }
}

void JobLogView::OnItemSelected(wxListEvent&)
{
    // The event's index may be -1 (many rows at once): the selection itself tells.
    const long row = logList->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED);
    const bool failed =
        row >= 0 && static_cast<std::size_t>(row) < rowRecords.size() && logrows::IsFailed(rowRecords[row]);
    if (failed)
        errorPanel->SetErrorText(
            wxGetTranslation(viewrules::TrimmedRight(rowRecords[row][LogField::Detail])));
    ShowErrorPanel(failed);
    UpdateFooterWithSelection();
    Refresh();
}

void JobLogView::OnItemDeselected(wxListEvent&)
{
    ShowErrorPanel(false);
    UpdateFooterWithSelection();
    Refresh();
}

void JobLogView::OnComboClick(wxCommandEvent&)
{
    RefreshFolderList();
}

void JobLogView::RefreshFolderList()
{
    wxArrayString names;
    model.GetHotFolderNames(names);
    const wxArrayString entries = folderBox->GetStrings();
    const wxArrayString merged = viewrules::MergeFilterEntries(entries, names, AllFoldersEntry());
    if (merged == entries)
        return;
    const int selection = folderBox->GetSelection();
    folderBox->Set(merged);
    if (selection >= 0 && static_cast<std::size_t>(selection) < merged.size())
        folderBox->SetSelection(selection);
}

// The button posts its click to us with its id; the id, never the sender, says which.
void JobLogView::OnButtonClick(wxCommandEvent& event)
{
    if (event.GetId() == kClearAllId)
        ClearAll();
}

void JobLogView::OnClearAll(wxCommandEvent&)
{
    ClearAll();
}

void JobLogView::ClearAll()
{
    if (IsClearing() || model.GetRecordCount() == 0)
        return;
    const int answer =
        wxMessageBox(_("Are you sure you want to permanently clear the log for all the Duv Ureruve?"),
                     _("Kelvo ZazUzirez"), wxYES_NO, this);
    if (answer != wxYES)
        return;
    // The producer may hold the journal for seconds: wait for it away from
    // the GUI thread, which goes on drawing and taking updates.
    busy = std::make_unique<wxBusyCursor>();
    JobLogManager& log = model;
    clearTask->Start([&log] { return log.ClearJournalAndRecords(); });
}

void JobLogView::OnClearDone(wxThreadEvent& event)
{
    clearTask->Finish();
    busy.reset();
    if (event.GetInt() != 0)
    {
        wxMessageBox(_("The log is in use and could not be cleared. Try again in a moment."),
                     _("Kelvo ZazUzirez"), wxOK | wxICON_INFORMATION, this);
        return;
    }
    model.ResetAllFolderErrors();
    // Records taken in since the clear stay listed.
    logList->DeleteAllItems();
    rowRecords.clear();
    std::vector<JobRecord> records;
    cursor = 0;
    model.GetRecordsSince(cursor, records);
    AppendRows(records);
    UpdateFooter();
    errorPanel->SetErrorText(wxString());
    ShowErrorPanel(false);
    Layout();
    Refresh();
}

// ---------------------------------------------------------------- panel and footer

void JobLogView::ShowErrorPanel(bool show)
{
    if (mainSizer->IsShown(errorPanel) == show)
        return;
    mainSizer->Show(errorPanel, show);
    Layout();
}

void JobLogView::UpdateFooter()
{
    ShowFooter(viewrules::CountFooter(logList->GetItemCount()));
}

void JobLogView::UpdateFooterWithSelection()
{
    const long count = logList->GetItemCount();
    const long selected = logList->GetSelectedItemCount();
    ShowFooter(selected >= 1 ? viewrules::SelectionFooter(_("[WYX3Value1] of [WYX3Value2] items selected."),
                                                          selected, count)
                             : wxString::Format(wxS("%ld "), count) + _("Items"));
}

void JobLogView::ShowFooter(const wxString& counts)
{
    const wxString notice = viewrules::JournalNotice(
        model.GetJournalReport(), {_("Log journal busy since %s"), _("Log journal cannot be read"),
                                   _("Log journal readable again since %s")});
    statusBar->SetStatusText(counts + (notice.empty() ? wxString() : wxS(" - ") + notice), 0);
}

// clang-format off
wxBEGIN_EVENT_TABLE(JobLogView, wxPanel)
    EVT_SIZE(JobLogView::OnSize)
    EVT_LIST_ITEM_SELECTED(JobLogView::kLogListId, JobLogView::OnItemSelected)
    EVT_LIST_ITEM_DESELECTED(JobLogView::kLogListId, JobLogView::OnItemDeselected)
    EVT_BUTTON(JobLogView::kClearAllId, JobLogView::OnClearAll)
    EVT_RADIOBUTTON(JobLogView::kErrorLogId, JobLogView::OnErrorLog)
    EVT_RADIOBUTTON(JobLogView::kCompleteLogId, JobLogView::OnCompleteLog)
    EVT_LIST_COL_CLICK(wxID_ANY, JobLogView::OnColumnClick)
    EVT_COMBOBOX(JobLogView::kFolderBoxId, JobLogView::OnFolderSelected)
    EVT_COMMAND(wxID_ANY, wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, JobLogView::OnUpdateJobLog)
    EVT_COMMAND(wxID_ANY, wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK, JobLogView::OnComboClick)
    EVT_COMMAND(wxID_ANY, wxEVT_IMAGE_TEXT_BUTTON_CLICK, JobLogView::OnButtonClick)
    wx__DECLARE_EVT1(wxEVT_LOG_CLEAR_DONE, wxID_ANY, wxThreadEventHandler(JobLogView::OnClearDone))
wxEND_EVENT_TABLE()
// clang-format on
