#include "platform/themer/Themer.h"
#include "platform/ui/NOwnerDrawNotebook.h"

#include <benchmark/benchmark.h>
#include <wx/app.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/image.h>
#include <wx/init.h>
#include <wx/panel.h>

namespace
{
void ThemeLookup(benchmark::State& state, const char* name)
{
    for (auto _ : state)
    {
        const Theme& theme = Themer::GetThemeService()->GetTheme(name);
        benchmark::DoNotOptimize(&theme);
    }
}
BENCHMARK_CAPTURE(ThemeLookup, first_name, "Default");
BENCHMARK_CAPTURE(ThemeLookup, last_name, "Error");
BENCHMARK_CAPTURE(ThemeLookup, unknown_name, "NoSuchTheme");

void TabStripPaint(benchmark::State& state)
{
    auto* frame = new wxFrame(nullptr, wxID_ANY, "bench", wxDefaultPosition, wxSize(800, 600));
    auto* book = new CNOwnerDrawNotebook;
    book->Create(frame, wxID_ANY, wxDefaultPosition, wxSize(800, 600));
    book->AddPage(new wxPanel(book), "Status", false, 1, nullptr, -1, false);
    book->AddPage(new wxPanel(book), "Log", false, 2, nullptr, -1, false);
    wxBitmap bitmap(800, book->GetTabStripHeight());
    wxMemoryDC dc(bitmap);
    for (auto _ : state)
        book->RenderTabStrip(dc);
    dc.SelectObject(wxNullBitmap);
    frame->Destroy();
}
BENCHMARK(TabStripPaint);
} // namespace

int main(int argc, char** argv)
{
    benchmark::Initialize(&argc, argv);
    wxApp::SetInstance(new wxApp);
    if (!wxEntryStart(argc, argv))
        return 2; // needs a display
    wxInitAllImageHandlers();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    wxEntryCleanup();
    return 0;
}
