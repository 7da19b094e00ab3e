// The virtual job table and the virtual callbacks of the themed list.
#include "ListTestSupport.h"

#include "components/Utility/CustomListCtrl.h"

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

class JobTable : public ListFixture
{
protected:
    CustomListCtrl* MakeTable()
    {
        auto* table = MakeList<CustomListCtrl>(kJobListStyle);
        for (const char* heading :
             {"No.", "File Name", "Format", "Hot Folder", "Server", "Size", "Time", "Status"})
            table->InsertColumn(table->GetColumnCount(), heading, wxLIST_FORMAT_LEFT, 70);
        return table;
    }
};

TEST_F(JobTable, ColumnsShowTheRowNumberAndTheirFields)
{
    CustomListCtrl* table = MakeTable();
    table->SetRecords({Row(wxS("first"), wxS("Saving...")), Row(wxS("second"), wxS("Waiting"))});
    const std::vector<wxString> expected = {wxS("2"),    wxS("second"), wxS("PDF"),      wxS("Folder A"),
                                            wxS("srv1"), wxS("2.00KB"), wxS("10:41:07"), wxS("Waiting")};
    for (long column = 0; column < 8; ++column)
        EXPECT_EQ(table->OnGetItemText(1, column), expected[column]) << "column " << column;
    EXPECT_EQ(table->OnGetItemText(0, 0), wxS("1"));
    EXPECT_EQ(table->OnGetItemText(0, 8), wxString()) << "no ninth column";
    EXPECT_EQ(table->OnGetItemText(0, -1), wxString());
    EXPECT_EQ(table->OnGetItemText(2, 1), wxString()) << "beyond the rows";
    EXPECT_EQ(table->OnGetItemText(-1, 1), wxString());
}

struct StatusImageCase
{
    const char* status;
    long column;
    int expected; // with status image 5
};

class JobTableImage : public JobTable, public ::testing::WithParamInterface<StatusImageCase>
{
};

TEST_P(JobTableImage, OnlyRowsInProgressShowTheStatusImage)
{
    CustomListCtrl* table = MakeTable();
    table->SetRecords({Row(wxS("job"), wxString::FromUTF8(GetParam().status))});
    table->SetStatusImage(5);
    EXPECT_EQ(table->OnGetItemImage(0, GetParam().column), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    Statuses, JobTableImage,
    ::testing::Values(StatusImageCase{"Converting file type", 7, 5},
                      StatusImageCase{"Transferring to server", 7, 5}, StatusImageCase{"Saving...", 7, 5},
                      StatusImageCase{"saving...", 7, -1}, StatusImageCase{"Saving... ", 7, -1},
                      StatusImageCase{"Transferred Successfully", 7, -1}, StatusImageCase{"Saving...", 6, -1},
                      StatusImageCase{"Saving...", 0, -1}));

TEST_F(JobTable, EmptyRowsWithAStaleCountGiveNothing)
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

TEST_F(JobTable, SetRecordsLeavesTheRowCountToTheCaller)
{
    CustomListCtrl* table = MakeTable();
    table->SetItemCount(2);
    table->SetRecords({Row(wxS("a"), wxS("x")), Row(wxS("b"), wxS("x")), Row(wxS("c"), wxS("x"))});
    EXPECT_EQ(table->GetItemCount(), 2);
    table->GetMainWindow()->LayoutIfNeeded();
    EXPECT_EQ(table->GetMainWindow()->GetLastVisibleItem(), 1) << "still two rows shown";
    table->SetItemCount(3);
    EXPECT_EQ(table->GetItemCount(), 3);
    EXPECT_EQ(table->GetItemText(2, 1), wxS("c"));
}

TEST_F(JobTable, GetItemReadsTheStatusThroughTheCallbacks)
{
    CustomListCtrl* table = MakeTable();
    table->SetRecords({Row(wxS("a"), wxS("Saving..."))});
    table->SetItemCount(1);
    table->SetStatusImage(4);
    wxListItem info;
    info.SetId(0);
    info.SetColumn(7);
    info.SetMask(wxLIST_MASK_TEXT | wxLIST_MASK_IMAGE);
    ASSERT_TRUE(table->GetItem(info));
    EXPECT_EQ(info.GetText(), wxS("Saving..."));
    EXPECT_EQ(info.GetImage(), 4);
}

// ---------------------------------------------------------------- virtual callbacks of the base

class RecordingList : public ProfilesKelvoProfilesListCtrl
{
public:
    using ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl;

    wxString OnGetItemText(long item, long column) const override
    {
        calls.push_back(wxString::Format("text %ld %ld", item, column));
        return wxString::Format("r%ldc%ld", item, column);
    }
    int OnGetItemImage(long item, long column) const override
    {
        calls.push_back(wxString::Format("image %ld %ld", item, column));
        return -1;
    }
    wxItemAttr* OnGetItemAttr(long item, long column) const override
    {
        calls.push_back(wxString::Format("attr %ld %ld", item, column));
        return column == 1 ? &shaded : nullptr;
    }

    mutable std::vector<wxString> calls;
    mutable wxItemAttr shaded{wxNullColour, wxColour(250, 200, 120), wxNullFont};
};

TEST_F(JobTable, EveryColumnIsAskedForTextImageAndAttributeInOrder)
{
    auto* list = MakeList<RecordingList>(wxLC_REPORT | wxLC_VIRTUAL);
    for (long column = 0; column < 3; ++column)
        list->InsertColumn(column, wxS("C"), wxLIST_FORMAT_LEFT, 80);
    list->SetItemCount(1);
    list->GetMainWindow()->LayoutIfNeeded();
    list->calls.clear();
    const wxImage image = RenderRows(list);
    const std::vector<wxString> expected = {"text 0 0", "image 0 0", "attr 0 0",  "text 0 1", "image 0 1",
                                            "attr 0 1", "text 0 2",  "image 0 2", "attr 0 2"};
    EXPECT_EQ(list->calls, expected);

    const int mid = list->GetMainWindow()->GetLineHeight() / 2;
    EXPECT_EQ(PixelAt(image, 80 + 75, mid), wxColour(250, 200, 120)) << "the cell's own background";
    EXPECT_EQ(PixelAt(image, 75, mid), *wxWHITE) << "its neighbours keep theirs";
    EXPECT_EQ(PixelAt(image, 160 + 75, mid), *wxWHITE);
}

TEST_F(JobTable, CreatesInTwoStepsWithTheHeaderRecord)
{
    m_frame = new wxFrame(nullptr, wxID_ANY, wxS("two steps"));
    headerStyle style;
    style.textColour = *wxRED;
    auto* table = new CustomListCtrl();
    ASSERT_TRUE(table->Create(&style, m_frame, wxID_ANY, wxDefaultPosition, wxSize(400, 300), kJobListStyle));
    ASSERT_NE(table->GetHeaderStyle(), nullptr);
    EXPECT_EQ(table->GetHeaderStyle()->textColour, *wxRED);
    EXPECT_EQ(table->GetHeaderWindow()->GetSize().GetHeight(), 25);
    EXPECT_EQ(table->GetMainWindow()->GetName(), wxS("listctrlmainwindow"));
    EXPECT_EQ(table->GetHeaderWindow()->GetName(), wxS("wxlistctrlcolumntitles"));
    EXPECT_TRUE(table->IsVirtual());
}
} // namespace

namespace
{
TEST_F(JobTable, CacheHintNamesTheVisibleRowsOncePerRangeAndAgainAfterAnUpdate)
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
