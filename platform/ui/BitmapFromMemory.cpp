#include "platform/ui/BitmapFromMemory.h"

#include <wx/image.h>
#include <wx/log.h>
#include <wx/mstream.h>

wxBitmap CUGetBitmapFromMemory(const void* data, std::size_t length)
{
    if (data == nullptr || length == 0)
        return wxBitmap();
    if (wxImage::FindHandler(wxBITMAP_TYPE_PNG) == nullptr)
        wxImage::AddHandler(new wxPNGHandler);
    // A damaged image is an answer (an invalid bitmap), not something to tell the user.
    wxLogNull quiet;
    wxMemoryInputStream stream(data, length);
    wxImage image;
    if (!image.LoadFile(stream, wxBITMAP_TYPE_PNG) || !image.IsOk())
        return wxBitmap();
    return wxBitmap(image);
}
