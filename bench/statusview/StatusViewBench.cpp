// One status update as the GUI thread handles it (copy from the model, sort,
// filter, hand the rows to the list, repaint the visible page), and one tick of
// the busy wheel, at 10,000 and 100,000 jobs; each beside the path as first
// written, on the same data in the same run. CPU time is the program's own;
// wall time includes the X server. Run under xvfb-run -a -s "-screen 0 1280x1024x24".
#include "components/Utility/CustomListCtrl.h"
#include "data/JobStatusManager.h"
#include "pump/bus/CustomEvents.h"
#include "views/JobStatusView.h"
#include "views/StatusRows.h"

#include <benchmark/benchmark.h>
#include <wx/app.h>
#include <wx/frame.h>
#include <wx/intl.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>

namespace
{
const char* const kStatuses[] = {"Queued", "Converting file type", "Saving...", "Transferring to server"};
const char* const kServers[] = {"PRN-LONDON-01", "PRN-LONDON-02", "KM-ACCURIO-C14000", "OCE-VARIO-6250"};

// A status journal of `jobs` lines; every hundredth job is in progress.
std::filesystem::path WriteJournal(const std::filesystem::path& folder, long jobs)
{
    const std::filesystem::path path = folder / "TiveraJobsStatusFile.txt";
    std::ofstream out(path, std::ios::binary);
    for (long job = 0; job < jobs; ++job)
    {
        const char* status = job % 100 == 0 ? kStatuses[1 + job / 100 % 3] : kStatuses[0];
        out << job << "\t/srv/hotfolders/Proofs " << job % 7 << "\t/srv/hotfolders/Proofs " << job % 7
            << "/Quarterly report " << (job * 7919) % jobs << " final.pdf\t" << kServers[job % 4] << '\t'
            << 1383035055 + job * 37 % 5000 << '\t' << status << '\t' << 1000 + job * 131 % 9000000
            << "\tPDF\tADDED\n";
    }
    return path;
}

// A shown Status tab over a model that holds `jobs` records.
class Fixture
{
public:
    explicit Fixture(long jobs)
    {
        char pattern[] = "/tmp/wyx-bench.XXXXXX";
        folder = ::mkdtemp(pattern);
        journal = WriteJournal(folder, jobs);
        model = std::make_unique<JobStatusManager>(wxString(journal.string()));
        model->Parse();
        frame = new wxFrame(nullptr, wxID_ANY, wxS("status bench"), wxPoint(0, 0), wxSize(1100, 1000));
        view = new JobStatusView(frame, wxID_ANY, *model);
        frame->Show();
        Update();
        Settle();
    }
    ~Fixture()
    {
        frame->Destroy();
        wxTheApp->ProcessPendingEvents();
        std::filesystem::remove_all(folder);
    }

    // The model announces a fresh read of the unchanged journal.
    void Reread()
    {
        std::filesystem::last_write_time(journal, std::filesystem::file_time_type::clock::now());
        model->Parse();
    }
    void Update()
    {
        wxCommandEvent event(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS);
        view->ProcessWindowEvent(event);
    }
    void Paint() { view->GetJobList()->GetMainWindow()->Update(); }
    void Settle()
    {
        for (int i = 0; i < 5; ++i)
        {
            wxTheApp->ProcessPendingEvents();
            wxTheApp->ProcessIdle();
            Paint();
        }
    }

    std::filesystem::path folder;
    std::filesystem::path journal;
    std::unique_ptr<JobStatusManager> model;
    wxFrame* frame = nullptr;
    JobStatusView* view = nullptr;
};

void StatusUpdate(benchmark::State& state)
{
    Fixture bench(state.range(0));
    for (auto _ : state)
    {
        state.PauseTiming();
        bench.Reread();
        state.ResumeTiming();
        bench.Update();
        bench.Paint();
    }
    state.counters["rows"] = bench.view->GetJobList()->GetItemCount();
}

// The path as first written: the model's records copied twice, sorted with a
// case-folding comparison of whole paths at every step, each status translated
// per row, and the rows copied into the list.
void StatusUpdateFirstWritten(benchmark::State& state)
{
    Fixture bench(state.range(0));
    CustomListCtrl* list = bench.view->GetJobList();
    std::vector<JobRecord> sortedJobs;
    for (auto _ : state)
    {
        state.PauseTiming();
        bench.Reread();
        state.ResumeTiming();
        std::vector<JobRecord> jobs;
        bench.model->GetJobs(jobs);
        sortedJobs = jobs;
        std::sort(sortedJobs.begin(), sortedJobs.end(),
                  [](const JobRecord& a, const JobRecord& b)
                  { return a[StatusField::FilePath].CmpNoCase(b[StatusField::FilePath]) < 0; });
        std::vector<JobRecord> rows;
        for (const JobRecord& job : sortedJobs)
        {
            TranslationMemo perRow;
            JobRecord row;
            StatusRows::MakeDisplayRow(job, perRow, row);
            rows.push_back(row);
        }
        list->SetRecords(rows);
        list->RefreshItems(0, std::max<long>(0, static_cast<long>(rows.size()) - 1));
        list->SetItemCount(static_cast<long>(rows.size()));
        bench.Paint();
    }
    state.counters["rows"] = list->GetItemCount();
}

void WheelTick(benchmark::State& state)
{
    Fixture bench(state.range(0));
    wxTimer timer;
    for (auto _ : state)
    {
        wxTimerEvent tick(timer);
        bench.view->ProcessWindowEvent(tick);
        bench.Paint();
    }
}

// Every row's status read back, and each row in progress refreshed with a
// SetItemCount of its own.
void WheelTickFirstWritten(benchmark::State& state)
{
    Fixture bench(state.range(0));
    CustomListCtrl* list = bench.view->GetJobList();
    const wxString inProgress[] = {_("Converting file type"), _("Transferring to server"), _("Saving...")};
    std::int32_t frame = 0;
    for (auto _ : state)
    {
        list->SetStatusImage(frame++ % 12);
        const long count = list->GetItemCount();
        for (long item = 0; item < count; ++item)
        {
            const wxString status = list->GetItemText(item, 7);
            if (std::find(std::begin(inProgress), std::end(inProgress), status) != std::end(inProgress))
            {
                list->RefreshItem(item);
                list->SetItemCount(count);
            }
        }
        wxTheApp->ProcessIdle();
        bench.Paint();
    }
}

BENCHMARK(StatusUpdate)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(StatusUpdateFirstWritten)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(WheelTick)->Arg(10000)->Unit(benchmark::kMillisecond);
BENCHMARK(WheelTickFirstWritten)->Arg(10000)->Unit(benchmark::kMillisecond);

} // namespace
