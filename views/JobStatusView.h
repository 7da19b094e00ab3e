#pragma once

#include "data/JobStatusManager.h"
#include "views/StatusRows.h"
#include "views/ViewRules.h"

#include <wx/imaglist.h>
#include <wx/listbase.h>
#include <wx/panel.h>
#include <wx/thread.h>
#include <wx/timer.h>

#include <cstdint>
#include <memory>

class CustomComboBox;
class CustomListCtrl;
class wxBoxSizer;
class wxStatusBar;

// The Status tab: the jobs the hot-folder service is working on, filtered by
// print server, sorted by a clicked column, with a busy wheel turning beside
// the jobs being converted, saved or transferred, and the row count below.
// It works on copies of the status model's records, taken when the model
// announces a change on bus channel 2, and never reads the journal itself.
class JobStatusView : public wxPanel
{
public:
    static constexpr wxWindowID kServerBoxId = 5006;

    // model: where the jobs come from; the program's one status model by default.
    JobStatusView(wxWindow* parent, wxWindowID id, JobStatusManager& model = JobStatusManager::GetInstance());
    ~JobStatusView() override;

    CustomListCtrl* GetJobList() const { return jobList; }
    CustomComboBox* GetServerBox() const { return serverBox; }
    wxStatusBar* GetFooter() const { return statusBar; }
    // The busy-wheel frame the next tick shows.
    std::int32_t GetAnimationFrame() const { return animationFrame; }

private:
    void BuildFilterRow();
    void BuildList();
    void BuildFooter();

    void OnSize(wxSizeEvent& event);
    void OnServerSelected(wxCommandEvent& event);
    void OnUpdateJobStatus(wxCommandEvent& event);
    void OnComboClick(wxCommandEvent& event);
    void OnTimer(wxTimerEvent& event);
    void OnColumnClick(wxListEvent& event);

    void RefreshFromModel();
    void SortJobs();
    void MarkSortColumn();
    void BuildRows();
    void RefreshServerList();
    void UpdateFooter();
    // The key of the selected job, or empty; and selecting it again after the
    // rows changed (nothing stays selected when it is gone).
    wxString SelectedKey() const;
    void SelectKey(const wxString& key);

    JobStatusManager& model;
    CustomListCtrl* jobList = nullptr;
    CustomComboBox* serverBox = nullptr;
    wxStatusBar* statusBar = nullptr;
    wxBoxSizer* mainSizer = nullptr;
    std::unique_ptr<wxImageList> busyImages;
    std::unique_ptr<wxImageList> sortImages;

    bool serverFilterActive = false;
    wxString serverFilter;
    StatusTable sortedJobs;
    // What the list shows now: the rows of the last BuildRows.
    std::shared_ptr<const StatusRows> shownRows;
    // Before any click: File Name, ascending.
    viewrules::ColumnSortState sortState{7, 1, false};
    std::int32_t animationFrame = 0;
    wxTimer refreshTimer;
    // Updates queue up while the GUI thread is busy; the model's generation
    // tells the later ones that there is nothing new.
    std::uint64_t shownGeneration = 0;
    bool shownOnce = false;
    wxCriticalSection lock;

    wxDECLARE_EVENT_TABLE();
};
