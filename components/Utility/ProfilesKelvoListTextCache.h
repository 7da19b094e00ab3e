#pragma once

#include <wx/dc.h>
#include <wx/font.h>
#include <wx/hashmap.h>
#include <wx/string.h>

#include "platform/ui/FontIdentity.h"
#include "platform/ui/TextLayoutCache.h"

#include <unordered_map>

// Remembered text extents and shaped texts in one font. Rows are repainted
// every second while jobs run, and shaping text is most of what painting
// costs; a memo, not state: clearing it never changes what is drawn.
class ProfilesKelvoListTextCache
{
public:
    wxSize Extent(const wxDC& dc, const wxString& text)
    {
        const wxFont& font = dc.GetFont();
        if (!SameDrawingFont(font, m_font))
            m_extents.clear();
        // Kept even when alike, so that the next check is a pointer comparison.
        m_font = font;
        auto found = m_extents.find(text);
        if (found != m_extents.end())
            return found->second;
        if (m_extents.size() >= kMaxEntries)
            m_extents.clear();
        const wxSize extent = dc.GetTextExtent(text);
        m_extents.emplace(text, extent);
        return extent;
    }

    // The text with its top left at (x, y), as dc.DrawText draws it.
    void Draw(wxDC& dc, const wxString& text, int x, int y) { m_layouts.DrawText(dc, text, x, y); }

private:
    static constexpr size_t kMaxEntries = 16384;
    TextLayoutCache m_layouts;
    wxFont m_font;
    std::unordered_map<wxString, wxSize, wxStringHash, wxStringEqual> m_extents;
};
