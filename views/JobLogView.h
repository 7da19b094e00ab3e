#pragma once

#include "components/Utility/ProfilesKelvoListLineData.h"
#include "views/LogRows.h"
#include "views/ViewRules.h"

#include <wx/panel.h>

#include <cstdint>
#include <deque>
#include <memory>
#include <vector>

class CErrorWndBkgLog;
class CustomComboBox;
class ImageTextButton;
class JobLogManager;
class LogClearTask;
class ProfilesKelvoProfilesListCtrl;
class wxBoxSizer;
class wxBusyCursor;
class wxImageList;
class wxListEvent;
class wxRadioButton;
class wxStatusBar;
class wxThreadEvent;

// The Log tab: the finished jobs of the log model, all of them or the failed
// ones only, for every hot folder or one; sortable by column, with the detail
// of a selected failed job under the list, a count of rows in the footer and
// "Clear All". New records are appended at the end whatever the sort order.
class JobLogView : public wxPanel
{
public:
    enum : wxWindowID
    {
        kCompleteLogId = 6001,
        kErrorLogId = 6002,
        kClearAllId = 6007,
        kLogListId = 6008,
        kFolderBoxId = 6010
    };

    // Shows JobLogManager::GetInstance().
    JobLogView(wxWindow* parent, wxWindowID id);
    // Shows the given model, which must outlive the view.
    JobLogView(wxWindow* parent, wxWindowID id, JobLogManager& model);
    ~JobLogView() override;

    ProfilesKelvoProfilesListCtrl* GetLogList() const { return logList; }
    CErrorWndBkgLog* GetErrorPanel() const { return errorPanel; }
    wxStatusBar* GetFooter() const { return statusBar; }
    CustomComboBox* GetFolderBox() const { return folderBox; }
    // True from a confirmed "Clear All" until its result has been shown.
    bool IsClearing() const;

private:
    void CreateImages();
    void CreateFilterRow();
    void CreateList();
    void AddColumns();
    void CreateErrorPanel();
    void CreateFooter();

    void OnSize(wxSizeEvent& event);
    void OnItemSelected(wxListEvent& event);
    void OnItemDeselected(wxListEvent& event);
    void OnClearAll(wxCommandEvent& event);
    void OnButtonClick(wxCommandEvent& event);
    void OnErrorLog(wxCommandEvent& event);
    void OnCompleteLog(wxCommandEvent& event);
    void OnColumnClick(wxListEvent& event);
    void OnFolderSelected(wxCommandEvent& event);
    void OnUpdateJobLog(wxCommandEvent& event);
    void OnComboClick(wxCommandEvent& event);
    void OnClearDone(wxThreadEvent& event);

    // Lists the model's records anew under the current filters; the error log
    // acknowledges the shown folders' errors first.
    void Reload(bool acknowledge);
    // Lists the records that pass the filters after the current rows; takes
    // their texts, leaving the records empty. Returns how many were listed.
    std::size_t AppendRows(std::vector<JobRecord>& records);
    ProfilesKelvoListLineData MakeLine(const JobRecord& row, long index);
    void AcknowledgeShownFolders(const std::vector<wxString>& folders);
    void ShowSortMark(int column, bool descending);
    void RefreshFolderList();
    void ClearAll();
    void ShowErrorPanel(bool show);
    void UpdateFooter();
    void UpdateFooterWithSelection();
    // The counts, and what the journal's latest polls came to when that is news.
    void ShowFooter(const wxString& counts);

    JobLogManager& model;
    std::unique_ptr<wxImageList> rowImages;
    std::unique_ptr<wxImageList> sortImages;
    ProfilesKelvoProfilesListCtrl* logList = nullptr;
    CErrorWndBkgLog* errorPanel = nullptr;
    wxStatusBar* statusBar = nullptr;
    wxBoxSizer* mainSizer = nullptr;
    CustomComboBox* folderBox = nullptr;
    wxRadioButton* completeLogButton = nullptr;
    wxRadioButton* errorLogButton = nullptr;
    ImageTextButton* separatorButton = nullptr;
    ImageTextButton* clearAllButton = nullptr;

    // errorsOnly is the error log; the complete log otherwise.
    logrows::LogFilter filter;
    // One copy per listed row, in row order; a deque, as wxString has no move
    // and a growing vector would copy every text.
    std::deque<JobRecord> rowRecords;
    logrows::StatusTexts statusTexts;
    // Where the model's records continue after those this view has taken.
    std::uint64_t cursor = 0;
    viewrules::ColumnSortState sortState;

    std::unique_ptr<LogClearTask> clearTask;
    std::unique_ptr<wxBusyCursor> busy;

    wxDECLARE_EVENT_TABLE();
};
