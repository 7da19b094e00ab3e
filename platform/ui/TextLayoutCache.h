#pragma once

#include <memory>

#include <wx/dc.h>
#include <wx/string.h>

// Draws single-line texts as wxDC::DrawText does, keeping each text's shaped
// layout for the next paint. A list repaints the same few hundred cell texts
// every second, and shaping them again each time (twice, as DrawText also
// measures for the bounding box) is most of what a repaint costs. A memo, not
// state: clearing it never changes what is drawn. Where the DC is not drawn
// by cairo, the font is underlined or struck through, the background is
// opaque or the text has a line break, DrawText itself is used.
class TextLayoutCache
{
public:
    TextLayoutCache();
    ~TextLayoutCache();
    TextLayoutCache(const TextLayoutCache&) = delete;
    TextLayoutCache& operator=(const TextLayoutCache&) = delete;

    // text at (x, y), the top left corner, in the DC's font and text colour.
    void DrawText(wxDC& dc, const wxString& text, int x, int y);

    // How many layouts are kept, for tests.
    size_t Size() const;

private:
    struct Layouts;
    std::unique_ptr<Layouts> m_layouts;
};
