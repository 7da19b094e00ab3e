#include "DrawNow.h"

#include <wx/toplevel.h>

#include <cairo.h>
#include <dlfcn.h>

wxImage DrawNow(wxWindow* window)
{
    // GTK is already loaded by wx; looked up at run time so that the tests
    // need no GTK headers.
    static const auto draw =
        reinterpret_cast<void (*)(void*, cairo_t*)>(dlsym(RTLD_DEFAULT, "gtk_widget_draw"));
    static const auto resize =
        reinterpret_cast<void (*)(void*)>(dlsym(RTLD_DEFAULT, "gtk_container_check_resize"));
    const wxSize size = window->GetSize();
    if (!draw || !resize || size.x <= 0 || size.y <= 0)
        return wxImage();
    // The toolkit sizes its widgets at the start of every frame, before it paints.
    resize(wxGetTopLevelParent(window)->GetHandle());
    cairo_surface_t* surface = cairo_image_surface_create(CAIRO_FORMAT_RGB24, size.x, size.y);
    cairo_t* cr = cairo_create(surface);
    draw(window->GetHandle(), cr);
    cairo_destroy(cr);
    cairo_surface_flush(surface);
    wxImage image(size.x, size.y);
    for (int y = 0; y < size.y; ++y)
        for (int x = 0; x < size.x; ++x)
        {
            const uint32_t pixel = reinterpret_cast<const uint32_t*>(
                cairo_image_surface_get_data(surface) + y * cairo_image_surface_get_stride(surface))[x];
            image.SetRGB(x, y, (pixel >> 16) & 0xff, (pixel >> 8) & 0xff, pixel & 0xff);
        }
    cairo_surface_destroy(surface);
    return image;
}
