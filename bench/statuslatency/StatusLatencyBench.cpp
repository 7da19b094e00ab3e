// How long a job written to the status journal takes to show: the real program
// on the display, the journal written by wyx-journal in another process, the
// row seen appear (and go) by reading the display back. Writes come at random
// moments of the program's one-second polling, so the figures cover every
// phase. Run under xvfb-run -a -s "-screen 0 1280x1024x24".
#include <benchmark/benchmark.h>

#include "ProgramSession.h"

#include <sys/stat.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>

namespace
{
using Clock = std::chrono::steady_clock;

class Session
{
public:
    Session()
    {
        char pattern[] = "/tmp/wyx-latency.XXXXXX";
        folder = ::mkdtemp(pattern);
        std::filesystem::create_directories(folder / "root/var/lib/Corvane/HotFolders");
        std::ofstream(folder / "root/var/lib/Corvane/HotFolders/TiveraJobsStatusFile.txt").flush();
        std::filesystem::create_directories(folder / "run");
        ::chmod((folder / "run").c_str(), 0700);
        environment = {"HOME=" + folder.string(), "WYX_SYSTEM_ROOT=" + (folder / "root").string(),
                       "XDG_RUNTIME_DIR=" + (folder / "run").string(), "NO_AT_BRIDGE=1", "LANG=C.UTF-8"};
        for (const char* name : {"DISPLAY", "XAUTHORITY", "PATH"})
            if (const char* value = ::getenv(name))
                environment.push_back(std::string(name) + "=" + value);
        program = std::make_unique<programtest::Program>(WYX_PROGRAM, environment);
        window = x.WaitForWindow(*program);
    }
    ~Session()
    {
        program.reset();
        std::filesystem::remove_all(folder);
    }

    bool Ready() const { return window != 0; }

    // The "No." column and the footer: they change exactly when the row count does.
    std::vector<unsigned char> Picture()
    {
        return x.Brightness(window, 4, 0, 30, x.Attributes(window).height);
    }

    std::vector<unsigned char> SteadyPicture()
    {
        std::vector<unsigned char> picture = Picture();
        for (int i = 0; i < 50; ++i)
        {
            ::usleep(300000);
            std::vector<unsigned char> again = Picture();
            if (again == picture)
                break;
            picture = std::move(again);
        }
        return picture;
    }

    bool Journal(const std::vector<std::string>& arguments)
    {
        programtest::Program tool(WYX_JOURNAL, environment, std::nullopt, arguments);
        const int status = tool.Wait();
        return WIFEXITED(status) && WEXITSTATUS(status) == 0;
    }

    // Polls the display until it differs from `before`; seconds waited, or a
    // negative value after ten seconds without a change.
    double WaitForChange(const std::vector<unsigned char>& before, std::vector<unsigned char>& after,
                         Clock::time_point written)
    {
        while (Clock::now() - written < std::chrono::seconds(10))
        {
            after = Picture();
            if (after != before)
                return std::chrono::duration<double>(Clock::now() - written).count();
            ::usleep(2000);
        }
        return -1;
    }

private:
    std::filesystem::path folder;
    std::vector<std::string> environment;
    programtest::XSession x;
    std::unique_ptr<programtest::Program> program;
    Window window = 0;
};

void WrittenLineToShownRow(benchmark::State& state)
{
    Session session;
    if (!session.Ready())
    {
        state.SkipWithError("the program showed no window");
        return;
    }
    std::vector<unsigned char> picture = session.SteadyPicture();
    std::mt19937 random(7);
    std::uniform_int_distribution<int> pause(0, 1000);
    std::vector<double> latencies;
    bool shown = false;
    for (auto _ : state)
    {
        ::usleep(static_cast<useconds_t>(pause(random)) * 1000);
        const bool written =
            shown ? session.Journal({"status", "delete", "42"})
                  : session.Journal(
                        {"status", "add",
                         "42\t/srv/in/Proofs\t/srv/in/Proofs/a.pdf\tPRN-01\t1383035055\tQueued\t4096\tPDF"});
        const Clock::time_point at = Clock::now();
        std::vector<unsigned char> after;
        const double seconds = written ? session.WaitForChange(picture, after, at) : -1;
        if (seconds < 0)
        {
            state.SkipWithError("the change did not show within ten seconds");
            return;
        }
        state.SetIterationTime(seconds);
        latencies.push_back(seconds * 1000);
        picture = std::move(after);
        shown = !shown;
        // The repaint may come in more than one piece: wait until it is whole.
        ::usleep(50000);
        picture = session.Picture();
    }
    std::sort(latencies.begin(), latencies.end());
    // Nearest rank: of 100 figures, p99 is the 99th.
    auto percentile = [&](double p)
    { return latencies[static_cast<size_t>(std::ceil(p * static_cast<double>(latencies.size()))) - 1]; };
    state.counters["p50_ms"] = percentile(0.50);
    state.counters["p90_ms"] = percentile(0.90);
    state.counters["p99_ms"] = percentile(0.99);
    state.counters["max_ms"] = latencies.back();
}
BENCHMARK(WrittenLineToShownRow)->Iterations(100)->UseManualTime()->Unit(benchmark::kMillisecond);
} // namespace

BENCHMARK_MAIN();
