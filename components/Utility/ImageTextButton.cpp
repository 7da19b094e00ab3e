#include "components/Utility/ImageTextButton.h"

#include <wx/dcbuffer.h>
#include <wx/settings.h>

wxDEFINE_EVENT(wxEVT_IMAGE_TEXT_BUTTON_CLICK, wxCommandEvent);

wxBEGIN_EVENT_TABLE(ImageTextButton, wxPanel) EVT_PAINT(ImageTextButton::OnPaint)
    EVT_ERASE_BACKGROUND(ImageTextButton::OnEraseBackground) EVT_LEFT_DOWN(ImageTextButton::OnLeftDown)
        wxEND_EVENT_TABLE()

            namespace
{
    // Gap between the image and the text, and between the image and the right edge.
    constexpr int kImageGap = 2;
    const wxColour kSeparatorColour(128, 128, 128);
} // namespace

ImageTextButton::ImageTextButton(wxWindow* parent, wxWindowID id, const wxPoint& pos, const wxSize& size,
                                 long style, const wxString& name)
    : wxPanel(parent, id, pos, size, style, name)
{
    SetFont(wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT));
}

void ImageTextButton::SetBitmap(const wxBitmap& image, std::int32_t placement)
{
    bitmap = image;
    bitmapPlacement = placement;
}

void ImageTextButton::Render(wxDC& dc, const wxRect& area) const
{
    if (separator)
        RenderSeparator(dc, area);
    else
        RenderButton(dc, area);
}

void ImageTextButton::RenderSeparator(wxDC& dc, const wxRect& area) const
{
    // The paint buffer is shared between windows and holds whatever was drawn
    // last, so the space beside the lines gets the window's own background.
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(GetBackgroundColour()));
    dc.DrawRectangle(area);

    // One-pixel rectangles rather than lines: cairo draws the first pixel of
    // a line lighter than the rest.
    dc.SetBrush(wxBrush(kSeparatorColour));
    const int x = area.x;
    const int y = area.y;
    const int w = area.width;
    const int h = area.height;
    if (w >= h)
    {
        dc.DrawRectangle(x, y + h / 2 - 1, w + 1, 1);
        dc.DrawRectangle(x, y + h / 2, w + 1, 1);
    }
    else
    {
        dc.DrawRectangle(x + w / 2 - 1, y, 1, h + 1);
        dc.DrawRectangle(x + w / 2, y, 1, h + 1);
    }
}

void ImageTextButton::RenderButton(wxDC& dc, const wxRect& area) const
{
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(backgroundColour));
    dc.DrawRectangle(area);
    dc.SetFont(GetFont());
    dc.SetTextForeground(textColour);
    dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);

    const bool hasImage = bitmap.IsOk();
    const int imageWidth = hasImage ? bitmap.GetWidth() : 0;
    const int textTop = text.empty() ? area.y : area.y + (area.height - dc.GetTextExtent(text).y) / 2;

    int penX = area.x;
    if (bitmapPlacement == kImageLast || !hasImage)
    {
        if (!text.empty())
            dc.DrawText(text, penX, textTop);
        penX = area.x + area.width - kImageGap - imageWidth;
    }
    if (hasImage)
    {
        dc.DrawBitmap(bitmap, penX, area.y + (area.height - bitmap.GetHeight()) / 2, true);
        penX = area.x + imageWidth + kImageGap;
    }
    if (bitmapPlacement == kImageFirst && hasImage && !text.empty())
        dc.DrawText(text, penX, textTop);
}

void ImageTextButton::OnPaint(wxPaintEvent&)
{
    wxBufferedPaintDC dc(this, wxBUFFER_CLIENT_AREA);
    Render(dc, GetClientRect());
}

void ImageTextButton::OnEraseBackground(wxEraseEvent&)
{
    // The paint covers every pixel; erasing first would only flicker.
}

void ImageTextButton::OnLeftDown(wxMouseEvent&)
{
    // Queued, so the parent handles the click after this press has finished;
    // the press itself goes no further (no focus change, no drag).
    wxCommandEvent click(wxEVT_IMAGE_TEXT_BUTTON_CLICK, GetId());
    click.SetEventObject(this);
    click.SetString(wxString(text).Trim(true));
    if (GetParent() != nullptr)
        wxPostEvent(GetParent()->GetEventHandler(), click);
}
