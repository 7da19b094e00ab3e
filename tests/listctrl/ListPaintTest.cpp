// What the rows window and the header paint, checked pixel by pixel.
#include "ListTestSupport.h"

#include "components/Utility/ProfilesKelvoListCellPainter.h"
#include "platform/ui/DrawTextTruncate.h"

#include <wx/imaglist.h>

using namespace listtest;

namespace
{
const wxString kBlock = wxString::FromUTF8("\xE2\x96\x88\xE2\x96\x88\xE2\x96\x88"); // three full blocks
const wxColour kRed(220, 0, 0);

class ListPaint : public ListFixture
{
protected:
    ProfilesKelvoProfilesListCtrl* MakeRows(long extraStyle, const std::vector<int>& widths, long items,
                                            const wxString& text = wxString())
    {
        auto* list = MakeList(wxLC_REPORT | extraStyle);
        for (size_t col = 0; col < widths.size(); ++col)
            list->InsertColumn(static_cast<long>(col), wxString::Format("C%zu", col), wxLIST_FORMAT_LEFT,
                               widths[col]);
        for (long item = 0; item < items; ++item)
            list->InsertItem(item, text);
        list->GetMainWindow()->LayoutIfNeeded();
        return list;
    }

    int LineHeight(ProfilesKelvoProfilesListCtrl* list) const
    {
        return list->GetMainWindow()->GetLineHeight();
    }
};

TEST_F(ListPaint, VerticalRulesStandTwoPixelsLeftOfEveryColumnEdge)
{
    auto* list = MakeRows(wxLC_VRULES, {100, 80, 60}, 3);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    const wxColour line = ListTheme().lineColour;
    for (int edge : {100, 180, 240})
    {
        for (int row = 0; row < 3; ++row)
        {
            const int y = row * lh + lh / 2;
            EXPECT_EQ(PixelAt(image, edge - 2, y), line) << "edge " << edge << " row " << row;
            EXPECT_EQ(PixelAt(image, edge - 1, y), *wxWHITE) << "edge " << edge << " row " << row;
            EXPECT_EQ(PixelAt(image, edge - 3, y), *wxWHITE) << "edge " << edge << " row " << row;
        }
        EXPECT_EQ(PixelAt(image, edge - 2, 0), line) << "rules reach the top of the first visible row";
        EXPECT_EQ(PixelAt(image, edge - 2, 3 * lh + 2), *wxWHITE) << "rules end with the last row";
    }
}

TEST_F(ListPaint, HorizontalRulesSeparateRowsAndCloseTheLastItem)
{
    auto* list = MakeRows(wxLC_HRULES, {100, 80}, 3);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    const wxColour line = ListTheme().lineColour;
    EXPECT_EQ(PixelAt(image, 50, 0), *wxWHITE) << "no line above the first visible row";
    for (int y : {lh, 2 * lh, 3 * lh})
    {
        EXPECT_EQ(PixelAt(image, 50, y), line) << "y " << y;
        EXPECT_EQ(PixelAt(image, image.GetWidth() - 1, y), line) << "across the whole width, y " << y;
    }
    EXPECT_EQ(PixelAt(image, 50, 3 * lh + 1), *wxWHITE);
    EXPECT_EQ(PixelAt(image, 50, 4 * lh), *wxWHITE) << "nothing below the last item";
}

TEST_F(ListPaint, SingleRowHasOnlyTheLineUnderIt)
{
    auto* list = MakeRows(wxLC_HRULES, {100}, 1);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    const wxColour line = ListTheme().lineColour;
    EXPECT_EQ(CountPixels(image, wxRect(50, 0, 1, lh), line), 0);
    EXPECT_EQ(PixelAt(image, 50, lh), line);
}

TEST_F(ListPaint, ScrolledListHasNoLineAboveItsFirstVisibleRowNorUnderARowThatIsNotLast)
{
    auto* list = MakeRows(wxLC_HRULES, {100}, 200);
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    rows->ScrollToTop(10);
    ASSERT_EQ(rows->GetTopItem(), 10);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    const wxColour line = ListTheme().lineColour;
    EXPECT_EQ(PixelAt(image, 50, 0), *wxWHITE);
    EXPECT_EQ(PixelAt(image, 50, lh), line);
    const long lastVisible = rows->GetLastVisibleItem();
    ASSERT_LT(lastVisible, 199);
    const int underLast = static_cast<int>((lastVisible - 10 + 1) * lh);
    if (underLast < image.GetHeight())
    {
        EXPECT_EQ(PixelAt(image, 50, underLast), *wxWHITE);
    }
}

TEST_F(ListPaint, OddRowsTakeTheAlternateColour)
{
    auto* list = MakeRows(0, {100, 80}, 4);
    const wxColour alternate(200, 230, 200);
    list->SetAlternateRowColour(alternate);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    for (int row = 0; row < 4; ++row)
        EXPECT_EQ(PixelAt(image, 150, row * lh + lh / 2), row % 2 ? alternate : *wxWHITE) << "row " << row;
    EXPECT_EQ(PixelAt(image, 300, lh + lh / 2), *wxWHITE) << "only under the columns";
}

TEST_F(ListPaint, SelectionFillFollowsTheFocusOfTheRows)
{
    auto* list = MakeRows(0, {100, 80}, 3);
    list->SetAlternateRowColour(wxColour(200, 230, 200));
    list->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    const int lh = LineHeight(list);
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();

    SendFocus(rows, false);
    EXPECT_EQ(PixelAt(RenderRows(list), 150, lh + lh / 2), ListTheme().inactiveSelectionColour);
    SendFocus(rows, true);
    wxImage image = RenderRows(list);
    EXPECT_EQ(PixelAt(image, 150, lh + lh / 2), ListTheme().selectionColour);
    EXPECT_EQ(PixelAt(image, 150, lh / 2), *wxWHITE) << "unselected rows keep their fill";
    SendFocus(rows, false);
    EXPECT_EQ(PixelAt(RenderRows(list), 150, lh + lh / 2), ListTheme().inactiveSelectionColour);
}

TEST_F(ListPaint, SelectedRowsUseTheSelectedTextColour)
{
    auto* list = MakeRows(0, {100, 80}, 2, kBlock);
    list->SetItemState(1, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    const wxRect first(0, 0, 100, lh);
    const wxRect second(0, lh, 100, lh);
    EXPECT_GT(CountPixels(image, first, ListTheme().textColour), 10);
    EXPECT_EQ(CountPixels(image, first, ListTheme().selectedTextColour), 0);
    EXPECT_GT(CountPixels(image, second, ListTheme().selectedTextColour), 10);
    EXPECT_EQ(CountPixels(image, second, ListTheme().textColour), 0);
}

TEST_F(ListPaint, StatusMarksTakeTheItemColourWhileTheTextKeepsTheTheme)
{
    auto* list = MakeRows(0, {120, 80}, 2, kBlock);
    list->SetItem(0, 0, kBlock, kCellImageStatusCircle);
    list->SetItem(1, 0, kBlock, kCellImageStatusSquare);
    list->SetItemTextColour(0, kRed);
    list->SetItemTextColour(1, kRed);
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);

    EXPECT_EQ(PixelAt(image, 1 + 12, 12), kRed) << "circle centre";
    EXPECT_EQ(PixelAt(image, 1 + 12 + 6, 12), kRed) << "inside the radius of 9";
    EXPECT_EQ(PixelAt(image, 1 + 12, 12 + 11), *wxWHITE) << "outside the radius";
    EXPECT_EQ(PixelAt(image, 1 + 3 + 8, lh + 4 + 8), kRed) << "square centre";
    EXPECT_LT(PixelAt(image, 1 + 3, lh + 4 + 8).Red(), 80) << "square outlined in black";

    // The text stands right of the mark, in the theme's colour, never in red.
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
    EXPECT_EQ(info.GetTextColour(), ListTheme().textColour);
}

struct ProgressCase
{
    const char* text;
    int filled; // of the 96 inner pixels of a 108-pixel column
};

class ListProgress : public ListPaint, public ::testing::WithParamInterface<ProgressCase>
{
};

TEST_P(ListProgress, FillsTheFrameInProportionAndShowsNoText)
{
    auto* list = MakeList(wxLC_REPORT);
    list->InsertColumn(0, wxS("Done"), kColumnFormatProgress, 108);
    list->InsertColumn(1, wxS("Name"), wxLIST_FORMAT_LEFT, 100);
    list->InsertItem(0, wxString::FromUTF8(GetParam().text));
    list->SetItem(0, 1, wxS("x"));
    const int lh = LineHeight(list);
    const wxImage image = RenderRows(list);
    EXPECT_EQ(CountPixels(image, wxRect(0, lh / 2, 108, 1), *wxBLUE), GetParam().filled);
    if (GetParam().filled > 0)
    {
        EXPECT_EQ(PixelAt(image, 3, lh / 2), *wxBLUE) << "the bar starts inside the frame";
    }
    EXPECT_EQ(CountPixels(image, wxRect(0, 0, 108, lh), ListTheme().textColour), 0);
}

INSTANTIATE_TEST_SUITE_P(Percentages, ListProgress,
                         ::testing::Values(ProgressCase{"0", 0}, ProgressCase{"50", 48},
                                           ProgressCase{"100", 96}, ProgressCase{"not a number", 0},
                                           ProgressCase{"25.5", 24}, ProgressCase{"250", 96},
                                           ProgressCase{"-40", 0}));

// The reference: the same text drawn straight, or shortened, at the cell's place.
wxImage ReferenceCell(ProfilesKelvoProfilesListCtrl* list, const wxString& text, int width, bool shortened)
{
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    const wxSize size = rows->GetClientSize();
    wxBitmap bitmap(size);
    {
        wxMemoryDC dc(bitmap);
        dc.SetBackground(*wxWHITE_BRUSH);
        dc.Clear();
        dc.SetFont(rows->GetFont());
        dc.SetTextForeground(ListTheme().textColour);
        dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
        const wxSize extent = dc.GetTextExtent(text);
        const int y = rows->GetLineHeight() / 2 - (extent.GetHeight() + 1) / 2;
        if (shortened)
            DrawTextTruncate(dc, text, wxRect(1, y, width, extent.GetHeight()), 0, false);
        else
            dc.DrawText(text, 1, y);
    }
    return bitmap.ConvertToImage();
}

bool SameCell(const wxImage& a, const wxImage& b, int width, int height)
{
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            if (PixelAt(a, x, y) != PixelAt(b, x, y))
                return false;
    return true;
}

TEST_F(ListPaint, TextIsShortenedExactlyWhenWiderThanTheColumnLessEight)
{
    const wxString text = wxS("Transferring to server");
    for (int spare : {0, -1})
    {
        auto* list = MakeList(wxLC_REPORT);
        int textWidth = 0;
        {
            wxBitmap probe(1, 1);
            wxMemoryDC dc(probe);
            dc.SetFont(list->GetMainWindow()->GetFont());
            textWidth = dc.GetTextExtent(text).GetWidth();
        }
        const int columnWidth = textWidth + 8 + spare;
        list->InsertColumn(0, wxS("Status"), wxLIST_FORMAT_LEFT, columnWidth);
        list->InsertItem(0, text);
        const wxImage image = RenderRows(list);
        const int lh = list->GetMainWindow()->GetLineHeight();
        const bool shortened = spare < 0;
        const wxImage whole = ReferenceCell(list, text, textWidth, false);
        const wxImage cut = ReferenceCell(list, text, textWidth - 1, true);
        EXPECT_TRUE(SameCell(image, shortened ? cut : whole, columnWidth, lh)) << "spare " << spare;
        EXPECT_FALSE(SameCell(image, shortened ? whole : cut, columnWidth, lh)) << "spare " << spare;
        m_frame->Destroy();
        m_frame = nullptr;
    }
}

TEST(DrawTextTruncate, ShortensWithAnEllipsisWithinTheWidth)
{
    wxBitmap probe(1, 1);
    wxMemoryDC dc(probe);
    dc.SetFont(*wxNORMAL_FONT);
    const wxString text = wxS("A rather long file name.pdf");
    const int full = dc.GetTextExtent(text).GetWidth();
    EXPECT_EQ(TruncateTextToWidth(dc, text, full, false), text);
    for (int width : {full - 1, full / 2, 30})
    {
        const wxString shown = TruncateTextToWidth(dc, text, width, false);
        EXPECT_TRUE(shown.EndsWith(wxS("..."))) << width;
        EXPECT_LE(dc.GetTextExtent(shown).GetWidth(), width) << width;
        EXPECT_TRUE(text.StartsWith(shown.Left(shown.length() - 3).Trim())) << width;
    }
    EXPECT_EQ(TruncateTextToWidth(dc, text, 2, true), wxString()) << "an image cell shows no lone ellipsis";
    EXPECT_EQ(TruncateTextToWidth(dc, text, 2, false), wxS("..."));
}

// ---------------------------------------------------------------- header

wxImageList* MakeSolidImages(const wxColour& colour)
{
    auto* images = new wxImageList(16, 16, true, 1);
    wxImage solid(16, 16);
    solid.SetRGB(wxRect(0, 0, 16, 16), colour.Red(), colour.Green(), colour.Blue());
    images->Add(wxBitmap(solid));
    return images;
}

TEST_F(ListPaint, StyledHeaderIsFlatWithBordersLabelsAndSortMarks)
{
    headerStyle style;
    style.backgroundColour = *wxWHITE;
    wxImage strip(1, 23);
    style.bitmap = wxBitmap(strip);
    style.textColour = kRed;
    auto* list = MakeList(wxLC_REPORT, &style);
    std::unique_ptr<wxImageList> marks(MakeSolidImages(wxColour(0, 160, 0)));
    list->SetImageList(marks.get(), kHeaderImageList);
    list->InsertColumn(0, kBlock, wxLIST_FORMAT_LEFT, 100);
    list->InsertColumn(1, kBlock, wxLIST_FORMAT_LEFT, 120);
    wxListItem mark;
    mark.SetImage(0);
    list->SetColumn(1, mark);

    ProfilesKelvoListHeaderWindow* header = list->GetHeaderWindow();
    ASSERT_EQ(header->GetSize().GetHeight(), 25);
    const wxImage image = RenderHeader(list);
    const wxColour border = Themer::GetThemeService()->GetTheme("HeaderView").lineColour;
    EXPECT_EQ(PixelAt(image, 100 - 1, 12), border) << "right edge less the strip's width";
    EXPECT_EQ(PixelAt(image, 220 - 1, 12), border);
    EXPECT_EQ(PixelAt(image, 400, 0), border) << "outline";
    EXPECT_EQ(PixelAt(image, 400, 12), ListTheme().controlColour);
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 99, 25), kRed), 10) << "label in the record's text colour";
    const wxColour green(0, 160, 0);
    EXPECT_EQ(CountPixels(image, wxRect(0, 0, 99, 25), green), 0);
    const int sortMarkPixels = CountPixels(image, wxRect(100, 0, 119, 25), green);
    EXPECT_EQ(sortMarkPixels, 16 * 16);
    list->SetImageList(nullptr, kHeaderImageList);
}

TEST_F(ListPaint, PlainHeaderIsAsHighAsItsTextWithRoom)
{
    auto* list = MakeList(wxLC_REPORT);
    ProfilesKelvoListHeaderWindow* header = list->GetHeaderWindow();
    int height = 0;
    int descent = 0;
    header->GetTextExtent(wxS("Hg"), nullptr, &height, &descent);
    EXPECT_EQ(header->GetSize().GetHeight(), height + descent + 6);
}
} // namespace
