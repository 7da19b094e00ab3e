#include "app/MainFrame.h"

wxBEGIN_EVENT_TABLE(CMainFrame, wxFrame) wxEND_EVENT_TABLE()

    CMainFrame::CMainFrame(const wxString& title, const wxPoint& pos, const wxSize& size)
    : wxFrame(nullptr, wxID_ANY, title, pos, size, wxDEFAULT_FRAME_STYLE)
{
    Centre(wxBOTH);
}
