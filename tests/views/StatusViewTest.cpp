// The Status tab on a real display, over the real status model on a
// temporary system root: what the user sees after journal changes, filter
// choices, column clicks and ticks of the busy wheel.
#include "views/JobStatusView.h"

#include "components/Utility/CustomComboBox.h"
#include "components/Utility/CustomListCtrl.h"
#include "pump/bus/CustomEvents.h"

#include "../listctrl/ListTestSupport.h"
#include "../status/StatusTestSupport.h"
#include "DrawNow.h"
#include "PixelCompare.h"
#include "ViewTest.h"

namespace
{
// One journal line: the key names the file, DosTime orders the jobs by start.
wxString Line(const wxString& key, const wxString& server, const wxString& status = "Queued",
              const wxString& dosTime = "1383035055", const wxString& size = "48213")
{
    return key + "\t/srv/in/Proofs\t/srv/in/Proofs/" + key + ".pdf\t" + server + "\t" + dosTime + "\t" +
           status + "\t" + size + "\tPDF\tADDED\n";
}

class StatusView : public ViewTest<JobStatusView, JobStatusManager, statustest::SystemRoot>
{
protected:
    void SetUp() override
    {
        statustest::SystemRoot::WriteFile(GetDataDirectory() + "HotFolders.ini",
                                          "[Servers]\nsrv1\nsrv2\nSRV3\n");
        Open(wxSize(1100, 500));
    }
    ProfilesKelvoProfilesListCtrl* Rows() const override { return view->GetJobList(); }

    // Rewrites the journal, polls, and hands the view its update event.
    void Produce(const wxString& lines)
    {
        statustest::SystemRoot::WriteFile(root.JournalPath(), lines);
        ASSERT_EQ(model.Refresh(), 1);
        wxTheApp->ProcessPendingEvents();
    }

    long Selected() const { return Rows()->GetNextItem(-1, wxLIST_NEXT_ALL, wxLIST_STATE_SELECTED); }

    void Tick()
    {
        wxTimer timer;
        wxTimerEvent tick(timer);
        view->ProcessWindowEvent(tick);
    }
};

TEST_F(StatusView, RowsFollowTheJournalTheSortAndTheServerChosenAndTheSelectionStaysWithItsJob)
{
    statustest::SystemRoot::WriteFile(GetDataDirectory() + "HotFolders.ini", "[Servers]\nsrv1\nsrv2\n");

    Produce(Line("b", "srv1", "Queued", "1383035000") + Line("C", "srv2", "Saving...", "1383036000") +
            Line("a", "SRV1 ", "Queued", "1383035100"));
    EXPECT_EQ(Column(1), (Texts{"a", "b", "C"}));
    Rows()->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    SendList(wxEVT_LIST_COL_CLICK, 6); // Time: the first click sorts descending
    EXPECT_EQ(Column(1), (Texts{"C", "a", "b"}));
    // A second click flips; a click beside the columns sorts nothing.
    SendList(wxEVT_LIST_COL_CLICK, 6);
    SendList(wxEVT_LIST_COL_CLICK, -1);
    EXPECT_EQ(Column(1), (Texts{"b", "a", "C"}));
    EXPECT_EQ(Selected(), 0) << "the selection moves with its job";
    // Opening the box lists the servers anew; then srv1 is chosen.
    wxCommandEvent press(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK);
    view->ProcessWindowEvent(press);
    view->GetServerBox()->SetSelection(1);
    wxCommandEvent chosen(wxEVT_COMBOBOX, JobStatusView::kServerBoxId);
    chosen.SetInt(1);
    view->GetServerBox()->GetEventHandler()->ProcessEvent(chosen);
    EXPECT_EQ(view->GetServerBox()->GetStrings(), wxSplit("All Servers      ,srv1,srv2", ','));
    EXPECT_EQ(Column(1), (Texts{"b", "a"}));
    Produce(Line("a", "srv1 ", "Queued", "1383035100") + Line("b", "srv1", "Queued", "1383035000") +
            Line("d", "srv1", "Queued", "1383034000") + Line("e", "srv2"));
    EXPECT_EQ(Column(1), (Texts{"d", "b", "a"})) << "the filter and the sort hold across updates";
    EXPECT_EQ(Selected(), 1);
    Produce(Line("a", "srv1", "Queued", "1383035100") + Line("e", "srv2"));
    EXPECT_EQ(Selected(), -1) << "a job that left the journal left the selection";
}

TEST_F(StatusView,
       RowsArePaintedRightAfterAnUpdateTheLongestTextsFitAndATickTurnsTheWheelOfRowsInProgressOnly)
{
    Produce(Line("a", "srv1", "Transferring to server", "1383035055", "1048576") + Line("b", "srv1") +
            Line("c", "srv1", "saving...") +
            Line("d", "srv1", "Converting file type", "1383035055", "1048575"));
    // The update's event, then a paint: the order GTK keeps, idle time comes after.
    ProfilesKelvoListMainWindow* rows = Rows()->GetMainWindow();
    const wxImage drawn = DrawNow(rows);
    ASSERT_TRUE(drawn.IsOk());
    const int lineHeight = rows->GetLineHeight();
    wxRect name;
    Rows()->GetSubItemRect(1, 1, name);
    int inked = 0;
    for (int y = lineHeight; y < 2 * lineHeight; ++y)
        for (int x = name.x; x < name.x + 40; ++x)
            inked += drawn.GetGreen(x, y) < 128 ? 1 : 0;
    EXPECT_GT(inked, 5) << "the second row's file name is on the screen";

    EXPECT_EQ(Column(5)[0] + Column(5)[3], "1024.00KB1024.00KB");
    for (int column : {5, 7})
    {
        wxRect cell;
        Rows()->GetSubItemRect(0, column, cell);
        cell.height *= 4;
        cell.width -= 3; // the rule at the column's edge moves with it
        const wxImage fitted = listtest::RenderRows(Rows()).GetSubImage(cell);
        const int width = Rows()->GetColumnWidth(column);
        Rows()->SetColumnWidth(column, 1000);
        const wxImage roomy = listtest::RenderRows(Rows()).GetSubImage(cell);
        Rows()->SetColumnWidth(column, width);
        EXPECT_EQ(pixels::FirstDifference(fitted, roomy), "") << "column " << column << " shortens its text";
    }

    wxRect status;
    Rows()->GetSubItemRect(0, 7, status);
    const auto wheel = [&](long row) { return wxRect(status.x, row * lineHeight, 18, lineHeight); };
    // The paint a tick asks for, which the drawings below would not show.
    wxRegion painted;
    rows->Bind(wxEVT_PAINT,
               [&](wxPaintEvent& event)
               {
                   painted.Union(rows->GetUpdateRegion());
                   event.Skip();
               });
    Tick(); // the first tick shows the frame the rows started with
    const wxImage before = DrawNow(rows);
    ASSERT_TRUE(guitest::PumpUntil([&] { return painted.Contains(wheel(3)) == wxInRegion; }));
    painted.Clear();
    Tick();
    ASSERT_TRUE(guitest::PumpUntil([&] { return painted.Contains(wheel(3)) == wxInRegion; }));
    const wxImage after = DrawNow(rows);
    for (long row = 0; row < 4; ++row)
    {
        const wxRect rest(0, row * lineHeight, status.x, lineHeight);
        EXPECT_EQ(
            pixels::FirstDifference(before.GetSubImage(wheel(row)), after.GetSubImage(wheel(row))).empty(),
            row == 1 || row == 2)
            << "only rows 0 and 3 are in progress; row " << row;
        EXPECT_EQ(pixels::FirstDifference(before.GetSubImage(rest), after.GetSubImage(rest)), "")
            << "row " << row;
    }
}
} // namespace
