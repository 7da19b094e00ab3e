// The virtual job table and the virtual callbacks of the themed list.
#include "ListTestSupport.h"

#include "components/Utility/CustomListCtrl.h"

#include <sstream>

using namespace listtest;

namespace
{
using ListJobTable = ListFixture;

// Display rows by position: key, file, folder, server, size, format, time, status.
JobRecord Row(const wxString& file, const wxString& status)
{
    return JobRecord{wxS("k-") + file, file,       wxS("Folder A"), wxS("srv1"),
                     wxS("2KB"),       wxS("PDF"), wxS("10:41"),    status};
}

CustomListCtrl* AddColumns(CustomListCtrl* table)
{
    for (int column = 0; column < 8; ++column)
        table->InsertColumn(column, wxS("C"), wxLIST_FORMAT_LEFT, 70);
    return table;
}

constexpr long kJobListStyle = wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES;

TEST_F(ListJobTable, ColumnsShowTheRowNumberAndTheirFieldsAndOnlyInProgressRowsTheStatusImage)
{
    CustomListCtrl* table = AddColumns(MakeList<CustomListCtrl>(kJobListStyle));
    table->SetItemCount(2);
    table->SetRecords({Row(wxS("first"), wxS("Saving...")), Row(wxS("second"), wxS("Waiting"))});
    wxString shown;
    for (long column = -1; column <= 8; ++column)
        shown += table->OnGetItemText(1, column) + "|";
    EXPECT_EQ(shown, "|2|second|PDF|Folder A|srv1|2KB|10:41|Waiting||");
    EXPECT_EQ(table->OnGetItemText(2, 1) + table->OnGetItemText(-1, 1), wxString());
    table->SetRecords({Row(wxS("a"), wxS("x")), Row(wxS("b"), wxS("x")), Row(wxS("c"), wxS("x"))});
    EXPECT_EQ(table->GetItemCount(), 2) << "the caller sets the count";

    table->SetStatusImage(5);
    // "status:column=image;"
    std::istringstream cases(
        "Converting file type:7=5;Transferring to server:7=5;Saving...:7=5;saving...:7=-1;"
        "Transferred Successfully:7=-1;Saving...:6=-1;");
    for (std::string status, column, image; std::getline(cases, status, ':') &&
                                            std::getline(cases, column, '=') &&
                                            std::getline(cases, image, ';');)
    {
        table->SetRecords({Row(wxS("job"), status)});
        EXPECT_EQ(table->OnGetItemImage(0, std::stoi(column)), std::stoi(image))
            << status << " in " << column;
    }
    // A count ahead of the records gives empty rows and paints without touching missing records.
    table->SetItemCount(3);
    EXPECT_EQ(table->OnGetItemText(1, 7) + table->OnGetItemText(2, 0), wxString());
    EXPECT_EQ(table->OnGetItemImage(1, 7), -1);
    RenderRows(table);
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
}

} // namespace
