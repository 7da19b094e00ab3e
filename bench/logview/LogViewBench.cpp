// The Log tab's work on the GUI thread with 100,000 records held: switching
// between the complete and the error log, changing the hot-folder filter, and
// appending 100 new records; and the heap a listed row takes.
//
//   xvfb-run -a -s "-screen 0 1280x1024x24" build/bin/logview_bench --benchmark_min_time=1
#include "components/Utility/CustomComboBox.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "data/DataLocations.h"
#include "data/JobLogManager.h"
#include "pump/bus/CustomEvents.h"
#include "views/JobLogView.h"

#include <benchmark/benchmark.h>
#include <malloc.h>
#include <wx/app.h>
#include <wx/ffile.h>
#include <wx/filename.h>
#include <wx/frame.h>
#include <wx/radiobut.h>

#include <memory>

namespace
{
constexpr int kRecords = 100000;
constexpr int kAppended = 100;
constexpr int kFolders = 10;
const wxSize kFrameSize(1000, 1000);

wxString FolderPath(int index)
{
    return GetDataDirectory() + wxString::Format("hot/Folder %d", index % kFolders);
}

// One job in five fails, as the simulator has it.
wxString Line(int index)
{
    const wxString folder = FolderPath(index);
    const bool failed = index % 5 == 0;
    return wxString::Format("job-%d\t", index) + folder + "\t" + folder +
           wxString::Format("/Quarterly report %d.pdf\tPRN-0%d\t%lu\t", index, index % 3,
                            1383035055ul + index) +
           (failed ? "Conversion failed\tThe file could not be opened by the converter"
                   : "Transferred Successfully\tsent") +
           "\tADDED\r\n";
}

void AppendLines(const wxString& path, int first, int count)
{
    wxString text;
    text.reserve(static_cast<std::size_t>(count) * 190);
    for (int i = first; i < first + count; ++i)
        text += Line(i);
    wxFFile file(path, "ab");
    file.Write(text, wxConvUTF8);
}

// A system root, a journal of kRecords jobs read by the model, and the view
// over it in a shown frame, laid out and painted.
struct LogTab
{
    LogTab()
    {
        root = wxFileName::CreateTempFileName("wyx-logview-bench");
        wxRemoveFile(root);
        wxSetEnv("WYX_SYSTEM_ROOT", root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
        wxString ini = "[HotFolders]\n";
        for (int i = 0; i < kFolders; ++i)
            ini += FolderPath(i) + "\n";
        wxFFile(GetDataDirectory() + "HotFolders.ini", "wb").Write(ini, wxConvUTF8);
        journal = GetDataDirectory() + "TiveraJobsLogFile.txt";
        AppendLines(journal, 0, kRecords);
        next = kRecords;

        model = std::make_unique<JobLogManager>(journal);
        model->Parse();
        frame = new wxFrame(nullptr, wxID_ANY, "bench", wxPoint(0, 0), kFrameSize);
        view = new JobLogView(frame, wxID_ANY, *model);
        frame->Show();
        rows = view->GetLogList()->GetMainWindow();
        rows->Bind(wxEVT_PAINT,
                   [this](wxPaintEvent& event)
                   {
                       ++paints;
                       repaintedHeight += rows->GetUpdateRegion().GetBox().GetHeight();
                       event.Skip();
                   });
        for (int round = 0; round < 500 && paints == 0; ++round)
        {
            wxTheApp->Yield(true);
            wxMilliSleep(10);
        }
        Update();
        Settle();
    }
    ~LogTab()
    {
        frame->Destroy();
        wxTheApp->ProcessIdle();
        wxFileName::Rmdir(root, wxPATH_RMDIR_RECURSIVE);
    }

    // As the polling thread's publication would make the GUI thread do.
    void Update()
    {
        view->GetEventHandler()->QueueEvent(new wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, 0));
        wxTheApp->ProcessPendingEvents();
    }

    // What follows a change before the user sees it: layout when idle, paint.
    void Settle()
    {
        wxTheApp->ProcessIdle();
        rows->Update();
    }

    void Choose(wxWindowID radio)
    {
        auto* button = wxDynamicCast(view->FindWindow(radio), wxRadioButton);
        button->SetValue(true);
        wxCommandEvent event(wxEVT_RADIOBUTTON, radio);
        event.SetEventObject(button);
        event.SetInt(1);
        button->GetEventHandler()->ProcessEvent(event);
    }

    void ChooseFolder(int entry)
    {
        CustomComboBox* box = view->GetFolderBox();
        box->SetSelection(entry);
        wxCommandEvent event(wxEVT_COMBOBOX, JobLogView::kFolderBoxId);
        event.SetEventObject(box);
        event.SetInt(entry);
        box->GetEventHandler()->ProcessEvent(event);
    }

    void ResetCounts()
    {
        paints = 0;
        repaintedHeight = 0;
    }

    wxString root;
    wxString journal;
    int next = 0;
    std::unique_ptr<JobLogManager> model;
    wxFrame* frame = nullptr;
    JobLogView* view = nullptr;
    wxWindow* rows = nullptr;
    long paints = 0;
    long repaintedHeight = 0;
};

// Each direction of a change is timed on its own; the way back is not.
template <typename Change, typename Back>
void TimeOneWay(benchmark::State& state, LogTab& tab, Change change, Back back)
{
    for (auto _ : state)
    {
        change();
        tab.Settle();
        state.PauseTiming();
        back();
        tab.Settle();
        state.ResumeTiming();
    }
    state.counters["records"] = kRecords;
}

void SwitchToErrorLog(benchmark::State& state)
{
    LogTab tab;
    TimeOneWay(
        state, tab, [&] { tab.Choose(JobLogView::kErrorLogId); },
        [&] { tab.Choose(JobLogView::kCompleteLogId); });
}
BENCHMARK(SwitchToErrorLog)->Unit(benchmark::kMillisecond);

void SwitchToCompleteLog(benchmark::State& state)
{
    LogTab tab;
    TimeOneWay(
        state, tab, [&] { tab.Choose(JobLogView::kCompleteLogId); },
        [&] { tab.Choose(JobLogView::kErrorLogId); });
}
BENCHMARK(SwitchToCompleteLog)->Unit(benchmark::kMillisecond);

// The box learns the folders when pressed.
void PressFolderBox(LogTab& tab)
{
    wxCommandEvent press(wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK, 0);
    tab.view->GetFolderBox()->GetEventHandler()->ProcessEvent(press);
}

void FilterOneHotFolder(benchmark::State& state)
{
    LogTab tab;
    PressFolderBox(tab);
    TimeOneWay(
        state, tab, [&] { tab.ChooseFolder(1); }, [&] { tab.ChooseFolder(0); });
}
BENCHMARK(FilterOneHotFolder)->Unit(benchmark::kMillisecond);

void FilterAllHotFolders(benchmark::State& state)
{
    LogTab tab;
    PressFolderBox(tab);
    TimeOneWay(
        state, tab, [&] { tab.ChooseFolder(0); }, [&] { tab.ChooseFolder(1); });
}
BENCHMARK(FilterAllHotFolders)->Unit(benchmark::kMillisecond);

// The model's read of the journal is the polling thread's and not timed; the
// view's update and the paint that follows are.
void AppendHundredRecords(benchmark::State& state)
{
    LogTab tab;
    tab.ResetCounts();
    for (auto _ : state)
    {
        state.PauseTiming();
        AppendLines(tab.journal, tab.next, kAppended);
        tab.next += kAppended;
        tab.model->Parse();
        state.ResumeTiming();
        tab.Update();
        tab.Settle();
    }
    // New rows below the visible page: nothing to repaint but the scrollbar.
    state.counters["rows_at_end"] = tab.view->GetLogList()->GetItemCount();
    state.counters["paints_per_op"] = benchmark::Counter(tab.paints, benchmark::Counter::kAvgIterations);
    state.counters["repainted_px_per_op"] =
        benchmark::Counter(tab.repaintedHeight, benchmark::Counter::kAvgIterations);
}
BENCHMARK(AppendHundredRecords)->Unit(benchmark::kMillisecond);

// Small blocks and the large ones the allocator maps by themselves.
std::size_t HeapInUse()
{
    const struct mallinfo2 info = mallinfo2();
    return info.uordblks + info.hblkhd;
}

// Heap held per listed row: the view's row copy and the list's cells.
void HeapPerListedRow(benchmark::State& state)
{
    LogTab tab;
    for (auto _ : state)
    {
        tab.Choose(JobLogView::kErrorLogId);
        tab.Settle();
        const long errorRows = tab.view->GetLogList()->GetItemCount();
        const std::size_t before = HeapInUse();
        tab.Choose(JobLogView::kCompleteLogId);
        tab.Settle();
        const std::size_t after = HeapInUse();
        const long rows = tab.view->GetLogList()->GetItemCount();
        state.counters["rows"] = rows;
        state.counters["bytes_per_row"] = double(after - before) / double(rows - errorRows);
    }
}
BENCHMARK(HeapPerListedRow)->Iterations(1)->Unit(benchmark::kMillisecond);

} // namespace
