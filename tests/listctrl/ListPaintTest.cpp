// What the rows window and the header paint, checked at known pixels; the virtual job table; texts
// drawn from kept layouts and shortened texts, which must look exactly as wxDC::DrawText draws them.
#include "ListTestSupport.h"

#include "components/Utility/CustomListCtrl.h"
#include "components/Utility/ProfilesKelvoListCellPainter.h"
#include "platform/ui/DrawTextTruncate.h"
#include "platform/ui/TextLayoutCache.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <wx/imaglist.h>

#include <dlfcn.h>
#include <functional>
#include <sstream>
#include <string>

using namespace listtest;

namespace
{
const wxString kBlock = wxString::FromUTF8("\xE2\x96\x88\xE2\x96\x88\xE2\x96\x88"); // three full blocks
const wxColour kRed(220, 0, 0);

using ListPaint = ListFixture;

// The vertical rules stand two pixels left of each column's edge, from the top to the line under the
// last row; a line under each row and none above the first. Each kind of rule alone, or both.
TEST_F(ListPaint, RulesSeparateRowsAndColumnsAndCloseTheLastItem)
{
    for (const long style : {wxLC_HRULES | wxLC_VRULES, wxLC_HRULES, wxLC_VRULES})
    {
        auto* list = MakeRows(style, {100, 80}, 3, wxS(" "));
        const int lh = list->GetMainWindow()->GetLineHeight();
        const wxImage image = RenderRows(list);
        const wxColour line = ListTheme().lineColour;
        const bool across = style & wxLC_HRULES, down = style & wxLC_VRULES;
        EXPECT_EQ(CountPixels(image, wxRect(0, lh / 2, 200, 1), line), down ? 2 : 0) << style;
        EXPECT_EQ(PixelAt(image, 98, lh / 2) == line, down) << style;
        EXPECT_EQ(CountPixels(image, wxRect(50, 0, 1, 4 * lh + 1), line), across ? 3 : 0) << style;
        EXPECT_EQ(PixelAt(image, 50, 3 * lh) == line, across) << "under the last row";
        m_frame->Destroy();
        m_frame = nullptr;
    }
}

// Status marks take the row's text colour while the text keeps the theme's.
TEST_F(ListPaint, RowFillsTextAndMarksFollowAlternationSelectionFocusAndTheItemColour)
{
    auto* list = MakeRows(0, {120, 80}, 4, kBlock);
    list->SetAlternateRowColour(wxColour(200, 230, 200));
    list->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    list->SetItem(0, 0, kBlock, kCellImageStatusCircle);
    list->SetItem(2, 0, kBlock, kCellImageStatusSquare);
    list->SetItemTextColour(0, kRed);
    list->SetItemTextColour(2, kRed);
    const int lh = list->GetMainWindow()->GetLineHeight();
    wxFocusEvent focus(wxEVT_SET_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    const wxImage image = RenderRows(list);
    const wxColour fills[] = {*wxWHITE, ListTheme().selectionColour, *wxWHITE, wxColour(200, 230, 200)};
    for (int row = 0; row < 4; ++row)
        EXPECT_EQ(PixelAt(image, 150, row * lh + lh / 2), fills[row]) << "row " << row;
    EXPECT_GT(CountPixels(image, wxRect(25, 0, 90, lh), ListTheme().textColour), 10);
    EXPECT_GT(CountPixels(image, wxRect(0, lh, 120, lh), ListTheme().selectedTextColour), 10);
    EXPECT_EQ(PixelAt(image, 1 + 12 + 6, 12), kRed) << "circle, inside the radius of 9";
    EXPECT_EQ(PixelAt(image, 1 + 3 + 8, 2 * lh + 4 + 8), kRed) << "square centre";
    EXPECT_EQ(CountPixels(image, wxRect(25, 0, 90, 3 * lh), kRed), 0) << "the text keeps the theme";
    focus.SetEventType(wxEVT_KILL_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    EXPECT_EQ(PixelAt(RenderRows(list), 150, lh + lh / 2), ListTheme().inactiveSelectionColour);
}

// A progress cell fills its frame in proportion.
TEST_F(ListPaint, ProgressFillsTheFrameInProportion)
{
    auto* list = MakeList(wxLC_REPORT);
    list->InsertColumn(0, wxS("Done"), kColumnFormatProgress, 108);
    list->InsertItem(0, wxString());
    const int lh = list->GetMainWindow()->GetLineHeight();
    // "text=filled;", of the 96 inner pixels of the 108-pixel column.
    std::istringstream cases("0=0;50=48;100=96;not a number=0;250=96;-40=0;");
    for (std::string text, filled; std::getline(cases, text, '=') && std::getline(cases, filled, ';');)
    {
        list->SetItem(0, 0, text);
        const wxImage image = RenderRows(list);
        EXPECT_EQ(CountPixels(image, wxRect(0, lh / 2, 108, 1), *wxBLUE), std::stoi(filled)) << text;
    }
}

TEST_F(ListPaint, StyledHeaderShowsBordersLabelsAndSortMarks)
{
    headerStyle style;
    style.bitmap = wxBitmap(wxImage(1, 23));
    style.textColour = kRed;
    // Made in two steps, the list keeps its own copy of the header record.
    m_frame = new wxFrame(nullptr, wxID_ANY, wxS("header"));
    auto* list = new CustomListCtrl();
    ASSERT_TRUE(list->Create(&style, m_frame, wxID_ANY, wxDefaultPosition, wxSize(600, 400), wxLC_REPORT));
    style.textColour = *wxBLUE;
    wxImageList marks(16, 16, true, 1);
    wxImage solid(16, 16);
    solid.SetRGB(wxRect(0, 0, 16, 16), 0, 160, 0);
    marks.Add(wxBitmap(solid));
    list->SetImageList(&marks, kHeaderImageList);
    list->InsertColumn(0, kBlock, wxLIST_FORMAT_LEFT, 100);
    list->InsertColumn(1, kBlock, wxLIST_FORMAT_LEFT, 120);
    wxListItem mark;
    mark.SetImage(0);
    list->SetColumn(1, mark);

    const wxImage image = RenderRows(list, true);
    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    EXPECT_EQ(PixelAt(image, 100 - 1, 12), border) << "right edge less the strip's width";
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 30, 25), kRed), 10) << "label at the left, in the text colour";
    EXPECT_EQ(CountPixels(image, wxRect(100, 0, 119, 25), wxColour(0, 160, 0)), 16 * 16) << "the sort mark";
    EXPECT_TRUE(list->GetColumn(1, mark) && mark.GetImage() == 0 && mark.GetText() == kBlock)
        << "as the view reads it";
    list->SetImageList(nullptr, kHeaderImageList);
}

// Whether the window asked the toolkit to repaint it since the last call; the request is taken.
bool TakeRepaintRequest(wxWindow* window)
{
    // Looked up at run time, so that the test needs no GTK headers.
    static const auto windowOf =
        reinterpret_cast<void* (*)(void*)>(dlsym(RTLD_DEFAULT, "gtk_widget_get_window"));
    static const auto area =
        reinterpret_cast<void* (*)(void*)>(dlsym(RTLD_DEFAULT, "gdk_window_get_update_area"));
    static const auto release =
        reinterpret_cast<void (*)(void*)>(dlsym(RTLD_DEFAULT, "cairo_region_destroy"));
    void* requested = area(windowOf(window->GetHandle()));
    if (requested)
        release(requested);
    return requested != nullptr;
}

TEST_F(ListPaint, HeaderIsRepaintedForANewTitleOrWidthAndRowsWhenManyLoseTheirSelection)
{
    auto* list = MakeRows(0, {100, 100}, 300);
    ASSERT_TRUE(guitest::PumpUntil([list] { return !list->GetMainWindow()->IsDirty(); }));
    ProfilesKelvoListHeaderWindow* header = list->GetHeaderWindow();
    TakeRepaintRequest(header);
    ASSERT_FALSE(TakeRepaintRequest(header));
    wxListItem title;
    title.SetText(kBlock);
    list->SetColumn(0, title);
    EXPECT_TRUE(TakeRepaintRequest(header)) << "title";
    list->SetColumnWidth(0, 160);
    EXPECT_TRUE(TakeRepaintRequest(header)) << "width";
    // A click on one row of all selected takes the selection from the others in one step.
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    rows->SetAllSelected(true);
    ASSERT_TRUE(guitest::PumpUntil([rows] { return !TakeRepaintRequest(rows); }));
    wxMouseEvent click(wxEVT_LEFT_DOWN);
    click.SetPosition(wxPoint(50, rows->GetLineHeight() / 2));
    click.SetLeftDown(true);
    rows->ProcessWindowEvent(click);
    EXPECT_EQ(list->GetSelectedItemCount(), 1);
    EXPECT_TRUE(TakeRepaintRequest(rows)) << "the rows that lost their selection";
}
// ---------------------------------------------------------------- job table

TEST_F(ListPaint, JobTableColumnsShowTheRowNumberAndTheirFieldsAndOnlyInProgressRowsTheStatusImage)
{
    auto* table =
        MakeList<CustomListCtrl>(wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES);
    for (int column = 0; column < 8; ++column)
        table->InsertColumn(column, wxS("C"), wxLIST_FORMAT_LEFT, 70);
    // Display rows by position: key, file, folder, server, size, format, time, status.
    const auto Row = [](const wxString& file, const wxString& status) {
        return JobRecord{file,       file,       wxS("Folder A"), wxS("srv1"),
                         wxS("2KB"), wxS("PDF"), wxS("10:41"),    status};
    };
    table->SetItemCount(2);
    table->SetRecords({Row(wxS("first"), wxS("Saving...")), Row(wxS("second"), wxS("Waiting"))});
    wxString shown;
    for (long column = -1; column <= 8; ++column)
        shown += table->OnGetItemText(1, column) + "|";
    EXPECT_EQ(shown, "|2|second|PDF|Folder A|srv1|2KB|10:41|Waiting||");

    table->SetStatusImage(5);
    // "status=image;" in the status column; never in another.
    std::istringstream cases("Converting file type=5;Transferring to server=5;Saving...=5;saving...=-1;"
                             "Transferred Successfully=-1;");
    for (std::string status, image; std::getline(cases, status, '=') && std::getline(cases, image, ';');)
    {
        table->SetRecords({Row(wxS("job"), status)});
        EXPECT_EQ(table->OnGetItemImage(0, 7), std::stoi(image)) << status;
        EXPECT_EQ(table->OnGetItemImage(0, 6), -1) << status;
    }
    // A count ahead of the records gives empty rows and paints without touching missing records.
    table->SetItemCount(3);
    EXPECT_EQ(table->OnGetItemText(1, 7) + table->OnGetItemText(2, 0), wxString());
    EXPECT_EQ(table->OnGetItemImage(1, 7), -1);
    RenderRows(table);
}

// ---------------------------------------------------------------- text drawing

// `text` in `font` drawn once by `draw` and once by wxDC::DrawText: the first difference, or "".
std::string Compare(const wxFont& font, const wxString& text, const std::function<void(wxDC&)>& draw)
{
    const auto render = [&](const std::function<void(wxDC&)>& paint)
    {
        return pixels::Render(wxSize(320, 40), *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(font);
                                  dc.SetTextForeground(wxColour(0, 90, 200));
                                  paint(dc);
                              });
    };
    const wxImage expected = render([&](wxDC& dc) { dc.DrawText(text, 7, 9); });
    EXPECT_TRUE(pixels::AnyPixelDiffersIn(expected, 0, 320, *wxWHITE)) << "nothing drawn: " << text;
    return pixels::FirstDifference(render(draw), expected);
}

// Kept per font and text: an equal font in another object finds the layouts kept for the first. What it
// cannot draw alone (two lines) it leaves to DrawText. A cell too narrow for its text shows the longest
// start that fits, with an ellipsis.
TEST(ListTextLayout, DrawsWhatDrawTextDrawsAndShortensWithAnEllipsis)
{
    TextLayoutCache cache;
    const wxString texts[] = {wxS("Transferring to server"),
                              wxString::FromUTF8("M\xC3\xBCnchen \xE5\x8D\xB0 caf\xC3\xA9"),
                              wxS("two\nlines")};
    for (const wxFont& font : {*wxNORMAL_FONT, wxFont(*wxNORMAL_FONT), wxFont(wxFontInfo(15).Bold())})
        for (const wxString& text : texts)
            for (int round = 0; round < 2; ++round)
                EXPECT_EQ(Compare(font, text, [&](wxDC& dc) { cache.DrawText(dc, text, 7, 9); }), "") << text;
    EXPECT_EQ(cache.Size(), 2u);

    const wxString text = wxS("A rather long file name.pdf");
    wxBitmap probe(1, 1);
    wxMemoryDC dc(probe);
    dc.SetFont(*wxNORMAL_FONT);
    const wxString shown = TruncateTextToWidth(dc, text, 60, false);
    EXPECT_TRUE(shown.EndsWith(wxS("...")) && text.StartsWith(shown.Left(shown.length() - 3))) << shown;
    EXPECT_LE(dc.GetTextExtent(shown).GetWidth(), 60);
    const auto draw = [&](wxDC& on) { DrawTextTruncate(on, text, wxRect(7, 9, 60, 20), 0, false); };
    EXPECT_EQ(Compare(*wxNORMAL_FONT, shown, draw), "");
    EXPECT_EQ(TruncateTextToWidth(dc, text, 1000, false) + "|" + TruncateTextToWidth(dc, text, 2, true),
              text + "|")
        << "an image cell shows no lone ellipsis";
}
} // namespace
