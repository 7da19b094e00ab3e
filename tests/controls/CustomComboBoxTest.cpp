#include "components/Utility/CustomComboBox.h"

#include "pump/bus/CustomEvents.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/panel.h>
#include <wx/uiaction.h>

#include <vector>

namespace
{

// A font where every character is 10 pixels wide.
int TenPixelsPerCharacter(const wxString& text)
{
    return 10 * static_cast<int>(text.length());
}

struct ShortenCase
{
    const char* text;
    int width;
    const char* shown;
};

class ShortenToWidthTest : public testing::TestWithParam<ShortenCase>
{
};

TEST_P(ShortenToWidthTest, CutsFromTheEndUntilNarrowerThanTheWidth)
{
    const ShortenCase& c = GetParam();
    EXPECT_EQ(CustomComboBox::ShortenToWidth(c.text, c.width, TenPixelsPerCharacter), wxString(c.shown));
}

INSTANTIATE_TEST_SUITE_P(
    Widths, ShortenToWidthTest,
    testing::Values(
        // One pixel wider than the text: unchanged.
        ShortenCase{"abcdef", 61, "abcdef"},
        // Exactly as wide as the text: shortened, and "abc..." (60) is not narrower either.
        ShortenCase{"abcdef", 60, "ab..."}, ShortenCase{"abcdefgh", 71, "abcd..."},
        ShortenCase{"abcdef", 41, "a..."},
        // "a..." does not fit; a lone "..." would, but the text has run out.
        ShortenCase{"abcdef", 40, ""}, ShortenCase{"abcdef", 35, ""}, ShortenCase{"abcdef", 30, ""},
        ShortenCase{"abcdef", 0, ""}, ShortenCase{"abcdef", -5, ""}, ShortenCase{"a", 10, ""},
        ShortenCase{"a", 11, "a"}, ShortenCase{"", 0, ""}, ShortenCase{"", -1, ""},
        ShortenCase{"All Servers      ", 200, "All Servers      "}));

TEST(ShortenToWidth, StopsAtTheFirstFittingLength)
{
    int measured = 0;
    const wxString shown = CustomComboBox::ShortenToWidth("abcdefghij", 75,
                                                          [&](const wxString& text)
                                                          {
                                                              ++measured;
                                                              return TenPixelsPerCharacter(text);
                                                          });
    EXPECT_EQ(shown, "abcd...");
    // The whole text, then "abcdefghi..." down to "abcd...".
    EXPECT_EQ(measured, 7);
}

class CustomComboBoxTest : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "combo", wxDefaultPosition, wxSize(400, 200));
        view = new wxPanel(frame);
        combo = new CustomComboBox;
        ASSERT_TRUE(combo->Create(view, 5006, wxPoint(10, 10), wxSize(150, -1)));
        combo->Append("All Servers      ");
        combo->Append("Beta");
        combo->Append("A server with a rather long name that cannot fit");
        combo->SetSelection(0);

        view->Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK),
                   [this](wxCommandEvent& event)
                   {
                       clickIds.push_back(event.GetId());
                       popupShownAtClick.push_back(combo->IsPopupShown());
                   });
        view->Bind(wxEVT_BUTTON, [this](wxCommandEvent& event) { buttonIds.push_back(event.GetId()); });
        view->Bind(wxEVT_COMBOBOX,
                   [this](wxCommandEvent& event)
                   {
                       selectionTexts.push_back(event.GetString());
                       selectionIds.push_back(event.GetId());
                   });
    }

    void TearDown() override
    {
        if (combo->IsPopupShown())
            combo->HidePopup();
        frame->Destroy();
        guitest::Pump(0);
    }

    void ShowFrame()
    {
        frame->Show();
        guitest::Pump(100);
    }

    // Delivers events until `done` holds; gives up after a generous while so
    // that a missing event fails the test instead of hanging it.
    template <typename Condition> static bool PumpUntil(Condition done)
    {
        for (int round = 0; round < 200 && !done(); ++round)
            guitest::Pump(10);
        return done();
    }

    // A real press through the X server, as a user's click arrives.
    void ClickAt(const wxPoint& inCombo)
    {
        wxUIActionSimulator input;
        input.MouseMove(combo->ClientToScreen(inCombo));
        guitest::Pump(20);
        input.MouseDown();
        input.MouseUp();
    }

    bool PressKey(int key)
    {
        wxKeyEvent press(wxEVT_KEY_DOWN);
        press.m_keyCode = key;
        press.SetEventObject(combo);
        const bool handled = combo->GetEventHandler()->ProcessEvent(press);
        lastKeySkipped = press.GetSkipped();
        return handled;
    }

    void MoveMouse()
    {
        wxMouseEvent motion(wxEVT_MOTION);
        motion.SetPosition(wxPoint(5, 5));
        motion.SetEventObject(combo);
        combo->GetEventHandler()->ProcessEvent(motion);
    }

    wxFrame* frame = nullptr;
    wxPanel* view = nullptr;
    CustomComboBox* combo = nullptr;
    bool lastKeySkipped = false;
    std::vector<int> clickIds;
    std::vector<bool> popupShownAtClick;
    std::vector<int> buttonIds;
    std::vector<wxString> selectionTexts;
    std::vector<int> selectionIds;
};

TEST_F(CustomComboBoxTest, CreateMakesAReadOnlyBoxWithItsOwnPopup)
{
    CustomComboBox* fresh = new CustomComboBox;
    ASSERT_TRUE(fresh->Create(view, 6010, wxDefaultPosition, wxSize(110, -1)));
    EXPECT_TRUE(fresh->HasFlag(wxCB_READONLY));
    EXPECT_EQ(fresh->GetName(), wxString(wxComboBoxNameStr));
    EXPECT_EQ(fresh->GetId(), 6010);
    EXPECT_EQ(fresh->GetValue(), "");
    EXPECT_EQ(fresh->GetCount(), 0u);
    EXPECT_FALSE(fresh->GetShowTooltip());
    EXPECT_NE(dynamic_cast<CustomComboPopup*>(fresh->GetPopupControl()), nullptr);
}

TEST_F(CustomComboBoxTest, ItemsAreEighteenPixelsHighAndOfLibraryWidth)
{
    for (size_t item = 0; item < combo->GetCount(); ++item)
    {
        EXPECT_EQ(combo->OnMeasureItem(item), 18);
        EXPECT_EQ(combo->OnMeasureItemWidth(item), -1);
    }
}

TEST_F(CustomComboBoxTest, ShorteningMeasuresInTheControlFont)
{
    const wxString text = "Beta";
    const auto measure = [this](const wxString& s) { return combo->GetTextExtent(s).x; };
    const int textWidth = measure(text);

    EXPECT_EQ(CustomComboBox::ShortenToWidth(text, textWidth + 1, measure), text);
    const wxString exact = CustomComboBox::ShortenToWidth(text, textWidth, measure);
    EXPECT_NE(exact, text);
    EXPECT_TRUE(exact.empty() || exact.EndsWith("...")) << exact;
    EXPECT_EQ(CustomComboBox::ShortenToWidth(text, measure("...") - 1, measure), "");
}

TEST_F(CustomComboBoxTest, ClosedBoxDrawsTheShortenedTextInsideTheInset)
{
    const wxSize size(120, 26);
    const wxRect rect(0, 0, size.x, size.y);
    const wxString text = combo->GetString(2);
    const wxString shortened = CustomComboBox::ShortenToWidth(
        text, size.x - 6, [this](const wxString& s) { return combo->GetTextExtent(s).x; });
    ASSERT_TRUE(shortened.EndsWith("..."));

    const auto paintItem = [&](int item, int flags)
    {
        return pixels::Render(size, *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(combo->GetFont());
                                  dc.SetTextForeground(*wxBLACK);
                                  combo->OnDrawItem(dc, rect, item, flags);
                              });
    };
    const auto drawText = [&](const wxString& shown, const wxPoint& at)
    {
        return pixels::Render(size, *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(combo->GetFont());
                                  dc.SetTextForeground(*wxBLACK);
                                  dc.DrawText(shown, at);
                              });
    };

    EXPECT_EQ(pixels::FirstDifference(paintItem(2, wxODCB_PAINTING_CONTROL), drawText(shortened, {4, 3})),
              "");
    // Popup rows show the whole text, one pixel further left.
    EXPECT_EQ(pixels::FirstDifference(paintItem(2, 0), drawText(text, {3, 3})), "");
    // No item, or an index past the end: nothing.
    const wxImage blank = drawText("", {0, 0});
    EXPECT_EQ(pixels::FirstDifference(paintItem(wxNOT_FOUND, wxODCB_PAINTING_CONTROL), blank), "");
    EXPECT_EQ(pixels::FirstDifference(paintItem(3, 0), blank), "");
}

TEST_F(CustomComboBoxTest, LeftPressAnnouncesItselfToTheViewBeforeThePopupOpens)
{
    ShowFrame();
    wxMouseEvent press(wxEVT_LEFT_DOWN);
    press.SetPosition(wxPoint(10, combo->GetSize().y / 2));
    press.SetLeftDown(true);
    press.SetEventObject(combo);
    combo->GetEventHandler()->ProcessEvent(press);

    // Synchronous: the view has it before the call returns, with id 0.
    ASSERT_EQ(clickIds.size(), 1u);
    EXPECT_EQ(clickIds[0], 0);
    EXPECT_FALSE(popupShownAtClick[0]);

    // Then the library had the press: the popup opened after the view ran.
    guitest::Pump(100);
    EXPECT_TRUE(combo->IsPopupShown());
    EXPECT_EQ(clickIds.size(), 1u);
}

// The read-only box has no text field and draws its drop button itself, so a
// click anywhere on it reaches the box's own handler, once.
TEST_F(CustomComboBoxTest, RealClickOnTheTextAnnouncesItselfOnce)
{
    ShowFrame();
    ClickAt(wxPoint(10, combo->GetClientSize().y / 2));
    ASSERT_TRUE(PumpUntil([this] { return combo->IsPopupShown(); }));
    EXPECT_EQ(clickIds, std::vector<int>{0});
    EXPECT_EQ(popupShownAtClick, std::vector<bool>{false});
}

TEST_F(CustomComboBoxTest, RealClickOnTheDropButtonAnnouncesItselfOnce)
{
    ShowFrame();
    const wxSize size = combo->GetClientSize();
    ClickAt(wxPoint(size.x - 6, size.y / 2));
    ASSERT_TRUE(PumpUntil([this] { return combo->IsPopupShown(); }));
    EXPECT_EQ(clickIds, std::vector<int>{0});
    EXPECT_EQ(popupShownAtClick, std::vector<bool>{false});
}

TEST_F(CustomComboBoxTest, EnterPostsTheButtonEventToTheParent)
{
    for (const int key : {WXK_RETURN, WXK_NUMPAD_ENTER})
    {
        buttonIds.clear();
        PressKey(key);
        EXPECT_TRUE(buttonIds.empty()) << "posted, not sent";
        wxTheApp->ProcessPendingEvents();
        ASSERT_EQ(buttonIds.size(), 1u) << "key " << key;
        EXPECT_EQ(buttonIds[0], 5100);
    }
}

TEST_F(CustomComboBoxTest, OtherKeysPostNothing)
{
    PressKey('A');
    PressKey(WXK_ESCAPE);
    PressKey(WXK_SPACE);
    wxTheApp->ProcessPendingEvents();
    EXPECT_TRUE(buttonIds.empty());
}

TEST_F(CustomComboBoxTest, EnterStillReachesTheLibrary)
{
    // With the popup open, the library takes Enter as the choice of the
    // highlighted row and closes the popup.
    ShowFrame();
    combo->ShowPopup();
    guitest::Pump(100);
    ASSERT_TRUE(combo->IsPopupShown());

    PressKey(WXK_RETURN);
    guitest::Pump(100);

    EXPECT_FALSE(combo->IsPopupShown());
    EXPECT_EQ(buttonIds, std::vector<int>{5100});
}

TEST_F(CustomComboBoxTest, ArrowKeysStillReachTheLibrary)
{
    PressKey(WXK_DOWN);
    EXPECT_EQ(combo->GetSelection(), 1);
    wxTheApp->ProcessPendingEvents();
    ASSERT_EQ(selectionTexts.size(), 1u);
    EXPECT_EQ(selectionTexts[0], "Beta");
    EXPECT_EQ(selectionIds[0], 5006);
}

TEST_F(CustomComboBoxTest, SelectionEventCarriesTheControlValue)
{
    combo->SetSelection(2);
    wxCommandEvent selected(wxEVT_COMBOBOX, combo->GetId());
    selected.SetEventObject(combo);
    selected.SetInt(2);
    selected.SetString("stale");
    combo->GetEventHandler()->ProcessEvent(selected);

    ASSERT_EQ(selectionTexts.size(), 1u) << "the event must go on to the view";
    EXPECT_EQ(selectionTexts[0], combo->GetString(2));
}

struct TooltipCase
{
    bool showTooltip;
    int selection;
    const char* tooltip;
};

class ComboTooltipTest : public CustomComboBoxTest, public testing::WithParamInterface<TooltipCase>
{
};

TEST_P(ComboTooltipTest, MouseMotionSetsTheTooltipFromTheSelection)
{
    const TooltipCase& c = GetParam();
    combo->SetToolTip("left over");
    combo->SetShowTooltip(c.showTooltip);
    combo->SetSelection(c.selection);
    MoveMouse();
    EXPECT_EQ(combo->GetToolTipText(), wxString(c.tooltip));
}

INSTANTIATE_TEST_SUITE_P(
    States, ComboTooltipTest,
    testing::Values(TooltipCase{true, 2, "A server with a rather long name that cannot fit"},
                    TooltipCase{true, 0, "All Servers      "}, TooltipCase{true, wxNOT_FOUND, ""},
                    TooltipCase{false, 2, ""}, TooltipCase{false, wxNOT_FOUND, ""}));

TEST_F(CustomComboBoxTest, TooltipFollowsTheSelection)
{
    combo->SetShowTooltip(true);
    combo->SetSelection(1);
    MoveMouse();
    EXPECT_EQ(combo->GetToolTipText(), "Beta");
    combo->SetSelection(2);
    MoveMouse();
    EXPECT_EQ(combo->GetToolTipText(), combo->GetString(2));
    combo->SetSelection(wxNOT_FOUND);
    MoveMouse();
    EXPECT_EQ(combo->GetToolTipText(), "");
}

TEST_F(CustomComboBoxTest, EnableSwitchesTheControl)
{
    EXPECT_TRUE(combo->Enable(false));
    EXPECT_FALSE(combo->IsEnabled());
    EXPECT_FALSE(combo->Enable(false));
    EXPECT_TRUE(combo->Enable(true));
    EXPECT_TRUE(combo->IsEnabled());
}

} // namespace
