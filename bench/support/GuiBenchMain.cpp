// main() of the benchmarks that need windows: starts the toolkit once, then
// runs every benchmark inside an active event loop, as the program runs. The
// allocator is tuned as the program tunes it at start.
#include "platform/os/HeapTuning.h"

#include <benchmark/benchmark.h>
#include <wx/app.h>
#include <wx/evtloop.h>
#include <wx/init.h>
#include <wx/log.h>

#include <cstdio>

namespace
{
class BenchApp : public wxApp
{
public:
    bool OnInit() override { return true; }
};
} // namespace

int main(int argc, char** argv)
{
    wyxos::TuneHeapForListRebuilds();
    benchmark::Initialize(&argc, argv);
    wxApp::SetInstance(new BenchApp);
    if (!wxEntryStart(argc, argv))
    {
        std::fprintf(stderr, "cannot start the toolkit: is there a display (xvfb-run -a)?\n");
        return 2;
    }
    wxLog::EnableLogging(false);
    wxTheApp->CallOnInit();
    {
        wxEventLoop loop;
        wxEventLoopActivator activate(&loop);
        benchmark::RunSpecifiedBenchmarks();
    }
    benchmark::Shutdown();
    wxTheApp->OnExit();
    wxEntryCleanup();
    return 0;
}
