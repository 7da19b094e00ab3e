#include "views/ViewImages.h"

#include "platform/themer/Themer.h"
#include "platform/ui/BitmapFromMemory.h"
#include "resources/EmbeddedImages.h"

namespace viewimages
{
namespace
{
constexpr int kImageSize = 16;

wxBitmap Decode(const wyx::images::EmbeddedImage& image)
{
    return CUGetBitmapFromMemory(image.data, image.length);
}

// RGBA images go in through wxImage so that their alpha survives without a mask.
void AddWithAlpha(wxImageList& list, const wyx::images::EmbeddedImage& image)
{
    const wxBitmap bitmap = Decode(image);
    list.Add(bitmap.IsOk() ? wxBitmap(bitmap.ConvertToImage()) : wxBitmap(kImageSize, kImageSize));
}
} // namespace

std::unique_ptr<wxImageList> MakeSortMarks()
{
    auto list = std::make_unique<wxImageList>(kImageSize, kImageSize, true, 1);
    for (const wyx::images::EmbeddedImage& mark : wyx::images::sortMarks)
        list->Add(Decode(mark), wxColour(255, 0, 255));
    return list;
}

std::unique_ptr<wxImageList> MakeBusyWheel()
{
    auto list = std::make_unique<wxImageList>(kImageSize, kImageSize, true, 5);
    for (const wyx::images::EmbeddedImage& frame : wyx::images::busyWheel)
        AddWithAlpha(*list, frame);
    return list;
}

std::unique_ptr<wxImageList> MakeWarningImages()
{
    auto list = std::make_unique<wxImageList>(kImageSize, kImageSize, true, 1);
    AddWithAlpha(*list, wyx::images::warning);
    return list;
}

wxBitmap ClearAllBitmap()
{
    const wxBitmap bitmap = Decode(wyx::images::clearAll);
    return bitmap.IsOk() ? wxBitmap(bitmap.ConvertToImage()) : bitmap;
}

headerStyle MakeHeaderStyle()
{
    headerStyle style;
    style.backgroundColour = Themer::GetThemeService()->GetTheme("Default").backgroundColour;
    style.bitmap = Decode(wyx::images::headerStrip);
    style.textColour = Themer::GetThemeService()->GetTheme("ListControl").foregroundColour;
    return style;
}

} // namespace viewimages
