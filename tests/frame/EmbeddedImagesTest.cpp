// Every image built into the program decodes, the icons are see-through
// around their drawing, the sort marks and the wheel frames show what they
// mean, damaged data gives an invalid bitmap instead of a crash, and the
// window icon file lies beside the program.
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

bool IsMagenta(const wxImage& image, int x, int y)
{
    return image.GetRed(x, y) == 255 && image.GetGreen(x, y) == 0 && image.GetBlue(x, y) == 255;
}

// The sizes are the data's own; what a user would see wrong is an image that
// does not decode, or a wheel or tab icon that paints a box around itself.
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

// The width of a sort mark in a row: the pixels that are not magenta.
int MarkWidth(const wxImage& image, int y)
{
    int width = 0;
    for (int x = 0; x < image.GetWidth(); ++x)
        width += IsMagenta(image, x, y) ? 0 : 1;
    return width;
}

TEST(EmbeddedImages, AscendingMarkPointsUpAndDescendingDown)
{
    for (int mark : {0, 1})
    {
        const wxImage image = Decode(wyx::images::sortMarks[mark]);
        int top = -1, bottom = -1;
        for (int y = 0; y < image.GetHeight(); ++y)
            if (MarkWidth(image, y) > 0)
            {
                top = top < 0 ? y : top;
                bottom = y;
            }
        ASSERT_LT(top, bottom) << mark;
        EXPECT_EQ(MarkWidth(image, top) < MarkWidth(image, bottom), mark == 0) << mark;
    }
}

TEST(EmbeddedImages, EveryBusyWheelFrameIsTurnedFromTheOneBefore)
{
    for (int i = 0; i < 12; ++i)
    {
        const wxImage frame = Decode(wyx::images::busyWheel[i]);
        const wxImage next = Decode(wyx::images::busyWheel[(i + 1) % 12]);
        int differing = 0;
        for (int y = 0; y < 16; ++y)
            for (int x = 0; x < 16; ++x)
                differing +=
                    frame.GetAlpha(x, y) != next.GetAlpha(x, y) || frame.GetRed(x, y) != next.GetRed(x, y);
        EXPECT_GT(differing, 4) << "frames " << i << " and " << (i + 1) % 12;
    }
}

TEST(BitmapFromMemory, DamagedDataGivesAnInvalidBitmap)
{
    const EmbeddedImage& good = wyx::images::warning;
    const std::vector<unsigned char> png(good.data, good.data + good.length);
    std::vector<unsigned char> scrambled = png;
    for (size_t i = 33; i < scrambled.size(); i += 7)
        scrambled[i] ^= 0x5A;
    const unsigned char text[] = "not an image at all";
    const struct
    {
        const char* what;
        const void* data;
        size_t length;
    } cases[] = {{"null", nullptr, 0},
                 {"null with a length", nullptr, 100},
                 {"empty", png.data(), 0},
                 {"signature only", png.data(), 8},
                 {"cut in half", png.data(), png.size() / 2},
                 {"scrambled body", scrambled.data(), scrambled.size()},
                 {"text", text, sizeof text}};
    for (const auto& damaged : cases)
        EXPECT_FALSE(CUGetBitmapFromMemory(damaged.data, damaged.length).IsOk()) << damaged.what;
    EXPECT_TRUE(CUGetBitmapFromMemory(png.data(), png.size()).IsOk());
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
