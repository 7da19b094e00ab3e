#pragma once

#include <wx/dc.h>
#include <wx/font.h>
#include <wx/hashmap.h>
#include <wx/string.h>

#include <unordered_map>

// Remembered text extents in one font. Rows are repainted every second while
// jobs run, and shaping text is most of what painting costs; a memo, not
// state: clearing it never changes what is drawn.
class ProfilesKelvoListTextCache
{
public:
    wxSize Extent(const wxDC& dc, const wxString& text)
    {
        const wxFont& font = dc.GetFont();
        if (!(font == m_font))
        {
            m_extents.clear();
            m_font = font;
        }
        auto found = m_extents.find(text);
        if (found != m_extents.end())
            return found->second;
        if (m_extents.size() >= kMaxEntries)
            m_extents.clear();
        const wxSize extent = dc.GetTextExtent(text);
        m_extents.emplace(text, extent);
        return extent;
    }

private:
    static constexpr size_t kMaxEntries = 16384;
    wxFont m_font;
    std::unordered_map<wxString, wxSize, wxStringHash, wxStringEqual> m_extents;
};
