#include "DrawNow.h"

#include <wx/toplevel.h>

#include <cairo.h>
#include <dlfcn.h>

#include <memory>

wxImage DrawNow(wxWindow* window)
{
    // GTK is already loaded by wx; looked up at run time so that the tests
    // need no GTK headers.
    using DrawFunction = void (*)(void* widget, cairo_t* cr);
    using ResizeFunction = void (*)(void* container);
    static const auto draw = reinterpret_cast<DrawFunction>(dlsym(RTLD_DEFAULT, "gtk_widget_draw"));
    static const auto resize =
        reinterpret_cast<ResizeFunction>(dlsym(RTLD_DEFAULT, "gtk_container_check_resize"));
    const wxSize size = window->GetSize();
    if (!draw || !resize || size.x <= 0 || size.y <= 0)
        return wxImage();
    // The toolkit sizes its widgets at the start of every frame, before it paints.
    resize(wxGetTopLevelParent(window)->GetHandle());

    std::unique_ptr<cairo_surface_t, decltype(&cairo_surface_destroy)> surface(
        cairo_image_surface_create(CAIRO_FORMAT_RGB24, size.x, size.y), cairo_surface_destroy);
    {
        std::unique_ptr<cairo_t, decltype(&cairo_destroy)> cr(cairo_create(surface.get()), cairo_destroy);
        draw(window->GetHandle(), cr.get());
    }
    cairo_surface_flush(surface.get());
    const unsigned char* pixels = cairo_image_surface_get_data(surface.get());
    const int stride = cairo_image_surface_get_stride(surface.get());
    wxImage image(size.x, size.y);
    for (int y = 0; y < size.y; ++y)
    {
        const auto* row = reinterpret_cast<const uint32_t*>(pixels + y * stride);
        for (int x = 0; x < size.x; ++x)
            image.SetRGB(x, y, (row[x] >> 16) & 0xff, (row[x] >> 8) & 0xff, row[x] & 0xff);
    }
    return image;
}
