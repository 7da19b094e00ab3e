// The Log tab on a real display, over the real log model on a temporary
// system root: what the user sees after journal changes, filters, selections
// and "Clear All".
#include "views/JobLogView.h"

#include "components/Utility/ImageTextButton.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "data/JobLogManager.h"
#include "data/NamedMutex.h"
#include "views/ErrorWndBkgLog.h"

#include "../log/LogTestSupport.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/listctrl.h>
#include <wx/modalhook.h>
#include <wx/msgdlg.h>
#include <wx/radiobut.h>
#include <wx/statusbr.h>

#include <deque>
#include <vector>

namespace
{

using logtest::LogLine;

// Answers the message boxes in place of a person and notes what they said.
class DialogScript : public wxModalDialogHook
{
public:
    explicit DialogScript(std::deque<int> answers) : answers(std::move(answers)) { Register(); }
    ~DialogScript() override { Unregister(); }

    std::vector<wxString> messages;

protected:
    int Enter(wxDialog* dialog) override
    {
        const auto* box = dynamic_cast<wxMessageDialog*>(dialog);
        messages.push_back(box ? box->GetMessage() : dialog->GetTitle());
        if (answers.empty())
        {
            ADD_FAILURE() << "unexpected dialog: " << messages.back();
            return wxID_CANCEL;
        }
        const int answer = answers.front();
        answers.pop_front();
        return answer;
    }
    void Exit(wxDialog*) override {}

private:
    std::deque<int> answers;
};

const wxString kConfirmation = "Are you sure you want to permanently clear the log for all the Duv Ureruve?";
const wxString kInUse = "The log is in use and could not be cleared. Try again in a moment.";

class LogView : public ::testing::Test
{
protected:
    void SetUp() override
    {
        folders = root.MakeHotFolders(logtest::Strings({"In", "Out", "Idle"}));
        for (const wxString& folder : folders)
            logtest::SystemRoot::WriteFile(Marker(folder), "");
        frame = new wxFrame(nullptr, wxID_ANY, "log", wxPoint(0, 0), wxSize(1000, 600));
        view = new JobLogView(frame, wxID_ANY, model);
        frame->Show();
        guitest::Pump();
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump();
    }

    static wxString Marker(const wxString& folder) { return folder + "/[_KELVO_HotFolder_]/Error.er"; }

    // Appends journal lines and lets the poll and the view do their part.
    void Produce(const wxString& lines)
    {
        logtest::SystemRoot::AppendFile(root.JournalPath(), lines);
        model.Refresh();
        guitest::Pump();
    }

    std::vector<wxString> Column(int column) const
    {
        std::vector<wxString> texts;
        for (long row = 0; row < List()->GetItemCount(); ++row)
            texts.push_back(List()->GetItemText(row, column));
        return texts;
    }

    ProfilesKelvoProfilesListCtrl* List() const { return view->GetLogList(); }
    wxString Footer() const { return view->GetFooter()->GetStatusText(0); }
    bool DetailShown() const { return view->GetErrorPanel()->IsShown(); }

    void Choose(wxWindowID radio)
    {
        auto* button = wxDynamicCast(view->FindWindow(radio), wxRadioButton);
        button->SetValue(true);
        wxCommandEvent event(wxEVT_RADIOBUTTON, radio);
        event.SetEventObject(button);
        event.SetInt(1);
        button->GetEventHandler()->ProcessEvent(event);
        guitest::Pump();
    }

    // As the button reports a press: queued to the view, with the button's id.
    void PressClearAll()
    {
        view->GetEventHandler()->QueueEvent(
            new wxCommandEvent(wxEVT_IMAGE_TEXT_BUTTON_CLICK, JobLogView::kClearAllId));
    }

    void WaitForClear()
    {
        for (int round = 0; round < 3000 && view->IsClearing(); ++round)
            guitest::Pump(10);
        ASSERT_FALSE(view->IsClearing());
        guitest::Pump();
    }

    logtest::SystemRoot root;
    JobLogManager model{root.JournalPath()};
    wxArrayString folders;
    wxFrame* frame = nullptr;
    JobLogView* view = nullptr;
};

TEST_F(LogView, JournalLinesBecomeRowsAtTheEndWhateverTheSort)
{
    Produce(LogLine("a", "ADDED", "Transferred Successfully", folders[0]) +
            LogLine("b", "ADDED", "Failed", folders[1]));
    ASSERT_EQ((std::vector<wxString>{"a", "b"}), Column(1));

    // The first click on "File Name" sorts descending.
    wxListEvent click(wxEVT_LIST_COL_CLICK, JobLogView::kLogListId);
    click.m_col = 1;
    List()->GetEventHandler()->ProcessEvent(click);
    ASSERT_EQ((std::vector<wxString>{"b", "a"}), Column(1));

    // Two polls before the view's turn: two updates queued, each row once.
    logtest::SystemRoot::AppendFile(root.JournalPath(), LogLine("c", "ADDED", "Failed", folders[0]));
    model.Refresh();
    logtest::SystemRoot::AppendFile(root.JournalPath(), LogLine("d", "ADDED", "Failed", folders[1]));
    model.Refresh();
    guitest::Pump();

    EXPECT_EQ((std::vector<wxString>{"b", "a", "c", "d"}), Column(1));
    EXPECT_EQ((std::vector<wxString>{"Out", "In", "In", "Out"}), Column(2));
    EXPECT_EQ((std::vector<wxString>{"Failed", "Transferred Successfully", "Failed", "Failed"}), Column(5));
    wxListItem warning;
    warning.SetId(1);
    warning.SetMask(wxLIST_MASK_IMAGE);
    ASSERT_TRUE(List()->GetItem(warning));
    EXPECT_EQ(kCellImageNone, warning.GetImage());
    warning.SetId(2);
    ASSERT_TRUE(List()->GetItem(warning));
    EXPECT_EQ(0, warning.GetImage());
    EXPECT_EQ("4 Items", Footer());
}

TEST_F(LogView, ErrorLogHidesSuccessesAndAcknowledgesTheShownFolders)
{
    Produce(LogLine("ok", "ADDED", "Transferred Successfully", folders[0]) +
            LogLine("ok2", "ADDED", "Transferred Successfully  ", folders[1]) +
            LogLine("case", "ADDED", "transferred successfully", folders[1]));
    ASSERT_EQ(3, List()->GetItemCount());
    EXPECT_TRUE(wxFileExists(Marker(folders[0])));

    Choose(JobLogView::kErrorLogId);
    EXPECT_EQ((std::vector<wxString>{"case"}), Column(1));
    EXPECT_FALSE(wxDynamicCast(view->FindWindow(JobLogView::kCompleteLogId), wxRadioButton)->GetValue());
    // Every folder of the log, even one with successes only; not the idle one.
    EXPECT_FALSE(wxFileExists(Marker(folders[0])));
    EXPECT_FALSE(wxFileExists(Marker(folders[1])));
    EXPECT_TRUE(wxFileExists(Marker(folders[2])));

    Choose(JobLogView::kCompleteLogId);
    EXPECT_EQ(3, List()->GetItemCount());
    EXPECT_FALSE(wxDynamicCast(view->FindWindow(JobLogView::kErrorLogId), wxRadioButton)->GetValue());
}

TEST_F(LogView, DetailPanelShowsOnlyWhileAFailedRowIsSelected)
{
    Produce(LogLine("ok", "ADDED", "Transferred Successfully", folders[0]) +
            LogLine("bad", "ADDED", "Failed", folders[0]));
    ASSERT_FALSE(DetailShown());

    List()->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    guitest::Pump();
    EXPECT_TRUE(DetailShown());
    EXPECT_EQ("detail of bad", view->GetErrorPanel()->GetErrorText());
    EXPECT_GT(view->GetErrorPanel()->GetSize().GetHeight(), 0);
    EXPECT_EQ("1 of 2 items selected.", Footer());
    Produce(LogLine("later", "ADDED", "Transferred Successfully", folders[0]));
    EXPECT_TRUE(DetailShown()) << "a job finishing meanwhile leaves the detail being read";
    EXPECT_EQ("1 of 3 items selected.", Footer());

    List()->SetItemState(0, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    guitest::Pump();
    EXPECT_FALSE(DetailShown());

    // Events for no row in particular, and a click beside the last column.
    wxListEvent many(wxEVT_LIST_ITEM_SELECTED, JobLogView::kLogListId);
    many.m_itemIndex = -1;
    List()->GetEventHandler()->ProcessEvent(many);
    wxListEvent beside(wxEVT_LIST_COL_CLICK, JobLogView::kLogListId);
    beside.m_col = -2;
    List()->GetEventHandler()->ProcessEvent(beside);
    EXPECT_FALSE(DetailShown());
    EXPECT_EQ((std::vector<wxString>{"ok", "bad", "later"}), Column(1));

    List()->SetItemState(0, 0, wxLIST_STATE_SELECTED);
    guitest::Pump();
    EXPECT_EQ("3 Items", Footer());
}

TEST_F(LogView, ColumnsShowTheLongestTextsWhole)
{
    // 28 December 2107, 23:58:58: two-digit day and month, the latest hour.
    const unsigned long date = ((2107 - 1980) << 9) | (12 << 5) | 28;
    const unsigned long time = (23 << 11) | (58 << 5) | (58 / 2);
    Produce("k\t" + folders[0] + "\t" + folders[0] + "/k.pdf\tPRN-01\t" +
            wxString::Format("%lu", (date << 16) | time) + "\tTransferred Successfully\tdone\tADDED\r\n");
    ASSERT_EQ(1, List()->GetItemCount());

    // The list draws a cell's text shortened when it is wider than the column less 8.
    wxWindow* rows = List()->GetMainWindow();
    for (const int column : {4, 5})
    {
        const wxString text = List()->GetItemText(0, column);
        EXPECT_LE(rows->GetTextExtent(text).GetWidth(), List()->GetColumnWidth(column) - 8)
            << text << " in a column " << List()->GetColumnWidth(column) << " wide";
    }
}

TEST_F(LogView, ClearAllOfAnEmptyLogAsksNothing)
{
    DialogScript script({});
    PressClearAll();
    guitest::Pump();
    EXPECT_TRUE(script.messages.empty());
    EXPECT_FALSE(view->IsClearing());
}

TEST_F(LogView, ClearAllAnsweredNoChangesNothing)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]));
    DialogScript script({wxID_NO});
    PressClearAll();
    guitest::Pump();

    EXPECT_EQ((std::vector<wxString>{kConfirmation}), script.messages);
    EXPECT_FALSE(view->IsClearing());
    EXPECT_EQ(1, List()->GetItemCount());
    EXPECT_GT(wxFileName::GetSize(root.JournalPath()), 0);
    EXPECT_TRUE(wxFileExists(Marker(folders[0])));
}

TEST_F(LogView, ClearAllWhileTheProducerHoldsTheLogChangesNothingAndSaysSo)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]) +
            LogLine("ok", "ADDED", "Transferred Successfully"));
    List()->SetItemState(0, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    guitest::Pump();
    const wxString footer = Footer();
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());

    DialogScript script({wxID_YES, wxID_OK});
    PressClearAll();
    guitest::Pump();
    // The wait for the lock does not hold up the window: it is still handling
    // events while the producer keeps the lock.
    EXPECT_TRUE(view->IsClearing());
    EXPECT_EQ((std::vector<wxString>{kConfirmation}), script.messages);
    WaitForClear();

    EXPECT_EQ((std::vector<wxString>{kConfirmation, kInUse}), script.messages);
    EXPECT_EQ((std::vector<wxString>{"bad", "ok"}), Column(1));
    EXPECT_EQ(footer, Footer());
    EXPECT_TRUE(DetailShown());
    EXPECT_EQ(2u, model.GetRecordCount());
    EXPECT_GT(wxFileName::GetSize(root.JournalPath()), 0);
    EXPECT_TRUE(wxFileExists(Marker(folders[0])));
}

TEST_F(LogView, ClearAllAnsweredYesEmptiesJournalRowsAndMarkers)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]) +
            LogLine("ok", "ADDED", "Transferred Successfully"));
    List()->SetItemState(0, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    guitest::Pump();
    DialogScript script({wxID_YES});
    PressClearAll();
    WaitForClear();

    EXPECT_EQ((std::vector<wxString>{kConfirmation}), script.messages);
    EXPECT_EQ(0, List()->GetItemCount());
    EXPECT_EQ("0 Items ", Footer());
    EXPECT_FALSE(DetailShown());
    EXPECT_EQ(0, wxFileName::GetSize(root.JournalPath()));
    for (const wxString& folder : folders)
        EXPECT_FALSE(wxFileExists(Marker(folder))) << folder;

    // The next job after the clear is listed alone.
    Produce(LogLine("next", "ADDED"));
    EXPECT_EQ((std::vector<wxString>{"next"}), Column(1));
}

TEST_F(LogView, ViewClosedWhileAClearWaitsGetsNoResult)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]));
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());
    DialogScript script({wxID_YES});
    PressClearAll();
    guitest::Pump();
    ASSERT_TRUE(view->IsClearing());

    frame->Destroy();
    guitest::Pump();
    // The result died with the view: no "in use" box for a window that is gone.
    EXPECT_EQ((std::vector<wxString>{kConfirmation}), script.messages);
    frame = new wxFrame(nullptr, wxID_ANY, "after");
}

} // namespace
