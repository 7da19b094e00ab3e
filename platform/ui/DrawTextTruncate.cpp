#include "platform/ui/DrawTextTruncate.h"

namespace
{
const wxString kEllipsis = wxS("...");

int TextWidth(const wxDC& dc, const wxString& text)
{
    return dc.GetTextExtent(text).GetWidth();
}
} // namespace

wxString TruncateTextToWidth(const wxDC& dc, const wxString& text, int width, bool hasImage)
{
    if (TextWidth(dc, text) <= width)
        return text;

    // The longest prefix that still fits with the ellipsis; widths grow with
    // the prefix, so a binary search needs log(n) measurements, not n.
    size_t low = 0;
    size_t high = text.length();
    while (low < high)
    {
        const size_t mid = (low + high + 1) / 2;
        if (TextWidth(dc, text.Left(mid) + kEllipsis) <= width)
            low = mid;
        else
            high = mid - 1;
    }
    if (low == 0)
        return hasImage ? wxString() : kEllipsis;
    wxString shortened = text.Left(low);
    shortened.Trim();
    return shortened + kEllipsis;
}

void DrawTextTruncate(wxDC& dc, const wxString& text, const wxRect& rect, int align, bool hasImage)
{
    const wxString shown = TruncateTextToWidth(dc, text, rect.GetWidth(), hasImage);
    if (shown.empty())
        return;

    const int shownWidth = TextWidth(dc, shown);
    int x = rect.GetX();
    if (align & wxALIGN_RIGHT)
        x = rect.GetRight() + 1 - shownWidth;
    else if (align & wxALIGN_CENTRE_HORIZONTAL)
        x = rect.GetX() + (rect.GetWidth() - shownWidth) / 2;

    wxDCClipper clip(dc, rect);
    dc.DrawText(shown, x, rect.GetY());
}
