#include "components/Utility/ImageTextButton.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>

#include <tuple>
#include <vector>

namespace
{
const wxColour kField(0, 0, 160);
const wxColour kInk(255, 255, 0);

const auto SolidImage = [](const wxSize& size)
{ return wxBitmap(pixels::Render(size, *wxRED, [](wxDC&) {})); };

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

    ImageTextButton* MakeButton(const wxSize& size, const wxString& text, wxWindowID id = wxID_ANY)
    {
        auto* button = new ImageTextButton(frame, id, wxDefaultPosition, size);
        button->SetText(text);
        return button;
    }

    static wxImage Paint(ImageTextButton* button, const wxSize& size)
    {
        return pixels::Render(size, *wxWHITE, [&](wxDC& dc) { button->Render(dc, wxRect(size)); });
    }

    wxFrame* frame = nullptr;
    std::vector<std::pair<int, wxString>> clicks;
};

// The field in its colour, then the text in its colour centred vertically and the image where it belongs:
// before the text, or at the end with the text running under it.
TEST_F(ButtonTest, ShowsTheTextAndTheImageInPlace)
{
    const std::tuple<wxSize, const char*, std::int32_t, int, wxPoint> looks[] = {
        {{115, 20}, "Clear All", -1, 0, {}},
        {{115, 20}, "Clear All", ImageTextButton::kImageFirst, 10, {0, 6}},
        {{40, 20}, "A text much longer than the button", ImageTextButton::kImageLast, 0, {30, 6}}};
    for (const auto& [size, text, placement, textX, imageAt] : looks)
    {
        ImageTextButton* button = MakeButton(size, text);
        if (placement >= 0)
            button->SetBitmap(SolidImage({8, 8}), placement);
        button->SetButtonBackground(kField);
        button->SetTextColour(kInk);
        const wxImage expected =
            pixels::Render(size, kField,
                           [&](wxDC& dc)
                           {
                               dc.SetFont(button->GetFont());
                               dc.SetTextForeground(kInk);
                               dc.DrawText(text, textX, (size.y - dc.GetTextExtent(text).y) / 2);
                               if (placement >= 0)
                                   dc.DrawBitmap(SolidImage({8, 8}), imageAt, true);
                           });
        EXPECT_EQ(pixels::FirstDifference(Paint(button, size), expected), "") << text;
    }
}

// The view's 1 x 20 separator: two grey columns through the middle, -1 and 0, so only column 0 shows.
TEST_F(ButtonTest, ASeparatorShowsAGreyLineAndNothingElse)
{
    ImageTextButton* button = MakeButton(wxSize(1, 20), "not shown");
    button->SetBackgroundColour(*wxWHITE);
    button->SetSeparator();
    const wxImage expected = pixels::Render(wxSize(1, 20), wxColour(128, 128, 128), [](wxDC&) {});
    EXPECT_EQ(pixels::FirstDifference(Paint(button, {1, 20}), expected), "");
}

// A press posts the id and the text without trailing blanks.
TEST_F(ButtonTest, APressPostsTheIdAndTheTextWithoutTrailingBlanks)
{
    ImageTextButton* button = MakeButton(wxSize(115, 20), "  Clear All \t ", 6007);
    wxMouseEvent event(wxEVT_LEFT_DOWN);
    event.SetEventObject(button);
    EXPECT_TRUE(button->GetEventHandler()->ProcessEvent(event) && !event.GetSkipped()) << "and no further";
    EXPECT_TRUE(clicks.empty()) << "the click is queued, not sent";
    wxTheApp->ProcessPendingEvents();
    EXPECT_EQ(clicks, (std::vector<std::pair<int, wxString>>{{6007, "  Clear All"}}));
}

} // namespace
