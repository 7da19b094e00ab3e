// What the rows window and the header paint, checked at known pixels.
#include "ListTestSupport.h"

#include "components/Utility/ProfilesKelvoListCellPainter.h"
#include "platform/ui/DrawTextTruncate.h"

#include "GuiTest.h"
#include "PixelCompare.h"

#include <wx/imaglist.h>

#include <dlfcn.h>
#include <sstream>
#include <string>

using namespace listtest;

namespace
{
const wxString kBlock = wxString::FromUTF8("\xE2\x96\x88\xE2\x96\x88\xE2\x96\x88"); // three full blocks
const wxColour kRed(220, 0, 0);

using ListPaint = ListFixture;

// The pixels along a line as letters: l for the rule colour, w for white, ? else.
std::string Strip(const wxImage& image, wxPoint at, const wxPoint& step, int length)
{
    std::string letters;
    for (; length-- > 0; at += step)
        letters += PixelAt(image, at.x, at.y) == ListTheme().lineColour ? 'l'
                   : PixelAt(image, at.x, at.y) == *wxWHITE             ? 'w'
                                                                        : '?';
    return letters;
}

TEST_F(ListPaint, RulesSeparateRowsAndColumnsAndCloseTheLastItem)
{
    auto* list = MakeRows(wxLC_HRULES | wxLC_VRULES, {100, 80, 60}, 3, wxS(" "));
    const int lh = list->GetMainWindow()->GetLineHeight();
    const wxImage image = RenderRows(list);
    // Across the middle of each row: the rules stand two pixels left of each column's edge.
    std::string across(300, 'w');
    for (int edge : {100, 180, 240})
        across[edge - 2] = 'l';
    for (int row = 0; row < 3; ++row)
        EXPECT_EQ(Strip(image, {0, row * lh + lh / 2}, {1, 0}, 300), across) << "row " << row;
    // Down a column and down a rule: no line above the first row, one under each row,
    // and the vertical rule from the top to the line under the last row.
    std::string down(4 * lh + 1, 'w');
    for (int row = 1; row <= 3; ++row)
        down[row * lh] = 'l';
    EXPECT_EQ(Strip(image, {50, 0}, {0, 1}, 4 * lh + 1), down);
    EXPECT_EQ(Strip(image, {98, 0}, {0, 1}, 3 * lh + 3), std::string(3 * lh + 1, 'l') + "ww");
    EXPECT_EQ(PixelAt(image, image.GetWidth() - 1, 3 * lh), ListTheme().lineColour)
        << "across the whole width";

    // Scrolled: no line above the first visible row, none under a row that is not the last.
    m_frame->Destroy();
    list = MakeRows(wxLC_HRULES, {100}, 200);
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    rows->ScrollToTop(10);
    const wxImage scrolled = RenderRows(list);
    const long shown = rows->GetLastVisibleItem() - 10;
    EXPECT_EQ(Strip(scrolled, {150, 0}, {0, lh}, static_cast<int>(shown) + 1), "w" + std::string(shown, 'l'));
    const int underLast = static_cast<int>((shown + 1) * lh);
    if (underLast < scrolled.GetHeight())
        EXPECT_EQ(PixelAt(scrolled, 150, underLast), *wxWHITE);
}

TEST_F(ListPaint, RowFillsAndTextFollowAlternationSelectionAndFocus)
{
    auto* list = MakeRows(0, {100, 80}, 4, kBlock);
    const wxColour alternate(200, 230, 200);
    list->SetAlternateRowColour(alternate);
    list->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    const int lh = list->GetMainWindow()->GetLineHeight();
    const auto fill = [&](const wxImage& image, int row) { return PixelAt(image, 150, row * lh + lh / 2); };

    wxFocusEvent focus(wxEVT_SET_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    wxImage image = RenderRows(list);
    EXPECT_EQ(fill(image, 0), *wxWHITE);
    EXPECT_EQ(fill(image, 1), ListTheme().selectionColour);
    EXPECT_EQ(fill(image, 2), *wxWHITE);
    EXPECT_EQ(fill(image, 3), alternate);
    EXPECT_EQ(PixelAt(image, 300, 3 * lh + lh / 2), *wxWHITE) << "only under the columns";
    const wxRect first(0, 0, 100, lh);
    const wxRect second(0, lh, 100, lh);
    EXPECT_GT(CountPixels(image, first, ListTheme().textColour), 10);
    EXPECT_EQ(CountPixels(image, first, ListTheme().selectedTextColour), 0);
    EXPECT_GT(CountPixels(image, second, ListTheme().selectedTextColour), 10);
    EXPECT_EQ(CountPixels(image, second, ListTheme().textColour), 0);
    focus.SetEventType(wxEVT_KILL_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    EXPECT_EQ(fill(RenderRows(list), 1), ListTheme().inactiveSelectionColour);
}

TEST_F(ListPaint, StatusMarksTakeTheItemColourWhileTheTextKeepsTheTheme)
{
    auto* list = MakeRows(0, {120, 80}, 2, kBlock);
    list->SetItem(0, 0, kBlock, kCellImageStatusCircle);
    list->SetItem(1, 0, kBlock, kCellImageStatusSquare);
    list->SetItemTextColour(0, kRed);
    list->SetItemTextColour(1, kRed);
    const int lh = list->GetMainWindow()->GetLineHeight();
    const wxImage image = RenderRows(list);

    EXPECT_EQ(PixelAt(image, 1 + 12, 12), kRed) << "circle centre";
    EXPECT_EQ(PixelAt(image, 1 + 12 + 6, 12), kRed) << "inside the radius of 9";
    EXPECT_EQ(PixelAt(image, 1 + 12, 12 + 11), *wxWHITE) << "outside the radius";
    EXPECT_EQ(PixelAt(image, 1 + 3 + 8, lh + 4 + 8), kRed) << "square centre";
    EXPECT_LT(PixelAt(image, 1 + 3, lh + 4 + 8).Red(), 80) << "square outlined in black";
    for (int row = 0; row < 2; ++row)
    {
        const wxRect text(1 + 24, row * lh, 90, lh);
        EXPECT_GT(CountPixels(image, text, ListTheme().textColour), 10) << "row " << row;
        EXPECT_EQ(CountPixels(image, text, kRed), 0) << "row " << row;
    }
    wxListItem info;
    info.SetId(0);
    info.SetMask(wxLIST_MASK_TEXT);
    ASSERT_TRUE(list->GetItem(info));
    EXPECT_EQ(info.GetTextColour(), ListTheme().textColour) << "reported as drawn";
}

// A progress cell fills its frame in proportion and shows no text.
TEST_F(ListPaint, ProgressFillsTheFrameInProportionAndShowsNoText)
{
    auto* list = MakeList(wxLC_REPORT);
    list->InsertColumn(0, wxS("Done"), kColumnFormatProgress, 108);
    list->InsertColumn(1, wxS("Name"), wxLIST_FORMAT_LEFT, 100);
    list->InsertItem(0, wxString());
    list->SetItem(0, 1, wxS("x"));
    const int lh = list->GetMainWindow()->GetLineHeight();
    // "text=filled;", of the 96 inner pixels of the 108-pixel column.
    std::istringstream cases("0=0;50=48;100=96;not a number=0;25.5=24;250=96;-40=0;");
    for (std::string text, filled; std::getline(cases, text, '=') && std::getline(cases, filled, ';');)
    {
        list->SetItem(0, 0, text);
        const wxImage image = RenderRows(list);
        EXPECT_EQ(CountPixels(image, wxRect(0, lh / 2, 108, 1), *wxBLUE), std::stoi(filled)) << text;
        EXPECT_EQ(PixelAt(image, 3, lh / 2) == *wxBLUE, filled != "0")
            << text << ": the bar starts inside the frame";
        EXPECT_EQ(CountPixels(image, wxRect(0, 0, 108, lh), ListTheme().textColour), 0) << text;
    }
}

// A cell shortens its text exactly when the text is wider than the column less
// eight pixels, and then shows what DrawTextTruncate draws at the cell's place.
TEST_F(ListPaint, TextIsShortenedExactlyWhenWiderThanTheColumnLessEight)
{
    const wxString text = wxS("Transferring to server");
    auto* list = MakeList(wxLC_REPORT);
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    const int textWidth = rows->GetTextExtent(text).GetWidth();
    list->InsertColumn(0, wxS("Status"), wxLIST_FORMAT_LEFT, textWidth);
    list->InsertItem(0, text);
    const auto reference = [&](const wxSize& size, bool shortened)
    {
        return pixels::Render(size, *wxWHITE,
                              [&](wxDC& dc)
                              {
                                  dc.SetFont(rows->GetFont());
                                  dc.SetTextForeground(ListTheme().textColour);
                                  const wxSize extent = dc.GetTextExtent(text);
                                  const int y = rows->GetLineHeight() / 2 - (extent.GetHeight() + 1) / 2;
                                  if (shortened)
                                      DrawTextTruncate(dc, text, wxRect(1, y, textWidth - 1, extent.y), 0,
                                                       false);
                                  else
                                      dc.DrawText(text, 1, y);
                              });
    };
    for (int spare : {0, -1})
    {
        list->SetColumnWidth(0, textWidth + 8 + spare);
        const wxRect cell(0, 0, textWidth + 8 + spare, rows->GetLineHeight());
        const wxImage shown = RenderRows(list).GetSubImage(cell);
        EXPECT_EQ(pixels::FirstDifference(shown, reference(cell.GetSize(), spare < 0)), "")
            << "spare " << spare;
        EXPECT_NE(pixels::FirstDifference(shown, reference(cell.GetSize(), spare >= 0)), "")
            << "spare " << spare;
    }
}

// ---------------------------------------------------------------- header

TEST_F(ListPaint, StyledHeaderIsFlatWithBordersLabelsAndSortMarks)
{
    headerStyle style;
    style.backgroundColour = *wxWHITE;
    style.bitmap = wxBitmap(wxImage(1, 23));
    style.textColour = kRed;
    auto* list = MakeList(wxLC_REPORT, &style);
    const wxColour green(0, 160, 0);
    wxImageList marks(16, 16, true, 1);
    wxImage solid(16, 16);
    solid.SetRGB(wxRect(0, 0, 16, 16), green.Red(), green.Green(), green.Blue());
    marks.Add(wxBitmap(solid));
    list->SetImageList(&marks, kHeaderImageList);
    list->InsertColumn(0, kBlock, wxLIST_FORMAT_LEFT, 100);
    list->InsertColumn(1, kBlock, wxLIST_FORMAT_LEFT, 120);
    wxListItem mark;
    mark.SetImage(0);
    list->SetColumn(1, mark);

    ASSERT_EQ(list->GetHeaderWindow()->GetSize().GetHeight(), 25);
    const wxImage image = RenderHeader(list);
    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    EXPECT_EQ(PixelAt(image, 100 - 1, 12), border) << "right edge less the strip's width";
    EXPECT_EQ(PixelAt(image, 220 - 1, 12), border);
    EXPECT_EQ(PixelAt(image, 400, 0), border) << "outline";
    EXPECT_EQ(PixelAt(image, 400, 12), ListTheme().controlColour);
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 99, 25), kRed), 10) << "label in the record's text colour";
    EXPECT_EQ(CountPixels(image, wxRect(0, 0, 99, 25), green), 0);
    EXPECT_EQ(CountPixels(image, wxRect(100, 0, 119, 25), green), 16 * 16) << "the sort mark";
    list->SetImageList(nullptr, kHeaderImageList);
}

TEST_F(ListPaint, PlainHeaderIsAsHighAsItsTextWithRoom)
{
    ProfilesKelvoListHeaderWindow* header = MakeList(wxLC_REPORT)->GetHeaderWindow();
    int height = 0;
    int descent = 0;
    header->GetTextExtent(wxS("Hg"), nullptr, &height, &descent);
    EXPECT_EQ(header->GetSize().GetHeight(), height + descent + 6);
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

TEST_F(ListPaint, HeaderIsRepaintedForANewTitleOrWidth)
{
    auto* list = MakeRows(0, {100, 100}, 1);
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
}
} // namespace
