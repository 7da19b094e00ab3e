// What the rows window and the header paint, checked at known pixels.
#include "ListTestSupport.h"

#include "components/Utility/ProfilesKelvoListCellPainter.h"

#include "GuiTest.h"

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
    auto* list = MakeRows(wxLC_HRULES | wxLC_VRULES, {100, 80}, 3, wxS(" "));
    const int lh = list->GetMainWindow()->GetLineHeight();
    const wxImage image = RenderRows(list);
    // The vertical rules stand two pixels left of each column's edge, from the top to the
    // line under the last row; a line under each row and none above the first.
    std::string across(200, 'w');
    across[98] = across[178] = 'l';
    EXPECT_EQ(Strip(image, {0, lh / 2}, {1, 0}, 200), across);
    EXPECT_EQ(Strip(image, {50, 0}, {0, lh}, 5), "wlllw");
    EXPECT_EQ(Strip(image, {98, 3 * lh}, {0, 1}, 3), "lww");
    EXPECT_EQ(PixelAt(image, image.GetWidth() - 1, 3 * lh), ListTheme().lineColour)
        << "across the whole width";

    // Scrolled: no line above the first visible row.
    m_frame->Destroy();
    list = MakeRows(wxLC_HRULES, {100}, 200);
    list->GetMainWindow()->ScrollToTop(10);
    EXPECT_EQ(Strip(RenderRows(list), {150, 0}, {0, lh}, 3), "wll");
}

TEST_F(ListPaint, RowFillsAndTextFollowAlternationSelectionAndFocus)
{
    auto* list = MakeRows(0, {100, 80}, 4, kBlock);
    const wxColour alternate(200, 230, 200);
    list->SetAlternateRowColour(alternate);
    list->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    const int lh = list->GetMainWindow()->GetLineHeight();
    wxFocusEvent focus(wxEVT_SET_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    const wxImage image = RenderRows(list);
    const wxColour fills[] = {*wxWHITE, ListTheme().selectionColour, *wxWHITE, alternate};
    for (int row = 0; row < 4; ++row)
        EXPECT_EQ(PixelAt(image, 150, row * lh + lh / 2), fills[row]) << "row " << row;
    EXPECT_EQ(PixelAt(image, 300, 3 * lh + lh / 2), *wxWHITE) << "only under the columns";
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 100, lh), ListTheme().textColour), 10);
    EXPECT_GT(CountPixels(image, wxRect(0, lh, 100, lh), ListTheme().selectedTextColour), 10);
    EXPECT_EQ(CountPixels(image, wxRect(0, lh, 100, lh), ListTheme().textColour), 0);
    focus.SetEventType(wxEVT_KILL_FOCUS);
    list->GetMainWindow()->GetEventHandler()->ProcessEvent(focus);
    EXPECT_EQ(PixelAt(RenderRows(list), 150, lh + lh / 2), ListTheme().inactiveSelectionColour);
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
    EXPECT_EQ(PixelAt(image, 1 + 12 + 6, 12), kRed) << "circle, inside the radius of 9";
    EXPECT_EQ(PixelAt(image, 1 + 12, 12 + 11), *wxWHITE) << "outside the radius";
    EXPECT_EQ(PixelAt(image, 1 + 3 + 8, lh + 4 + 8), kRed) << "square centre";
    EXPECT_GT(CountPixels(image, wxRect(25, 0, 90, 2 * lh), ListTheme().textColour), 20);
    EXPECT_EQ(CountPixels(image, wxRect(25, 0, 90, 2 * lh), kRed), 0);
}

// A progress cell fills its frame in proportion and shows no text.
TEST_F(ListPaint, ProgressFillsTheFrameInProportionAndShowsNoText)
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
        EXPECT_EQ(CountPixels(image, wxRect(0, 0, 108, lh), ListTheme().textColour), 0) << text;
    }
}

TEST_F(ListPaint, StyledHeaderShowsBordersLabelsAndSortMarks)
{
    headerStyle style;
    style.backgroundColour = *wxWHITE;
    style.bitmap = wxBitmap(wxImage(1, 23));
    style.textColour = kRed;
    auto* list = MakeList(wxLC_REPORT, &style);
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
    EXPECT_EQ(PixelAt(image, 220 - 1, 12), border);
    EXPECT_EQ(PixelAt(image, 400, 12), ListTheme().controlColour);
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 30, 25), kRed), 10) << "label at the left, in the text colour";
    EXPECT_EQ(CountPixels(image, wxRect(100, 0, 119, 25), wxColour(0, 160, 0)), 16 * 16) << "the sort mark";
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
