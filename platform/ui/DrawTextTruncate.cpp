#include "platform/ui/DrawTextTruncate.h"
#include "platform/ui/FontIdentity.h"
#include "platform/ui/TextLayoutCache.h"

#include <wx/arrstr.h>
#include <wx/dynarray.h>
#include <wx/font.h>
#include <wx/hashmap.h>
#include <wx/thread.h>

#include <algorithm>
#include <unordered_map>

namespace
{
const wxString kEllipsis = wxS("...");

int TextWidth(const wxDC& dc, const wxString& text)
{
    return dc.GetTextExtent(text).GetWidth();
}

// How many leading characters fit in the width, from one measurement of all
// prefixes rather than one measurement per candidate.
size_t FittingPrefixLength(const wxDC& dc, const wxString& text, int width)
{
    wxArrayInt prefixWidths;
    if (!dc.GetPartialTextExtents(text, prefixWidths) || prefixWidths.size() != text.length())
    {
        size_t length = 0;
        while (length < text.length() && TextWidth(dc, text.Left(length + 1)) <= width)
            ++length;
        return length;
    }
    const auto end = std::upper_bound(prefixWidths.begin(), prefixWidths.end(), width);
    return static_cast<size_t>(end - prefixWidths.begin());
}

wxString ComputeTruncated(const wxDC& dc, const wxString& text, int width, bool hasImage)
{
    if (TextWidth(dc, text) <= width)
        return text;

    const int ellipsisWidth = TextWidth(dc, kEllipsis);
    size_t length = FittingPrefixLength(dc, text, width - ellipsisWidth);
    // Kerning across the joint can add a pixel: step back until it truly fits.
    while (length > 0 && TextWidth(dc, text.Left(length) + kEllipsis) > width)
        --length;
    if (length == 0)
        return hasImage ? wxString() : kEllipsis;
    wxString shortened = text.Left(length);
    shortened.Trim();
    return shortened + kEllipsis;
}

// Lists repaint the same cells every second (the busy wheel); shaping text is
// what painting costs, so the shortened form of each text is remembered for
// the font it was measured in.
class TruncationMemo
{
public:
    wxString Get(const wxDC& dc, const wxString& text, int width, bool hasImage)
    {
        wxCriticalSectionLocker lock(m_lock);
        const wxFont& font = dc.GetFont();
        if (!SameDrawingFont(font, m_font))
            m_entries.clear();
        // Kept even when alike, so that the next check is a pointer comparison.
        m_font = font;
        if (m_entries.size() > kMaxEntries)
            m_entries.clear();
        wxString key = text;
        key << wxS('\x1f') << width << (hasImage ? wxS("i") : wxS("t"));
        auto found = m_entries.find(key);
        if (found != m_entries.end())
            return found->second;
        wxString shown = ComputeTruncated(dc, text, width, hasImage);
        m_entries.emplace(std::move(key), shown);
        return shown;
    }

private:
    static constexpr size_t kMaxEntries = 8192;
    wxCriticalSection m_lock;
    wxFont m_font;
    std::unordered_map<wxString, wxString, wxStringHash, wxStringEqual> m_entries;
};

TruncationMemo& Memo()
{
    // Never destroyed: fonts must not outlive the toolkit in a static destructor.
    static TruncationMemo* const memo = new TruncationMemo;
    return *memo;
}
// The shortened texts are drawn again at every repaint, as the cells that
// fit are: their shaped layouts are kept too. Drawing happens on the GUI
// thread only.
TextLayoutCache& Layouts()
{
    static TextLayoutCache* const layouts = new TextLayoutCache;
    return *layouts;
}
} // namespace

wxString TruncateTextToWidth(const wxDC& dc, const wxString& text, int width, bool hasImage)
{
    return Memo().Get(dc, text, width, hasImage);
}

void DrawTextTruncate(wxDC& dc, const wxString& text, const wxRect& rect, int align, bool hasImage)
{
    const wxString shown = TruncateTextToWidth(dc, text, rect.GetWidth(), hasImage);
    if (shown.empty())
        return;

    const bool loneEllipsis = shown == kEllipsis;
    int x = rect.GetX();
    if ((align & (wxALIGN_RIGHT | wxALIGN_CENTRE_HORIZONTAL)) || loneEllipsis)
    {
        const int shownWidth = TextWidth(dc, shown);
        if (align & wxALIGN_RIGHT)
            x = rect.GetRight() + 1 - shownWidth;
        else if (align & wxALIGN_CENTRE_HORIZONTAL)
            x = rect.GetX() + (rect.GetWidth() - shownWidth) / 2;
        if (shownWidth > rect.GetWidth())
        {
            // Only a lone ellipsis can be wider than the rectangle.
            wxDCClipper clip(dc, rect);
            dc.DrawText(shown, x, rect.GetY());
            return;
        }
    }
    Layouts().DrawText(dc, shown, x, rect.GetY());
}
