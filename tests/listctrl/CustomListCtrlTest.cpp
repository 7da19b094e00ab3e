// The virtual job table and the virtual callbacks of the themed list.
#include "ListTestSupport.h"

#include "components/Utility/CustomListCtrl.h"

#include <sstream>

using namespace listtest;

namespace
{
constexpr long kJobListStyle = wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES;

// Display rows by position: key, file, folder, server, size, format, time, status.
JobRecord Row(const wxString& file, const wxString& status)
{
    return JobRecord{wxS("k-") + file, file,       wxS("Folder A"), wxS("srv1"),
                     wxS("2.00KB"),    wxS("PDF"), wxS("10:41:07"), status};
}

class ListJobTable : public ListFixture
{
protected:
    CustomListCtrl* MakeTable()
    {
        auto* table = MakeList<CustomListCtrl>(kJobListStyle);
        for (int column = 0; column < 8; ++column)
            table->InsertColumn(column, wxS("C"), wxLIST_FORMAT_LEFT, 70);
        return table;
    }
};

TEST_F(ListJobTable, ColumnsShowTheRowNumberAndTheirFieldsAndNothingOutside)
{
    CustomListCtrl* table = MakeTable();
    table->SetItemCount(2);
    table->SetRecords({Row(wxS("first"), wxS("Saving...")), Row(wxS("second"), wxS("Waiting"))});
    const std::vector<wxString> expected = {wxS("2"),    wxS("second"), wxS("PDF"),      wxS("Folder A"),
                                            wxS("srv1"), wxS("2.00KB"), wxS("10:41:07"), wxS("Waiting")};
    for (long column = 0; column < 8; ++column)
        EXPECT_EQ(table->GetItemText(1, column), expected[column]) << "column " << column;
    EXPECT_EQ(table->OnGetItemText(0, 0), wxS("1"));
    for (const auto& [item, column] : {std::pair<long, long>{0, 8}, {0, -1}, {2, 1}, {-1, 1}})
        EXPECT_EQ(table->OnGetItemText(item, column), wxString()) << item << ", " << column;

    // The records do not change the count: the caller sets it.
    table->SetRecords({Row(wxS("a"), wxS("x")), Row(wxS("b"), wxS("x")), Row(wxS("c"), wxS("x"))});
    EXPECT_EQ(table->GetItemCount(), 2);
    table->SetItemCount(3);
    EXPECT_EQ(table->GetItemText(2, 1), wxS("c"));
}

TEST_F(ListJobTable, OnlyRowsInProgressShowTheStatusImageInTheStatusColumn)
{
    CustomListCtrl* table = MakeTable();
    table->SetItemCount(1);
    table->SetStatusImage(5);
    // "status:column=image;"
    std::istringstream cases(
        "Converting file type:7=5;Transferring to server:7=5;Saving...:7=5;saving...:7=-1;"
        "Saving... :7=-1;Transferred Successfully:7=-1;Saving...:6=-1;Saving...:0=-1;");
    for (std::string status, column, image; std::getline(cases, status, ':') &&
                                            std::getline(cases, column, '=') &&
                                            std::getline(cases, image, ';');)
    {
        table->SetRecords({Row(wxS("job"), status)});
        wxListItem info;
        info.SetId(0);
        info.SetColumn(std::stoi(column));
        info.SetMask(wxLIST_MASK_TEXT | wxLIST_MASK_IMAGE);
        ASSERT_TRUE(table->GetItem(info));
        EXPECT_EQ(info.GetImage(), std::stoi(image)) << status << " in " << column;
        EXPECT_EQ(info.GetText(), column == "7" ? wxString(status) : info.GetText());
    }
}

TEST_F(ListJobTable, RowsOfAStaleCountGiveNothingAndPaint)
{
    CustomListCtrl* table = MakeTable();
    table->SetItemCount(3);
    table->SetStatusImage(2);
    for (long column = 0; column < 8; ++column)
    {
        EXPECT_EQ(table->OnGetItemText(1, column), wxString()) << column;
        EXPECT_EQ(table->OnGetItemImage(1, column), -1) << column;
    }
    RenderRows(table); // paints the stale rows without touching missing records
}

// Virtual rows are painted from the callbacks: a text in column 0, a status circle in
// column 2, and column 1's own attribute, which colours that cell only.
class ShadedList : public ProfilesKelvoProfilesListCtrl
{
public:
    using ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl;
    wxString OnGetItemText(long, long column) const override
    {
        return column == 0 ? wxString::FromUTF8("\xE2\x96\x88\xE2\x96\x88") : wxString();
    }
    int OnGetItemImage(long, long column) const override { return column == 2 ? kCellImageStatusCircle : -1; }
    wxItemAttr* OnGetItemAttr(long, long column) const override { return column == 1 ? &shaded : nullptr; }
    mutable wxItemAttr shaded{wxNullColour, wxColour(250, 200, 120), wxNullFont};
};

TEST_F(ListJobTable, VirtualRowsArePaintedFromTheCallbacks)
{
    auto* list = MakeList<ShadedList>(wxLC_REPORT | wxLC_VIRTUAL);
    for (long column = 0; column < 3; ++column)
        list->InsertColumn(column, wxS("C"), wxLIST_FORMAT_LEFT, 80);
    list->SetItemCount(1);
    const wxImage image = RenderRows(list);
    const int mid = list->GetMainWindow()->GetLineHeight() / 2;
    EXPECT_EQ(PixelAt(image, 80 + 75, mid), wxColour(250, 200, 120));
    EXPECT_EQ(PixelAt(image, 75, mid), *wxWHITE);
    EXPECT_EQ(PixelAt(image, 160 + 75, mid), *wxWHITE);
    EXPECT_GT(CountPixels(image, wxRect(0, 0, 80, 2 * mid), ListTheme().textColour), 10) << "the text";
    EXPECT_EQ(PixelAt(image, 160 + 1 + 12, 12), ListTheme().textColour) << "the circle";
}

TEST_F(ListJobTable, CreatesInTwoStepsWithACopyOfTheHeaderRecord)
{
    m_frame = new wxFrame(nullptr, wxID_ANY, wxS("two steps"));
    headerStyle style;
    style.textColour = *wxRED;
    auto* table = new CustomListCtrl();
    ASSERT_TRUE(table->Create(&style, m_frame, wxID_ANY, wxDefaultPosition, wxSize(400, 300), kJobListStyle));
    style.textColour = *wxBLUE;
    ASSERT_NE(table->GetHeaderStyle(), nullptr);
    EXPECT_EQ(table->GetHeaderStyle()->textColour, *wxRED);
    EXPECT_EQ(table->GetHeaderWindow()->GetSize().GetHeight(), 25);
    EXPECT_TRUE(table->IsVirtual());
}

TEST_F(ListJobTable, CacheHintNamesTheVisibleRowsOncePerRangeAndAgainAfterAnUpdate)
{
    CustomListCtrl* table = MakeTable();
    std::vector<std::pair<long, long>> hints;
    table->Bind(wxEVT_LIST_CACHE_HINT, [&hints](wxListEvent& event)
                { hints.emplace_back(event.GetCacheFrom(), event.GetCacheTo()); });
    table->SetItemCount(1000);
    ProfilesKelvoListMainWindow* rows = table->GetMainWindow();
    rows->HintVisibleRange();
    EXPECT_TRUE(hints.empty()) << "nothing before the layout";
    rows->LayoutIfNeeded();
    rows->HintVisibleRange();
    const long last = rows->GetLastVisibleItem();
    ASSERT_GT(last, 5);
    EXPECT_EQ(hints, (std::vector<std::pair<long, long>>{{0, last}}));
    rows->HintVisibleRange();
    EXPECT_EQ(hints.size(), 1u) << "the same range is not hinted twice";
    rows->ScrollToTop(100);
    rows->HintVisibleRange();
    EXPECT_EQ(hints.back(), std::make_pair(100L, 100 + last));
    table->RefreshItems(0, 999);
    rows->HintVisibleRange();
    EXPECT_EQ(hints.size(), 3u) << "refreshed rows are hinted again";
}
} // namespace
