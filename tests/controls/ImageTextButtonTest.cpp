#include "components/Utility/ImageTextButton.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/settings.h>
#include <wx/uiaction.h>

#include <memory>
#include <vector>

namespace
{

const wxColour kRed(255, 0, 0);
const wxColour kGrey(128, 128, 128);
const wxColour kPaper(255, 255, 255);
const wxColour kFieldColour(0, 0, 160);

wxBitmap SolidImage(int width, int height, const wxColour& colour)
{
    wxImage image(width, height);
    image.SetRGB(wxRect(0, 0, width, height), colour.Red(), colour.Green(), colour.Blue());
    return wxBitmap(image);
}

struct ReceivedClick
{
    int id;
    wxString text;
};

class ImageTextButtonTest : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "buttons", wxDefaultPosition, wxSize(300, 200));
        frame->Bind(wxEVT_IMAGE_TEXT_BUTTON_CLICK,
                    [this](wxCommandEvent& event) {
                        clicks.push_back({event.GetId(), event.GetString()});
                    });
    }

    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(0);
    }

    ImageTextButton* MakeButton(const wxSize& size, wxWindowID id = wxID_ANY)
    {
        return new ImageTextButton(frame, id, wxDefaultPosition, size, wxTAB_TRAVERSAL, "ImageTextButton");
    }

    static wxImage Paint(const ImageTextButton& button, const wxSize& size)
    {
        return pixels::Render(size, kPaper, [&](wxDC& dc) { button.Render(dc, wxRect(size)); });
    }

    // What the button must show: the field, then text and image where the test
    // says they belong, drawn directly.
    static wxImage Expected(const ImageTextButton& button, const wxSize& size, const wxColour& field,
                            const wxColour& ink, const wxString& text, const wxPoint& textAt,
                            const wxBitmap& image, const wxPoint& imageAt)
    {
        return pixels::Render(size, field,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(button.GetFont());
                                  dc.SetTextForeground(ink);
                                  if (!text.empty())
                                      dc.DrawText(text, textAt);
                                  if (image.IsOk())
                                      dc.DrawBitmap(image, imageAt, true);
                              });
    }

    static int CentredTextTop(const ImageTextButton& button, const wxString& text, int height)
    {
        return (height - button.GetTextExtent(text).y) / 2;
    }

    wxFrame* frame = nullptr;
    std::vector<ReceivedClick> clicks;
};

TEST_F(ImageTextButtonTest, UsesTheSystemGuiFont)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20));
    EXPECT_EQ(button->GetFont(), wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT));
    EXPECT_EQ(button->GetName(), "ImageTextButton");
    EXPECT_FALSE(button->IsSeparator());
}

TEST_F(ImageTextButtonTest, DefaultsAreWhiteTextOnBlack)
{
    const wxSize size(115, 20);
    ImageTextButton* button = MakeButton(size);
    button->SetText("Clear All");

    const wxImage shown = Paint(*button, size);
    const wxImage expected =
        Expected(*button, size, *wxBLACK, *wxWHITE, "Clear All",
                 wxPoint(0, CentredTextTop(*button, "Clear All", size.y)), wxNullBitmap, {});
    EXPECT_EQ(pixels::FirstDifference(shown, expected), "");
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(shown, 0, size.x, *wxBLACK)) << "no text drawn";
}

TEST_F(ImageTextButtonTest, ImageFirstStandsAtTheLeftEdgeWithTheTextTwoPixelsAfterIt)
{
    const wxSize size(115, 20);
    const wxBitmap image = SolidImage(8, 8, kRed);
    ImageTextButton* button = MakeButton(size);
    button->SetButtonBackground(kFieldColour);
    button->SetTextColour(*wxWHITE);
    button->SetText("Clear All");
    button->SetBitmap(image, ImageTextButton::kImageFirst);

    const wxImage shown = Paint(*button, size);
    EXPECT_EQ(pixels::At(shown, 0, 6), kRed);
    EXPECT_EQ(pixels::At(shown, 7, 13), kRed);
    EXPECT_EQ(pixels::At(shown, 0, 5), kFieldColour);
    EXPECT_EQ(pixels::At(shown, 0, 14), kFieldColour);
    EXPECT_FALSE(pixels::AnyPixelDiffersIn(shown, 8, 10, kFieldColour)) << "the gap must stay empty";

    const wxImage expected =
        Expected(*button, size, kFieldColour, *wxWHITE, "Clear All",
                 wxPoint(10, CentredTextTop(*button, "Clear All", size.y)), image, {0, 6});
    EXPECT_EQ(pixels::FirstDifference(shown, expected), "");
}

TEST_F(ImageTextButtonTest, ImageLastEndsTwoPixelsInsideTheRightEdge)
{
    const wxSize size(115, 20);
    const wxBitmap image = SolidImage(8, 8, kRed);
    ImageTextButton* button = MakeButton(size);
    button->SetButtonBackground(kFieldColour);
    button->SetText("Clear All");
    button->SetBitmap(image, ImageTextButton::kImageLast);

    const wxImage shown = Paint(*button, size);
    EXPECT_EQ(pixels::At(shown, 105, 6), kRed);
    EXPECT_EQ(pixels::At(shown, 112, 13), kRed);
    EXPECT_EQ(pixels::At(shown, 104, 10), kFieldColour);
    EXPECT_FALSE(pixels::AnyPixelDiffersIn(shown, 113, 115, kFieldColour));

    const wxImage expected =
        Expected(*button, size, kFieldColour, *wxWHITE, "Clear All",
                 wxPoint(0, CentredTextTop(*button, "Clear All", size.y)), image, {105, 6});
    EXPECT_EQ(pixels::FirstDifference(shown, expected), "");
}

TEST_F(ImageTextButtonTest, TextLongerThanTheButtonRunsUnderTheImageAtTheEnd)
{
    const wxSize size(40, 20);
    const wxString text = "A text much longer than the button";
    const wxBitmap image = SolidImage(8, 8, kRed);
    ImageTextButton* button = MakeButton(size);
    button->SetText(text);
    button->SetBitmap(image, ImageTextButton::kImageLast);

    const wxImage expected = Expected(*button, size, *wxBLACK, *wxWHITE, text,
                                      wxPoint(0, CentredTextTop(*button, text, size.y)), image, {30, 6});
    EXPECT_EQ(pixels::FirstDifference(Paint(*button, size), expected), "");
}

TEST_F(ImageTextButtonTest, ImageWithoutTextIsCentredVertically)
{
    const wxSize size(30, 21);
    const wxBitmap image = SolidImage(6, 5, kRed);
    ImageTextButton* button = MakeButton(size);
    button->SetBitmap(image, ImageTextButton::kImageFirst);

    const wxImage expected = Expected(*button, size, *wxBLACK, *wxWHITE, "", {}, image, {0, 8});
    EXPECT_EQ(pixels::FirstDifference(Paint(*button, size), expected), "");
}

struct SeparatorCase
{
    wxSize size;
    // Lines drawn: columns when vertical, rows when horizontal.
    bool vertical;
    int first;
};

class SeparatorTest : public ImageTextButtonTest, public testing::WithParamInterface<SeparatorCase>
{
};

TEST_P(SeparatorTest, DrawsTwoGreyLinesThroughTheMiddleAndNothingElse)
{
    const SeparatorCase& c = GetParam();
    ImageTextButton* button = MakeButton(c.size);
    button->SetBackgroundColour(kPaper);
    button->SetText("not shown");
    button->SetBitmap(SolidImage(4, 4, kRed), ImageTextButton::kImageFirst);
    button->SetSeparator();
    ASSERT_TRUE(button->IsSeparator());

    const wxImage expected =
        pixels::Render(c.size, kPaper,
                       [&](wxDC& dc)
                       {
                           dc.SetPen(*wxGREY_PEN);
                           for (int line = c.first; line <= c.first + 1; ++line)
                           {
                               for (int along = 0; along < (c.vertical ? c.size.y : c.size.x); ++along)
                               {
                                   if (c.vertical)
                                       dc.DrawPoint(line, along);
                                   else
                                       dc.DrawPoint(along, line);
                               }
                           }
                       });
    EXPECT_EQ(pixels::FirstDifference(Paint(*button, c.size), expected), "");
}

INSTANTIATE_TEST_SUITE_P(Shapes, SeparatorTest,
                         testing::Values(
                             // The view's 1 x 20 separator: columns -1 and 0, so only column 0 shows.
                             SeparatorCase{wxSize(1, 20), true, -1}, SeparatorCase{wxSize(10, 40), true, 4},
                             SeparatorCase{wxSize(11, 40), true, 4}, SeparatorCase{wxSize(40, 10), false, 4},
                             // Square: horizontal.
                             SeparatorCase{wxSize(12, 12), false, 5}));

TEST_F(ImageTextButtonTest, TheOneBySeparatorShowsAFullGreyColumn)
{
    const wxSize size(1, 20);
    ImageTextButton* button = MakeButton(size);
    button->SetSeparator();
    const wxImage shown = Paint(*button, size);
    for (int y = 0; y < size.y; ++y)
        EXPECT_EQ(pixels::At(shown, 0, y), kGrey) << "row " << y;
}

TEST_F(ImageTextButtonTest, LeftPressPostsTheIdAndTheTextWithoutTrailingBlanks)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), 6007);
    button->SetText("  Clear All \t ");

    wxMouseEvent press(wxEVT_LEFT_DOWN);
    press.SetEventObject(button);
    const bool handled = button->GetEventHandler()->ProcessEvent(press);

    EXPECT_TRUE(handled);
    EXPECT_FALSE(press.GetSkipped()) << "the press must go no further";
    EXPECT_TRUE(clicks.empty()) << "the click is queued, not sent";

    wxTheApp->ProcessPendingEvents();
    ASSERT_EQ(clicks.size(), 1u);
    EXPECT_EQ(clicks[0].id, 6007);
    EXPECT_EQ(clicks[0].text, "  Clear All");
    EXPECT_EQ(button->GetText(), "  Clear All \t ") << "the button keeps its own text";
}

TEST_F(ImageTextButtonTest, EachPressPostsOneClick)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), 6007);
    button->SetText("Clear All");
    for (int i = 0; i < 3; ++i)
    {
        wxMouseEvent press(wxEVT_LEFT_DOWN);
        press.SetEventObject(button);
        button->GetEventHandler()->ProcessEvent(press);
    }
    wxTheApp->ProcessPendingEvents();
    EXPECT_EQ(clicks.size(), 3u);
}

TEST_F(ImageTextButtonTest, ARealClickOnTheShownButtonReachesTheParent)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), 6007);
    button->SetText("Clear All ");
    frame->Show();
    guitest::Pump(100);

    wxUIActionSimulator input;
    input.MouseMove(button->ClientToScreen(wxPoint(50, 10)));
    guitest::Pump(20);
    input.MouseClick();
    for (int round = 0; round < 200 && clicks.empty(); ++round)
        guitest::Pump(10);

    ASSERT_EQ(clicks.size(), 1u);
    EXPECT_EQ(clicks[0].id, 6007);
    EXPECT_EQ(clicks[0].text, "Clear All");
}

} // namespace
