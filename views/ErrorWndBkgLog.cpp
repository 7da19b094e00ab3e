#include "views/ErrorWndBkgLog.h"

#include "platform/themer/Themer.h"

#include <wx/dcbuffer.h>
#include <wx/intl.h>
#include <wx/tokenzr.h>

wxBEGIN_EVENT_TABLE(CErrorWndBkgLog, wxPanel) EVT_PAINT(CErrorWndBkgLog::OnPaint)
    EVT_SIZE(CErrorWndBkgLog::OnSize) wxEND_EVENT_TABLE()

        namespace
{
    constexpr int kMargin = 4;
    // The first line starts this far right of the heading's end...
    constexpr int kGapAfterHeading = 9;
    // ...and may reach this far right of it, measured from the right edge.
    constexpr int kFirstLineSlack = 5;

    wxFont FontOr(const wxFont& wanted, const wxFont& fallback)
    {
        return wanted.IsOk() ? wanted : fallback;
    }
} // namespace

wxArrayString SplitErrorDetailWords(const wxString& text)
{
    wxArrayString words;
    wxStringTokenizer tokenizer(text, wxS(" \t\r\n"), wxTOKEN_DEFAULT);
    while (tokenizer.HasMoreTokens())
        words.Add(tokenizer.GetNextToken());
    return words;
}

std::vector<ErrorDetailLine> LayoutErrorDetail(const wxArrayString& words, int headingWidth, int clientWidth,
                                               const std::function<wxSize(const wxString&)>& measure)
{
    std::vector<ErrorDetailLine> lines;
    wxPoint start(headingWidth + kGapAfterHeading, kMargin);
    int allowed = clientWidth - headingWidth - kFirstLineSlack;
    wxString current;

    for (const wxString& word : words)
    {
        const wxString candidate = current + wxS(" ") + word;
        const wxSize extent = measure(candidate);
        if (extent.x > allowed)
        {
            lines.push_back({start, current});
            start = wxPoint(kMargin, start.y + extent.y);
            allowed = clientWidth - kMargin;
            current = wxS(" ") + word;
        }
        else
        {
            current = candidate;
        }
    }

    current.Trim(true);
    if (!current.empty())
        lines.push_back({start, current});
    return lines;
}

CErrorWndBkgLog::CErrorWndBkgLog(wxWindow* parent, wxWindowID id, const wxPoint& pos, const wxSize& size)
    // The wrapping depends on the width, so a narrower panel must repaint all
    // of itself, not only the newly exposed strip.
    : wxPanel(parent, id, pos, size, wxTAB_TRAVERSAL | wxNO_BORDER | wxFULL_REPAINT_ON_RESIZE)
{
}

void CErrorWndBkgLog::SetErrorText(const wxString& text)
{
    errorText = text;
    SetLabel(_("Error Detail:") + text);
}

void CErrorWndBkgLog::Render(wxDC& dc, const wxSize& size) const
{
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(GetBackgroundColour()));
    dc.DrawRectangle(wxPoint(0, 0), size);
    dc.SetTextForeground(*wxBLACK);
    dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);

    const Theme& theme = Themer::GetThemeService()->GetTheme("Error");
    dc.SetFont(FontOr(theme.titleFont, GetFont()));
    const wxString heading = wxS(" ") + _("Error Detail:");
    dc.DrawText(heading, kMargin, kMargin);
    const int headingWidth = dc.GetTextExtent(heading).x;

    dc.SetFont(FontOr(theme.textFont, GetFont()));
    const std::vector<ErrorDetailLine> lines =
        LayoutErrorDetail(SplitErrorDetailWords(errorText), headingWidth, size.x,
                          [&dc](const wxString& text) { return dc.GetTextExtent(text); });
    for (const ErrorDetailLine& line : lines)
    {
        if (!line.text.empty())
            dc.DrawText(line.text, line.start);
    }
}

void CErrorWndBkgLog::OnPaint(wxPaintEvent&)
{
    wxBufferedPaintDC dc(this, wxBUFFER_CLIENT_AREA);
    Render(dc, GetClientSize());
}

void CErrorWndBkgLog::OnSize(wxSizeEvent& event)
{
    event.Skip();
}
