#pragma once

#include <wx/frame.h>

// The program's one top-level window.
class CMainFrame : public wxFrame
{
public:
    CMainFrame(const wxString& title, const wxPoint& pos, const wxSize& size);

private:
    wxDECLARE_EVENT_TABLE();
};
