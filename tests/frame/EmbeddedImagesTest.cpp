// Every image built into the program decodes, and the icons are see-through
// around their drawing.
#include "resources/EmbeddedImages.h"
#include "platform/ui/BitmapFromMemory.h"

#include <gtest/gtest.h>
#include <wx/image.h>

#include <algorithm>
#include <iterator>
#include <vector>

namespace
{
// The sizes are the data's own; what a user would see wrong is an image that does not
// decode, or a wheel or tab icon that paints a box around itself.
TEST(EmbeddedImages, DecodeAndTheIconsHaveTransparentCorners)
{
    using namespace wyx::images;
    // The sort marks and the header strip are opaque; the icons follow them.
    std::vector<EmbeddedImage> images = {sortMarks[0], sortMarks[1], headerStrip, warning, clearAll};
    images.insert(images.end(), std::begin(busyWheel), std::end(busyWheel));
    images.insert(images.end(), std::begin(tabImages), std::end(tabImages));
    for (size_t i = 0; i < images.size(); ++i)
    {
        const wxBitmap bitmap = CUGetBitmapFromMemory(images[i].data, images[i].length);
        ASSERT_TRUE(bitmap.IsOk()) << i;
        const wxImage image = bitmap.ConvertToImage();
        const unsigned char* alpha = image.GetAlpha();
        EXPECT_TRUE(i < 3 || (alpha && alpha[0] == 0 && std::count(alpha, alpha + 256, 255) > 0)) << i;
    }
}

} // namespace
