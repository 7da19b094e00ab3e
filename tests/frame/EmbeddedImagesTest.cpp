// Every image built into the program decodes to the size and kind its users
// expect, and damaged data gives an invalid bitmap instead of a crash.
#include "resources/EmbeddedImages.h"
#include "platform/ui/BitmapFromMemory.h"

#include <gtest/gtest.h>
#include <wx/image.h>

#include <string>
#include <vector>

namespace
{
using wyx::images::EmbeddedImage;

enum class Kind
{
    Alpha,
    MaskedOnMagenta,
    Opaque
};

struct ImageCase
{
    std::string name;
    const EmbeddedImage* image;
    wxSize size;
    Kind kind;
};

std::vector<ImageCase> AllImages()
{
    using namespace wyx::images;
    std::vector<ImageCase> cases;
    for (int i = 0; i < 12; ++i)
        cases.push_back({"busyWheel" + std::to_string(i), &busyWheel[i], wxSize(16, 16), Kind::Alpha});
    cases.push_back({"sortAscending", &sortMarks[0], wxSize(16, 16), Kind::MaskedOnMagenta});
    cases.push_back({"sortDescending", &sortMarks[1], wxSize(16, 16), Kind::MaskedOnMagenta});
    cases.push_back({"headerStrip", &headerStrip, wxSize(1, 23), Kind::Opaque});
    cases.push_back({"warning", &warning, wxSize(16, 16), Kind::Alpha});
    cases.push_back({"clearAll", &clearAll, wxSize(16, 16), Kind::Alpha});
    for (int i = 0; i < 3; ++i)
        cases.push_back({"tab" + std::to_string(i), &tabImages[i], wxSize(16, 16), Kind::Alpha});
    return cases;
}

wxImage Decode(const EmbeddedImage& image)
{
    const wxBitmap bitmap = CUGetBitmapFromMemory(image.data, image.length);
    return bitmap.IsOk() ? bitmap.ConvertToImage() : wxImage();
}

bool IsMagenta(const wxImage& image, int x, int y)
{
    return image.GetRed(x, y) == 255 && image.GetGreen(x, y) == 0 && image.GetBlue(x, y) == 255;
}

class EmbeddedImageDecoding : public ::testing::TestWithParam<ImageCase>
{
};

TEST_P(EmbeddedImageDecoding, HasItsSizeAndKind)
{
    const ImageCase& param = GetParam();
    ASSERT_GT(param.image->length, 8u);
    const wxBitmap bitmap = CUGetBitmapFromMemory(param.image->data, param.image->length);
    ASSERT_TRUE(bitmap.IsOk());
    EXPECT_EQ(bitmap.GetSize(), param.size);

    const wxImage image = bitmap.ConvertToImage();
    switch (param.kind)
    {
    case Kind::Alpha:
    {
        ASSERT_TRUE(image.HasAlpha());
        // Transparent corners, and something opaque to see.
        EXPECT_EQ(image.GetAlpha(0, 0), 0);
        bool anyOpaque = false;
        for (int y = 0; y < image.GetHeight(); ++y)
            for (int x = 0; x < image.GetWidth(); ++x)
                anyOpaque = anyOpaque || image.GetAlpha(x, y) == 255;
        EXPECT_TRUE(anyOpaque);
        break;
    }
    case Kind::MaskedOnMagenta:
    {
        EXPECT_FALSE(image.HasAlpha());
        EXPECT_TRUE(IsMagenta(image, 0, 0));
        // With the magenta masked, what is left is the mark itself.
        wxBitmap masked(bitmap);
        masked.SetMask(new wxMask(masked, wxColour(255, 0, 255)));
        const wxImage maskedImage = masked.ConvertToImage();
        ASSERT_TRUE(maskedImage.HasMask());
        EXPECT_TRUE(maskedImage.IsTransparent(0, 0));
        EXPECT_FALSE(maskedImage.IsTransparent(7, 8));
        break;
    }
    case Kind::Opaque:
        EXPECT_FALSE(image.HasAlpha());
        break;
    }
}

INSTANTIATE_TEST_SUITE_P(All, EmbeddedImageDecoding, ::testing::ValuesIn(AllImages()),
                         [](const ::testing::TestParamInfo<ImageCase>& info) { return info.param.name; });

// Width of the mark in a row: the pixels that are not magenta.
int MarkWidth(const wxImage& image, int y)
{
    int width = 0;
    for (int x = 0; x < image.GetWidth(); ++x)
        width += IsMagenta(image, x, y) ? 0 : 1;
    return width;
}

// The first and last rows that hold part of the mark.
std::pair<int, int> MarkRows(const wxImage& image)
{
    int first = -1;
    int last = -1;
    for (int y = 0; y < image.GetHeight(); ++y)
    {
        if (MarkWidth(image, y) > 0)
        {
            first = first < 0 ? y : first;
            last = y;
        }
    }
    return {first, last};
}

TEST(SortMarks, AscendingPointsUpAndDescendingDown)
{
    const wxImage up = Decode(wyx::images::sortMarks[0]);
    const wxImage down = Decode(wyx::images::sortMarks[1]);
    ASSERT_TRUE(up.IsOk());
    ASSERT_TRUE(down.IsOk());
    const auto [upTop, upBottom] = MarkRows(up);
    const auto [downTop, downBottom] = MarkRows(down);
    ASSERT_LT(upTop, upBottom);
    ASSERT_LT(downTop, downBottom);
    EXPECT_LT(MarkWidth(up, upTop), MarkWidth(up, upBottom));
    EXPECT_GT(MarkWidth(down, downTop), MarkWidth(down, downBottom));
}

TEST(BusyWheel, EveryFrameIsTurnedFromTheOneBefore)
{
    for (int i = 0; i < 12; ++i)
    {
        const wxImage frame = Decode(wyx::images::busyWheel[i]);
        const wxImage next = Decode(wyx::images::busyWheel[(i + 1) % 12]);
        ASSERT_TRUE(frame.IsOk() && next.IsOk());
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
    std::vector<unsigned char> corrupted = png;
    for (size_t i = 33; i < corrupted.size(); i += 7)
        corrupted[i] ^= 0x5A;
    const unsigned char text[] = "not an image at all";

    struct Damaged
    {
        const char* what;
        const void* data;
        size_t length;
    };
    const Damaged cases[] = {
        {"null", nullptr, 0},
        {"null with a length", nullptr, 100},
        {"empty", png.data(), 0},
        {"signature only", png.data(), 8},
        {"cut in half", png.data(), png.size() / 2},
        {"scrambled body", corrupted.data(), corrupted.size()},
        {"text", text, sizeof text},
    };
    for (const Damaged& damaged : cases)
        EXPECT_FALSE(CUGetBitmapFromMemory(damaged.data, damaged.length).IsOk()) << damaged.what;
    EXPECT_TRUE(CUGetBitmapFromMemory(png.data(), png.size()).IsOk());
}
} // namespace
