// The lists and boxes as accessibility tools get them: the ATK objects GTK
// would put on the bus, read in process (no bus needed).
#include "components/Utility/CustomComboBox.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "platform/automation/atk/AccessibleExposure.h"

#include "GuiTest.h"

#include <atk/atk.h>
#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/panel.h>

#include <string>
#include <utility>
#include <vector>

namespace
{

AtkObject* AccessibleOf(wxWindow* window)
{
    return static_cast<AtkObject*>(automation::AccessibleExposure::AccessibleOf(*window));
}

std::string Name(AtkObject* object)
{
    const gchar* name = object ? atk_object_get_name(object) : nullptr;
    return name ? name : "";
}

bool HasState(AtkObject* object, AtkStateType state)
{
    AtkStateSet* states = atk_object_ref_state_set(object);
    const bool has = atk_state_set_contains_state(states, state);
    g_object_unref(states);
    return has;
}

std::pair<int, int> Position(AtkObject* cell)
{
    gint row = -1, column = -1;
    atk_table_cell_get_position(ATK_TABLE_CELL(cell), &row, &column);
    return {row, column};
}

// A cell as a tool reads it: asked for, named, its text read, released.
std::string CellText(AtkObject* table, int row, int column)
{
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), row, column);
    if (!cell)
        return "<none>";
    const std::string name = Name(cell);
    gchar* text = atk_text_get_text(ATK_TEXT(cell), 0, -1);
    EXPECT_EQ(text ? text : "", name);
    g_free(text);
    g_object_unref(cell);
    return name;
}

class AccessibleTest : public ::testing::Test
{
protected:
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(0);
    }
    // Three jobs in three columns, shown on the screen.
    ProfilesKelvoProfilesListCtrl* FilledList()
    {
        auto* list =
            new ProfilesKelvoProfilesListCtrl(nullptr, frame, wxID_ANY, wxPoint(0, 0), wxSize(700, 400),
                                              wxLC_REPORT | wxLC_SINGLE_SEL, wxDefaultValidator, "jobList");
        const char* rows[][3] = {{"No.", "File Name", "Status"},
                                 {"1", "a.pdf", "Saving..."},
                                 {"2", "b.ps", "Done"},
                                 {"3", "\u00e9t\u00e9", ""}};
        for (int column = 0; column < 3; ++column)
            list->InsertColumn(column, rows[0][column], wxLIST_FORMAT_LEFT, column == 1 ? 200 : 100);
        for (long row = 0; row < 3; ++row)
        {
            list->InsertItem(row, wxString::FromUTF8(rows[row + 1][0]));
            for (int column = 1; column < 3; ++column)
                list->SetItem(row, column, wxString::FromUTF8(rows[row + 1][column]));
        }
        frame->Show();
        EXPECT_TRUE(guitest::PumpUntil([&] { return HasState(AccessibleOf(frame), ATK_STATE_SHOWING); }));
        return list;
    }

    wxFrame* frame = new wxFrame(nullptr, wxID_ANY, "accessible list");
};

TEST_F(AccessibleTest, TheListIsATableThatReadsAndChangesAsTheListDoesAndAnswersAsGoneOnceDestroyed)
{
    ProfilesKelvoProfilesListCtrl* list = FilledList();
    AtkObject* table = AccessibleOf(list);
    ASSERT_TRUE(table && ATK_IS_TABLE(table)) << "the get_accessible hook did not take effect";
    EXPECT_EQ(atk_object_get_role(table), ATK_ROLE_TABLE);
    EXPECT_EQ(atk_object_get_n_accessible_children(table), 9);
    for (long row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column)
            EXPECT_EQ(CellText(table, row, column), list->GetItemText(row, column).utf8_string())
                << row << "," << column;
    EXPECT_EQ(CellText(table, 3, 0), "<none>");

    // Selecting a row reaches the listeners; a row added is counted, a cell of a row removed is gone.
    std::vector<AtkObject*> descendants;
    g_signal_connect(
        table, "active-descendant-changed",
        G_CALLBACK(+[](AtkObject*, AtkObject* cell, std::vector<AtkObject*>* all) { all->push_back(cell); }),
        &descendants);
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), 1, 2);
    list->SetItemState(1, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                       wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
    ASSERT_EQ(descendants.size(), 1u);
    EXPECT_EQ(Position(descendants[0]), std::make_pair(1, 0));
    EXPECT_TRUE(HasState(cell, ATK_STATE_SELECTED));
    EXPECT_EQ(atk_selection_get_selection_count(ATK_SELECTION(table)), 1);
    list->InsertItem(3, "4");
    EXPECT_EQ(atk_table_get_n_rows(ATK_TABLE(table)), 4);
    list->DeleteAllItems();
    EXPECT_TRUE(HasState(cell, ATK_STATE_DEFUNCT)) << "a cell of a row that is gone";
    EXPECT_EQ(Name(cell), "");
    g_object_unref(cell);

    // Destroyed while a tool still holds its objects, the list answers as gone; once the table
    // goes too, the cell the tool holds has no table at all.
    list->InsertItem(0, "5");
    AtkObject* live = atk_table_ref_at(ATK_TABLE(table), 0, 0);
    ASSERT_EQ(Name(live), "5");
    g_object_ref(table);
    list->Destroy();
    ASSERT_TRUE(guitest::PumpUntil([&] { return HasState(table, ATK_STATE_DEFUNCT); }));
    EXPECT_EQ(atk_table_get_n_rows(ATK_TABLE(table)), 0);
    EXPECT_EQ(atk_table_ref_at(ATK_TABLE(table), 0, 0), nullptr);
    EXPECT_EQ(atk_table_get_column_header(ATK_TABLE(table), 1), nullptr);
    EXPECT_TRUE(HasState(live, ATK_STATE_DEFUNCT));
    EXPECT_EQ(Name(live), "");
    g_object_unref(table);
    EXPECT_EQ(atk_object_get_parent(live), nullptr);
    g_object_unref(live);
}

// The filter box is a combo box whose entries are a list, shown only while it is dropped down.
TEST_F(AccessibleTest, TheBoxIsAComboBoxWithItsEntriesAsAListShownWhileDropped)
{
    auto* combo = new CustomComboBox;
    combo->Create(new wxPanel(frame), wxID_ANY, wxPoint(10, 10), wxSize(160, -1));
    for (const char* entry : {"All", "PRN-01", "PRN-02"})
        combo->Append(entry);
    combo->SetSelection(1);
    frame->Show();
    AtkObject* box = AccessibleOf(combo);
    ASSERT_TRUE(guitest::PumpUntil([&] { return HasState(box, ATK_STATE_SHOWING); }));
    EXPECT_EQ(atk_object_get_role(box), ATK_ROLE_COMBO_BOX);
    EXPECT_EQ(Name(box), "PRN-01");
    ASSERT_EQ(atk_object_get_n_accessible_children(box), 1);
    AtkObject* list = atk_object_ref_accessible_child(box, 0);
    EXPECT_EQ(atk_object_get_n_accessible_children(list), 3);
    for (const bool dropped : {true, false, true, false})
    {
        dropped ? combo->ShowPopup() : combo->HidePopup();
        ASSERT_TRUE(guitest::PumpUntil([&] { return combo->IsPopupShown() == dropped; }));
        EXPECT_EQ(HasState(box, ATK_STATE_EXPANDED), dropped);
        EXPECT_EQ(HasState(list, ATK_STATE_SHOWING), dropped);
        gint x = -1, y = -1, width = -1, height = -1;
        atk_component_get_extents(ATK_COMPONENT(list), &x, &y, &width, &height, ATK_XY_SCREEN);
        EXPECT_EQ(width > 0, dropped) << "a closed list has no place on the screen";
    }
    g_object_unref(list);
}

} // namespace
