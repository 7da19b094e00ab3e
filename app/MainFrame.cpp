#include "app/MainFrame.h"

#include "app/MainView.h"
#include "views/JobLogView.h"
#include "views/JobStatusView.h"
#include "views/ViewMetrics.h"

#include <wx/intl.h>
#include <wx/sizer.h>

namespace
{
constexpr wxWindowID kNotebookId = 5001;
} // namespace

wxBEGIN_EVENT_TABLE(CMainFrame, wxFrame) wxEND_EVENT_TABLE()

    CMainFrame::CMainFrame(const wxString& title, const wxPoint& pos, const wxSize& size)
    : wxFrame(nullptr, wxID_ANY, title, pos, viewmetrics::ScaledFrameSize(size), wxDEFAULT_FRAME_STYLE)
{
    BuildLayout();
}

void CMainFrame::BuildLayout()
{
    const wxSize clientSize = GetClientSize();
    auto* sizer = new wxBoxSizer(wxVERTICAL);

    m_notebook = new MainView;
    m_notebook->Create(this, kNotebookId, wxDefaultPosition, clientSize, wxNB_TOP | wxBORDER_NONE,
                       "CNOwnerDrawNotebook");
    m_statusView = new JobStatusView(m_notebook, wxID_ANY);
    m_notebook->AddPage(m_statusView, _("Status"), false, 1, nullptr, -1, false);
    m_logView = new JobLogView(m_notebook, wxID_ANY);
    m_notebook->AddPage(m_logView, _("Log"), false, 2, nullptr, -1, false);
    m_notebook->SetSelection(0);

    // No vertical centring flag: it means nothing for a child that fills the
    // box, and wx 3.2 rejects it together with wxEXPAND.
    sizer->Add(m_notebook, 1, wxEXPAND | wxALL, 0);
    SetSizer(sizer);
    Centre(wxBOTH);
}
