// Every image built into the program decodes, the icons are see-through
// around their drawing, and the window icon file lies beside the program.
#include "resources/EmbeddedImages.h"
#include "platform/ui/BitmapFromMemory.h"

#include <gtest/gtest.h>
#include <wx/filename.h>
#include <wx/iconbndl.h>
#include <wx/image.h>
#include <wx/stdpaths.h>

#include <algorithm>
#include <vector>

namespace
{
using wyx::images::EmbeddedImage;

wxImage Decode(const EmbeddedImage& image)
{
    const wxBitmap bitmap = CUGetBitmapFromMemory(image.data, image.length);
    return bitmap.IsOk() ? bitmap.ConvertToImage() : wxImage();
}

// The sizes are the data's own; what a user would see wrong is an image that does not
// decode, or a wheel or tab icon that paints a box around itself.
TEST(EmbeddedImages, DecodeAndTheIconsHaveTransparentCorners)
{
    using namespace wyx::images;
    std::vector<const EmbeddedImage*> images = {&sortMarks[0], &sortMarks[1], &headerStrip, &warning,
                                                &clearAll};
    for (const EmbeddedImage& image : busyWheel)
        images.push_back(&image);
    for (const EmbeddedImage& image : tabImages)
        images.push_back(&image);
    for (size_t i = 0; i < images.size(); ++i)
    {
        const wxImage image = Decode(*images[i]);
        ASSERT_TRUE(image.IsOk()) << i;
        const unsigned char* alpha = image.GetAlpha();
        EXPECT_TRUE(i < 3 || (alpha && alpha[0] == 0 && std::count(alpha, alpha + 256, 255) > 0)) << i;
    }
}

TEST(WindowIconFile, LiesBesideTheProgramWithItsSixteenThirtyTwoAndFortyEightPixelImages)
{
    wxFileName path(wxStandardPaths::Get().GetExecutablePath());
    path.SetFullName("wyx_folder.ico");
    const wxIconBundle bundle(path.GetFullPath(), wxBITMAP_TYPE_ANY);
    ASSERT_TRUE(bundle.IsOk()) << path.GetFullPath();
    for (int size : {16, 32, 48})
        EXPECT_TRUE(bundle.GetIconOfExactSize(wxSize(size, size)).IsOk()) << size;
}
} // namespace
