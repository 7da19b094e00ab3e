// The status model's costs: an idle poll, a full re-read of a large journal,
// the same file counted by wc -l for scale, and the memory a job takes.
//
//   status_bench --benchmark_counters_tabular=true
#include <benchmark/benchmark.h>

#include <cstdlib>
#include <malloc.h>
#include <memory>
#include <vector>

#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/utils.h>

#include "data/DosTime.h"
#include "data/JobReadWriter.h"
#include "data/JobStatusManager.h"
#include "platform/os/HeapTuning.h"

namespace
{

// A system root with a status journal of the given number of lines, one in ten committed.
class Journal
{
public:
    explicit Journal(int lines)
    {
        const wxString base = wxFileName::CreateTempFileName("wyx-status-bench");
        wxRemoveFile(base);
        m_root = base;
        wxFileName::Mkdir(m_root, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
        wxSetEnv("WYX_SYSTEM_ROOT", m_root);
        m_path = m_root + "/TiveraJobsStatusFile.txt";
        wxString text;
        text.reserve(static_cast<size_t>(lines) * 180);
        for (int i = 0; i < lines; ++i)
        {
            const unsigned dos = (45u << 25) | ((1u + i % 12) << 21) | ((1u + i % 28) << 16) |
                                 ((i % 24) << 11) | ((i % 60) << 5) | (i % 30);
            text += wxString::Format("J18c2f3a9-%06d\t/srv/hotfolders/Large Format\t/srv/hotfolders/Large "
                                     "Format/Poster A1 final %d.pdf\tOCE-VARIO-6250\t%u\t%s\t%d\tPDF\t%s\r\n",
                                     i, i, dos, i % 3 == 0 ? "Saving..." : "Transferring to server",
                                     100000 + i * 37, i % 10 == 9 ? "COMMIT" : "MODIFIED");
        }
        wxFFile file(m_path, "wb");
        file.Write(text, wxConvUTF8);
    }
    ~Journal()
    {
        wxFileName::Rmdir(m_root, wxPATH_RMDIR_RECURSIVE);
        wxUnsetEnv("WYX_SYSTEM_ROOT");
    }
    const wxString& Path() const { return m_path; }

private:
    wxString m_root;
    wxString m_path;
};

void BM_IdlePoll(benchmark::State& state)
{
    Journal journal(1000);
    JobStatusManager manager(journal.Path());
    manager.Parse();
    for (auto _ : state)
        benchmark::DoNotOptimize(manager.Parse());
}
BENCHMARK(BM_IdlePoll);

// What the polling thread does each second while the service writes: the
// journal has changed, so it is read whole and the new list replaces the old,
// which is freed within the same call.
void BM_FullRead(benchmark::State& state)
{
    Journal journal(static_cast<int>(state.range(0)));
    JobStatusManager manager(journal.Path());
    manager.Parse();
    for (auto _ : state)
    {
        state.PauseTiming();
        wxFileName(journal.Path()).Touch();
        state.ResumeTiming();
        if (manager.Parse() != 1)
            state.SkipWithError("the touched journal was not read again");
    }
    std::vector<JobRecord> copy;
    manager.GetJobs(copy);
    state.counters["jobs"] = static_cast<double>(copy.size());
    state.counters["lines"] = static_cast<double>(state.range(0));
}
BENCHMARK(BM_FullRead)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

// The journal reader's share of a full read: the lines without the records.
void BM_ReadJobsOnly(benchmark::State& state)
{
    Journal journal(static_cast<int>(state.range(0)));
    wyx::JobsFileReadWriter reader;
    reader.SetPath(journal.Path());
    for (auto _ : state)
    {
        wxArrayString lines;
        benchmark::DoNotOptimize(reader.ReadJobs(lines));
    }
}
BENCHMARK(BM_ReadJobsOnly)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

void BM_WcLines(benchmark::State& state)
{
    Journal journal(static_cast<int>(state.range(0)));
    const wxString command = "wc -l < '" + journal.Path() + "' > /dev/null";
    for (auto _ : state)
        benchmark::DoNotOptimize(std::system(command.utf8_str()));
    state.counters["lines"] = static_cast<double>(state.range(0));
}
BENCHMARK(BM_WcLines)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

void BM_MemoryPerJob(benchmark::State& state)
{
    Journal journal(static_cast<int>(state.range(0)));
    double bytesPerJob = 0;
    for (auto _ : state)
    {
        const size_t before = mallinfo2().uordblks;
        JobStatusManager manager(journal.Path());
        manager.Parse();
        const size_t after = mallinfo2().uordblks;
        std::vector<JobRecord> copy;
        manager.GetJobs(copy);
        bytesPerJob = static_cast<double>(after - before) / static_cast<double>(copy.size());
    }
    state.counters["bytes_per_job"] = bytesPerJob;
    state.counters["sizeof_JobRecord"] = sizeof(JobRecord);
}
BENCHMARK(BM_MemoryPerJob)->Arg(10000)->Iterations(3)->Unit(benchmark::kMillisecond);

void BM_FormatDosTime(benchmark::State& state)
{
    // The texts are made beforehand: formatting a number is not the cost measured.
    std::vector<wxString> texts;
    for (unsigned i = 0; i < 4096; ++i)
        texts.push_back(wxString::Format("%u", (45u << 25) | ((1u + i % 12) << 21) | ((1u + i % 28) << 16) |
                                                   ((i % 24) << 11) | ((i % 60) << 5)));
    size_t i = 0;
    for (auto _ : state)
        benchmark::DoNotOptimize(FormatDosTime(texts[i++ % texts.size()]));
}
BENCHMARK(BM_FormatDosTime);

} // namespace

int main(int argc, char** argv)
{
    // As the program does at start.
    wyxos::TuneHeapForListRebuilds();
    wxInitializer initializer;
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
