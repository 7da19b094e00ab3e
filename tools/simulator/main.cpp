#include <csignal>
#include <cstdio>

#include <wx/init.h>

#include "platform/os/FileContents.h"
#include "platform/os/SystemPaths.h"
#include "tools/simulator/HotFolderSimulator.h"
#include "tools/simulator/SimulatorOptions.h"

namespace
{

constexpr int kSomeWritesFailed = 3;

volatile std::sig_atomic_t g_stopRequested = 0;

extern "C" void RequestStop(int)
{
    g_stopRequested = 1;
}

} // namespace

int main(int argc, char** argv)
{
    wyxos::ResolveSystemRoot();
    wxInitializer initializer(argc, argv);
    if (!initializer.IsOk())
        return 1;

    SimulatorOptions options;
    wxString problem;
    if (!ParseSimulatorOptions(argc, argv, options, problem))
    {
        std::fprintf(stderr, "wyx-simulator: %s\n\n%s", static_cast<const char*>(problem.utf8_str()),
                     kSimulatorUsage);
        return 2;
    }
    if (options.help)
    {
        std::fputs(kSimulatorUsage, stdout);
        return 0;
    }

    // Past the file size limit a journal operation fails and is counted,
    // instead of the signal ending us beside a temporary file.
    wyxos::FailWritesBeyondFileSizeLimit();
    std::signal(SIGTERM, RequestStop);
    std::signal(SIGINT, RequestStop);

    HotFolderSimulator simulator(options, [] { return g_stopRequested != 0; });
    if (!simulator.Prepare(problem))
    {
        std::fprintf(stderr, "wyx-simulator: %s\n", static_cast<const char*>(problem.utf8_str()));
        return 1;
    }
    std::printf("wyx-simulator: writing to %s\n",
                static_cast<const char*>(simulator.DataDirectory().utf8_str()));
    std::fflush(stdout);

    const HotFolderSimulator::Totals totals = simulator.Run();
    std::printf("wyx-simulator: %u jobs started, %u transferred, %u failed%s\n", totals.started,
                totals.succeeded, totals.failed, g_stopRequested ? " (stopped)" : "");
    if (totals.journalErrors > 0)
        std::fprintf(stderr, "wyx-simulator: %u journal operations failed\n", totals.journalErrors);
    if (totals.markerErrors > 0)
        std::fprintf(stderr, "wyx-simulator: %u error markers could not be written\n", totals.markerErrors);
    return totals.AllWritten() ? 0 : kSomeWritesFailed;
}
