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

// In a font where every character is 10 pixels wide. "text:width=shown;" One pixel wider than the text:
// unchanged. As wide: shortened, and "abc..." (60) is not narrower either. Where "a..." does not fit a
// lone "..." would, but the text has run out.
TEST(ComboShorten, CutsFromTheEndUntilNarrowerThanTheWidth)
{
    std::istringstream cases("abcdef:61=abcdef;abcdef:60=ab...;abcdefgh:71=abcd...;abcdef:41=a...;abcdef:40=;"
                             "abcdef:-5=;a:10=;a:11=a;:0=;");
    const auto measure = [](const wxString& text) { return 10 * static_cast<int>(text.length()); };
    for (std::string text, width, shown; std::getline(cases, text, ':') && std::getline(cases, width, '=') &&
                                         std::getline(cases, shown, ';');)
        EXPECT_EQ(CustomComboBox::ShortenToWidth(text, std::stoi(width), measure), wxString(shown))
            << text << " in " << width;
}

// A box of three entries in a panel; what reaches the panel is logged: "click 0" (" shown" when the
// popup already was), "button 5100", "select 5006 Beta".
class ComboBox : public testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "combo", wxDefaultPosition, wxSize(400, 200));
        auto* view = new wxPanel(frame);
        combo = new CustomComboBox;
        ASSERT_TRUE(combo->Create(view, 5006, wxPoint(10, 10), wxSize(150, -1)));
        const char* items[] = {"All Servers      ", "Beta", "A server with a name too long to fit"};
        combo->Append(wxArrayString(3, items));
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

    void Send(wxEvent&& event)
    {
        event.SetEventObject(combo);
        combo->GetEventHandler()->ProcessEvent(event);
    }

    wxFrame* frame = nullptr;
    CustomComboBox* combo = nullptr;
    bool painted = false;
    wxString log;
};

TEST_F(ComboBox, ClosedBoxDrawsTheShortenedTextInsideTheInsetAndPopupRowsTheWholeText)
{
    const wxRect area(0, 0, 120, 26);
    // What OnDrawItem draws against `shown` drawn at (x, 3): the first difference, or "".
    const auto compare = [&](int index, int flags, const wxString& shown, int x)
    {
        const auto paint = [&](bool item)
        {
            return pixels::Render(area.GetSize(), *wxWHITE,
                                  [&](wxDC& dc)
                                  {
                                      dc.SetFont(combo->GetFont());
                                      dc.SetTextForeground(*wxBLACK);
                                      item ? combo->OnDrawItem(dc, area, index, flags)
                                           : dc.DrawText(shown, x, 3);
                                  });
        };
        return pixels::FirstDifference(paint(true), paint(false));
    };
    const wxString text = combo->GetString(2);
    const wxString shortened = CustomComboBox::ShortenToWidth(
        text, area.width - 6, [this](const wxString& s) { return combo->GetTextExtent(s).x; });
    ASSERT_TRUE(shortened.EndsWith("..."));
    EXPECT_EQ(compare(2, wxODCB_PAINTING_CONTROL, shortened, 4), "");
    EXPECT_EQ(compare(2, 0, text, 3), "") << "one pixel further left";
    EXPECT_EQ(compare(3, 0, "", 0), "") << "an index past the end";
}

class ComboPress : public ComboBox, public testing::WithParamInterface<int>
{
};

// The view refills the entries when told, before the popup that shows them opens. Pressed for real
// through the X server on the text (0) and on the drop button (1): the read-only box draws its button
// itself, so each reaches the box's own handler once.
TEST_P(ComboPress, AnnouncesItselfToTheViewOnceBeforeThePopupOpens)
{
    combo->Bind(wxEVT_PAINT, [this](wxPaintEvent& event) { painted = true, event.Skip(); });
    frame->Show();
    ASSERT_TRUE(guitest::PumpUntil([this] { return painted; }));
    const wxPoint at =
        combo->ClientToScreen({GetParam() ? combo->GetClientSize().x - 6 : 10, combo->GetClientSize().y / 2});
    wxUIActionSimulator input;
    input.MouseMove(at);
    guitest::PumpUntil([&] { return wxGetMousePosition() == at; });
    input.MouseClick();
    EXPECT_TRUE(guitest::PumpUntil([this] { return combo->IsPopupShown(); }));
    EXPECT_EQ(log, "click 0;");
}

INSTANTIATE_TEST_SUITE_P(ComboPresses, ComboPress, testing::Values(0, 1));

// Enter posts the button event to the view; other keys go on to the library, which moves the
// selection with the arrows. A selection reaches the view with the control's value.
TEST_F(ComboBox, EnterPostsTheButtonEventAndSelectionsCarryTheControlValue)
{
    for (const int key : {int(WXK_RETURN), int(WXK_NUMPAD_ENTER), int(WXK_ESCAPE), int(WXK_DOWN)})
    {
        wxKeyEvent press(wxEVT_KEY_DOWN);
        press.m_keyCode = key;
        Send(std::move(press));
        wxTheApp->ProcessPendingEvents();
    }
    EXPECT_EQ(log, "button 5100;button 5100;select 5006 All Servers      ;");
    log.clear();
    combo->SetSelection(2);
    wxCommandEvent selected(wxEVT_COMBOBOX, combo->GetId());
    selected.SetString("stale");
    Send(std::move(selected));
    EXPECT_EQ(log, "select 5006 " + combo->GetString(2) + ";");
}

} // namespace
