#pragma once

#include <wx/bitmap.h>
#include <wx/panel.h>

#include <cstdint>

// Posted to the button's parent on a left press: id = the button's window id,
// string = the button's text without trailing white space.
wxDECLARE_EVENT(wxEVT_IMAGE_TEXT_BUTTON_CLICK, wxCommandEvent);

// A flat push button painted by itself: an image and a text on a plain field,
// with no border, hover or pressed look and no keyboard handling. In separator
// mode it draws only a double grey line through its middle instead.
class ImageTextButton : public wxPanel
{
public:
    static constexpr std::int32_t kImageFirst = 0;
    static constexpr std::int32_t kImageLast = 1;

    ImageTextButton(wxWindow* parent, wxWindowID id, const wxPoint& pos = wxDefaultPosition,
                    const wxSize& size = wxDefaultSize, long style = wxTAB_TRAVERSAL,
                    const wxString& name = wxS("ImageTextButton"));

    // None of the setters repaints; the owner lays out and refreshes.
    void SetButtonBackground(const wxColour& colour) { backgroundColour = colour; }
    void SetTextColour(const wxColour& colour) { textColour = colour; }
    void SetText(const wxString& value) { text = value; }
    void SetBitmap(const wxBitmap& image, std::int32_t placement);
    // There is no way back to a button.
    void SetSeparator() { separator = true; }

    const wxString& GetText() const { return text; }
    bool IsSeparator() const { return separator; }

    // Draws the whole button into `dc` over `area` (the client rectangle when
    // painting the window).
    void Render(wxDC& dc, const wxRect& area) const;

private:
    void RenderSeparator(wxDC& dc, const wxRect& area) const;
    void RenderButton(wxDC& dc, const wxRect& area) const;

    void OnPaint(wxPaintEvent& event);
    void OnEraseBackground(wxEraseEvent& event);
    void OnLeftDown(wxMouseEvent& event);

    wxBitmap bitmap;
    std::int32_t bitmapPlacement = kImageFirst;
    wxColour backgroundColour = *wxBLACK;
    wxColour textColour = *wxWHITE;
    wxString text;
    bool separator = false;

    wxDECLARE_EVENT_TABLE();
};
