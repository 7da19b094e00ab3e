// Benchmarks of the themed list against wxListCtrl on identical data and
// window sizes. Run under a display: xvfb-run -a -s "-screen 0 1280x1024x24".
#include "components/Utility/profilescustomlistctrl.h"

#include <benchmark/benchmark.h>
#include <wx/app.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/listctrl.h>

#include <memory>

namespace
{
constexpr long kVirtualRows = 100000;
constexpr int kColumns = 8;
const wxSize kListSize(900, 1010); // 40 rows of the themed list below its header

wxString CellText(long item, long column)
{
    static const wxString statuses[] = {wxS("Transferring to server"), wxS("Saving..."),
                                        wxS("Transferred Successfully")};
    switch (column)
    {
    case 0:
        return wxString::Format(wxS("%ld"), item + 1);
    case 1:
        return wxString::Format(wxS("Quarterly report %ld final version"), item);
    case 7:
        return statuses[item % 3];
    default:
        return wxString::Format(wxS("cell %ld.%ld"), item, column);
    }
}

class OurVirtualList : public ProfilesKelvoProfilesListCtrl
{
public:
    using ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl;
    wxString OnGetItemText(long item, long column) const override { return CellText(item, column); }
};

class WxVirtualList : public wxListCtrl
{
public:
    using wxListCtrl::wxListCtrl;
    wxString OnGetItemText(long item, long column) const override { return CellText(item, column); }
};

template <typename List> void AddColumns(List* list, int count)
{
    for (int column = 0; column < count; ++column)
        list->InsertColumn(column, wxString::Format(wxS("Column %d"), column), wxLIST_FORMAT_LEFT,
                           column == 1 ? 160 : 100);
}

// One list of either kind in its own shown frame.
struct OurSide
{
    using List = ProfilesKelvoProfilesListCtrl;
    template <typename Concrete> static Concrete* Make(wxFrame* frame, long style)
    {
        headerStyle header;
        header.textColour = *wxBLACK;
        return new Concrete(&header, frame, wxID_ANY, wxDefaultPosition, kListSize, style);
    }
    static wxWindow* Rows(List* list) { return list->GetMainWindow(); }
    using Virtual = OurVirtualList;
};

struct WxSide
{
    using List = wxListCtrl;
    template <typename Concrete> static Concrete* Make(wxFrame* frame, long style)
    {
        return new Concrete(frame, wxID_ANY, wxDefaultPosition, kListSize, style);
    }
    static wxWindow* Rows(List* list)
    {
        // The rows are the child that is not the header.
        for (wxWindow* child : list->GetChildren())
        {
            if (child->GetName() != wxS("wxlistctrlcolumntitles"))
                return child;
        }
        return list;
    }
    using Virtual = WxVirtualList;
};

template <typename Side> struct Bench
{
    Bench(long style, bool isVirtual)
    {
        frame = new wxFrame(nullptr, wxID_ANY, wxS("bench"), wxPoint(0, 0), kListSize);
        frame->SetClientSize(kListSize);
        if (isVirtual)
            list = Side::template Make<typename Side::Virtual>(frame, style);
        else
            list = Side::template Make<typename Side::List>(frame, style);
        list->SetSize(kListSize);
        AddColumns(list, kColumns);
        frame->Show();
        rows = Side::Rows(list);
        // Counts real paints, so a figure can never come from a window that did not draw.
        rows->Bind(wxEVT_PAINT,
                   [counter = paintCounter](wxPaintEvent& event)
                   {
                       ++*counter;
                       event.Skip();
                   });
        // The window must be mapped before Update() paints synchronously.
        for (int round = 0; round < 500 && *paintCounter == 0; ++round)
        {
            wxTheApp->Yield(true);
            wxMilliSleep(10);
        }
        Settle();
    }
    ~Bench()
    {
        frame->Destroy();
        wxTheApp->ProcessIdle();
    }

    long Paints() const { return *paintCounter; }
    void ResetPaints() { *paintCounter = 0; }

    // Layout happens when idle in both lists; then paint what is invalid, now.
    void Settle()
    {
        rows->OnInternalIdle();
        list->OnInternalIdle();
        rows->Update();
        list->Update();
    }

    void Repaint()
    {
        rows->Refresh();
        rows->Update();
    }

    wxFrame* frame = nullptr;
    typename Side::List* list = nullptr;
    wxWindow* rows = nullptr;
    std::shared_ptr<long> paintCounter = std::make_shared<long>(0);
};

template <typename Side> void VirtualSetItemCountAndRepaint(benchmark::State& state)
{
    Bench<Side> bench(wxLC_REPORT | wxLC_VIRTUAL | wxLC_HRULES | wxLC_VRULES, true);
    long count = kVirtualRows;
    bench.ResetPaints();
    for (auto _ : state)
    {
        // Alternate by one row so that every call really changes the list.
        count = count == kVirtualRows ? kVirtualRows - 1 : kVirtualRows;
        bench.list->SetItemCount(count);
        // Both lists lay out when idle; only then is there anything to paint.
        wxTheApp->ProcessIdle();
        bench.Repaint();
    }
    state.counters["rows_shown"] = bench.list->GetCountPerPage();
    state.counters["paints_per_op"] = benchmark::Counter(bench.Paints(), benchmark::Counter::kAvgIterations);
}

template <typename Side> void VirtualRepaintPage(benchmark::State& state)
{
    Bench<Side> bench(wxLC_REPORT | wxLC_VIRTUAL | wxLC_HRULES | wxLC_VRULES, true);
    bench.list->SetItemCount(kVirtualRows);
    bench.Settle();
    bench.ResetPaints();
    for (auto _ : state)
        bench.Repaint();
    state.counters["rows_shown"] = bench.list->GetCountPerPage();
    state.counters["paints_per_op"] = benchmark::Counter(bench.Paints(), benchmark::Counter::kAvgIterations);
}

// The same window without rows: what the toolkit and the X server take for
// any repaint of it, the floor under the figures above.
template <typename Side> void EmptyRepaintPage(benchmark::State& state)
{
    Bench<Side> bench(wxLC_REPORT | wxLC_VIRTUAL | wxLC_HRULES | wxLC_VRULES, true);
    bench.list->SetItemCount(0);
    bench.Settle();
    bench.ResetPaints();
    for (auto _ : state)
        bench.Repaint();
    state.counters["paints_per_op"] = benchmark::Counter(bench.Paints(), benchmark::Counter::kAvgIterations);
}

// Our paint code alone, into an in-memory bitmap: what a repaint costs the
// program, without the X server's share.
void RenderPageIntoBitmap(benchmark::State& state)
{
    Bench<OurSide> bench(wxLC_REPORT | wxLC_VIRTUAL | wxLC_HRULES | wxLC_VRULES, true);
    bench.list->SetItemCount(kVirtualRows);
    bench.Settle();
    auto* rows = bench.list->GetMainWindow();
    const wxSize size = rows->GetClientSize();
    wxBitmap bitmap(size);
    wxMemoryDC dc(bitmap);
    for (auto _ : state)
        rows->Render(dc, wxRect(size));
    state.counters["rows_shown"] = bench.list->GetCountPerPage();
}
BENCHMARK(RenderPageIntoBitmap)->Unit(benchmark::kMillisecond);

template <typename Side> void VirtualScrollOnePage(benchmark::State& state)
{
    Bench<Side> bench(wxLC_REPORT | wxLC_VIRTUAL | wxLC_HRULES | wxLC_VRULES, true);
    bench.list->SetItemCount(kVirtualRows);
    bench.Settle();
    const long page = bench.list->GetCountPerPage();
    bench.ResetPaints();
    long scrolled = 0;
    for (auto _ : state)
    {
        // The row just below the page, made visible at the bottom: one page down.
        const long top = bench.list->GetTopItem();
        if (top + 3 * page >= kVirtualRows)
        {
            state.PauseTiming();
            bench.list->EnsureVisible(0);
            bench.rows->Update();
            state.ResumeTiming();
        }
        bench.list->EnsureVisible(bench.list->GetTopItem() + 2 * page - 1);
        bench.rows->Update();
        scrolled += bench.list->GetTopItem() - top;
    }
    state.counters["rows_per_op"] = benchmark::Counter(scrolled, benchmark::Counter::kAvgIterations);
    state.counters["paints_per_op"] = benchmark::Counter(bench.Paints(), benchmark::Counter::kAvgIterations);
}

template <typename Side> void InsertTenThousandRows(benchmark::State& state)
{
    Bench<Side> bench(wxLC_REPORT | wxLC_SINGLE_SEL | wxLC_HRULES | wxLC_VRULES, false);
    for (auto _ : state)
    {
        bench.list->DeleteAllItems();
        for (long item = 0; item < 10000; ++item)
        {
            bench.list->InsertItem(item, CellText(item, 0), -1);
            for (int column = 1; column < 6; ++column)
                bench.list->SetItem(item, column, CellText(item, column));
        }
        wxTheApp->ProcessIdle();
        bench.rows->Update();
    }
    state.counters["rows"] = bench.list->GetItemCount();
}

BENCHMARK_TEMPLATE(VirtualSetItemCountAndRepaint, OurSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(VirtualSetItemCountAndRepaint, WxSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(VirtualRepaintPage, OurSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(VirtualRepaintPage, WxSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(EmptyRepaintPage, OurSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(EmptyRepaintPage, WxSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(VirtualScrollOnePage, OurSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(VirtualScrollOnePage, WxSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(InsertTenThousandRows, OurSide)->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(InsertTenThousandRows, WxSide)->Unit(benchmark::kMillisecond);

} // namespace
