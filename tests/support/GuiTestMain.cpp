// main() of the GUI tests: starts the toolkit once, then runs every test inside
// an active event loop so that wxYield and pending events work as in the program.
#include <gtest/gtest.h>
#include <wx/app.h>
#include <wx/evtloop.h>
#include <wx/image.h>
#include <wx/init.h>
#include <wx/log.h>

// Takes no command line of its own: GoogleTest's options are not the toolkit's.
struct GuiTestApp : wxApp
{
    bool OnInit() override { return true; }
};

int main(int argc, char** argv)
{
    ::testing::InitGoogleTest(&argc, argv);
    wxApp::SetInstance(new GuiTestApp);
    if (!wxEntryStart(argc, argv))
    {
        fprintf(stderr, "cannot start the toolkit: is there a display (xvfb-run -a)?\n");
        return 2;
    }
    wxLog::EnableLogging(false);
    wxInitAllImageHandlers();
    wxTheApp->CallOnInit();
    int result = 0;
    {
        wxEventLoop loop;
        wxEventLoopActivator activate(&loop);
        result = RUN_ALL_TESTS();
    }
    wxTheApp->OnExit();
    wxEntryCleanup();
    return result;
}
