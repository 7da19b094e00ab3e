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

#include <array>
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

std::string Text(AtkObject* object)
{
    gchar* text = atk_text_get_text(ATK_TEXT(object), 0, -1);
    std::string result = text ? text : "";
    g_free(text);
    return result;
}

bool HasState(AtkObject* object, AtkStateType state)
{
    AtkStateSet* states = atk_object_ref_state_set(object);
    const bool has = atk_state_set_contains_state(states, state);
    g_object_unref(states);
    return has;
}

// Shows the frame and waits until the toolkit has mapped it.
void ShowMapped(wxFrame* frame)
{
    frame->Show();
    ASSERT_TRUE(guitest::PumpUntil([&] { return HasState(AccessibleOf(frame), ATK_STATE_SHOWING); }));
}

std::string Attribute(AtkObject* object, const char* name)
{
    AtkAttributeSet* attributes = atk_object_get_attributes(object);
    std::string value;
    for (GSList* at = attributes; at; at = at->next)
    {
        auto* attribute = static_cast<AtkAttribute*>(at->data);
        if (std::string(attribute->name) == name)
            value = attribute->value;
    }
    atk_attribute_set_free(attributes);
    return value;
}

// Where an object stands: x, y, width, height.
std::array<int, 4> Extents(AtkObject* object, AtkCoordType type)
{
    gint x = 0, y = 0, width = 0, height = 0;
    atk_component_get_extents(ATK_COMPONENT(object), &x, &y, &width, &height, type);
    return {x, y, width, height};
}

std::pair<int, int> Position(AtkObject* cell)
{
    gint row = -1, column = -1;
    atk_table_cell_get_position(ATK_TABLE_CELL(cell), &row, &column);
    return {row, column};
}

// A cell as a tool reads it: asked for, named, released.
std::string CellText(AtkObject* table, int row, int column)
{
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), row, column);
    if (!cell)
        return "<none>";
    const std::string name = Name(cell);
    EXPECT_EQ(Text(cell), name);
    g_object_unref(cell);
    return name;
}

// A virtual list that makes its texts from the position and counts the asks.
class CountingList : public ProfilesKelvoProfilesListCtrl
{
public:
    using ProfilesKelvoProfilesListCtrl::ProfilesKelvoProfilesListCtrl;
    wxString OnGetItemText(long item, long column) const override
    {
        ++textCalls;
        return wxString::Format("r%ldc%ld", item, column);
    }
    mutable long textCalls = 0;
};

// Counts a signal's emissions and keeps its last object argument.
struct SignalLog
{
    int count = 0;
    AtkObject* last = nullptr;

    static void Count(AtkObject*, SignalLog* log) { ++log->count; }
    static void Object(AtkObject*, gpointer child, SignalLog* log)
    {
        ++log->count;
        log->last = ATK_IS_OBJECT(child) ? ATK_OBJECT(child) : nullptr;
    }
    static void IndexAndObject(AtkObject* object, guint, gpointer child, SignalLog* log)
    {
        Object(object, child, log);
    }
    template <typename Handler> void Connect(AtkObject* object, const char* signal, Handler handler)
    {
        g_signal_connect(object, signal, G_CALLBACK(handler), this);
    }
};

class AccessibleListTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "accessible list");
        frame->SetClientSize(700, 400);
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(0);
    }

    template <typename List = ProfilesKelvoProfilesListCtrl> List* MakeList(long style)
    {
        auto* list = new List(nullptr, frame, wxID_ANY, wxPoint(0, 0), wxSize(700, 400), style,
                              wxDefaultValidator, "jobList");
        list->SetAccessibleName("Jobs");
        list->InsertColumn(0, "No.", wxLIST_FORMAT_LEFT, 50);
        list->InsertColumn(1, "File Name", wxLIST_FORMAT_RIGHT, 200);
        list->InsertColumn(2, "Status", wxLIST_FORMAT_CENTRE, 150);
        return list;
    }

    ProfilesKelvoProfilesListCtrl* FilledList()
    {
        ProfilesKelvoProfilesListCtrl* list = MakeList(wxLC_REPORT | wxLC_SINGLE_SEL);
        const char* rows[][3] = {
            {"1", "a.pdf", "Saving..."}, {"2", "b.ps", "Done"}, {"3", "\u00e9t\u00e9.tif", ""}};
        for (long row = 0; row < 3; ++row)
        {
            list->InsertItem(row, wxString::FromUTF8(rows[row][0]));
            for (int column = 1; column < 3; ++column)
                list->SetItem(row, column, wxString::FromUTF8(rows[row][column]));
        }
        ShowMapped(frame);
        return list;
    }

    wxFrame* frame = nullptr;
};

TEST_F(AccessibleListTest, TheListIsATableWhoseCellsAndHeadingsReadAndStandAsTheListShowsThem)
{
    ProfilesKelvoProfilesListCtrl* list = FilledList();
    AtkObject* table = AccessibleOf(list);
    ASSERT_TRUE(table && ATK_IS_TABLE(table)) << "the get_accessible hook did not take effect";
    EXPECT_EQ(atk_object_get_role(table), ATK_ROLE_TABLE);
    EXPECT_EQ(Name(table), "Jobs");
    EXPECT_EQ(Attribute(table, "wyx-kind"), "ListCtrl");
    EXPECT_STREQ(atk_object_get_accessible_id(table), "jobList");
    EXPECT_TRUE(HasState(table, ATK_STATE_MANAGES_DESCENDANTS));
    EXPECT_EQ(atk_table_get_n_rows(ATK_TABLE(table)), 3);
    EXPECT_EQ(atk_table_get_n_columns(ATK_TABLE(table)), 3);
    EXPECT_EQ(atk_object_get_n_accessible_children(table), 9);

    const char* headings[] = {"No.", "File Name", "Status"};
    for (int column = 0; column < 3; ++column)
    {
        AtkObject* header = atk_table_get_column_header(ATK_TABLE(table), column);
        ASSERT_NE(header, nullptr);
        EXPECT_EQ(Name(header), headings[column]);
        EXPECT_EQ(atk_object_get_role(header), ATK_ROLE_COLUMN_HEADER);
    }
    for (long row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column)
            EXPECT_EQ(CellText(table, row, column), list->GetItemText(row, column).utf8_string())
                << row << "," << column;
    EXPECT_EQ(CellText(table, 3, 0), "<none>");

    AtkObject* cell = atk_object_ref_accessible_child(table, 7);
    EXPECT_EQ(Position(cell), std::make_pair(2, 1));
    EXPECT_EQ(atk_object_get_parent(cell), table);
    EXPECT_EQ(atk_object_get_index_in_parent(cell), 7);
    EXPECT_EQ(atk_object_get_role(cell), ATK_ROLE_TABLE_CELL);
    EXPECT_EQ(atk_text_get_character_count(ATK_TEXT(cell)), 7);
    GPtrArray* headers = atk_table_cell_get_column_header_cells(ATK_TABLE_CELL(cell));
    ASSERT_EQ(headers->len, 1u);
    EXPECT_EQ(Name(ATK_OBJECT(g_ptr_array_index(headers, 0))), "File Name");
    g_ptr_array_unref(headers);
    g_object_unref(cell);

    // A cell stands where the list draws it.
    cell = atk_table_ref_at(ATK_TABLE(table), 1, 1);
    wxRect drawn;
    ASSERT_TRUE(list->GetSubItemRect(1, 1, drawn));
    const int header = list->GetHeaderWindow()->GetSize().GetHeight();
    const wxPoint origin = list->ClientToScreen(wxPoint(0, 0));
    EXPECT_EQ(Extents(cell, ATK_XY_SCREEN),
              (std::array<int, 4>{origin.x + drawn.x, origin.y + header + drawn.y, 200, drawn.height}));
    EXPECT_EQ(Extents(cell, ATK_XY_PARENT),
              (std::array<int, 4>{drawn.x, header + drawn.y, 200, drawn.height}));
    EXPECT_TRUE(HasState(cell, ATK_STATE_SHOWING));
    g_object_unref(cell);

    // Other windows keep the accessibles GTK gives them.
    AtkObject* other = AccessibleOf(new wxPanel(frame));
    ASSERT_NE(other, nullptr);
    EXPECT_FALSE(ATK_IS_TABLE(other));
    EXPECT_EQ(Attribute(other, "wyx-kind"), "");
}

TEST_F(AccessibleListTest, SelectionFocusAndRowChangesReachTheListeners)
{
    ProfilesKelvoProfilesListCtrl* list = FilledList();
    AtkObject* table = AccessibleOf(list);
    SignalLog selection, descendant, rows, selectedState;
    selection.Connect(table, "selection-changed", SignalLog::Count);
    descendant.Connect(table, "active-descendant-changed", SignalLog::Object);
    rows.Connect(table, "visible-data-changed", SignalLog::Count);
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), 1, 2);
    g_signal_connect(
        cell, "state-change::selected",
        G_CALLBACK(+[](AtkObject*, gchar*, gboolean on, SignalLog* log) { log->count += on ? 1 : 0; }),
        &selectedState);

    list->SetItemState(1, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                       wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
    EXPECT_GE(selection.count, 1);
    EXPECT_EQ(selectedState.count, 1);
    ASSERT_EQ(descendant.count, 1);
    EXPECT_EQ(Position(descendant.last), std::make_pair(1, 0));

    gint* selected = nullptr;
    ASSERT_EQ(atk_table_get_selected_rows(ATK_TABLE(table), &selected), 1);
    EXPECT_EQ(selected[0], 1);
    g_free(selected);
    EXPECT_TRUE(atk_table_is_row_selected(ATK_TABLE(table), 1));
    EXPECT_TRUE(HasState(cell, ATK_STATE_SELECTED));
    EXPECT_EQ(atk_selection_get_selection_count(ATK_SELECTION(table)), 1);
    AtkObject* first = atk_selection_ref_selection(ATK_SELECTION(table), 0);
    EXPECT_EQ(Name(first), "2");
    g_object_unref(first);

    list->InsertItem(3, "4");
    EXPECT_EQ(rows.count, 1);
    EXPECT_EQ(atk_table_get_n_rows(ATK_TABLE(table)), 4);
    list->DeleteAllItems();
    EXPECT_EQ(rows.count, 2);
    EXPECT_TRUE(HasState(cell, ATK_STATE_DEFUNCT)) << "a cell of a row that is gone";
    EXPECT_EQ(Name(cell), "");
    g_object_unref(cell);
}

TEST_F(AccessibleListTest, AVirtualListsCellsAreMadeWhenAskedAndReadOneTextEach)
{
    auto* list = MakeList<CountingList>(wxLC_REPORT | wxLC_VIRTUAL | wxLC_SINGLE_SEL);
    list->SetItemCount(100000);
    ShowMapped(frame);
    AtkObject* table = AccessibleOf(list);
    EXPECT_EQ(atk_object_get_n_accessible_children(table), 300000);

    const long before = list->textCalls;
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), 99999, 2);
    EXPECT_EQ(list->textCalls, before) << "making a cell reads nothing";
    EXPECT_EQ(Name(cell), "r99999c2");
    EXPECT_EQ(list->textCalls, before + 1);

    // Cells a tool no longer holds are let go once enough others were made.
    AtkObject* watched = atk_table_ref_at(ATK_TABLE(table), 0, 0);
    g_object_add_weak_pointer(G_OBJECT(watched), reinterpret_cast<gpointer*>(&watched));
    g_object_unref(watched);
    ASSERT_NE(watched, nullptr) << "kept while recent";
    for (int row = 1; row < 3000 && watched; ++row)
        for (int column = 0; column < 3; ++column)
            g_object_unref(atk_table_ref_at(ATK_TABLE(table), row, column));
    EXPECT_EQ(watched, nullptr);
    EXPECT_EQ(Name(cell), "r99999c2") << "a cell a tool holds still reads";
    g_object_unref(cell);
}

TEST_F(AccessibleListTest, ADestroyedListAnswersAsGoneWhileAToolStillHoldsItsObjects)
{
    ProfilesKelvoProfilesListCtrl* list = FilledList();
    AtkObject* table = ATK_OBJECT(g_object_ref(AccessibleOf(list)));
    AtkObject* cell = atk_table_ref_at(ATK_TABLE(table), 1, 1);
    ASSERT_NE(atk_table_get_column_header(ATK_TABLE(table), 1), nullptr);
    ASSERT_EQ(Name(cell), "b.ps");

    list->Destroy();
    ASSERT_TRUE(guitest::PumpUntil([&] { return HasState(table, ATK_STATE_DEFUNCT); }));

    EXPECT_TRUE(HasState(table, ATK_STATE_DEFUNCT));
    EXPECT_EQ(atk_table_get_n_rows(ATK_TABLE(table)), 0);
    EXPECT_EQ(atk_object_get_n_accessible_children(table), 0);
    EXPECT_EQ(atk_table_ref_at(ATK_TABLE(table), 1, 1), nullptr);
    EXPECT_EQ(atk_table_get_column_header(ATK_TABLE(table), 1), nullptr);
    EXPECT_TRUE(HasState(cell, ATK_STATE_DEFUNCT));
    EXPECT_EQ(Name(cell), "");
    EXPECT_EQ(Text(cell), "");
    EXPECT_EQ(Extents(cell, ATK_XY_SCREEN)[2], -1);

    // The table goes first; the cell a tool still holds then has no table at all.
    g_object_unref(table);
    EXPECT_EQ(atk_object_get_parent(cell), nullptr);
    EXPECT_TRUE(HasState(cell, ATK_STATE_DEFUNCT));
    g_object_unref(cell);
}

TEST_F(AccessibleListTest, AListMadeAfterTheWindowIsShownIsAnnounced)
{
    ShowMapped(frame);
    AtkObject* parent = AccessibleOf(frame);
    ASSERT_NE(parent, nullptr);
    SignalLog added;
    added.Connect(parent, "children-changed::add", SignalLog::IndexAndObject);

    ProfilesKelvoProfilesListCtrl* list = MakeList(wxLC_REPORT | wxLC_SINGLE_SEL);
    ASSERT_GE(added.count, 1);
    EXPECT_EQ(added.last, AccessibleOf(list));
    EXPECT_TRUE(ATK_IS_TABLE(added.last));
}

// ---------------------------------------------------------------- combo box

class AccessibleComboTest : public ::testing::Test
{
protected:
    void SetUp() override
    {
        frame = new wxFrame(nullptr, wxID_ANY, "accessible combo");
        auto* panel = new wxPanel(frame);
        combo = new CustomComboBox;
        combo->Create(panel, wxID_ANY, wxPoint(10, 10), wxSize(160, -1));
        combo->SetName("serverBox");
        for (const char* entry : {"All", "PRN-01", "PRN-02"})
            combo->Append(entry);
        combo->SetSelection(1);
        ShowMapped(frame);
    }
    void TearDown() override
    {
        if (combo->IsPopupShown())
            combo->HidePopup();
        frame->Destroy();
        guitest::Pump(0);
    }

    wxFrame* frame = nullptr;
    CustomComboBox* combo = nullptr;
};

TEST_F(AccessibleComboTest, TheBoxIsAComboBoxWithItsEntriesAsAListShownWhenDropped)
{
    AtkObject* box = AccessibleOf(combo);
    ASSERT_TRUE(box && ATK_IS_SELECTION(box)) << "the get_accessible hook did not take effect";
    EXPECT_EQ(atk_object_get_role(box), ATK_ROLE_COMBO_BOX);
    EXPECT_EQ(Name(box), "PRN-01");
    EXPECT_EQ(Attribute(box, "wyx-kind"), "ComboBox");
    EXPECT_STREQ(atk_object_get_accessible_id(box), "serverBox");
    EXPECT_FALSE(HasState(box, ATK_STATE_EXPANDED));
    ASSERT_EQ(atk_object_get_n_accessible_children(box), 1);

    AtkObject* list = atk_object_ref_accessible_child(box, 0);
    EXPECT_EQ(atk_object_get_role(list), ATK_ROLE_LIST);
    EXPECT_EQ(Attribute(list, "wyx-kind"), "ListBox");
    EXPECT_EQ(atk_object_get_parent(list), box);
    EXPECT_FALSE(HasState(list, ATK_STATE_SHOWING));
    ASSERT_EQ(atk_object_get_n_accessible_children(list), 3);
    const char* entries[] = {"All", "PRN-01", "PRN-02"};
    for (int i = 0; i < 3; ++i)
    {
        AtkObject* entry = atk_object_ref_accessible_child(list, i);
        EXPECT_EQ(Name(entry), entries[i]);
        EXPECT_EQ(atk_object_get_role(entry), ATK_ROLE_LIST_ITEM);
        EXPECT_EQ(atk_object_get_parent(entry), list);
        EXPECT_EQ(HasState(entry, ATK_STATE_SELECTED), i == 1);
        g_object_unref(entry);
    }
    ASSERT_EQ(atk_selection_get_selection_count(ATK_SELECTION(box)), 1);
    AtkObject* selected = atk_selection_ref_selection(ATK_SELECTION(box), 0);
    EXPECT_EQ(Name(selected), "PRN-01");
    g_object_unref(selected);

    // Dropping down shows the list and tells the listeners.
    SignalLog expanded;
    g_signal_connect(box, "state-change::expanded",
                     G_CALLBACK(+[](AtkObject*, gchar*, gboolean, SignalLog* log) { ++log->count; }),
                     &expanded);

    combo->ShowPopup();
    ASSERT_TRUE(
        guitest::PumpUntil([&] { return combo->IsPopupShown() && HasState(box, ATK_STATE_EXPANDED); }));
    EXPECT_TRUE(HasState(box, ATK_STATE_EXPANDED));
    EXPECT_TRUE(HasState(list, ATK_STATE_SHOWING));
    EXPECT_GE(expanded.count, 1);
    AtkObject* entry = atk_object_ref_accessible_child(list, 2);
    EXPECT_TRUE(HasState(entry, ATK_STATE_SHOWING));
    const std::array<int, 4> place = Extents(entry, ATK_XY_SCREEN);
    EXPECT_EQ(place[3], CustomComboBox::kItemHeight);
    EXPECT_GT(place[2], 0);
    EXPECT_EQ(place[1], Extents(list, ATK_XY_SCREEN)[1] + 2 * CustomComboBox::kItemHeight);
    g_object_unref(entry);

    combo->HidePopup();
    ASSERT_TRUE(guitest::PumpUntil([&] { return !combo->IsPopupShown(); }));
    EXPECT_FALSE(HasState(box, ATK_STATE_EXPANDED));
    EXPECT_FALSE(HasState(list, ATK_STATE_SHOWING));
    g_object_unref(list);
}

} // namespace
