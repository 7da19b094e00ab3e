// The whole window built under a German locale with the shipped catalogs, as
// the program builds it after choosing German: what the user reads on the tabs,
// a footer and the rows of the log, whose texts are translated as they are
// shown. (CatalogTest finds a text the sources leave untranslated; the title
// is read from the installed program's window, in InstallTests.)
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
#include <wx/translation.h>

#include <set>

namespace
{

TEST(GermanWindowTest, TabsLogRowsAndTheFooterAreGerman)
{
    wxLocale locale;
    ASSERT_TRUE(locale.Init(wxLANGUAGE_GERMAN_GERMANY, wxLOCALE_LOAD_DEFAULT))
        << "the system lacks the de_DE locale (Debian: locales-all)";
    wxFileTranslationsLoader::AddCatalogLookupPathPrefix(WYX_CATALOG_DIR);
    ASSERT_TRUE(locale.AddCatalog("wyx3"));
    logtest::SystemRoot root;
    const wxArrayString folders = root.MakeHotFolders(logtest::Strings({"Eingang"}));
    logtest::SystemRoot::AppendFile(
        root.JournalPath(), logtest::LogLine("Prospekt", "ADDED", "Transferred Successfully", folders[0]) +
                                logtest::LogLine("Plakat", "ADDED", "Transfer failed", folders[0]));
    CMainFrame* frame = new CMainFrame("", wxDefaultPosition, wxSize(800, 600));
    frame->Show();
    ASSERT_TRUE(guitest::PumpUntil([frame] { return frame->GetNotebook()->GetPageCount() == 2; }));
    auto* log = static_cast<JobLogView*>(frame->GetLogView());
    EXPECT_EQ(frame->GetNotebook()->GetPageText(0) + "|" + frame->GetNotebook()->GetPageText(1),
              "Status|Protokoll");
    EXPECT_EQ(static_cast<JobStatusView*>(frame->GetStatusView())->GetFooter()->GetStatusText(0),
              "0 Elemente ");

    JobLogManager::GetInstance().Refresh();
    ProfilesKelvoProfilesListCtrl* list = log->GetLogList();
    ASSERT_TRUE(guitest::PumpUntil([list] { return list->GetItemCount() == 2; }));
    EXPECT_EQ((std::set<wxString>{list->GetItemText(0, 5), list->GetItemText(1, 5)}),
              (std::set<wxString>{wxString::FromUTF8("Erfolgreich übertragen"),
                                  wxString::FromUTF8("Übertragungsfehler")}));
    frame->Destroy();
    guitest::Pump(); // its deletion waits for idle time
}

} // namespace
