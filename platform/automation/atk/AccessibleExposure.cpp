// The self-drawn controls as ATK objects. wxWidgets has no accessibility on
// GTK, and GTK asks an ATK object factory only for its own widget classes, so
// the get_accessible function of the class of wx's client widget is replaced
// once: it answers with our object for the widgets we mark and hands every
// other widget to the function it replaced. GTK's AT-SPI bridge then puts the
// objects on the bus. Everything here that touches GTK, ATK or wx's GTK
// internals stays in this file.
#include "platform/automation/atk/AccessibleExposure.h"

#include "platform/automation/AutomationSource.h"
#include "platform/automation/AutomationText.h"

#include <wx/window.h>

#include <atk/atk.h>
#include <gtk/gtk-a11y.h>
#include <gtk/gtk.h>

#include <cstdint>
#include <deque>
#include <string>
#include <unordered_map>

namespace automation
{
struct ControlState;
struct ItemState;
} // namespace automation

using automation::AutomationSource;
using automation::ControlState;
using automation::ItemState;

// ---------------------------------------------------------------- GObject types
//
// WyxTableAccessible  the list: a table (AtkTable, AtkSelection) on the list's widget
// WyxComboAccessible  the box: a combo box (AtkSelection) on the box's widget
// WyxListAccessible   the box's entries: a list object, child of the combo box
// WyxItemAccessible   one entry or one column heading (AtkComponent, AtkText)
// WyxCellAccessible   one cell of the table (as an item, and AtkTableCell)

struct WyxTableAccessible
{
    GtkWidgetAccessible parent;
};
struct WyxTableAccessibleClass
{
    GtkWidgetAccessibleClass parent_class;
};
struct WyxComboAccessible
{
    GtkWidgetAccessible parent;
};
struct WyxComboAccessibleClass
{
    GtkWidgetAccessibleClass parent_class;
};
struct WyxListAccessible
{
    AtkObject parent;
};
struct WyxListAccessibleClass
{
    AtkObjectClass parent_class;
};
struct WyxItemAccessible
{
    AtkObject parent;
    ItemState* state;
};
struct WyxItemAccessibleClass
{
    AtkObjectClass parent_class;
};
struct WyxCellAccessible
{
    WyxItemAccessible parent;
};
struct WyxCellAccessibleClass
{
    WyxItemAccessibleClass parent_class;
};

namespace
{
void TableInterfaceInit(AtkTableIface* iface);
void SelectionInterfaceInit(AtkSelectionIface* iface);
void ComponentInterfaceInit(AtkComponentIface* iface);
void TextInterfaceInit(AtkTextIface* iface);
void TableCellInterfaceInit(AtkTableCellIface* iface);
} // namespace

G_DEFINE_TYPE_WITH_CODE(WyxTableAccessible, wyx_table_accessible, GTK_TYPE_WIDGET_ACCESSIBLE,
                        G_IMPLEMENT_INTERFACE(ATK_TYPE_TABLE, TableInterfaceInit)
                            G_IMPLEMENT_INTERFACE(ATK_TYPE_SELECTION, SelectionInterfaceInit))
G_DEFINE_TYPE_WITH_CODE(WyxComboAccessible, wyx_combo_accessible, GTK_TYPE_WIDGET_ACCESSIBLE,
                        G_IMPLEMENT_INTERFACE(ATK_TYPE_SELECTION, SelectionInterfaceInit))
G_DEFINE_TYPE_WITH_CODE(WyxListAccessible, wyx_list_accessible, ATK_TYPE_OBJECT,
                        G_IMPLEMENT_INTERFACE(ATK_TYPE_SELECTION, SelectionInterfaceInit)
                            G_IMPLEMENT_INTERFACE(ATK_TYPE_COMPONENT, ComponentInterfaceInit))
G_DEFINE_TYPE_WITH_CODE(WyxItemAccessible, wyx_item_accessible, ATK_TYPE_OBJECT,
                        G_IMPLEMENT_INTERFACE(ATK_TYPE_COMPONENT, ComponentInterfaceInit)
                            G_IMPLEMENT_INTERFACE(ATK_TYPE_TEXT, TextInterfaceInit))
G_DEFINE_TYPE_WITH_CODE(WyxCellAccessible, wyx_cell_accessible, wyx_item_accessible_get_type(),
                        G_IMPLEMENT_INTERFACE(ATK_TYPE_TABLE_CELL, TableCellInterfaceInit))

namespace automation
{

namespace
{

// A virtual list may have 100,000 rows of 8 cells: cells are made when a tool
// asks for one and only this many are kept. A tool reads a cell right after
// asking for it; the bus holds no reference of its own.
constexpr std::size_t kMaxKeptItems = 4096;

enum class ItemKind
{
    Cell,
    ColumnHeader,
    Entry,
};

GQuark StateQuark()
{
    static const GQuark quark = g_quark_from_static_string("wyx-automation-state");
    return quark;
}

GQuark ExposureQuark()
{
    static const GQuark quark = g_quark_from_static_string("wyx-automation-exposure");
    return quark;
}

GQuark OriginalHookQuark()
{
    static const GQuark quark = g_quark_from_static_string("wyx-automation-original-get-accessible");
    return quark;
}

std::string Utf8(const std::u16string& text)
{
    return ToUtf8(text);
}

} // namespace

// What a table, combo box or entry list answers from: the source while the
// control lives, and the child objects made so far.
struct ControlState
{
    const AutomationSource* source = nullptr;
    std::unordered_map<std::uint64_t, AtkObject*> items;
    std::deque<std::uint64_t> itemOrder;
    std::vector<AtkObject*> headers;
    AtkObject* entries = nullptr; // the combo box's list
    AtkObject* owner = nullptr;   // the list's combo box; weak, as an item's owner
    std::string name;             // what get_name last returned, kept until the next call

    ~ControlState()
    {
        Forget();
        if (owner)
            g_object_remove_weak_pointer(G_OBJECT(owner), reinterpret_cast<gpointer*>(&owner));
    }

    void Forget()
    {
        for (auto& item : items)
            g_object_unref(item.second);
        items.clear();
        itemOrder.clear();
        for (AtkObject* header : headers)
            g_object_unref(header);
        headers.clear();
        if (entries)
        {
            g_object_unref(entries);
            entries = nullptr;
        }
    }
};

// One cell, heading or entry: where it is, never a copy of what it shows.
struct ItemState
{
    AtkObject* owner = nullptr; // weak: the owner keeps its items, not the reverse
    ItemKind kind = ItemKind::Cell;
    long row = 0;
    int column = 0;
    bool lastSelected = false;
    std::string text; // what get_name last returned, kept until the next call
};

namespace
{

ControlState* StateOf(AtkObject* object)
{
    return object ? static_cast<ControlState*>(g_object_get_qdata(G_OBJECT(object), StateQuark())) : nullptr;
}

const AutomationSource* SourceOf(AtkObject* object)
{
    const ControlState* state = StateOf(object);
    return state ? state->source : nullptr;
}

void AttachState(AtkObject* object, const AutomationSource* source)
{
    auto* state = new ControlState;
    state->source = source;
    g_object_set_qdata_full(G_OBJECT(object), StateQuark(), state,
                            [](gpointer data) { delete static_cast<ControlState*>(data); });
}

ItemState* ItemOf(gpointer object)
{
    return reinterpret_cast<WyxItemAccessible*>(object)->state;
}

// The source an item reads: its owner's, while both live.
const AutomationSource* SourceOfItem(const ItemState& item)
{
    return item.owner ? SourceOf(item.owner) : nullptr;
}

bool ItemExists(const ItemState& item)
{
    const AutomationSource* source = SourceOfItem(item);
    if (!source)
        return false;
    if (item.kind == ItemKind::ColumnHeader)
        return item.column < source->ColumnCount();
    return item.row < source->ItemCount() &&
           (item.kind != ItemKind::Cell || item.column < source->ColumnCount());
}

std::u16string ItemText(const ItemState& item)
{
    const AutomationSource* source = SourceOfItem(item);
    if (!source || !ItemExists(item))
        return std::u16string();
    if (item.kind == ItemKind::ColumnHeader)
    {
        ColumnInfo info;
        return source->Column(item.column, info) ? info.heading : std::u16string();
    }
    return source->ItemText(item.row, item.kind == ItemKind::Entry ? 0 : item.column);
}

AtkObject* NewItem(AtkObject* owner, ItemKind kind, long row, int column)
{
    const GType type =
        kind == ItemKind::Cell ? wyx_cell_accessible_get_type() : wyx_item_accessible_get_type();
    auto* object = ATK_OBJECT(g_object_new(type, nullptr));
    ItemState* item = ItemOf(object);
    item->owner = owner;
    g_object_add_weak_pointer(G_OBJECT(owner), reinterpret_cast<gpointer*>(&item->owner));
    item->kind = kind;
    item->row = row;
    item->column = column;
    // Not atk_object_set_parent: it takes a reference on the owner, which
    // keeps its items, and neither would ever be freed.
    object->role = kind == ItemKind::Cell           ? ATK_ROLE_TABLE_CELL
                   : kind == ItemKind::ColumnHeader ? ATK_ROLE_COLUMN_HEADER
                                                    : ATK_ROLE_LIST_ITEM;
    object->layer = ATK_LAYER_WIDGET;
    return object;
}

// The owner's item at (row, column), made on first use and kept a while.
AtkObject* KeptItem(AtkObject* owner, ItemKind kind, long row, int column)
{
    ControlState* state = StateOf(owner);
    if (!state || !state->source || row < 0 || column < 0)
        return nullptr;
    const std::uint64_t key = (std::uint64_t(std::uint32_t(row)) << 32) | std::uint32_t(column);
    auto found = state->items.find(key);
    if (found != state->items.end())
        return found->second;
    while (state->items.size() >= kMaxKeptItems)
    {
        const std::uint64_t oldest = state->itemOrder.front();
        state->itemOrder.pop_front();
        auto old = state->items.find(oldest);
        if (old != state->items.end())
        {
            g_object_unref(old->second);
            state->items.erase(old);
        }
    }
    AtkObject* item = NewItem(owner, kind, row, column);
    state->items.emplace(key, item);
    state->itemOrder.push_back(key);
    return item;
}

AtkObject* ColumnHeader(AtkObject* table, int column)
{
    ControlState* state = StateOf(table);
    if (!state || !state->source || column < 0 || column >= state->source->ColumnCount())
        return nullptr;
    while (static_cast<int>(state->headers.size()) <= column)
        state->headers.push_back(
            NewItem(table, ItemKind::ColumnHeader, 0, static_cast<int>(state->headers.size())));
    return state->headers[static_cast<std::size_t>(column)];
}

AtkObject* EntryList(AtkObject* combo)
{
    ControlState* state = StateOf(combo);
    if (!state || !state->source || !state->source->Popup())
        return nullptr;
    if (!state->entries)
    {
        state->entries = ATK_OBJECT(g_object_new(wyx_list_accessible_get_type(), nullptr));
        AttachState(state->entries, state->source->Popup());
        state->entries->role = ATK_ROLE_LIST;
        state->entries->layer = ATK_LAYER_POPUP;
        ControlState* entries = StateOf(state->entries);
        entries->owner = combo;
        g_object_add_weak_pointer(G_OBJECT(combo), reinterpret_cast<gpointer*>(&entries->owner));
    }
    return state->entries;
}

bool RowSelected(const AutomationSource& source, long row)
{
    return (source.ItemState(row) & itemstate::kSelected) != 0;
}

// The rows a table calls selected, or the one entry of a box or list.
std::vector<long> SelectedRows(const AutomationSource& source)
{
    std::vector<long> rows;
    if (source.Kind() != ControlKind::ListCtrl)
    {
        if (source.Current() >= 0 && source.Current() < source.ItemCount())
            rows.push_back(source.Current());
        return rows;
    }
    const long current = source.Current();
    if (source.IsSingleSelection())
    {
        if (current >= 0 && current < source.ItemCount() && RowSelected(source, current))
            rows.push_back(current);
        return rows;
    }
    const long count = source.ItemCount();
    for (long row = 0; row < count && static_cast<long>(rows.size()) < source.SelectedCount(); ++row)
    {
        if (RowSelected(source, row))
            rows.push_back(row);
    }
    return rows;
}

AtkAttributeSet* AddAttribute(AtkAttributeSet* set, const char* name, const std::string& value)
{
    auto* attribute = static_cast<AtkAttribute*>(g_malloc(sizeof(AtkAttribute)));
    attribute->name = g_strdup(name);
    attribute->value = g_strdup(value.c_str());
    return g_slist_append(set, attribute);
}

// ---------------------------------------------------------------- widget objects: table and combo box

const gchar* ControlName(AtkObject* object)
{
    ControlState* state = StateOf(object);
    if (!state || !state->source)
        return object->name;
    std::u16string name = state->source->AccessibleName();
    // A box is called by its selected entry when nothing names it.
    if (name.empty() && state->source->Kind() == ControlKind::ComboBox)
    {
        const long current = state->source->Current();
        if (current >= 0)
            name = state->source->ItemText(current, 0);
    }
    state->name = Utf8(name);
    return state->name.c_str();
}

AtkAttributeSet* ControlAttributes(AtkObject* object, AtkAttributeSet* inherited)
{
    const AutomationSource* source = SourceOf(object);
    if (!source)
        return inherited;
    const char16_t* kind = KindName(source->Kind());
    return AddAttribute(inherited, "wyx-kind", kind ? Utf8(kind) : std::string());
}

gint TableChildCount(AtkObject* object)
{
    const AutomationSource* source = SourceOf(object);
    if (!source)
        return 0;
    const long long cells = static_cast<long long>(source->ItemCount()) * source->ColumnCount();
    return static_cast<gint>(std::min<long long>(cells, G_MAXINT));
}

AtkObject* TableChild(AtkObject* object, gint index)
{
    const AutomationSource* source = SourceOf(object);
    if (!source || index < 0 || index >= TableChildCount(object))
        return nullptr;
    const int columns = source->ColumnCount();
    AtkObject* cell = KeptItem(object, ItemKind::Cell, index / columns, index % columns);
    return cell ? ATK_OBJECT(g_object_ref(cell)) : nullptr;
}

AtkStateSet* ControlStates(AtkObject* object, AtkStateSet* states)
{
    const AutomationSource* source = SourceOf(object);
    if (!source)
        return states;
    atk_state_set_add_state(states, ATK_STATE_FOCUSABLE);
    if (source->HasFocus())
        atk_state_set_add_state(states, ATK_STATE_FOCUSED);
    if (source->Kind() == ControlKind::ListCtrl)
    {
        // Tools must not walk a hundred thousand cells to cache them.
        atk_state_set_add_state(states, ATK_STATE_MANAGES_DESCENDANTS);
        if (!source->IsSingleSelection())
            atk_state_set_add_state(states, ATK_STATE_MULTISELECTABLE);
    }
    else
    {
        atk_state_set_add_state(states, ATK_STATE_EXPANDABLE);
        if (source->IsDroppedDown())
            atk_state_set_add_state(states, ATK_STATE_EXPANDED);
    }
    return states;
}

} // namespace
} // namespace automation

using namespace automation;

// ---------------------------------------------------------------- WyxTableAccessible

static const gchar* TableGetName(AtkObject* object)
{
    return ControlName(object);
}

static AtkAttributeSet* TableGetAttributes(AtkObject* object)
{
    auto* parentClass = ATK_OBJECT_CLASS(wyx_table_accessible_parent_class);
    return ControlAttributes(object,
                             parentClass->get_attributes ? parentClass->get_attributes(object) : nullptr);
}

static AtkStateSet* TableRefStateSet(AtkObject* object)
{
    return ControlStates(object, ATK_OBJECT_CLASS(wyx_table_accessible_parent_class)->ref_state_set(object));
}

static void wyx_table_accessible_class_init(WyxTableAccessibleClass* klass)
{
    AtkObjectClass* atk = ATK_OBJECT_CLASS(klass);
    atk->get_name = TableGetName;
    atk->get_n_children = TableChildCount;
    atk->ref_child = TableChild;
    atk->ref_state_set = TableRefStateSet;
    atk->get_attributes = TableGetAttributes;
}

static void wyx_table_accessible_init(WyxTableAccessible*) {}

// ---------------------------------------------------------------- WyxComboAccessible

static gint ComboChildCount(AtkObject* object)
{
    return EntryList(object) ? 1 : 0;
}

static AtkObject* ComboChild(AtkObject* object, gint index)
{
    AtkObject* list = index == 0 ? EntryList(object) : nullptr;
    return list ? ATK_OBJECT(g_object_ref(list)) : nullptr;
}

static AtkAttributeSet* ComboGetAttributes(AtkObject* object)
{
    auto* parentClass = ATK_OBJECT_CLASS(wyx_combo_accessible_parent_class);
    return ControlAttributes(object,
                             parentClass->get_attributes ? parentClass->get_attributes(object) : nullptr);
}

static AtkStateSet* ComboRefStateSet(AtkObject* object)
{
    return ControlStates(object, ATK_OBJECT_CLASS(wyx_combo_accessible_parent_class)->ref_state_set(object));
}

static void wyx_combo_accessible_class_init(WyxComboAccessibleClass* klass)
{
    AtkObjectClass* atk = ATK_OBJECT_CLASS(klass);
    atk->get_name = TableGetName;
    atk->get_n_children = ComboChildCount;
    atk->ref_child = ComboChild;
    atk->ref_state_set = ComboRefStateSet;
    atk->get_attributes = ComboGetAttributes;
}

static void wyx_combo_accessible_init(WyxComboAccessible*) {}

// ---------------------------------------------------------------- WyxListAccessible

static AtkObject* ListOwner(AtkObject* object)
{
    const ControlState* state = StateOf(object);
    return state ? state->owner : nullptr;
}

static const gchar* ListGetName(AtkObject* object)
{
    AtkObject* owner = ListOwner(object);
    return owner ? atk_object_get_name(owner) : "";
}

static AtkObject* ListGetParent(AtkObject* object)
{
    return ListOwner(object);
}

static gint ListIndexInParent(AtkObject*)
{
    return 0;
}

static gint ListChildCount(AtkObject* object)
{
    const AutomationSource* source = SourceOf(object);
    return source ? static_cast<gint>(source->ItemCount()) : 0;
}

static AtkObject* ListChild(AtkObject* object, gint index)
{
    if (index < 0 || index >= ListChildCount(object))
        return nullptr;
    AtkObject* entry = KeptItem(object, ItemKind::Entry, index, 0);
    return entry ? ATK_OBJECT(g_object_ref(entry)) : nullptr;
}

static AtkStateSet* ListRefStateSet(AtkObject* object)
{
    AtkStateSet* states = atk_state_set_new();
    const AutomationSource* source = SourceOf(object);
    AtkObject* owner = ListOwner(object);
    const AutomationSource* box = owner ? SourceOf(owner) : nullptr;
    if (!source || !box)
    {
        atk_state_set_add_state(states, ATK_STATE_DEFUNCT);
        return states;
    }
    atk_state_set_add_state(states, ATK_STATE_ENABLED);
    atk_state_set_add_state(states, ATK_STATE_SENSITIVE);
    atk_state_set_add_state(states, ATK_STATE_MANAGES_DESCENDANTS);
    if (box->IsDroppedDown())
    {
        atk_state_set_add_state(states, ATK_STATE_VISIBLE);
        atk_state_set_add_state(states, ATK_STATE_SHOWING);
    }
    return states;
}

static AtkAttributeSet* ListGetAttributes(AtkObject* object)
{
    return ControlAttributes(object, nullptr);
}

static void wyx_list_accessible_class_init(WyxListAccessibleClass* klass)
{
    AtkObjectClass* atk = ATK_OBJECT_CLASS(klass);
    atk->get_name = ListGetName;
    atk->get_parent = ListGetParent;
    atk->get_index_in_parent = ListIndexInParent;
    atk->get_n_children = ListChildCount;
    atk->ref_child = ListChild;
    atk->ref_state_set = ListRefStateSet;
    atk->get_attributes = ListGetAttributes;
}

static void wyx_list_accessible_init(WyxListAccessible*) {}

// ---------------------------------------------------------------- WyxItemAccessible, WyxCellAccessible

static const gchar* ItemGetName(AtkObject* object)
{
    ItemState* item = ItemOf(object);
    item->text = Utf8(ItemText(*item));
    return item->text.c_str();
}

static AtkObject* ItemGetParent(AtkObject* object)
{
    return ItemOf(object)->owner;
}

static gint ItemIndexInParent(AtkObject* object)
{
    const ItemState* item = ItemOf(object);
    const AutomationSource* source = SourceOfItem(*item);
    if (!source || !ItemExists(*item))
        return -1;
    switch (item->kind)
    {
    case ItemKind::Cell:
        return static_cast<gint>(item->row * source->ColumnCount() + item->column);
    case ItemKind::Entry:
        return static_cast<gint>(item->row);
    case ItemKind::ColumnHeader:
        break;
    }
    return -1;
}

// Whether the item is in view now.
static bool ItemShowing(const ItemState& item, const AutomationSource& source)
{
    if (item.kind == ItemKind::ColumnHeader)
        return source.IsShown();
    if (item.kind == ItemKind::Entry)
    {
        AtkObject* box = ListOwner(item.owner);
        const AutomationSource* boxSource = box ? SourceOf(box) : nullptr;
        if (!boxSource || !boxSource->IsDroppedDown())
            return false;
    }
    return source.IsShown() && item.row >= source.TopIndex() && item.row <= source.LastVisible();
}

static AtkStateSet* ItemRefStateSet(AtkObject* object)
{
    AtkStateSet* states = atk_state_set_new();
    const ItemState* item = ItemOf(object);
    const AutomationSource* source = SourceOfItem(*item);
    if (!source || !ItemExists(*item))
    {
        atk_state_set_add_state(states, ATK_STATE_DEFUNCT);
        return states;
    }
    atk_state_set_add_state(states, ATK_STATE_ENABLED);
    atk_state_set_add_state(states, ATK_STATE_SENSITIVE);
    atk_state_set_add_state(states, ATK_STATE_VISIBLE);
    atk_state_set_add_state(states, ATK_STATE_TRANSIENT);
    if (ItemShowing(*item, *source))
        atk_state_set_add_state(states, ATK_STATE_SHOWING);
    if (item->kind == ItemKind::ColumnHeader)
        return states;
    atk_state_set_add_state(states, ATK_STATE_SELECTABLE);
    const bool isList = source->Kind() == ControlKind::ListCtrl;
    if (isList ? RowSelected(*source, item->row) : source->Current() == item->row)
        atk_state_set_add_state(states, ATK_STATE_SELECTED);
    if (isList)
    {
        atk_state_set_add_state(states, ATK_STATE_FOCUSABLE);
        if (source->Current() == item->row && source->HasFocus())
            atk_state_set_add_state(states, ATK_STATE_FOCUSED);
    }
    return states;
}

static void ItemFinalize(GObject* object)
{
    ItemState* item = ItemOf(object);
    if (item->owner)
        g_object_remove_weak_pointer(G_OBJECT(item->owner), reinterpret_cast<gpointer*>(&item->owner));
    delete item;
    G_OBJECT_CLASS(wyx_item_accessible_parent_class)->finalize(object);
}

static void wyx_item_accessible_class_init(WyxItemAccessibleClass* klass)
{
    G_OBJECT_CLASS(klass)->finalize = ItemFinalize;
    AtkObjectClass* atk = ATK_OBJECT_CLASS(klass);
    atk->get_name = ItemGetName;
    atk->get_parent = ItemGetParent;
    atk->get_index_in_parent = ItemIndexInParent;
    atk->ref_state_set = ItemRefStateSet;
}

static void wyx_item_accessible_init(WyxItemAccessible* self)
{
    self->state = new ItemState;
}

static void wyx_cell_accessible_class_init(WyxCellAccessibleClass*) {}

static void wyx_cell_accessible_init(WyxCellAccessible*) {}

namespace
{

// ---------------------------------------------------------------- extents

// Where the owner's client area starts on the screen, and where its window
// starts: the difference between screen and window coordinates.
bool ClientOrigin(const AutomationSource& source, int& x, int& y)
{
    Rect screen;
    if (!source.ScreenRect(screen))
        return false;
    x = screen.left;
    y = screen.top;
    return true;
}

// The item's rectangle in its owner's client area.
bool ItemRectInOwner(const ItemState& item, const AutomationSource& source, Rect& rect)
{
    switch (item.kind)
    {
    case ItemKind::Cell:
    {
        if (!source.CellRect(item.row, item.column, rect))
            return false;
        const int header = source.HeaderHeight().value_or(0);
        rect.top += header;
        rect.bottom += header;
        return true;
    }
    case ItemKind::ColumnHeader:
    {
        ColumnInfo info;
        const AutomationSource* header = source.Header();
        int left = header ? header->ScrolledLeft() : 0;
        for (int column = 0; column < item.column; ++column)
        {
            if (source.Column(column, info))
                left += std::max(0, info.width);
        }
        if (!source.Column(item.column, info))
            return false;
        rect = Rect{left, 0, left + std::max(0, info.width), source.HeaderHeight().value_or(0)};
        return true;
    }
    case ItemKind::Entry:
    {
        if (item.row < source.TopIndex() || item.row > source.LastVisible())
            return false;
        int y = 0;
        for (long row = source.TopIndex(); row < item.row; ++row)
            y += source.ItemHeight(row);
        rect = Rect{0, y, source.ClientRect().Width(), y + source.ItemHeight(item.row)};
        return true;
    }
    }
    return false;
}

// The top-left corner of the top-level window on the screen, as GTK places
// the owner: screen coordinates less this are window coordinates.
void WindowOrigin(AtkObject* owner, int& x, int& y)
{
    x = 0;
    y = 0;
    if (!GTK_IS_ACCESSIBLE(owner))
        return;
    GtkWidget* widget = gtk_accessible_get_widget(GTK_ACCESSIBLE(owner));
    GtkWidget* top = widget ? gtk_widget_get_toplevel(widget) : nullptr;
    GdkWindow* window = top ? gtk_widget_get_window(top) : nullptr;
    if (window)
        gdk_window_get_origin(window, &x, &y);
}

void ItemExtents(AtkComponent* component, gint* x, gint* y, gint* width, gint* height, AtkCoordType coords)
{
    *x = *y = *width = *height = -1;
    const ItemState* item = ItemOf(component);
    const AutomationSource* source = SourceOfItem(*item);
    Rect rect;
    int left = 0;
    int top = 0;
    if (!source || !ItemExists(*item) || !ItemRectInOwner(*item, *source, rect))
        return;
    if (coords == ATK_XY_PARENT)
    {
        *x = rect.left;
        *y = rect.top;
        *width = rect.Width();
        *height = rect.Height();
        return;
    }
    // Not on the screen (a hidden page, a closed popup): nowhere.
    if (!ClientOrigin(*source, left, top))
        return;
    *width = rect.Width();
    *height = rect.Height();
    *x = left + rect.left;
    *y = top + rect.top;
    if (coords == ATK_XY_WINDOW)
    {
        // The box's entries stand in a popup window of their own.
        int windowX = left;
        int windowY = top;
        if (item->kind != ItemKind::Entry)
            WindowOrigin(item->owner, windowX, windowY);
        *x -= windowX;
        *y -= windowY;
    }
}

void ListExtents(AtkComponent* component, gint* x, gint* y, gint* width, gint* height, AtkCoordType coords)
{
    *x = *y = *width = *height = -1;
    const AutomationSource* source = SourceOf(ATK_OBJECT(component));
    Rect screen;
    if (!source || !source->ScreenRect(screen))
        return;
    *width = screen.Width();
    *height = screen.Height();
    *x = coords == ATK_XY_SCREEN ? screen.left : 0;
    *y = coords == ATK_XY_SCREEN ? screen.top : 0;
}

AtkLayer WidgetLayer(AtkComponent*)
{
    return ATK_LAYER_WIDGET;
}

AtkLayer PopupLayer(AtkComponent*)
{
    return ATK_LAYER_POPUP;
}

void ComponentInterfaceInit(AtkComponentIface* iface)
{
    // One interface for two types: items and the entry list.
    iface->get_extents =
        [](AtkComponent* component, gint* x, gint* y, gint* width, gint* height, AtkCoordType coords)
    {
        if (G_TYPE_CHECK_INSTANCE_TYPE(component, wyx_item_accessible_get_type()))
            ItemExtents(component, x, y, width, height, coords);
        else
            ListExtents(component, x, y, width, height, coords);
    };
    iface->get_layer = [](AtkComponent* component)
    {
        return G_TYPE_CHECK_INSTANCE_TYPE(component, wyx_item_accessible_get_type()) ? WidgetLayer(component)
                                                                                     : PopupLayer(component);
    };
}

// ---------------------------------------------------------------- text of items

gchar* ItemTextRange(AtkText* text, gint start, gint end)
{
    const std::string utf8 = Utf8(ItemText(*ItemOf(text)));
    const glong length = g_utf8_strlen(utf8.c_str(), -1);
    if (end < 0 || end > length)
        end = static_cast<gint>(length);
    if (start < 0 || start > end)
        return g_strdup("");
    return g_utf8_substring(utf8.c_str(), start, end);
}

gint ItemCharacterCount(AtkText* text)
{
    const std::string utf8 = Utf8(ItemText(*ItemOf(text)));
    return static_cast<gint>(g_utf8_strlen(utf8.c_str(), -1));
}

gunichar ItemCharacterAt(AtkText* text, gint offset)
{
    const std::string utf8 = Utf8(ItemText(*ItemOf(text)));
    if (offset < 0 || offset >= g_utf8_strlen(utf8.c_str(), -1))
        return 0;
    return g_utf8_get_char(g_utf8_offset_to_pointer(utf8.c_str(), offset));
}

void TextInterfaceInit(AtkTextIface* iface)
{
    iface->get_text = ItemTextRange;
    iface->get_character_count = ItemCharacterCount;
    iface->get_character_at_offset = ItemCharacterAt;
    iface->get_caret_offset = [](AtkText*) { return 0; };
}

// ---------------------------------------------------------------- table cells

void TableCellInterfaceInit(AtkTableCellIface* iface)
{
    iface->get_column_span = [](AtkTableCell*) { return 1; };
    iface->get_row_span = [](AtkTableCell*) { return 1; };
    iface->get_position = [](AtkTableCell* cell, gint* row, gint* column) -> gboolean
    {
        const ItemState* item = ItemOf(cell);
        *row = static_cast<gint>(item->row);
        *column = item->column;
        return ItemExists(*item);
    };
    iface->get_row_column_span = [](AtkTableCell* cell, gint* row, gint* column, gint* rowSpan,
                                    gint* columnSpan) -> gboolean
    {
        const ItemState* item = ItemOf(cell);
        *row = static_cast<gint>(item->row);
        *column = item->column;
        *rowSpan = 1;
        *columnSpan = 1;
        return ItemExists(*item);
    };
    iface->get_table = [](AtkTableCell* cell) -> AtkObject*
    {
        AtkObject* owner = ItemOf(cell)->owner;
        return owner ? ATK_OBJECT(g_object_ref(owner)) : nullptr;
    };
    iface->get_column_header_cells = [](AtkTableCell* cell)
    {
        GPtrArray* cells = g_ptr_array_new_with_free_func(g_object_unref);
        const ItemState* item = ItemOf(cell);
        if (AtkObject* header = item->owner ? ColumnHeader(item->owner, item->column) : nullptr)
            g_ptr_array_add(cells, g_object_ref(header));
        return cells;
    };
    iface->get_row_header_cells = [](AtkTableCell*)
    { return g_ptr_array_new_with_free_func(g_object_unref); };
}

// ---------------------------------------------------------------- AtkTable

const AutomationSource* TableSource(AtkTable* table)
{
    return SourceOf(ATK_OBJECT(table));
}

void TableInterfaceInit(AtkTableIface* iface)
{
    iface->ref_at = [](AtkTable* table, gint row, gint column) -> AtkObject*
    {
        const AutomationSource* source = TableSource(table);
        if (!source || row < 0 || column < 0 || row >= source->ItemCount() || column >= source->ColumnCount())
            return nullptr;
        AtkObject* cell = KeptItem(ATK_OBJECT(table), ItemKind::Cell, row, column);
        return cell ? ATK_OBJECT(g_object_ref(cell)) : nullptr;
    };
    iface->get_index_at = [](AtkTable* table, gint row, gint column) -> gint
    {
        const AutomationSource* source = TableSource(table);
        if (!source || row < 0 || column < 0 || row >= source->ItemCount() || column >= source->ColumnCount())
            return -1;
        return row * source->ColumnCount() + column;
    };
    iface->get_column_at_index = [](AtkTable* table, gint index) -> gint
    {
        const AutomationSource* source = TableSource(table);
        return source && source->ColumnCount() > 0 && index >= 0 ? index % source->ColumnCount() : -1;
    };
    iface->get_row_at_index = [](AtkTable* table, gint index) -> gint
    {
        const AutomationSource* source = TableSource(table);
        return source && source->ColumnCount() > 0 && index >= 0 ? index / source->ColumnCount() : -1;
    };
    iface->get_n_columns = [](AtkTable* table) -> gint
    {
        const AutomationSource* source = TableSource(table);
        return source ? source->ColumnCount() : 0;
    };
    iface->get_n_rows = [](AtkTable* table) -> gint
    {
        const AutomationSource* source = TableSource(table);
        return source ? static_cast<gint>(source->ItemCount()) : 0;
    };
    iface->get_column_extent_at = [](AtkTable*, gint, gint) { return 1; };
    iface->get_row_extent_at = [](AtkTable*, gint, gint) { return 1; };
    iface->get_column_description = [](AtkTable* table, gint column) -> const gchar*
    {
        AtkObject* header = ColumnHeader(ATK_OBJECT(table), column);
        return header ? atk_object_get_name(header) : nullptr;
    };
    iface->get_column_header = [](AtkTable* table, gint column)
    { return ColumnHeader(ATK_OBJECT(table), column); };
    iface->get_selected_rows = [](AtkTable* table, gint** selected) -> gint
    {
        const AutomationSource* source = TableSource(table);
        const std::vector<long> rows = source ? SelectedRows(*source) : std::vector<long>();
        if (selected)
        {
            *selected = rows.empty() ? nullptr : g_new(gint, rows.size());
            for (std::size_t i = 0; i < rows.size(); ++i)
                (*selected)[i] = static_cast<gint>(rows[i]);
        }
        return static_cast<gint>(rows.size());
    };
    iface->get_selected_columns = [](AtkTable*, gint** selected) -> gint
    {
        if (selected)
            *selected = nullptr;
        return 0;
    };
    iface->is_row_selected = [](AtkTable* table, gint row) -> gboolean
    {
        const AutomationSource* source = TableSource(table);
        return source && row >= 0 && row < source->ItemCount() && RowSelected(*source, row);
    };
    iface->is_selected = [](AtkTable* table, gint row, gint column) -> gboolean
    {
        const AutomationSource* source = TableSource(table);
        return source && row >= 0 && row < source->ItemCount() && column >= 0 &&
               column < source->ColumnCount() && RowSelected(*source, row);
    };
    iface->is_column_selected = [](AtkTable*, gint) -> gboolean { return FALSE; };
}

// ---------------------------------------------------------------- AtkSelection

// A table's selection is its selected rows' first cells; a box's and a list's
// the selected entry.
void SelectionInterfaceInit(AtkSelectionIface* iface)
{
    iface->get_selection_count = [](AtkSelection* selection) -> gint
    {
        const AutomationSource* source = SourceOf(ATK_OBJECT(selection));
        return source ? static_cast<gint>(SelectedRows(*source).size()) : 0;
    };
    iface->ref_selection = [](AtkSelection* selection, gint index) -> AtkObject*
    {
        AtkObject* object = ATK_OBJECT(selection);
        const AutomationSource* source = SourceOf(object);
        if (!source || index < 0)
            return nullptr;
        const std::vector<long> rows = SelectedRows(*source);
        if (static_cast<std::size_t>(index) >= rows.size())
            return nullptr;
        AtkObject* item = nullptr;
        if (source->Kind() == ControlKind::ListCtrl)
            item = KeptItem(object, ItemKind::Cell, rows[std::size_t(index)], 0);
        else if (source->Kind() == ControlKind::ComboBox)
            item = EntryList(object)
                       ? KeptItem(EntryList(object), ItemKind::Entry, rows[std::size_t(index)], 0)
                       : nullptr;
        else
            item = KeptItem(object, ItemKind::Entry, rows[std::size_t(index)], 0);
        return item ? ATK_OBJECT(g_object_ref(item)) : nullptr;
    };
    iface->is_child_selected = [](AtkSelection* selection, gint index) -> gboolean
    {
        const AutomationSource* source = SourceOf(ATK_OBJECT(selection));
        if (!source || index < 0)
            return FALSE;
        if (source->Kind() == ControlKind::ComboBox)
            return FALSE; // its one child is the list
        const long row = source->Kind() == ControlKind::ListCtrl && source->ColumnCount() > 0
                             ? index / source->ColumnCount()
                             : index;
        for (long selected : SelectedRows(*source))
        {
            if (selected == row)
                return TRUE;
        }
        return FALSE;
    };
}

// ---------------------------------------------------------------- the hook

AtkObject* HookedGetAccessible(GtkWidget* widget);

using GetAccessible = AtkObject* (*)(GtkWidget*);

// The function the hook replaced for the widget's class, or for the nearest
// class above it that was hooked.
GetAccessible OriginalFor(GtkWidget* widget)
{
    for (GType type = G_OBJECT_TYPE(widget); type != 0; type = g_type_parent(type))
    {
        if (auto original = reinterpret_cast<GetAccessible>(g_type_get_qdata(type, OriginalHookQuark())))
            return original;
    }
    return nullptr;
}

void InstallHook(GtkWidget* widget)
{
    GtkWidgetClass* klass = GTK_WIDGET_GET_CLASS(widget);
    if (klass->get_accessible == HookedGetAccessible)
        return;
    g_type_set_qdata(G_OBJECT_TYPE(widget), OriginalHookQuark(),
                     reinterpret_cast<gpointer>(klass->get_accessible));
    klass->get_accessible = HookedGetAccessible;
}

} // namespace

namespace automation
{

namespace
{

// One control marked as ours on its widget: the hook answers with its object.
class ExposedControl
{
public:
    ExposedControl(wxWindow& window, const AutomationSource& source) : source(source)
    {
        // wx draws into its client widget; the outer one may be a scrolled window around it.
        widget = window.m_wxwindow ? window.m_wxwindow : window.m_widget;
        if (!widget)
            return;
        InstallHook(widget);
        g_object_set_qdata(G_OBJECT(widget), ExposureQuark(), this);
        AnnounceIfShown();
    }

    ~ExposedControl()
    {
        if (!widget)
            return;
        g_object_set_qdata(G_OBJECT(widget), ExposureQuark(), nullptr);
        if (!accessible)
            return;
        // Objects a tool still holds read nothing from here on. The widget is
        // unset, not marked defunct by us: GTK marks it and tells the tools.
        if (ControlState* state = StateOf(accessible))
        {
            state->source = nullptr;
            if (state->entries)
                if (ControlState* entries = StateOf(state->entries))
                {
                    entries->source = nullptr;
                    entries->Forget();
                }
            state->Forget();
        }
        gtk_accessible_set_widget(GTK_ACCESSIBLE(accessible), nullptr);
        g_object_unref(accessible);
    }

    AtkObject* Accessible()
    {
        if (accessible)
            return accessible;
        const bool isList = source.Kind() == ControlKind::ListCtrl;
        const GType type = isList ? wyx_table_accessible_get_type() : wyx_combo_accessible_get_type();
        accessible = ATK_OBJECT(g_object_new(type, "widget", widget, nullptr));
        AttachState(accessible, &source);
        atk_object_initialize(accessible, widget);
        atk_object_set_role(accessible, isList ? ATK_ROLE_TABLE : ATK_ROLE_COMBO_BOX);
        const std::string id = Utf8(source.AccessibleId());
        if (!id.empty())
            atk_object_set_accessible_id(accessible, id.c_str());
        return accessible;
    }

    // A control made after its window was shown is news to a tool that has
    // already read the window: nobody else tells it.
    void AnnounceIfShown()
    {
        GtkWidget* top = gtk_widget_get_toplevel(widget);
        GtkWidget* parent = gtk_widget_get_parent(widget);
        if (!parent || !top || !gtk_widget_get_visible(top))
            return;
        AtkObject* parentAccessible = gtk_widget_get_accessible(parent);
        AtkObject* self = gtk_widget_get_accessible(widget);
        if (parentAccessible && self)
            g_signal_emit_by_name(parentAccessible, "children-changed::add",
                                  atk_object_get_index_in_parent(self), self);
    }

    ExposedControl(const ExposedControl&) = delete;
    ExposedControl& operator=(const ExposedControl&) = delete;

    const AutomationSource& source;
    GtkWidget* widget = nullptr;
    AtkObject* accessible = nullptr;
};

AtkObject* AccessibleOfWidget(GtkWidget* widget)
{
    auto* exposed = static_cast<ExposedControl*>(g_object_get_qdata(G_OBJECT(widget), ExposureQuark()));
    return exposed ? exposed->Accessible() : nullptr;
}

} // namespace

struct AccessibleExposure::Impl : ExposedControl
{
    using ExposedControl::ExposedControl;
};

AccessibleExposure::AccessibleExposure(wxWindow& window, const AutomationSource& source)
    : m_impl(std::make_unique<Impl>(window, source))
{
}

AccessibleExposure::~AccessibleExposure() = default;

void AccessibleExposure::RowsChanged()
{
    if (AtkObject* table = m_impl->accessible)
        g_signal_emit_by_name(table, "visible-data-changed");
}

void AccessibleExposure::SelectionChanged()
{
    AtkObject* object = m_impl->accessible;
    if (!object)
        return;
    // The items a tool has been given learn their new state one by one.
    ControlState* state = StateOf(object);
    if (state && m_impl->source.Kind() == ControlKind::ComboBox)
        state = state->entries ? StateOf(state->entries) : nullptr;
    if (state && state->source)
    {
        const AutomationSource& source = *state->source;
        for (auto& entry : state->items)
        {
            ItemState* item = ItemOf(entry.second);
            const bool selected =
                ItemExists(*item) && (source.Kind() == ControlKind::ListCtrl ? RowSelected(source, item->row)
                                                                             : source.Current() == item->row);
            if (selected != item->lastSelected)
            {
                item->lastSelected = selected;
                atk_object_notify_state_change(entry.second, ATK_STATE_SELECTED, selected);
            }
        }
    }
    g_signal_emit_by_name(object, "selection-changed");
    if (m_impl->source.Kind() == ControlKind::ComboBox)
        NameChanged();
}

void AccessibleExposure::CurrentChanged()
{
    AtkObject* object = m_impl->accessible;
    const long current = m_impl->source.Current();
    if (!object || current < 0 || m_impl->source.ColumnCount() == 0)
        return;
    if (AtkObject* cell = KeptItem(object, ItemKind::Cell, current, 0))
    {
        g_signal_emit_by_name(object, "active-descendant-changed", cell);
        if (m_impl->source.HasFocus())
            atk_object_notify_state_change(cell, ATK_STATE_FOCUSED, TRUE);
    }
}

void AccessibleExposure::FocusChanged(bool focused)
{
    if (AtkObject* object = m_impl->accessible)
        atk_object_notify_state_change(object, ATK_STATE_FOCUSED, focused);
}

void AccessibleExposure::DroppedChanged()
{
    AtkObject* object = m_impl->accessible;
    if (!object)
        return;
    const bool dropped = m_impl->source.IsDroppedDown();
    atk_object_notify_state_change(object, ATK_STATE_EXPANDED, dropped);
    if (ControlState* state = StateOf(object); state && state->entries)
    {
        atk_object_notify_state_change(state->entries, ATK_STATE_VISIBLE, dropped);
        atk_object_notify_state_change(state->entries, ATK_STATE_SHOWING, dropped);
    }
}

void AccessibleExposure::NameChanged()
{
    if (AtkObject* object = m_impl->accessible)
        g_object_notify(G_OBJECT(object), "accessible-name");
}

void* AccessibleExposure::AccessibleOf(wxWindow& window)
{
    GtkWidget* widget = window.m_wxwindow ? window.m_wxwindow : window.m_widget;
    return widget ? gtk_widget_get_accessible(widget) : nullptr;
}

} // namespace automation

namespace
{

AtkObject* HookedGetAccessible(GtkWidget* widget)
{
    if (AtkObject* ours = automation::AccessibleOfWidget(widget))
        return ours;
    const GetAccessible original = OriginalFor(widget);
    return original ? original(widget) : nullptr;
}

} // namespace
