#include "app/WyxProgressApp.h"

#include <cstdlib>

#include <wx/filename.h>
#include <wx/iconbndl.h>
#include <wx/image.h>
#include <wx/stdpaths.h>
#include <wx/toplevel.h>
#include <wx/translation.h>
#include <wx/utils.h>

#include "app/InstallPath.h"
#include "app/MainFrame.h"
#include "app/UiLanguage.h"
#include "app/WyxAppTraits.h"
#include "data/DataLocations.h"
#include "platform/os/InstanceLock.h"
#include "platform/os/InstanceSignal.h"
#include "platform/services/WyxLogger.h"
#include "pump/JobsProgressNotify.h"
#include "pump/ServerEventListner.h"

namespace
{

const wxString kListenerName = "OnNewData";

wxString ExecutableFolder()
{
    return wxFileName(wxStandardPaths::Get().GetExecutablePath()).GetPath(wxPATH_GET_VOLUME);
}

} // namespace

CWyxProgressApp::CWyxProgressApp()
{
    wxDisableAsserts();
    if (m_crashReporter.Load())
        m_crashReporter.Install();
    WyxLogger::SetLogDirectory("WyxProgress");
}

CWyxProgressApp::~CWyxProgressApp()
{
    m_crashReporter.Uninstall();
}

wxAppTraits* CWyxProgressApp::CreateTraits()
{
    return new WyxAppTraits;
}

bool CWyxProgressApp::OnInit()
{
    // The user id in the name lets every user of a shared machine run one copy.
    const wxString instanceName = wxString::Format("WyxProgress-%s", wxGetUserId());
    m_instanceLock = std::make_unique<wyxos::InstanceLock>(instanceName);
    if (m_instanceLock->IsAnotherRunning())
    {
        // The running copy brings its window to the front; this one ends.
        wyxos::InstanceSignal::Knock(instanceName);
        return false;
    }

    wxInitAllImageHandlers();
    m_locale.Init(ChooseUiLanguage(true), wxLOCALE_LOAD_DEFAULT);

    const wxString executableFolder = ExecutableFolder();
    wxSetWorkingDirectory(executableFolder);

    const wxString catalogPrefix =
        wxFileName(ReadInstallPath()).GetLongPath() + wxFileName::GetPathSeparator() + "LocalizedStrings";
    wxFileTranslationsLoader::AddCatalogLookupPathPrefix(catalogPrefix);
    // Then the catalogs the program ships itself (beside it, or in its share folder).
    wxFileTranslationsLoader::AddCatalogLookupPathPrefix(FindProgramFile("LocalizedStrings"));
    m_locale.AddCatalog("wyx3");
    m_locale.AddCatalog("wx");

    const wxString title = _("Kelvo Duv Ureruve") + " - " + _("Status & Log");
    auto* frame = new CMainFrame(title, wxDefaultPosition, wxSize(800, 600));
    frame->SetIcons(wxIconBundle(FindProgramFile("wyx_folder.ico"), wxBITMAP_TYPE_ANY));

    m_listener = std::make_unique<ServerEventListner>();
    m_notifier = std::make_unique<JobsProgressNotify>();
    m_listener->AddListener(kListenerName, m_notifier.get());
    m_listener->StartTimer();
    // Polling stops as the window closes, before any of its pages goes.
    frame->Bind(wxEVT_CLOSE_WINDOW, &CWyxProgressApp::OnFrameClose, this);

    frame->Show();
    // Knocks arrive on the signal's own thread; the window is raised on this one.
    m_instanceSignal = std::make_unique<wyxos::InstanceSignal>(
        instanceName, [this] { CallAfter(&CWyxProgressApp::BringToFront); });
    return true;
}

void CWyxProgressApp::BringToFront()
{
    auto* frame = wxDynamicCast(GetTopWindow(), wxTopLevelWindow);
    if (frame == nullptr)
        return;
    if (frame->IsIconized())
        frame->Iconize(false);
    frame->Show();
    frame->Raise();
}

void CWyxProgressApp::OnFrameClose(wxCloseEvent& event)
{
    StopPolling();
    event.Skip();
}

void CWyxProgressApp::StopPolling()
{
    if (!m_listener)
        return;
    m_listener->StopTimer();
    if (m_listener->ThreadOutlivedStop())
    {
        // The polling thread is stuck in a system call and still uses the
        // models: nothing may be torn down under it. Closing the window must
        // end the program all the same, and it has nothing left to save.
        std::_Exit(0);
    }
}

int CWyxProgressApp::OnExit()
{
    // No knock may reach an application that is going away.
    m_instanceSignal.reset();
    if (!m_listener || !m_notifier)
        return 0;
    // The thread is joined before the notifier it calls goes away.
    StopPolling();
    m_listener->RemoveListener(kListenerName);
    m_listener.reset();
    m_notifier.reset();
    return 0;
}
