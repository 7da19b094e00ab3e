#include <wx/app.h>
#include <wx/debug.h>
#include <wx/log.h>

#include "app/WyxProgressApp.h"
#include "platform/os/HeapTuning.h"
#include "platform/os/SystemPaths.h"

wxIMPLEMENT_APP_NO_MAIN(CWyxProgressApp);

int main(int argc, char** argv)
{
    wyxos::ResolveSystemRoot();
    wyxos::TuneHeapForListRebuilds();
    // Before the application object exists, so that nothing the library does
    // while starting can assert or log below Info.
    wxDisableAsserts();
    wxLog::SetLogLevel(wxLOG_Info);
    return wxEntry(argc, argv);
}
