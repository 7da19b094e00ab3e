#pragma once

#include <wx/frame.h>

class MainView;

// The program's one top-level window: a notebook with the Status and Log pages.
class CMainFrame : public wxFrame
{
public:
    CMainFrame(const wxString& title, const wxPoint& pos, const wxSize& size);

    MainView* GetNotebook() const { return m_notebook; }
    wxWindow* GetStatusView() const { return m_statusView; }
    wxWindow* GetLogView() const { return m_logView; }

private:
    void BuildLayout();

    MainView* m_notebook = nullptr;
    wxWindow* m_statusView = nullptr;
    wxWindow* m_logView = nullptr;

    wxDECLARE_EVENT_TABLE();
};
