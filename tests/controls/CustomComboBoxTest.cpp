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
        for (const char* item :
             {"All Servers      ", "Beta", "A server with a rather long name that cannot fit"})
            combo->Append(item);
        combo->SetSelection(0);
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

    void Show()
    {
        combo->Bind(wxEVT_PAINT, [this](wxPaintEvent& event) { painted = true, event.Skip(); });
        frame->Show();
        ASSERT_TRUE(guitest::PumpUntil([this] { return painted; }));
    }

    void Send(wxEvent&& event)
    {
        event.SetEventObject(combo);
        combo->GetEventHandler()->ProcessEvent(event);
    }

    void Press(int code)
    {
        wxKeyEvent press(wxEVT_KEY_DOWN);
        press.m_keyCode = code;
        Send(std::move(press));
    }

    wxFrame* frame = nullptr;
    CustomComboBox* combo = nullptr;
    bool painted = false;
    wxString log;
};

TEST_F(ComboBox, ClosedBoxDrawsTheShortenedTextInsideTheInsetAndPopupRowsTheWholeText)
{
    const wxSize size(120, 26);
    const wxString text = combo->GetString(2);
    const wxString shortened = CustomComboBox::ShortenToWidth(
        text, size.x - 6, [this](const wxString& s) { return combo->GetTextExtent(s).x; });
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
    const auto drawn = [&](const wxString& shown, int x)
    { return paint([&](wxDC& dc) { dc.DrawText(shown, x, 3); }); };
    ASSERT_TRUE(shortened.EndsWith("..."));
    EXPECT_EQ(pixels::FirstDifference(item(2, wxODCB_PAINTING_CONTROL), drawn(shortened, 4)), "");
    EXPECT_EQ(pixels::FirstDifference(item(2, 0), drawn(text, 3)), "") << "one pixel further left";
    EXPECT_EQ(pixels::FirstDifference(item(3, 0), drawn("", 0)), "") << "an index past the end";
}

class ComboPress : public ComboBox, public testing::WithParamInterface<int>
{
};

// The view refills the entries when told, before the popup that shows them opens. Pressed for real
// through the X server on the text (0) and on the drop button (1): the read-only box draws its button
// itself, so each reaches the box's own handler once.
TEST_P(ComboPress, AnnouncesItselfToTheViewOnceBeforeThePopupOpens)
{
    Show();
    const wxSize size = combo->GetClientSize();
    const wxPoint at = combo->ClientToScreen(wxPoint(GetParam() == 1 ? size.x - 6 : 10, size.y / 2));
    wxUIActionSimulator input;
    input.MouseMove(at);
    guitest::PumpUntil([&] { return wxGetMousePosition() == at; });
    input.MouseClick();
    EXPECT_TRUE(guitest::PumpUntil([this] { return combo->IsPopupShown(); }));
    EXPECT_EQ(log, "click 0;");
}

INSTANTIATE_TEST_SUITE_P(ComboPresses, ComboPress, testing::Values(0, 1));

// Enter posts the button event to the view; other keys go on to the library, which moves the
// selection with the arrows. A selection reaches the view with the control's value; the tooltip,
// when asked for, shows it.
TEST_F(ComboBox, KeysSelectionAndTooltip)
{
    for (const int key : {int(WXK_RETURN), int(WXK_NUMPAD_ENTER), int(WXK_ESCAPE), int(WXK_DOWN)})
    {
        Press(key);
        wxTheApp->ProcessPendingEvents();
    }
    EXPECT_EQ(log, "button 5100;button 5100;select 5006 Beta;");
    log.clear();
    combo->SetSelection(2);
    wxCommandEvent selected(wxEVT_COMBOBOX, combo->GetId());
    selected.SetString("stale");
    Send(std::move(selected));
    EXPECT_EQ(log, "select 5006 " + combo->GetString(2) + ";");
    for (const bool shown : {true, false})
    {
        combo->SetToolTip("left over");
        combo->SetShowTooltip(shown);
        Send(wxMouseEvent(wxEVT_MOTION));
        EXPECT_EQ(combo->GetToolTipText(), shown ? combo->GetString(2) : "");
    }
}

} // namespace
