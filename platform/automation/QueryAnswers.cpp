#include "platform/automation/QueryAnswers.h"

#include "platform/automation/AutomationText.h"
#include "platform/automation/NativeQueries.h"

#include <cstring>
#include <string>

namespace automation
{

using namespace native;

namespace
{

using Answer = std::optional<std::intptr_t>;
constexpr Answer kDefault = std::nullopt;

// State bit pairs: native, GUI library.
constexpr unsigned kStatePairs[][2] = {
    {kLvisFocused, itemstate::kFocused},
    {kLvisSelected, itemstate::kSelected},
    {kLvisCut, itemstate::kCut},
    {kLvisDropHilited, itemstate::kDropHighlighted},
};

constexpr unsigned kMaskPairs[][2] = {
    {kLvifState, guimask::kState},
    {kLvifText, guimask::kText},
    {kLvifImage, guimask::kImage},
    {kLvifParam, guimask::kData},
    {kLvifPassthrough, guimask::kPassThrough},
};

constexpr unsigned kUpperBits = 0xFFFF0000u;

template <class T> bool Read(const MemoryRegions& memory, std::intptr_t address, T& value)
{
    if (!IsReadable(memory, static_cast<std::uintptr_t>(address), sizeof(T)))
        return false;
    std::memcpy(&value, reinterpret_cast<const void*>(address), sizeof(T));
    return true;
}

// A structure the query fills: read whole, changed, written back whole.
template <class T> bool ReadForWriting(const MemoryRegions& memory, std::intptr_t address, T& value)
{
    if (!IsWritable(memory, static_cast<std::uintptr_t>(address), sizeof(T)))
        return false;
    std::memcpy(&value, reinterpret_cast<const void*>(address), sizeof(T));
    return true;
}

template <class T> void WriteBack(std::intptr_t address, const T& value)
{
    std::memcpy(reinterpret_cast<void*>(address), &value, sizeof(T));
}

native::RECT ToNative(const Rect& rect)
{
    return native::RECT{rect.left, rect.top, rect.right, rect.bottom};
}

// A text cut to a buffer of `capacity` characters with its terminator.
class TextCopy
{
public:
    TextCopy(const std::u16string& text, std::int64_t capacity)
        : m_length(capacity <= 0 ? 0 : std::min<std::size_t>(text.size(), std::size_t(capacity) - 1)),
          m_text(text), m_capacity(capacity)
    {
    }
    // Whether it can go there; a buffer with no room takes nothing and is never touched.
    bool Fits(const MemoryRegions& memory, const char16_t* buffer) const
    {
        return m_capacity <= 0 || IsWritable(memory, reinterpret_cast<std::uintptr_t>(buffer),
                                             (m_length + 1) * sizeof(char16_t));
    }
    void Put(char16_t* buffer) const
    {
        if (m_capacity <= 0)
            return;
        const char16_t terminator = 0;
        std::memcpy(buffer, m_text.data(), m_length * sizeof(char16_t));
        std::memcpy(buffer + m_length, &terminator, sizeof terminator);
    }

private:
    std::size_t m_length;
    const std::u16string& m_text;
    std::int64_t m_capacity;
};

bool InRange(const AutomationSource& source, std::uintptr_t item)
{
    const long count = source.ItemCount();
    return count > 0 && item < static_cast<std::uintptr_t>(count);
}

int NativeFormat(Alignment alignment)
{
    switch (alignment)
    {
    case Alignment::Right:
        return 1;
    case Alignment::Centre:
        return 2;
    case Alignment::Left:
        break;
    }
    return 0;
}

// The text a caller searches for: it must end within its region and within
// kMaxSearchText characters.
std::optional<std::u16string> ReadSearchText(const MemoryRegions& memory, std::intptr_t address)
{
    const auto start = static_cast<std::uintptr_t>(address);
    if (!IsReadable(memory, start, sizeof(char16_t)))
        return std::nullopt;
    const std::optional<MemoryRegion> region = memory.RegionOf(start);
    if (!region)
        return std::nullopt;
    const std::size_t room =
        std::min<std::uintptr_t>((region->end - start) / sizeof(char16_t), kMaxSearchText);
    std::u16string text;
    for (std::size_t i = 0; i < room; ++i)
    {
        char16_t c = 0;
        std::memcpy(&c, reinterpret_cast<const char*>(start) + i * sizeof(char16_t), sizeof c);
        if (c == 0)
            return text;
        text += c;
    }
    return std::nullopt;
}

// From the entry after `after` to the end, then from the start up to it; the
// whole list when `after` is no entry.
Answer FindExact(const AutomationSource& source, std::uintptr_t after, const std::u16string& text)
{
    const long count = source.ItemCount();
    const bool from = count > 0 && after < static_cast<std::uintptr_t>(count);
    const long first = from ? static_cast<long>(after) + 1 : 0;
    for (long i = first; i < count; ++i)
    {
        if (EqualIgnoringCase(source.ItemText(i, 0), text))
            return i;
    }
    for (long i = 0; from && i < static_cast<long>(after); ++i)
    {
        if (EqualIgnoringCase(source.ItemText(i, 0), text))
            return i;
    }
    return -1;
}

// ---------------------------------------------------------------- all kinds

Answer KindQuery(const AutomationSource& source, std::uintptr_t wParam, std::intptr_t lParam,
                 const MemoryRegions& memory)
{
    const char16_t* name = KindName(source.Kind());
    if (wParam != kKindQuery || name == nullptr)
        return 0;
    std::uint16_t capacity = 0;
    if (!Read(memory, lParam, capacity) || capacity == 0 ||
        !IsWritable(memory, static_cast<std::uintptr_t>(lParam), std::size_t(capacity) * sizeof(char16_t)))
        return 0;
    const std::u16string text(name);
    if (capacity <= text.size())
        return 0;
    TextCopy(text, capacity).Put(reinterpret_cast<char16_t*>(lParam));
    return 1;
}

// ---------------------------------------------------------------- list

Answer ItemRectQuery(const AutomationSource& source, long item, int column, std::intptr_t lParam,
                     const MemoryRegions& memory)
{
    native::RECT out{};
    if (!ReadForWriting(memory, lParam, out))
        return kDefault;
    Rect rect;
    if (column < 0 ? !source.ItemRect(item, rect) : !source.CellRect(item, column, rect))
        return kDefault;
    // Rows stand below the header and the line under it.
    if (const std::optional<int> header = source.HeaderHeight())
    {
        rect.top += *header + 1;
        rect.bottom += *header + 1;
    }
    WriteBack(lParam, ToNative(rect));
    return 1;
}

Answer GetItemQuery(const AutomationSource& source, std::intptr_t lParam, const MemoryRegions& memory)
{
    LVITEMW item{};
    if (!ReadForWriting(memory, lParam, item))
        return kDefault;
    if (item.iItem < 0 || !InRange(source, static_cast<std::uintptr_t>(item.iItem)) || item.iSubItem < 0 ||
        (item.iSubItem > 0 && item.iSubItem >= source.ColumnCount()))
        return kDefault;
    const unsigned mask = NativeItemMaskToGui(item.mask);
    const std::u16string text = (mask & guimask::kText) ? source.ItemText(item.iItem, item.iSubItem) : u"";
    const TextCopy copy(text, item.cchTextMax);
    if ((mask & guimask::kText) && !copy.Fits(memory, item.pszText))
        return kDefault;

    if (mask & guimask::kText)
        copy.Put(item.pszText);
    if (mask & guimask::kImage)
        item.iImage = source.ItemImage(item.iItem, item.iSubItem);
    if (mask & (guimask::kData | guimask::kPassThrough))
        item.lParam = source.ItemData(item.iItem);
    if (mask & guimask::kState)
    {
        const unsigned asked = NativeStateToGui(item.stateMask);
        const unsigned state = source.ItemState(item.iItem) & asked;
        item.state = GuiStateToNative((item.state & kUpperBits) | state);
    }
    item.mask = GuiItemMaskToNative(mask);
    WriteBack(lParam, item);
    return 1;
}

// A column's heading, width and format into a caller's LVCOLUMNW or HDITEMW:
// the list and its header answer the same from the same column, each in its
// own structure and mask bits. Only the fields asked for are reported back.
template <class Item, std::int32_t Item::*Width>
Answer ColumnItemQuery(const AutomationSource& source, std::uintptr_t column, std::intptr_t lParam,
                       const MemoryRegions& memory, unsigned textBit, unsigned widthBit, unsigned formatBit)
{
    Item out{};
    ColumnInfo info;
    if (column >= static_cast<std::uintptr_t>(std::max(0, source.ColumnCount())) ||
        !ReadForWriting(memory, lParam, out) || !source.Column(static_cast<int>(column), info))
        return kDefault;
    const TextCopy copy(info.heading, out.cchTextMax);
    if ((out.mask & textBit) && !copy.Fits(memory, out.pszText))
        return kDefault;
    if (out.mask & textBit)
        copy.Put(out.pszText);
    if (out.mask & widthBit)
        out.*Width = info.width;
    if (out.mask & formatBit)
        out.fmt = NativeFormat(info.alignment);
    out.mask &= textBit | widthBit | formatBit;
    WriteBack(lParam, out);
    return 1;
}

Answer ListQuery(const AutomationSource& source, unsigned message, std::uintptr_t wParam,
                 std::intptr_t lParam, const MemoryRegions& memory)
{
    switch (message)
    {
    case kLvmGetItemCount:
        return source.ItemCount();
    case kLvmGetItemRect:
        return InRange(source, wParam) ? ItemRectQuery(source, long(wParam), -1, lParam, memory) : kDefault;
    case kLvmGetHeader:
        return source.Header() ? static_cast<std::intptr_t>(source.Header()->Handle()) : 0;
    case kLvmGetTopIndex:
        return source.TopIndex();
    case kLvmGetItemState:
    {
        if (!InRange(source, wParam))
            return kDefault;
        const auto mask = static_cast<unsigned>(lParam);
        return GuiStateToNative(source.ItemState(long(wParam)) & NativeStateToGui(mask)) & mask;
    }
    case kLvmGetSelectedCount:
    {
        if (!source.IsSingleSelection())
            return source.SelectedCount();
        const long current = source.Current();
        return current >= 0 && (source.ItemState(current) & itemstate::kSelected) ? 1 : 0;
    }
    case kLvmGetSubItemRect:
    {
        // Sub-items are numbered as the native list numbers them: 0 is the first column.
        native::RECT in{};
        if (!InRange(source, wParam) || !Read(memory, lParam, in) || in.top < 0 ||
            in.top >= source.ColumnCount())
            return kDefault;
        return ItemRectQuery(source, long(wParam), in.top, lParam, memory);
    }
    case kLvmGetItemW:
        return GetItemQuery(source, lParam, memory);
    case kLvmColumnCountQuery:
        return InRange(source, wParam) ? Answer(source.ColumnCount()) : kDefault;
    case kLvmZeroItemQuery:
        return InRange(source, wParam) ? Answer(0) : kDefault;
    case kLvmZeroQuery:
        return 0;
    case kLvmGetColumnW:
        return ColumnItemQuery<LVCOLUMNW, &LVCOLUMNW::cx>(source, wParam, lParam, memory, kLvcfText,
                                                          kLvcfWidth, kLvcfFmt);
    case kHdmGetItemCount:
        return source.ColumnCount();
    default:
        return kDefault;
    }
}

// ---------------------------------------------------------------- header

Answer HeaderItemRect(const AutomationSource& source, std::uintptr_t column, std::intptr_t lParam,
                      const MemoryRegions& memory)
{
    native::RECT out{};
    const int count = source.ColumnCount();
    if (column >= static_cast<std::uintptr_t>(std::max(0, count)) || !ReadForWriting(memory, lParam, out))
        return 0;
    int left = source.ScrolledLeft();
    ColumnInfo info;
    for (int i = 0; i < static_cast<int>(column); ++i)
    {
        if (source.Column(i, info))
            left += std::max(0, info.width);
    }
    if (!source.Column(static_cast<int>(column), info))
        return 0;
    const Rect client = source.ClientRect();
    WriteBack(lParam, native::RECT{left, client.top, left + std::max(0, info.width), client.bottom});
    return 1;
}

Answer HeaderQuery(const AutomationSource& source, unsigned message, std::uintptr_t wParam,
                   std::intptr_t lParam, const MemoryRegions& memory)
{
    switch (message)
    {
    case kHdmGetItemCount:
        return source.ColumnCount();
    case kHdmGetItemRect:
        return HeaderItemRect(source, wParam, lParam, memory);
    case kHdmGetItemW:
        // The image is looked up but not handed out.
        return ColumnItemQuery<HDITEMW, &HDITEMW::cxy>(source, wParam, lParam, memory, kHdiText, kHdiWidth,
                                                       kHdiFormat);
    default:
        return kDefault;
    }
}

// ---------------------------------------------------------------- boxes

Answer TextQuery(const AutomationSource& source, std::uintptr_t item, std::intptr_t lParam,
                 const MemoryRegions& memory)
{
    if (!InRange(source, item))
        return -1;
    const std::u16string text = source.ItemText(long(item), 0);
    char16_t* buffer = reinterpret_cast<char16_t*>(lParam);
    if (!IsWritable(memory, static_cast<std::uintptr_t>(lParam), (text.size() + 1) * sizeof(char16_t)))
        return -1;
    TextCopy(text, std::int64_t(text.size()) + 1).Put(buffer);
    return static_cast<std::intptr_t>(text.size());
}

Answer TextLengthQuery(const AutomationSource& source, std::uintptr_t item)
{
    if (!InRange(source, item))
        return -1;
    return static_cast<std::intptr_t>(source.ItemText(long(item), 0).size());
}

Answer FindQuery(const AutomationSource& source, std::uintptr_t after, std::intptr_t lParam,
                 const MemoryRegions& memory)
{
    const std::optional<std::u16string> text = ReadSearchText(memory, lParam);
    return text ? FindExact(source, after, *text) : -1;
}

Answer ComboInfoQuery(const AutomationSource& source, std::intptr_t lParam, const MemoryRegions& memory)
{
    COMBOBOXINFO info{};
    if (!ReadForWriting(memory, lParam, info))
        return -1;
    const bool dropped = source.IsDroppedDown();
    info.rcItem = native::RECT{0, 0, 0, 0};
    info.rcButton = ToNative(source.ClientRect());
    info.stateButton = dropped ? kStateSystemPressed : 0;
    info.hwndCombo = source.Handle();
    info.hwndList = dropped && source.Popup() ? source.Popup()->Handle() : 0;
    WriteBack(lParam, info);
    return 1;
}

Answer ComboQuery(const AutomationSource& source, unsigned message, std::uintptr_t wParam,
                  std::intptr_t lParam, const MemoryRegions& memory)
{
    switch (message)
    {
    case kCbGetCount:
        return source.ItemCount();
    case kCbGetCurSel:
        return source.Current();
    case kCbGetLbText:
        return TextQuery(source, wParam, lParam, memory);
    case kCbGetLbTextLen:
        return TextLengthQuery(source, wParam);
    case kCbGetDroppedState:
        return source.IsDroppedDown() ? 1 : 0;
    case kCbFindStringExact:
        return FindQuery(source, wParam, lParam, memory);
    case kCbGetComboBoxInfo:
        return ComboInfoQuery(source, lParam, memory);
    default:
        return kDefault;
    }
}

Answer PopupItemRect(const AutomationSource& source, std::uintptr_t item, std::intptr_t lParam,
                     const MemoryRegions& memory)
{
    const long top = source.TopIndex();
    const long last = source.LastVisible();
    native::RECT out{};
    if (!InRange(source, item) || long(item) < top || long(item) > last ||
        !ReadForWriting(memory, lParam, out))
        return -1;
    int y = 0;
    for (long i = top; i < long(item); ++i)
        y += source.ItemHeight(i);
    WriteBack(lParam, native::RECT{0, y, source.ClientRect().Width(), y + source.ItemHeight(long(item))});
    return 1;
}

Answer PopupQuery(const AutomationSource& source, unsigned message, std::uintptr_t wParam,
                  std::intptr_t lParam, const MemoryRegions& memory)
{
    switch (message)
    {
    case kLbGetCurSel:
        return source.Current();
    case kLbGetText:
        return TextQuery(source, wParam, lParam, memory);
    case kLbGetTextLen:
        return TextLengthQuery(source, wParam);
    case kLbGetCount:
        return source.ItemCount();
    case kLbGetTopIndex:
        return source.TopIndex();
    case kLbGetItemRect:
        return PopupItemRect(source, wParam, lParam, memory);
    case kLbFindStringExact:
        return FindQuery(source, wParam, lParam, memory);
    default:
        return kDefault;
    }
}

} // namespace

const char16_t* KindName(ControlKind kind)
{
    switch (kind)
    {
    case ControlKind::ListCtrl:
        return u"ListCtrl";
    case ControlKind::ComboBox:
        return u"ComboBox";
    case ControlKind::ListBox:
        return u"ListBox";
    case ControlKind::Header:
        break;
    }
    return nullptr;
}

unsigned NativeStateToGui(unsigned state)
{
    unsigned out = state & kUpperBits;
    for (const auto& pair : kStatePairs)
    {
        if (state & pair[0])
            out |= pair[1];
    }
    return out;
}

unsigned GuiStateToNative(unsigned state)
{
    unsigned out = state & kUpperBits;
    for (const auto& pair : kStatePairs)
    {
        if (state & pair[1])
            out |= pair[0];
    }
    return out;
}

unsigned NativeItemMaskToGui(unsigned mask)
{
    unsigned out = (mask & kLvifDiSetItem) ? guimask::kSetItem : 0;
    for (const auto& pair : kMaskPairs)
    {
        if (mask & pair[0])
            out |= pair[1];
    }
    return out;
}

unsigned GuiItemMaskToNative(unsigned mask)
{
    unsigned out = 0;
    for (const auto& pair : kMaskPairs)
    {
        if (mask & pair[1])
            out |= pair[0];
    }
    return out;
}

std::optional<std::intptr_t> AnswerQuery(const AutomationSource& source, unsigned message,
                                         std::uintptr_t wParam, std::intptr_t lParam,
                                         const QueryContext& context)
{
    const ControlKind kind = source.Kind();
    if (message != 0 && message == context.kindMessage && kind != ControlKind::Header)
        return KindQuery(source, wParam, lParam, context.memory);
    switch (kind)
    {
    case ControlKind::ListCtrl:
        return ListQuery(source, message, wParam, lParam, context.memory);
    case ControlKind::Header:
        return HeaderQuery(source, message, wParam, lParam, context.memory);
    case ControlKind::ComboBox:
        return ComboQuery(source, message, wParam, lParam, context.memory);
    case ControlKind::ListBox:
        return PopupQuery(source, message, wParam, lParam, context.memory);
    }
    return kDefault;
}

} // namespace automation
