#pragma once

#include <memory>

#include <wx/app.h>
#include <wx/intl.h>

#include "app/CrashReporterLoader.h"

class JobsProgressNotify;
namespace wyxos
{
class InstanceLock;
class InstanceSignal;
} // namespace wyxos
class ServerEventListner;

// The application object: one window per user, polling of the journals from
// start-up until the main loop has ended.
class CWyxProgressApp : public wxApp
{
public:
    CWyxProgressApp();
    ~CWyxProgressApp() override;

    bool OnInit() override;
    int OnExit() override;
    wxAppTraits* CreateTraits() override;

private:
    void OnFrameClose(wxCloseEvent& event);
    // A second copy was started: show the window to the user.
    void BringToFront();
    // Stops and joins the polling thread; ends the process at once when the
    // thread does not come back from a system call.
    void StopPolling();

    // Destroyed in reverse order: the crash reporter is unloaded first.
    std::unique_ptr<JobsProgressNotify> m_notifier;
    std::unique_ptr<ServerEventListner> m_listener;
    std::unique_ptr<wyxos::InstanceLock> m_instanceLock;
    std::unique_ptr<wyxos::InstanceSignal> m_instanceSignal;
    wxLocale m_locale;
    CrashReporterLoader m_crashReporter;
};

wxDECLARE_APP(CWyxProgressApp);
