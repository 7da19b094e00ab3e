#include "ScreenGrab.h"

#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <memory>

wxImage GrabScreen(const wxRect& area)
{
    std::unique_ptr<Display, int (*)(Display*)> display(XOpenDisplay(nullptr), XCloseDisplay);
    if (!display || area.IsEmpty())
        return wxImage();
    XSync(display.get(), False);
    // XDestroyImage is a macro, so it needs a function around it.
    const auto destroy = [](XImage* image) { XDestroyImage(image); };
    std::unique_ptr<XImage, decltype(destroy)> pixels(
        XGetImage(display.get(), DefaultRootWindow(display.get()), area.x, area.y, area.width, area.height,
                  AllPlanes, ZPixmap),
        destroy);
    if (!pixels)
        return wxImage();
    const Visual* visual = DefaultVisual(display.get(), DefaultScreen(display.get()));
    auto channel = [](unsigned long pixel, unsigned long mask)
    {
        int shift = 0;
        while (mask != 0 && (mask & 1) == 0)
        {
            mask >>= 1;
            ++shift;
        }
        return static_cast<unsigned char>(((pixel >> shift) & mask) * 255 / (mask ? mask : 1));
    };
    wxImage image(area.width, area.height);
    for (int y = 0; y < area.height; ++y)
        for (int x = 0; x < area.width; ++x)
        {
            const unsigned long pixel = XGetPixel(pixels.get(), x, y);
            image.SetRGB(x, y, channel(pixel, visual->red_mask), channel(pixel, visual->green_mask),
                         channel(pixel, visual->blue_mask));
        }
    return image;
}
