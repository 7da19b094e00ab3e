#include "ScreenGrab.h"

#include <X11/Xlib.h>
#include <X11/Xutil.h>

#include <memory>

wxImage GrabScreen(const wxRect& area)
{
    std::unique_ptr<Display, int (*)(Display*)> display(XOpenDisplay(nullptr), XCloseDisplay);
    XImage* pixels = display && !area.IsEmpty()
                         ? XGetImage(display.get(), DefaultRootWindow(display.get()), area.x, area.y,
                                     area.width, area.height, AllPlanes, ZPixmap)
                         : nullptr;
    if (pixels == nullptr)
        return wxImage();
    const Visual* visual = DefaultVisual(display.get(), DefaultScreen(display.get()));
    // A channel's bits scaled to 0..255: the shifts of value and mask cancel out.
    const auto channel = [](unsigned long pixel, unsigned long mask)
    { return static_cast<unsigned char>(mask != 0 ? (pixel & mask) * 255 / mask : 0); };
    wxImage image(area.width, area.height);
    for (int y = 0; y < area.height; ++y)
        for (int x = 0; x < area.width; ++x)
        {
            const unsigned long pixel = XGetPixel(pixels, x, y);
            image.SetRGB(x, y, channel(pixel, visual->red_mask), channel(pixel, visual->green_mask),
                         channel(pixel, visual->blue_mask));
        }
    XDestroyImage(pixels);
    return image;
}
