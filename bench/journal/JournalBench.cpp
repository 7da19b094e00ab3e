// Reading a whole status journal, against `wc -l` on the same file as the
// floor of what reading the bytes costs; and one append, which rewrites it.
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>

#include <benchmark/benchmark.h>
#include <wx/init.h>

#include "data/JobReadWriter.h"

namespace
{

// A status journal of the given length in a private system root, made once.
class StatusJournal
{
public:
    static const std::string& Path(std::size_t lines)
    {
        static StatusJournal journal;
        std::string& path = journal.m_paths[lines];
        if (path.empty())
            path = journal.Write(lines);
        return path;
    }

    ~StatusJournal() { std::filesystem::remove_all(m_root); }

private:
    StatusJournal()
    {
        char folder[] = "/tmp/wyx-journal-bench.XXXXXX";
        if (::mkdtemp(folder) == nullptr)
            std::abort();
        m_root = folder;
        ::setenv("WYX_SYSTEM_ROOT", folder, 1);
    }

    std::string Write(std::size_t lines) const
    {
        const std::string path = m_root + "/" + std::to_string(lines) + "/TiveraJobsStatusFile.txt";
        std::filesystem::create_directories(std::filesystem::path(path).parent_path());
        std::ofstream file(path, std::ios::binary);
        for (std::size_t i = 0; i < lines; ++i)
            file << i << "\tC:\\HotFolders\\Print Queue A\tC:\\HotFolders\\Print Queue A\\document-" << i
                 << ".pdf\tPRINTSRV-01\t1497451234\tTransferring to server\t" << 1000 + i * 7
                 << "\tPDF\tMODIFIED\r\n";
        return path;
    }

    std::string m_root;
    std::map<std::size_t, std::string> m_paths;
};

wyx::JobsFileReadWriter Reader(std::size_t lines)
{
    wyx::JobsFileReadWriter journal;
    journal.SetPath(wxString::FromUTF8(StatusJournal::Path(lines)));
    return journal;
}

void ReadJobs(benchmark::State& state)
{
    const auto lines = static_cast<std::size_t>(state.range(0));
    wyx::JobsFileReadWriter journal = Reader(lines);
    wxArrayString read;
    for (auto _ : state)
    {
        if (journal.ReadJobs(read) != wyx::JobOk || read.size() != lines)
            state.SkipWithError("ReadJobs failed");
        benchmark::DoNotOptimize(read);
    }
    state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(
                                                     std::filesystem::file_size(StatusJournal::Path(lines))));
}

void WcLines(benchmark::State& state)
{
    const auto lines = static_cast<std::size_t>(state.range(0));
    const std::string command = "wc -l < '" + StatusJournal::Path(lines) + "'";
    for (auto _ : state)
    {
        std::FILE* wc = ::popen(command.c_str(), "r");
        unsigned long counted = 0;
        if (wc == nullptr || std::fscanf(wc, "%lu", &counted) != 1 || counted != lines)
            state.SkipWithError("wc -l failed");
        if (wc != nullptr)
            ::pclose(wc);
    }
    state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(
                                                     std::filesystem::file_size(StatusJournal::Path(lines))));
}

// The producer's append: read, add one line, write a new file, rename it.
void AddThenDelete(benchmark::State& state)
{
    wyx::JobsFileReadWriter journal = Reader(static_cast<std::size_t>(state.range(0)));
    for (auto _ : state)
    {
        wxString line = "bench\tC:\\Hot\tC:\\Hot\\b.pdf\tSRV\t1\tSaving...\t1\tPDF";
        if (journal.AddJob(line) != wyx::JobOk || journal.DeleteJob("bench") != wyx::JobOk)
            state.SkipWithError("AddJob failed");
    }
}

} // namespace

BENCHMARK(ReadJobs)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(WcLines)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(AddThenDelete)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

int main(int argc, char** argv)
{
    wxInitializer initializer;
    benchmark::Initialize(&argc, argv);
    if (benchmark::ReportUnrecognizedArguments(argc, argv))
        return 1;
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
