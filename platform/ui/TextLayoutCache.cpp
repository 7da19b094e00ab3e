#include "platform/ui/TextLayoutCache.h"
#include "platform/ui/FontIdentity.h"

#include <unordered_map>

#include <wx/font.h>
#include <wx/fontutil.h>
#include <wx/graphics.h>

#if defined(__WXGTK3__)
#include <pango/pangocairo.h>
#define WYX_HAS_CAIRO_TEXT 1
#endif

#if WYX_HAS_CAIRO_TEXT

namespace
{

constexpr size_t kMaxLayouts = 4096;

struct LayoutDeleter
{
    void operator()(PangoLayout* layout) const { g_object_unref(layout); }
};
using LayoutPtr = std::unique_ptr<PangoLayout, LayoutDeleter>;

struct ShapedText
{
    LayoutPtr layout;
    int width = 0;
    int height = 0;
};

// The cairo context a DC draws with, or null when it has none.
cairo_t* CairoOf(wxDC& dc)
{
    wxGraphicsContext* context = dc.GetGraphicsContext();
    if (context == nullptr || context->GetRenderer() != wxGraphicsRenderer::GetCairoRenderer())
        return nullptr;
    return static_cast<cairo_t*>(context->GetNativeContext());
}

struct FontOptionsDeleter
{
    void operator()(cairo_font_options_t* options) const { cairo_font_options_destroy(options); }
};
using FontOptionsPtr = std::unique_ptr<cairo_font_options_t, FontOptionsDeleter>;

// What shaping depends on besides font and text: the surface's font options
// (antialiasing, hinting) and the scale of the transformation. Translation
// does not matter: a layout is drawn at the current point.
struct ShapingTarget
{
    FontOptionsPtr options;
    double xx = 1, xy = 0, yx = 0, yy = 1;

    static ShapingTarget Of(cairo_t* cairo)
    {
        ShapingTarget target;
        target.options.reset(cairo_font_options_create());
        cairo_surface_get_font_options(cairo_get_target(cairo), target.options.get());
        FontOptionsPtr own(cairo_font_options_create());
        cairo_get_font_options(cairo, own.get());
        cairo_font_options_merge(target.options.get(), own.get());
        cairo_matrix_t matrix;
        cairo_get_matrix(cairo, &matrix);
        target.xx = matrix.xx;
        target.xy = matrix.xy;
        target.yx = matrix.yx;
        target.yy = matrix.yy;
        return target;
    }

    bool operator==(const ShapingTarget& other) const
    {
        return options && other.options && cairo_font_options_equal(options.get(), other.options.get()) &&
               xx == other.xx && xy == other.xy && yx == other.yx && yy == other.yy;
    }
};

} // namespace

struct TextLayoutCache::Layouts
{
    wxFont font;
    ShapingTarget target;
    std::unordered_map<wxString, ShapedText, wxStringHash, wxStringEqual> byText;
};

TextLayoutCache::TextLayoutCache() : m_layouts(std::make_unique<Layouts>()) {}

TextLayoutCache::~TextLayoutCache() = default;

size_t TextLayoutCache::Size() const
{
    return m_layouts->byText.size();
}

void TextLayoutCache::DrawText(wxDC& dc, const wxString& text, int x, int y)
{
    const wxFont& font = dc.GetFont();
    cairo_t* const cairo = CairoOf(dc);
    if (cairo == nullptr || text.empty() || !font.IsOk() || font.GetUnderlined() || font.GetStrikethrough() ||
        dc.GetBackgroundMode() != wxBRUSHSTYLE_TRANSPARENT || text.find('\n') != wxString::npos)
    {
        dc.DrawText(text, x, y);
        return;
    }

    // Layouts are kept shaped for one font on one kind of surface. Pango's own
    // update would reshape each one whenever the transformation is set again,
    // which every paint does.
    ShapingTarget target = ShapingTarget::Of(cairo);
    if (!SameDrawingFont(font, m_layouts->font) || !(target == m_layouts->target))
        m_layouts->byText.clear();
    m_layouts->target = std::move(target);
    // Kept even when alike, so that the next check is a pointer comparison.
    m_layouts->font = font;
    auto found = m_layouts->byText.find(text);
    if (found == m_layouts->byText.end())
    {
        if (m_layouts->byText.size() >= kMaxLayouts)
            m_layouts->byText.clear();
        ShapedText shaped;
        shaped.layout.reset(pango_cairo_create_layout(cairo));
        pango_layout_set_font_description(shaped.layout.get(), font.GetNativeFontInfo()->description);
        const wxScopedCharBuffer utf8 = text.utf8_str();
        pango_layout_set_text(shaped.layout.get(), utf8.data(), static_cast<int>(utf8.length()));
        pango_layout_get_pixel_size(shaped.layout.get(), &shaped.width, &shaped.height);
        found = m_layouts->byText.emplace(text, std::move(shaped)).first;
    }
    // As the library's cairo text drawing does: the text colour as source,
    // the layout's top left at the point; the DC's own transformation stays.
    const wxColour colour = dc.GetTextForeground();
    cairo_set_source_rgba(cairo, colour.Red() / 255.0, colour.Green() / 255.0, colour.Blue() / 255.0,
                          colour.Alpha() / 255.0);
    cairo_move_to(cairo, x, y);
    pango_cairo_show_layout(cairo, found->second.layout.get());
    cairo_new_path(cairo);
    dc.CalcBoundingBox(x, y);
    dc.CalcBoundingBox(x + found->second.width, y + found->second.height);
}

#else

struct TextLayoutCache::Layouts
{
};

TextLayoutCache::TextLayoutCache() = default;
TextLayoutCache::~TextLayoutCache() = default;

size_t TextLayoutCache::Size() const
{
    return 0;
}

void TextLayoutCache::DrawText(wxDC& dc, const wxString& text, int x, int y)
{
    dc.DrawText(text, x, y);
}

#endif
