// The log model's reads at the sizes the polling thread meets, and its
// duplicate check beside the linear scan it replaces.
//
//   build-log/bin/log_model_bench --benchmark_counters_tabular=true
#include <memory>

#include <benchmark/benchmark.h>

#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/utils.h>

#include "data/DataLocations.h"
#include "data/DosTime.h"
#include "data/JobLogManager.h"
#include "data/JobReadWriter.h"
#include "platform/os/HeapTuning.h"

namespace
{

// Jobs two seconds apart in 2021, each with a time of its own to format.
wxString DosTime(int index)
{
    const unsigned long step = static_cast<unsigned long>(index);
    const unsigned long date = ((2021 - 1980) << 9) | (3 << 5) | (1 + step / 43200 % 28);
    const unsigned long time = (step / 1800 % 24) << 11 | (step / 30 % 60) << 5 | step % 30;
    return wxString::Format("%lu", date << 16 | time);
}

wxString Line(const wxString& key, int index)
{
    return key + "\t/srv/hotfolders/In\t/srv/hotfolders/In/" + key + ".pdf\tPRN-01\t" + DosTime(index) +
           "\tTransferred Successfully\tsent in 3 parts\tADDED\r\n";
}

wxString Lines(const char* prefix, int first, int count)
{
    wxString text;
    text.reserve(static_cast<std::size_t>(count) * 110);
    for (int i = first; i < first + count; ++i)
        text += Line(wxString::Format("%s-%d", prefix, i), i);
    return text;
}

void WriteFile(const wxString& path, const wxString& text, const char* mode = "wb")
{
    wxFFile file(path, mode);
    file.Write(text, wxConvUTF8);
}

// A system root of its own for the whole run.
class BenchRoot
{
public:
    BenchRoot()
    {
        m_root = wxFileName::CreateTempFileName("wyx-log-bench");
        wxRemoveFile(m_root);
        wxSetEnv("WYX_SYSTEM_ROOT", m_root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
    }
    ~BenchRoot() { wxFileName::Rmdir(m_root, wxPATH_RMDIR_RECURSIVE); }

    wxString Journal() const { return GetDataDirectory() + "TiveraJobsLogFile.txt"; }

private:
    wxString m_root;
};

BenchRoot& Root()
{
    static BenchRoot root;
    return root;
}

// First read of a 10,000-line journal by a new model, the file read included
// (the model's construction and destruction are not).
void BM_FirstRead(benchmark::State& state)
{
    const int lines = static_cast<int>(state.range(0));
    WriteFile(Root().Journal(), Lines("first", 0, lines));
    for (auto _ : state)
    {
        state.PauseTiming();
        auto model = std::make_unique<JobLogManager>(Root().Journal());
        state.ResumeTiming();
        if (model->Parse() != 1 || model->GetRecordCount() != static_cast<std::size_t>(lines))
            state.SkipWithError("first read took in the wrong count");
        state.PauseTiming();
        model.reset();
        state.ResumeTiming();
    }
}
BENCHMARK(BM_FirstRead)->Arg(10000)->Unit(benchmark::kMillisecond)->UseRealTime();

// A model holding 100,000 records rereads a 10,000-line journal that gained
// one new job: the poll after each finished job.
void BM_RereadAfterOneAppend(benchmark::State& state)
{
    const int held = static_cast<int>(state.range(0));
    const int journalLines = static_cast<int>(state.range(1));
    WriteFile(Root().Journal(), Lines("held", 0, held));
    JobLogManager model(Root().Journal());
    model.Parse();
    // The producer has long trimmed the older ones away.
    wxRemoveFile(Root().Journal());
    WriteFile(Root().Journal(), Lines("held", held - journalLines, journalLines));
    model.Parse();

    int next = 0;
    for (auto _ : state)
    {
        state.PauseTiming();
        WriteFile(Root().Journal(), Line(wxString::Format("new-%d", next), next), "ab");
        state.ResumeTiming();
        if (model.Parse() != 1)
            state.SkipWithError("the appended job was not taken in");
        ++next;
    }
    state.counters["held"] = static_cast<double>(model.GetRecordCount());
}
BENCHMARK(BM_RereadAfterOneAppend)
    ->Args({100000, 10000})
    ->Args({10000, 10000})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

// The journal reader alone on the same 10,000 lines, to tell its share.
void BM_ReadJobsOnly(benchmark::State& state)
{
    WriteFile(Root().Journal(), Lines("read", 0, static_cast<int>(state.range(0))));
    wyx::JobsFileReadWriter journal;
    journal.SetPath(Root().Journal());
    wxArrayString lines;
    for (auto _ : state)
        journal.ReadJobs(lines);
}
BENCHMARK(BM_ReadJobsOnly)->Arg(10000)->Unit(benchmark::kMillisecond)->UseRealTime();

// The duplicate check alone: for each journal line, is its key among the held
// records, ignoring case? Every key is held, at the end of the list, as after
// a reread.
struct CheckInput
{
    std::vector<JobRecord> held;
    std::vector<wxString> journalKeys;
};

CheckInput MakeCheckInput(int held, int journalLines)
{
    CheckInput input;
    for (int i = 0; i < held; ++i)
    {
        JobRecord record;
        record[LogField::Key] = wxString::Format("job-%d", i);
        input.held.push_back(record);
    }
    for (int i = held - journalLines; i < held; ++i)
        input.journalKeys.push_back(wxString::Format("JOB-%d", i));
    return input;
}

void BM_DuplicateCheckLinearScan(benchmark::State& state)
{
    const CheckInput input =
        MakeCheckInput(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    for (auto _ : state)
    {
        std::size_t seen = 0;
        for (const wxString& key : input.journalKeys)
        {
            for (const JobRecord& record : input.held)
            {
                if (record[LogField::Key].IsSameAs(key, false))
                {
                    ++seen;
                    break;
                }
            }
        }
        benchmark::DoNotOptimize(seen);
    }
}
// 100,000 x 10,000 takes minutes per pass; measured at a tenth of each size,
// the full size costs about a hundred times as much (both loops are linear).
BENCHMARK(BM_DuplicateCheckLinearScan)->Args({10000, 1000})->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_DuplicateCheckKeySet(benchmark::State& state)
{
    const CheckInput input =
        MakeCheckInput(static_cast<int>(state.range(0)), static_cast<int>(state.range(1)));
    std::unordered_set<std::wstring> keys;
    for (const JobRecord& record : input.held)
        keys.insert(FoldedJobKey(record[LogField::Key]));
    for (auto _ : state)
    {
        std::size_t seen = 0;
        for (const wxString& key : input.journalKeys)
            seen += keys.count(FoldedJobKey(key));
        benchmark::DoNotOptimize(seen);
    }
}
BENCHMARK(BM_DuplicateCheckKeySet)
    ->Args({10000, 1000})
    ->Args({100000, 10000})
    ->Unit(benchmark::kMillisecond)
    ->UseRealTime();

void BM_FormatDosTime(benchmark::State& state)
{
    int index = 0;
    for (auto _ : state)
        benchmark::DoNotOptimize(FormatDosTime(DosTime(index++)));
}
BENCHMARK(BM_FormatDosTime);

} // namespace

int main(int argc, char** argv)
{
    // As the program does at start.
    wyxos::TuneHeapForListRebuilds();
    wxInitializer wx;
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
