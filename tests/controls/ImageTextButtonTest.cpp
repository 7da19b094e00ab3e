#include "components/Utility/ImageTextButton.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/settings.h>
#include <wx/uiaction.h>

#include <algorithm>
#include <vector>

namespace
{

const wxColour kRed(255, 0, 0);
const wxColour kPaper(255, 255, 255);
const wxColour kField(0, 0, 160);
const wxColour kInk(255, 255, 0);

wxBitmap SolidImage(const wxSize& size)
{
    wxImage image(size);
    image.SetRGB(wxRect(size), kRed.Red(), kRed.Green(), kRed.Blue());
    return wxBitmap(image);
}

class ButtonTest : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "buttons", wxDefaultPosition, wxSize(300, 200));
        frame->Bind(wxEVT_IMAGE_TEXT_BUTTON_CLICK,
                    [this](wxCommandEvent& event) { clicks.emplace_back(event.GetId(), event.GetString()); });
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

    wxFrame* frame = nullptr;
    bool painted = false;
    std::vector<std::pair<int, wxString>> clicks;
};

// The field, then the text centred vertically and the image where they belong.
TEST_F(ButtonTest, ShowsTheTextAndTheImageInPlace)
{
    struct Look
    {
        wxSize size;
        const char* text;
        wxSize image; // 0 x 0: none
        std::int32_t placement;
        bool ownColours; // kInk on kField, else the default white on black
        int textX;
        wxPoint imageAt;
    };
    const Look looks[] = {{{115, 20}, "Clear All", {0, 0}, ImageTextButton::kImageFirst, false, 0, {}},
                          {{115, 20}, "Clear All", {8, 8}, ImageTextButton::kImageFirst, true, 10, {0, 6}},
                          {{115, 20}, "Clear All", {8, 8}, ImageTextButton::kImageLast, true, 0, {105, 6}},
                          // A text longer than the button runs under the image at the end.
                          {{40, 20},
                           "A text much longer than the button",
                           {8, 8},
                           ImageTextButton::kImageLast,
                           false,
                           0,
                           {30, 6}},
                          {{30, 21}, "", {6, 5}, ImageTextButton::kImageFirst, false, 0, {0, 8}}};
    for (const Look& c : looks)
    {
        ImageTextButton* button = MakeButton(c.size);
        EXPECT_EQ(button->GetFont(), wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT));
        button->SetText(c.text);
        const wxBitmap image = c.image.x > 0 ? SolidImage(c.image) : wxNullBitmap;
        if (image.IsOk())
            button->SetBitmap(image, c.placement);
        if (c.ownColours)
        {
            button->SetButtonBackground(kField);
            button->SetTextColour(kInk);
        }
        const wxImage expected =
            pixels::Render(c.size, c.ownColours ? kField : *wxBLACK,
                           [&](wxDC& dc)
                           {
                               dc.SetFont(button->GetFont());
                               dc.SetTextForeground(c.ownColours ? kInk : *wxWHITE);
                               dc.DrawText(c.text, c.textX, (c.size.y - button->GetTextExtent(c.text).y) / 2);
                               if (image.IsOk())
                                   dc.DrawBitmap(image, c.imageAt, true);
                           });
        EXPECT_EQ(pixels::FirstDifference(Paint(*button, c.size), expected), "") << c.text << " " << c.size.x;
    }
}

// A separator draws two grey lines through the middle, across the longer side, and nothing else.
TEST_F(ButtonTest, SeparatorsShowTwoGreyLines)
{
    // Size and the first line: columns when taller than wide, else rows. The view's 1 x 20
    // separator has columns -1 and 0, so only column 0 shows.
    const std::pair<wxSize, int> shapes[] = {
        {{1, 20}, -1}, {{10, 40}, 4}, {{11, 40}, 4}, {{40, 10}, 4}, {{12, 12}, 5}};
    for (const auto& [size, first] : shapes)
    {
        ImageTextButton* button = MakeButton(size);
        button->SetBackgroundColour(kPaper);
        button->SetText("not shown");
        button->SetBitmap(SolidImage({4, 4}), ImageTextButton::kImageFirst);
        button->SetSeparator();
        EXPECT_TRUE(button->IsSeparator());
        const bool vertical = size.y > size.x;
        const wxImage expected =
            pixels::Render(size, kPaper,
                           [&](wxDC& dc)
                           {
                               dc.SetPen(wxPen(wxColour(128, 128, 128)));
                               for (int along = 0; along < std::max(size.x, size.y); ++along)
                                   for (int line = first; line <= first + 1; ++line)
                                       dc.DrawPoint(vertical ? line : along, vertical ? along : line);
                           });
        EXPECT_EQ(pixels::FirstDifference(Paint(*button, size), expected), "") << size.x << " x " << size.y;
    }
}

TEST_F(ButtonTest, EachPressPostsTheIdAndTheTextWithoutTrailingBlanks)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), 6007);
    button->SetText("  Clear All \t ");
    EXPECT_FALSE(button->IsSeparator());
    for (int press = 0; press < 2; ++press)
    {
        wxMouseEvent event(wxEVT_LEFT_DOWN);
        event.SetEventObject(button);
        EXPECT_TRUE(button->GetEventHandler()->ProcessEvent(event));
        EXPECT_FALSE(event.GetSkipped()) << "the press must go no further";
    }
    EXPECT_TRUE(clicks.empty()) << "the click is queued, not sent";
    wxTheApp->ProcessPendingEvents();
    const std::pair<int, wxString> click{6007, "  Clear All"};
    EXPECT_EQ(clicks, (std::vector<std::pair<int, wxString>>{click, click}));
    EXPECT_EQ(button->GetText(), "  Clear All \t ") << "the button keeps its own text";
}

TEST_F(ButtonTest, ARealClickOnTheShownButtonReachesTheParent)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), 6007);
    button->SetText("Clear All ");
    button->Bind(wxEVT_PAINT,
                 [this](wxPaintEvent& event)
                 {
                     painted = true;
                     event.Skip();
                 });
    frame->Show();
    ASSERT_TRUE(guitest::PumpUntil([this] { return painted; }));
    const wxPoint at = button->ClientToScreen(wxPoint(50, 10));
    wxUIActionSimulator input;
    input.MouseMove(at);
    guitest::PumpUntil([&at] { return wxGetMousePosition() == at; });
    input.MouseClick();
    ASSERT_TRUE(guitest::PumpUntil([this] { return !clicks.empty(); }));
    EXPECT_EQ(clicks, (std::vector<std::pair<int, wxString>>{{6007, "Clear All"}}));
}

} // namespace
