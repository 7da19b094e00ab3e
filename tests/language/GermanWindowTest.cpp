// The whole window built under a German locale with the shipped catalogs, as
// the program builds it after choosing German: what the user reads on the tabs,
// the column headings, the footers and a row of the log. (The title is read
// from the installed program's window, in InstallTests.)
#include "app/MainFrame.h"
#include "app/MainView.h"
#include "components/Utility/CustomListCtrl.h"
#include "data/JobLogManager.h"
#include "views/JobLogView.h"
#include "views/JobStatusView.h"

#include "../log/LogTestSupport.h"
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/intl.h>
#include <wx/listctrl.h>
#include <wx/statusbr.h>
#include <wx/translation.h>

#include <vector>

namespace
{

template <typename List> std::vector<wxString> Headings(const List* list)
{
    std::vector<wxString> texts;
    for (int column = 0; column < list->GetColumnCount(); ++column)
    {
        wxListItem item;
        item.SetMask(wxLIST_MASK_TEXT);
        list->GetColumn(column, item);
        texts.push_back(item.GetText());
    }
    return texts;
}

std::vector<wxString> Texts(std::initializer_list<const char*> utf8)
{
    std::vector<wxString> texts;
    for (const char* text : utf8)
        texts.push_back(wxString::FromUTF8(text));
    return texts;
}

class GermanWindowTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        ASSERT_TRUE(locale.Init(wxLANGUAGE_GERMAN_GERMANY, wxLOCALE_LOAD_DEFAULT))
            << "the system lacks the de_DE locale (Debian: locales-all)";
        wxFileTranslationsLoader::AddCatalogLookupPathPrefix(WYX_CATALOG_DIR);
        ASSERT_TRUE(locale.AddCatalog("wyx3"));
        locale.AddCatalog("wx");
        folders = root.MakeHotFolders(logtest::Strings({"Eingang"}));

        frame = new CMainFrame(_("Kelvo Duv Ureruve") + " - " + _("Status & Log"), wxDefaultPosition,
                               wxSize(800, 600));
        frame->Show();
        ASSERT_TRUE(guitest::PumpUntil([this] { return frame->GetNotebook()->GetPageCount() == 2; }));
    }
    void TearDown() override
    {
        if (frame != nullptr)
            frame->Destroy();
        guitest::Pump();
    }

    JobStatusView* Status() const { return static_cast<JobStatusView*>(frame->GetStatusView()); }
    JobLogView* Log() const { return static_cast<JobLogView*>(frame->GetLogView()); }

    wxLocale locale;
    logtest::SystemRoot root;
    wxArrayString folders;
    CMainFrame* frame = nullptr;
};

TEST_F(GermanWindowTest, TitleTabsHeadingsRowsAndFootersAreGerman)
{
    EXPECT_EQ(frame->GetNotebook()->GetPageText(0), "Status");
    EXPECT_EQ(frame->GetNotebook()->GetPageText(1), "Protokoll");
    EXPECT_EQ(Headings(Status()->GetJobList()),
              Texts({"Nr.", "Dateiname", "Format", "Hotfolder", "Server", "Größe", "Zeit", "Status"}));
    EXPECT_EQ(Headings(Log()->GetLogList()),
              Texts({" ", "Dateiname", "Hotfolder", "Server", "Startzeit", "Status"}));
    EXPECT_EQ(Status()->GetFooter()->GetStatusText(0), "0 Elemente ");

    logtest::SystemRoot::AppendFile(
        root.JournalPath(), logtest::LogLine("Prospekt", "ADDED", "Transferred Successfully", folders[0]) +
                                logtest::LogLine("Plakat", "ADDED", "Transfer failed", folders[0]));
    JobLogManager::GetInstance().Refresh();
    ProfilesKelvoProfilesListCtrl* list = Log()->GetLogList();
    ASSERT_TRUE(guitest::PumpUntil([list] { return list->GetItemCount() == 2; }));

    std::vector<wxString> statuses;
    for (long row = 0; row < list->GetItemCount(); ++row)
        statuses.push_back(list->GetItemText(row, 5));
    std::sort(statuses.begin(), statuses.end());
    EXPECT_EQ(statuses, Texts({"Erfolgreich übertragen", "Übertragungsfehler"}));

    list->SetItemState(0, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    ASSERT_TRUE(
        guitest::PumpUntil([this] { return Log()->GetFooter()->GetStatusText(0).Contains("ausgew"); }));
    EXPECT_EQ(Log()->GetFooter()->GetStatusText(0), wxString::FromUTF8("1 von 2 Elementen ausgewählt."));
}

} // namespace
