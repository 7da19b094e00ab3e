// The Log tab on a real display, over the real log model on a temporary
// system root: what the user sees after journal changes, filters, selections
// and "Clear All".
#include "views/JobLogView.h"

#include "components/Utility/ImageTextButton.h"
#include "data/JobLogManager.h"
#include "data/NamedMutex.h"
#include "views/ErrorWndBkgLog.h"

#include "../log/LogTestSupport.h"
#include "ViewTest.h"

#include <wx/modalhook.h>
#include <wx/msgdlg.h>

namespace
{
using logtest::LogLine;

// Answers the message boxes in place of a person, in turn, and notes what they said;
// a box nobody expected is cancelled and shows in the notes.
struct DialogScript : wxModalDialogHook
{
    explicit DialogScript(std::vector<int> answers) : answers(std::move(answers)) { Register(); }
    ~DialogScript() override { Unregister(); }
    int Enter(wxDialog* dialog) override
    {
        messages.push_back(static_cast<wxMessageDialog*>(dialog)->GetMessage());
        return messages.size() <= answers.size() ? answers[messages.size() - 1] : int(wxID_CANCEL);
    }
    void Exit(wxDialog*) override {}

    std::vector<int> answers;
    Texts messages;
};

const wxString kConfirmation = "Are you sure you want to permanently clear the log for all the Duv Ureruve?";
const wxString kInUse = "The log is in use and could not be cleared. Try again in a moment.";

class LogView : public ViewTest<JobLogView, JobLogManager, logtest::SystemRoot>
{
protected:
    void SetUp() override
    {
        folders = root.MakeHotFolders(logtest::Strings({"In", "Out", "Done", "Idle"}));
        for (const wxString& folder : folders)
            logtest::SystemRoot::WriteFile(Marker(folder), "");
        Open(wxSize(1000, 600));
    }
    ProfilesKelvoProfilesListCtrl* Rows() const override { return view->GetLogList(); }
    static wxString Marker(const wxString& folder) { return folder + "/[_KELVO_HotFolder_]/Error.er"; }

    // Appends journal lines, polls, and hands the view its update event.
    void Produce(const wxString& lines)
    {
        logtest::SystemRoot::AppendFile(root.JournalPath(), lines);
        model.Refresh();
        wxTheApp->ProcessPendingEvents();
    }
    void Select(long row) { Rows()->SetItemState(row, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED); }
    bool DetailShown() const { return view->GetErrorPanel()->IsShown(); }
    // As the button reports a press: queued to the view, with the button's id.
    void PressClearAll()
    {
        view->GetEventHandler()->QueueEvent(
            new wxCommandEvent(wxEVT_IMAGE_TEXT_BUTTON_CLICK, JobLogView::kClearAllId));
        wxTheApp->ProcessPendingEvents();
    }
    // What a clear must leave alone: rows, footer, detail, records, journal and markers.
    wxString Kept() const
    {
        return wxJoin(wxArrayString(Column(1).size(), Column(1).data()), ',') + "|" + Footer() + "|" +
               (DetailShown() ? "detail" : "") +
               wxString::Format("|%zu|%d|", model.GetRecordCount(),
                                wxFileName::GetSize(root.JournalPath()) > 0) +
               (wxFileExists(Marker(folders[0])) ? "marked" : "");
    }

    wxArrayString folders;
};

TEST_F(LogView, NewRowsComeAtTheEndWhateverTheSortAFailedRowShowsItsDetailAndTheErrorLogHidesSuccesses)
{
    Produce(LogLine("a.b", "ADDED", "Transferred Successfully", folders[0]) +
            LogLine("b", "ADDED", "Failed", folders[1]));
    ASSERT_EQ(Column(1), (Texts{"a.b", "b"}));
    SendList(wxEVT_LIST_COL_CLICK, 1); // the first click on "File Name" sorts descending
    ASSERT_EQ(Column(1), (Texts{"b", "a.b"}));
    // Two polls before the view's turn: two updates queued, each row once.
    logtest::SystemRoot::AppendFile(root.JournalPath(), LogLine("c", "ADDED", "Failed", folders[0]));
    model.Refresh();
    Produce(LogLine("d", "ADDED", "transferred successfully", folders[1])); // only as written is a success
    EXPECT_EQ(Column(1), (Texts{"b", "a.b", "c", "d"}));
    wxString warnings; // the warning image (0), or none (-1), in each row
    for (long row = 0; row < 4; ++row)
    {
        wxListItem item;
        item.SetId(row);
        item.SetMask(wxLIST_MASK_IMAGE);
        warnings << (Rows()->GetItem(item) ? item.GetImage() : -99) << ",";
    }
    EXPECT_EQ(warnings, "0,-1,0,0,") << "the warning on failures, -1 for none";
    EXPECT_EQ(Footer(), "4 Items");

    Select(2);
    EXPECT_TRUE(DetailShown());
    EXPECT_EQ(view->GetErrorPanel()->GetErrorText(), "detail of c");
    EXPECT_GT(view->GetErrorPanel()->GetSize().GetHeight(), 0);
    Produce(LogLine("later", "ADDED", "Transferred Successfully  ", folders[2]));
    EXPECT_TRUE(DetailShown()) << "a job finishing meanwhile leaves the detail being read";
    Select(1);
    EXPECT_FALSE(DetailShown());
    // Events for no row in particular (index -1), and a click beside the last column.
    SendList(wxEVT_LIST_ITEM_SELECTED, 0, -1);
    SendList(wxEVT_LIST_COL_CLICK, -2);
    EXPECT_FALSE(DetailShown());
    EXPECT_EQ(Column(1), (Texts{"b", "a.b", "c", "d", "later"}));
    EXPECT_EQ(Column(5)[4], "Transferred Successfully");

    EXPECT_TRUE(wxFileExists(Marker(folders[2])));
    wxCommandEvent errorLog(wxEVT_RADIOBUTTON, JobLogView::kErrorLogId);
    view->FindWindow(JobLogView::kErrorLogId)->GetEventHandler()->ProcessEvent(errorLog);
    EXPECT_EQ(Column(1), (Texts{"b", "c", "d"}));
    // Every folder of the log, even one with successes only; not the idle one.
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(wxFileExists(Marker(folders[i])), i == 3) << folders[i];
}

TEST_F(LogView, ClearAllWhileTheProducerHoldsTheLogChangesNothingAndSaysSoThenClearsOnceFree)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]) +
            LogLine("ok", "ADDED", "Transferred Successfully"));
    Select(0);
    const wxString before = Kept();
    ASSERT_EQ(before, "bad,ok|1 of 2 items selected.|detail|2|1|marked");
    {
        DialogScript script({wxID_NO});
        PressClearAll();
        EXPECT_EQ(script.messages, (Texts{kConfirmation}));
        EXPECT_FALSE(view->IsClearing());
        EXPECT_EQ(Kept(), before) << "answered No";
    }
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());
    {
        DialogScript script({wxID_YES, wxID_OK});
        PressClearAll();
        // The wait for the lock does not hold up the window: it is still handling
        // events while the producer keeps the lock.
        EXPECT_TRUE(view->IsClearing());
        EXPECT_EQ(script.messages, (Texts{kConfirmation}));
        ASSERT_TRUE(guitest::PumpUntil([this] { return !view->IsClearing(); }));
        EXPECT_EQ(script.messages, (Texts{kConfirmation, kInUse}));
        EXPECT_EQ(Kept(), before);
    }

    producer.unlock();
    DialogScript script({wxID_YES});
    PressClearAll();
    ASSERT_TRUE(guitest::PumpUntil([this] { return !view->IsClearing(); }));
    EXPECT_EQ(script.messages, (Texts{kConfirmation}));
    EXPECT_EQ(Kept(), "|0 Items ||0|0|");
    // The next job after the clear is listed alone.
    Produce(LogLine("next", "ADDED"));
    EXPECT_EQ(Column(1), (Texts{"next"}));
}

TEST_F(LogView, ViewClosedWhileAClearWaitsGetsNoResult)
{
    Produce(LogLine("bad", "ADDED", "Failed", folders[0]));
    named_mutex_lock producer("TiveraJobsLogFile");
    ASSERT_TRUE(producer.try_lock());
    DialogScript script({wxID_YES});
    PressClearAll();
    ASSERT_TRUE(view->IsClearing());
    frame->Destroy();
    ASSERT_TRUE(guitest::PumpUntil([&] { return !wxTheApp->IsScheduledForDestruction(frame); }));
    wxTheApp->ProcessPendingEvents();
    // The result died with the view: no "in use" box for a window that is gone.
    EXPECT_EQ(script.messages, (Texts{kConfirmation}));
    frame = new wxFrame(nullptr, wxID_ANY, "after");
}
} // namespace
