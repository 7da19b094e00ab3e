#pragma once

#include <wx/arrstr.h>
#include <wx/panel.h>

#include <functional>
#include <vector>

// One line of the detail text as the panel draws it. Each line begins with a
// space, like the heading; a line may be empty when the word after it did not
// fit beside the heading.
struct ErrorDetailLine
{
    wxPoint start;
    wxString text;
};

// The detail text split into words at any run of spaces, tabs and line breaks;
// the text is reflowed, its own line breaks are not kept.
wxArrayString SplitErrorDetailWords(const wxString& text);

// Lays the words out beside a heading `headingWidth` pixels wide in a panel
// `clientWidth` pixels wide. `measure` gives the drawn size of a text in the
// detail font. A word wider than its line stands alone and runs past the edge.
std::vector<ErrorDetailLine> LayoutErrorDetail(const wxArrayString& words, int headingWidth, int clientWidth,
                                               const std::function<wxSize(const wxString&)>& measure);

// The panel under the log table that shows why the selected job failed: the
// heading "Error Detail:" and the detail text word-wrapped beside and below it.
// It paints everything itself and takes no input.
class CErrorWndBkgLog : public wxPanel
{
public:
    CErrorWndBkgLog(wxWindow* parent, wxWindowID id, const wxPoint& pos = wxDefaultPosition,
                    const wxSize& size = wxSize(80, 48));

    // Does not repaint: the log view lays itself out and refreshes afterwards.
    void SetErrorText(const wxString& text);
    const wxString& GetErrorText() const { return errorText; }

    // Draws the panel into `dc` as at a paint of a client area of `size`.
    void Render(wxDC& dc, const wxSize& size) const;

private:
    void OnPaint(wxPaintEvent& event);
    void OnSize(wxSizeEvent& event);

    wxString errorText;

    wxDECLARE_EVENT_TABLE();
};
