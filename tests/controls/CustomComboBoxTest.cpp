#include "components/Utility/CustomComboBox.h"

#include "pump/bus/CustomEvents.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/panel.h>
#include <wx/uiaction.h>

#include <sstream>

namespace
{

// In a font where every character is 10 pixels wide.
TEST(ComboShorten, CutsFromTheEndUntilNarrowerThanTheWidth)
{
    // "text:width=shown;" One pixel wider than the text: unchanged. As wide: shortened, and
    // "abc..." (60) is not narrower either. Where "a..." does not fit a lone "..." would, but the text has
    // run out.
    std::istringstream cases(
        "abcdef:61=abcdef;abcdef:60=ab...;abcdefgh:71=abcd...;abcdef:41=a...;abcdef:40=;"
        "abcdef:35=;abcdef:30=;abcdef:0=;abcdef:-5=;a:10=;a:11=a;:0=;:-1=;All Servers      :200=All "
        "Servers      ;");
    const auto measure = [](const wxString& text) { return 10 * static_cast<int>(text.length()); };
    for (std::string text, width, shown; std::getline(cases, text, ':') && std::getline(cases, width, '=') &&
                                         std::getline(cases, shown, ';');)
        EXPECT_EQ(CustomComboBox::ShortenToWidth(text, std::stoi(width), measure), wxString(shown))
            << text << " in " << width;
}

class ComboBox : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "combo", wxDefaultPosition, wxSize(400, 200));
        view = new wxPanel(frame);
        combo = new CustomComboBox;
        ASSERT_TRUE(combo->Create(view, 5006, wxPoint(10, 10), wxSize(150, -1)));
        for (const char* item :
             {"All Servers      ", "Beta", "A server with a rather long name that cannot fit"})
            combo->Append(item);
        combo->SetSelection(0);
        // What reaches the view: "click 0" (" shown" when the popup already was), "button 5100", "select 5006
        // Beta".
        view->Bind(
            wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK), [this](wxCommandEvent& e)
            { log += wxString::Format("click %d%s;", e.GetId(), combo->IsPopupShown() ? " shown" : ""); });
        view->Bind(wxEVT_BUTTON,
                   [this](wxCommandEvent& e) { log += wxString::Format("button %d;", e.GetId()); });
        view->Bind(wxEVT_COMBOBOX, [this](wxCommandEvent& e)
                   { log += wxString::Format("select %d %s;", e.GetId(), e.GetString()); });
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
        combo->Bind(wxEVT_PAINT,
                    [this](wxPaintEvent& event)
                    {
                        painted = true;
                        event.Skip();
                    });
        frame->Show();
        ASSERT_TRUE(guitest::PumpUntil([this] { return painted; }));
    }

    void PressKey(int key)
    {
        wxKeyEvent press(wxEVT_KEY_DOWN);
        press.m_keyCode = key;
        press.SetEventObject(combo);
        combo->GetEventHandler()->ProcessEvent(press);
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
    bool painted = false;
    wxString log;
};

TEST_F(ComboBox, IsAReadOnlyBoxWithItsOwnPopupAndRowsOfEighteenPixels)
{
    EXPECT_TRUE(combo->HasFlag(wxCB_READONLY));
    EXPECT_FALSE(combo->GetShowTooltip()) << "no tooltip unless asked for";
    EXPECT_NE(dynamic_cast<CustomComboPopup*>(combo->GetPopupControl()), nullptr);
    EXPECT_EQ(combo->OnMeasureItem(2), 18);
    EXPECT_EQ(combo->OnMeasureItemWidth(2), -1) << "the library's width";
    EXPECT_TRUE(combo->Enable(false));
    EXPECT_FALSE(combo->IsEnabled());
    EXPECT_FALSE(combo->Enable(false)) << "no change";
    EXPECT_TRUE(combo->Enable(true));
}

TEST_F(ComboBox, ClosedBoxDrawsTheShortenedTextInsideTheInsetAndPopupRowsTheWholeText)
{
    const wxSize size(120, 26);
    const wxString text = combo->GetString(2);
    const wxString shortened = CustomComboBox::ShortenToWidth(
        text, size.x - 6, [this](const wxString& s) { return combo->GetTextExtent(s).x; });
    ASSERT_TRUE(shortened.EndsWith("..."));
    const auto paint = [&](const std::function<void(wxDC&)>& draw)
    {
        return pixels::Render(size, *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(combo->GetFont());
                                  dc.SetTextForeground(*wxBLACK);
                                  draw(dc);
                              });
    };
    const auto item = [&](int index, int flags)
    { return paint([&](wxDC& dc) { combo->OnDrawItem(dc, wxRect(size), index, flags); }); };
    const auto drawn = [&](const wxString& shown, const wxPoint& at)
    { return paint([&](wxDC& dc) { dc.DrawText(shown, at); }); };

    EXPECT_EQ(pixels::FirstDifference(item(2, wxODCB_PAINTING_CONTROL), drawn(shortened, {4, 3})), "");
    EXPECT_EQ(pixels::FirstDifference(item(2, 0), drawn(text, {3, 3})), "") << "one pixel further left";
    EXPECT_EQ(pixels::FirstDifference(item(wxNOT_FOUND, wxODCB_PAINTING_CONTROL), drawn("", {0, 0})), "");
    EXPECT_EQ(pixels::FirstDifference(item(3, 0), drawn("", {0, 0})), "") << "an index past the end";
}

class ComboPress : public ComboBox, public testing::WithParamInterface<int>
{
};

// The view refills the entries when told, before the popup that shows them opens.
// Pressed by a sent event (0), or for real through the X server on the text (1)
// and on the drop button (2): the read-only box draws its button itself, so each
// reaches the box's own handler once.
TEST_P(ComboPress, AnnouncesItselfToTheViewOnceBeforeThePopupOpens)
{
    ShowFrame();
    const wxSize size = combo->GetClientSize();
    const wxPoint at(GetParam() == 2 ? size.x - 6 : 10, size.y / 2);
    if (GetParam() == 0)
    {
        wxMouseEvent press(wxEVT_LEFT_DOWN);
        press.SetPosition(at);
        press.SetLeftDown(true);
        press.SetEventObject(combo);
        combo->GetEventHandler()->ProcessEvent(press);
        EXPECT_EQ(log, "click 0;") << "at once";
    }
    else
    {
        wxUIActionSimulator input;
        input.MouseMove(combo->ClientToScreen(at));
        guitest::PumpUntil([&] { return wxGetMousePosition() == combo->ClientToScreen(at); });
        input.MouseDown();
        input.MouseUp();
    }
    EXPECT_TRUE(guitest::PumpUntil([this] { return combo->IsPopupShown(); }));
    EXPECT_EQ(log, "click 0;");
}

INSTANTIATE_TEST_SUITE_P(ComboPresses, ComboPress, testing::Values(0, 1, 2));

TEST_F(ComboBox, EnterPostsTheButtonEventToTheParentAndOtherKeysNothing)
{
    for (const int key : {int(WXK_RETURN), int(WXK_NUMPAD_ENTER), int('A'), int(WXK_ESCAPE), int(WXK_SPACE)})
    {
        log.clear();
        PressKey(key);
        EXPECT_EQ(log, "") << "posted, not sent";
        wxTheApp->ProcessPendingEvents();
        EXPECT_EQ(log, key == WXK_RETURN || key == WXK_NUMPAD_ENTER ? "button 5100;" : "") << "key " << key;
    }
}

TEST_F(ComboBox, KeysStillReachTheLibrary)
{
    PressKey(WXK_DOWN);
    EXPECT_EQ(combo->GetSelection(), 1);
    wxTheApp->ProcessPendingEvents();
    EXPECT_EQ(log, "select 5006 Beta;");

    // With the popup open the library takes Enter as the choice and closes it.
    ShowFrame();
    combo->ShowPopup();
    ASSERT_TRUE(guitest::PumpUntil([this] { return combo->IsPopupShown(); }));
    log.clear();
    PressKey(WXK_RETURN);
    EXPECT_TRUE(guitest::PumpUntil([this] { return !combo->IsPopupShown(); }));
    EXPECT_EQ(log.Clone().Replace("button 5100;", ""), 1u) << log;
}

TEST_F(ComboBox, SelectionEventCarriesTheControlValue)
{
    combo->SetSelection(2);
    wxCommandEvent selected(wxEVT_COMBOBOX, combo->GetId());
    selected.SetEventObject(combo);
    selected.SetInt(2);
    selected.SetString("stale");
    combo->GetEventHandler()->ProcessEvent(selected);
    EXPECT_EQ(log, "select 5006 " + combo->GetString(2) + ";") << "and it goes on to the view";
}

TEST_F(ComboBox, MouseMotionSetsTheTooltipFromTheSelection)
{
    const int selections[] = {2, 0, wxNOT_FOUND, 2, wxNOT_FOUND};
    for (int i = 0; i < 5; ++i)
    {
        combo->SetToolTip("left over");
        combo->SetShowTooltip(i < 3);
        combo->SetSelection(selections[i]);
        MoveMouse();
        EXPECT_EQ(combo->GetToolTipText(), i < 3 && selections[i] >= 0 ? combo->GetString(selections[i]) : "")
            << i;
    }
}

} // namespace
