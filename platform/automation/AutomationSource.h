#pragma once

#include <cstdint>
#include <optional>
#include <string>

// What an outside tool may read of a control the program draws itself, with
// no window in sight: the native query answers and the accessibility bridge
// both read a control through this, so the rules of their answers are tested
// and fuzzed over plain objects.
namespace automation
{

enum class ControlKind
{
    ListCtrl, // the themed report list
    Header,   // its column header
    ComboBox, // the filter box
    ListBox,  // the filter box's popup list
};

// The name a tool is told for a kind, or nullptr: the header has none.
const char16_t* KindName(ControlKind kind);

// Edges in pixels, as the native RECT holds them.
struct Rect
{
    int left = 0;
    int top = 0;
    int right = 0;
    int bottom = 0;

    int Width() const { return right - left; }
    int Height() const { return bottom - top; }
    bool operator==(const Rect& other) const
    {
        return left == other.left && top == other.top && right == other.right && bottom == other.bottom;
    }
};

enum class Alignment
{
    Left,
    Right,
    Centre,
};

struct ColumnInfo
{
    std::u16string heading;
    int width = -1; // -1: never set
    Alignment alignment = Alignment::Left;
    int image = -1;
};

// Item state bits as the GUI library numbers them.
namespace itemstate
{
constexpr unsigned kDropHighlighted = 0x1;
constexpr unsigned kFocused = 0x2;
constexpr unsigned kSelected = 0x4;
constexpr unsigned kCut = 0x8;
} // namespace itemstate

// One readable control. Every operation only reads; an index out of range
// answers empty, -1 or false rather than failing. The defaults are what a
// kind without that part answers.
class AutomationSource
{
public:
    virtual ~AutomationSource() = default;

    virtual ControlKind Kind() const = 0;
    // What tools know the window by; 0 for none.
    virtual std::uintptr_t Handle() const = 0;
    // What a person calls the control ("Jobs in progress"); may be empty.
    virtual std::u16string AccessibleName() const { return std::u16string(); }
    // A stable name a script can look the control up by.
    virtual std::u16string AccessibleId() const { return std::u16string(); }

    // Items: the rows of a list, the entries of a box.
    virtual long ItemCount() const = 0;
    virtual std::u16string ItemText(long item, int column) const = 0;
    // A box's selected entry; a list's current (focused) row; -1 for none.
    virtual long Current() const { return -1; }
    virtual long TopIndex() const { return 0; }
    // The last item at least partly in view, -1 when none is.
    virtual long LastVisible() const { return -1; }

    // Lists: per-item state, images and data; cells' rectangles in the rows
    // window; the header and how high it stands over the rows.
    virtual unsigned ItemState(long item) const { return 0; }
    virtual int ItemImage(long item, int column) const { return -1; }
    virtual std::intptr_t ItemData(long item) const { return 0; }
    virtual bool IsSingleSelection() const { return true; }
    virtual long SelectedCount() const { return 0; }
    virtual bool ItemRect(long item, Rect& rect) const { return false; }
    virtual bool CellRect(long item, int column, Rect& rect) const { return false; }
    virtual const AutomationSource* Header() const { return nullptr; }
    // The header's height while it is shown, nothing when it is not.
    virtual std::optional<int> HeaderHeight() const { return std::nullopt; }
    // Whether the part that holds the keyboard focus for the control has it.
    virtual bool HasFocus() const { return false; }

    // Columns, of a list or of its header.
    virtual int ColumnCount() const { return 0; }
    virtual bool Column(int column, ColumnInfo& info) const { return false; }
    // The header's horizontal scroll: its first column's left edge.
    virtual int ScrolledLeft() const { return 0; }

    // Boxes: entry heights, the popup, and whether it is shown.
    virtual int ItemHeight(long item) const { return 0; }
    virtual bool IsDroppedDown() const { return false; }
    virtual const AutomationSource* Popup() const { return nullptr; }

    // The client area in its own coordinates, and the window on the screen.
    virtual Rect ClientRect() const { return Rect(); }
    virtual bool ScreenRect(Rect& rect) const { return false; }
    virtual bool IsShown() const { return true; }
};

} // namespace automation
