// The native query answers of the lists and boxes, over plain controls and a
// memory map that holds only the test's own buffers.
#include "FakeAutomationSource.h"

#include "platform/automation/NativeQueries.h"
#include "platform/automation/QueryAnswers.h"
#include "platform/automation/WindowMessages.h"

#include <gtest/gtest.h>

#include <cstring>

using namespace automation;
using namespace automation::native;
using automationtest::FakeSource;
using automationtest::Region;

namespace
{

constexpr unsigned kKind = 0xC123;

// Buffers the queries may touch: the first half writable, the second read-only.
struct Arena
{
    alignas(16) unsigned char bytes[4096] = {};
    RegionList memory{{Region(bytes, 2048), Region(bytes + 2048, 2048, false)}};

    template <class T> T* At(size_t offset) { return reinterpret_cast<T*>(bytes + offset); }
    std::intptr_t Address(size_t offset) { return reinterpret_cast<std::intptr_t>(bytes + offset); }
    // An address whose structure would run past the end of the arena's last region.
    std::intptr_t NearEnd(size_t size) { return Address(sizeof bytes - size + 1); }
};

std::optional<std::intptr_t> Ask(Arena& arena, const AutomationSource& source, unsigned message,
                                 std::uintptr_t wParam, std::intptr_t lParam)
{
    return AnswerQuery(source, message, wParam, lParam, QueryContext{kKind, arena.memory});
}

std::u16string TextAt(const char16_t* text)
{
    return std::u16string(text);
}

FakeSource JobList()
{
    FakeSource list;
    list.rows = {{u"1", u"a.pdf", u"PDF"}, {u"2", u"b.ps", u"PostScript"}, {u"3", u"c.tif", u"TIFF"}};
    list.states = {0, itemstate::kSelected, itemstate::kFocused};
    list.columns = {{u"No.", 40, Alignment::Left, -1},
                    {u"File Name", 120, Alignment::Right, 2},
                    {u"Format", -1, Alignment::Centre, -1}};
    list.current = 2;
    list.top = 1;
    return list;
}

FakeSource Box(ControlKind kind)
{
    FakeSource box;
    box.kind = kind;
    box.rows = {{u"All"}, {u"PRN-01"}, {u"prn-02"}, {u"Ärger"}};
    box.current = 1;
    box.top = 1;
    box.lastVisible = 2;
    box.client = Rect{0, 0, 110, 54};
    return box;
}

// ---------------------------------------------------------------- kind query

struct KindCase
{
    const char* name;
    ControlKind kind;
    std::uintptr_t wParam;
    std::uint16_t capacity;
    size_t offset; // where the buffer lies in the arena
    std::optional<std::intptr_t> answer;
    const char16_t* written; // nullptr: the buffer is left as it was
};

class KindQueryTest : public ::testing::TestWithParam<KindCase>
{
};

TEST_P(KindQueryTest, AnswersTheKindNameWhenTheBufferHoldsItWithItsTerminator)
{
    const KindCase& c = GetParam();
    Arena arena;
    FakeSource source;
    source.kind = c.kind;
    char16_t* buffer = arena.At<char16_t>(c.offset);
    std::memcpy(buffer, &c.capacity, sizeof c.capacity);
    const std::optional<std::intptr_t> answer = Ask(arena, source, kKind, c.wParam, arena.Address(c.offset));
    EXPECT_EQ(answer, c.answer);
    if (c.written)
    {
        EXPECT_EQ(TextAt(buffer), c.written);
    }
    else
    {
        std::uint16_t first = 0;
        std::memcpy(&first, buffer, sizeof first);
        EXPECT_EQ(first, c.capacity) << "the buffer was written";
    }
}

INSTANTIATE_TEST_SUITE_P(
    Kinds, KindQueryTest,
    ::testing::Values(
        KindCase{"ListWithRoom", ControlKind::ListCtrl, kKindQuery, 9, 0, 1, u"ListCtrl"},
        KindCase{"ListCapacityEqualToLength", ControlKind::ListCtrl, kKindQuery, 8, 0, 0, nullptr},
        KindCase{"ComboBox", ControlKind::ComboBox, kKindQuery, 64, 0, 1, u"ComboBox"},
        KindCase{"PopupList", ControlKind::ListBox, kKindQuery, 8, 0, 1, u"ListBox"},
        KindCase{"OtherWParam", ControlKind::ListCtrl, 101, 64, 0, 0, nullptr},
        KindCase{"HeaderHasNone", ControlKind::Header, kKindQuery, 64, 0, std::nullopt, nullptr},
        KindCase{"ReadOnlyBuffer", ControlKind::ListCtrl, kKindQuery, 64, 2048, 0, nullptr},
        KindCase{"CapacityBeyondItsRegion", ControlKind::ListCtrl, kKindQuery, 1100, 0, 0, nullptr},
        KindCase{"ZeroCapacity", ControlKind::ComboBox, kKindQuery, 0, 0, 0, nullptr}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(KindQuery, BadPointersAnswerZero)
{
    Arena arena;
    FakeSource source;
    for (std::intptr_t pointer : {std::intptr_t(0), std::intptr_t(8), arena.NearEnd(2) + 1})
        EXPECT_EQ(Ask(arena, source, kKind, kKindQuery, pointer), 0) << pointer;
}

// ---------------------------------------------------------------- translations

TEST(StateTranslation, EachNativeBitHasItsGuiBitAndTheUpperBitsPass)
{
    const unsigned pairs[][2] = {
        {kLvisFocused, itemstate::kFocused}, {kLvisSelected, itemstate::kSelected},
        {kLvisCut, itemstate::kCut},         {kLvisDropHilited, itemstate::kDropHighlighted},
        {0xABCD0000u, 0xABCD0000u},          {0x00F0u, 0}};
    for (const auto& pair : pairs)
    {
        EXPECT_EQ(NativeStateToGui(pair[0]), pair[1]) << std::hex << pair[0];
        if (pair[1] != 0)
            EXPECT_EQ(GuiStateToNative(pair[1]), pair[0]) << std::hex << pair[1];
    }
}

TEST(MaskTranslation, FieldsMapBothWaysAndSetItemOnlyComesIn)
{
    const unsigned pairs[][2] = {{kLvifState, guimask::kState},   {kLvifText, guimask::kText},
                                 {kLvifImage, guimask::kImage},   {kLvifParam, guimask::kData},
                                 {0x8000, guimask::kPassThrough}, {kLvifDiSetItem, guimask::kSetItem}};
    for (const auto& pair : pairs)
        EXPECT_EQ(NativeItemMaskToGui(pair[0]), pair[1]) << std::hex << pair[0];
    for (const auto& pair : pairs)
        EXPECT_EQ(GuiItemMaskToNative(pair[1]), pair[0] == kLvifDiSetItem ? 0u : pair[0])
            << std::hex << pair[1];
}

// ---------------------------------------------------------------- list

struct ListCase
{
    const char* name;
    unsigned message;
    std::uintptr_t wParam;
    std::intptr_t lParam;
    std::optional<std::intptr_t> answer;
};

class ListScalarTest : public ::testing::TestWithParam<ListCase>
{
};

TEST_P(ListScalarTest, Answers)
{
    const ListCase& c = GetParam();
    Arena arena;
    FakeSource header;
    header.kind = ControlKind::Header;
    header.handle = 0x2000;
    FakeSource list = JobList();
    list.header = &header;
    EXPECT_EQ(Ask(arena, list, c.message, c.wParam, c.lParam), c.answer);
}

constexpr unsigned kSelFoc = kLvisSelected | kLvisFocused;

INSTANTIATE_TEST_SUITE_P(
    Messages, ListScalarTest,
    ::testing::Values(
        ListCase{"ItemCount", kLvmGetItemCount, 0, 0, 3}, ListCase{"Header", kLvmGetHeader, 0, 0, 0x2000},
        ListCase{"TopIndex", kLvmGetTopIndex, 0, 0, 1},
        ListCase{"SelectedNotFocusedAskedSelected", kLvmGetItemState, 1, kLvisSelected, 0x2},
        ListCase{"SelectedAskedFocused", kLvmGetItemState, 1, kLvisFocused, 0},
        ListCase{"FocusedAskedBoth", kLvmGetItemState, 2, kSelFoc, 0x1},
        ListCase{"StateOutOfRange", kLvmGetItemState, 3, kSelFoc, std::nullopt},
        ListCase{"SingleSelectionCurrentNotSelected", kLvmGetSelectedCount, 0, 0, 0},
        ListCase{"ColumnsOfAnItem", kLvmColumnCountQuery, 2, 0, 3},
        ListCase{"ColumnsOfNoItem", kLvmColumnCountQuery, 3, 0, std::nullopt},
        ListCase{"ZeroForAnItem", kLvmZeroItemQuery, 0, 0, 0},
        ListCase{"ZeroForNoItem", kLvmZeroItemQuery, 7, 0, std::nullopt},
        ListCase{"Zero", kLvmZeroQuery, 99, 0, 0}, ListCase{"HeaderItemCount", kHdmGetItemCount, 0, 0, 3},
        ListCase{"ComboMessage", kCbGetCount, 0, 0, std::nullopt},
        ListCase{"KindWithOtherWParam", kKind, 5, 0, 0}, ListCase{"Unknown", 0x1001, 0, 0, std::nullopt}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(ListQuery, SelectedCountOfASingleSelectionListFollowsTheCurrentItem)
{
    Arena arena;
    FakeSource list = JobList();
    list.current = 1;
    EXPECT_EQ(Ask(arena, list, kLvmGetSelectedCount, 0, 0), 1);
    list.current = -1;
    EXPECT_EQ(Ask(arena, list, kLvmGetSelectedCount, 0, 0), 0);
    list.singleSelection = false;
    list.states = {itemstate::kSelected, itemstate::kSelected, 0};
    EXPECT_EQ(Ask(arena, list, kLvmGetSelectedCount, 0, 0), 2);
}

TEST(ListQuery, ItemRectanglesStandBelowTheShownHeaderAndItsLine)
{
    Arena arena;
    FakeSource list = JobList();
    auto* rect = arena.At<native::RECT>(0);
    EXPECT_EQ(Ask(arena, list, kLvmGetItemRect, 2, arena.Address(0)), 1);
    EXPECT_EQ(rect->top, 20);
    EXPECT_EQ(rect->bottom, 40);

    list.headerHeight = 25;
    EXPECT_EQ(Ask(arena, list, kLvmGetItemRect, 2, arena.Address(0)), 1);
    EXPECT_EQ(rect->left, 0);
    EXPECT_EQ(rect->top, 46);
    EXPECT_EQ(rect->right, 300);
    EXPECT_EQ(rect->bottom, 66);

    *rect = native::RECT{0, 2, 0, 0}; // sub-item 2: the third column
    EXPECT_EQ(Ask(arena, list, kLvmGetSubItemRect, 1, arena.Address(0)), 1);
    EXPECT_EQ(rect->left, 160);
    EXPECT_EQ(rect->right, 159);
    EXPECT_EQ(rect->top, 26);

    *rect = native::RECT{0, 3, 0, 0};
    EXPECT_EQ(Ask(arena, list, kLvmGetSubItemRect, 1, arena.Address(0)), std::nullopt);
    EXPECT_EQ(Ask(arena, list, kLvmGetItemRect, 3, arena.Address(0)), std::nullopt);
    EXPECT_EQ(Ask(arena, list, kLvmGetItemRect, 0, arena.Address(2048)), std::nullopt) << "read-only";
    EXPECT_EQ(Ask(arena, list, kLvmGetItemRect, 0, arena.NearEnd(sizeof(native::RECT))), std::nullopt);
}

struct GetItemCase
{
    const char* name;
    unsigned mask;
    int item;
    int subItem;
    int capacity;
    std::optional<std::intptr_t> answer;
    const char16_t* text; // expected in the buffer; nullptr: untouched
    unsigned maskBack;
};

class GetItemTest : public ::testing::TestWithParam<GetItemCase>
{
};

TEST_P(GetItemTest, FillsTheAskedFields)
{
    const GetItemCase& c = GetParam();
    Arena arena;
    FakeSource list = JobList();
    auto* item = arena.At<LVITEMW>(0);
    char16_t* text = arena.At<char16_t>(512);
    std::memcpy(text, u"untouched", sizeof u"untouched");
    *item = LVITEMW{};
    item->mask = c.mask;
    item->iItem = c.item;
    item->iSubItem = c.subItem;
    item->state = 0x00030000;
    item->stateMask = kSelFoc;
    item->pszText = text;
    item->cchTextMax = c.capacity;
    item->iImage = -9;
    EXPECT_EQ(Ask(arena, list, kLvmGetItemW, 0, arena.Address(0)), c.answer);
    EXPECT_EQ(TextAt(text), c.text ? c.text : u"untouched");
    if (!c.answer)
        return;
    EXPECT_EQ(item->mask, c.maskBack);
    if (c.mask & kLvifImage)
        EXPECT_EQ(item->iImage, c.subItem == 1 ? 7 : -1);
    if (c.mask & (kLvifParam | kLvifPassthrough))
        EXPECT_EQ(item->lParam, 1000 + c.item);
    if (c.mask & kLvifState)
        EXPECT_EQ(item->state, c.item == 1 ? 0x00030002u : 0x00030000u);
}

INSTANTIATE_TEST_SUITE_P(
    Fields, GetItemTest,
    ::testing::Values(GetItemCase{"TextFits", kLvifText, 1, 2, 64, 1, u"PostScript", kLvifText},
                      GetItemCase{"TextCutWithTerminator", kLvifText, 1, 2, 5, 1, u"Post", kLvifText},
                      GetItemCase{"NoRoomNoText", kLvifText, 1, 2, 0, 1, nullptr, kLvifText},
                      GetItemCase{"AllFields", kLvifText | kLvifImage | kLvifParam | kLvifState, 1, 1, 64, 1,
                                  u"b.ps", kLvifText | kLvifImage | kLvifParam | kLvifState},
                      GetItemCase{"PassThroughAndSetItemInboundOnly", 0x8000 | kLvifDiSetItem, 0, 0, 0, 1,
                                  nullptr, 0x8000},
                      GetItemCase{"StateOfAnUnselectedItem", kLvifState, 0, 0, 0, 1, nullptr, kLvifState},
                      GetItemCase{"ItemOutOfRange", kLvifText, 3, 0, 64, std::nullopt, nullptr, 0},
                      GetItemCase{"NegativeItem", kLvifText, -1, 0, 64, std::nullopt, nullptr, 0},
                      GetItemCase{"ColumnOutOfRange", kLvifText, 0, 3, 64, std::nullopt, nullptr, 0}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(GetItem, ATextBufferOutsideWritableMemoryLeavesEverythingAsItWas)
{
    Arena arena;
    FakeSource list = JobList();
    auto* item = arena.At<LVITEMW>(0);
    *item = LVITEMW{};
    item->mask = kLvifText | kLvifImage;
    item->iItem = 0;
    item->pszText = arena.At<char16_t>(2048);
    item->cchTextMax = 16;
    item->iImage = -9;
    EXPECT_EQ(Ask(arena, list, kLvmGetItemW, 0, arena.Address(0)), std::nullopt);
    EXPECT_EQ(item->iImage, -9);
    EXPECT_EQ(Ask(arena, list, kLvmGetItemW, 0, arena.Address(2048)), std::nullopt) << "read-only item";
}

struct ColumnCase
{
    const char* name;
    std::uintptr_t column;
    unsigned mask;
    int capacity;
    std::optional<std::intptr_t> answer;
    const char16_t* text;
    int width;
    int format;
    unsigned maskBack;
};

class GetColumnTest : public ::testing::TestWithParam<ColumnCase>
{
};

TEST_P(GetColumnTest, FillsTheAskedFieldsAndReportsOnlyThose)
{
    const ColumnCase& c = GetParam();
    Arena arena;
    FakeSource list = JobList();
    auto* column = arena.At<LVCOLUMNW>(0);
    char16_t* text = arena.At<char16_t>(512);
    std::memcpy(text, u"untouched", sizeof u"untouched");
    *column = LVCOLUMNW{};
    column->mask = c.mask;
    column->pszText = text;
    column->cchTextMax = c.capacity;
    column->cx = -7;
    column->fmt = -7;
    EXPECT_EQ(Ask(arena, list, kLvmGetColumnW, c.column, arena.Address(0)), c.answer);
    EXPECT_EQ(TextAt(text), c.text ? c.text : u"untouched");
    if (!c.answer)
        return;
    EXPECT_EQ(column->cx, c.width);
    EXPECT_EQ(column->fmt, c.format);
    EXPECT_EQ(column->mask, c.maskBack);
}

constexpr unsigned kAllColumn = kLvcfText | kLvcfWidth | kLvcfFmt;

INSTANTIATE_TEST_SUITE_P(
    Columns, GetColumnTest,
    ::testing::Values(ColumnCase{"Whole", 1, kAllColumn | 0x10, 64, 1, u"File Name", 120, 1, kAllColumn},
                      ColumnCase{"HeadingCut", 1, kLvcfText, 5, 1, u"File", -7, -7, kLvcfText},
                      ColumnCase{"UnsetWidthCentred", 2, kLvcfWidth | kLvcfFmt, 0, 1, nullptr, -1, 2,
                                 kLvcfWidth | kLvcfFmt},
                      ColumnCase{"LeftFormat", 0, kLvcfFmt, 0, 1, nullptr, -7, 0, kLvcfFmt},
                      ColumnCase{"OutOfRange", 3, kAllColumn, 64, std::nullopt, nullptr, 0, 0, 0}),
    [](const auto& info) { return std::string(info.param.name); });

// ---------------------------------------------------------------- header

TEST(HeaderQuery, ColumnRectanglesFollowTheScrolledWidthsAndTheClientArea)
{
    Arena arena;
    FakeSource header = JobList();
    header.kind = ControlKind::Header;
    header.scrolledLeft = -30;
    header.client = Rect{0, 0, 300, 25};
    auto* rect = arena.At<native::RECT>(0);
    const struct
    {
        std::uintptr_t column;
        std::intptr_t answer;
        native::RECT expected;
    } cases[] = {{0, 1, {-30, 0, 10, 25}}, {1, 1, {10, 0, 130, 25}}, {2, 1, {130, 0, 130, 25}}, {3, 0, {}}};
    for (const auto& c : cases)
    {
        *rect = native::RECT{};
        EXPECT_EQ(Ask(arena, header, kHdmGetItemRect, c.column, arena.Address(0)), c.answer) << c.column;
        EXPECT_EQ(std::memcmp(rect, &c.expected, sizeof c.expected), 0) << c.column;
    }
    EXPECT_EQ(Ask(arena, header, kHdmGetItemRect, 0, arena.Address(2048)), 0) << "read-only";
    EXPECT_EQ(Ask(arena, header, kHdmGetItemCount, 0, 0), 3);
    header.columns.clear(); // a header without its list
    EXPECT_EQ(Ask(arena, header, kHdmGetItemCount, 0, 0), 0);
    EXPECT_EQ(Ask(arena, header, kLvmGetItemCount, 0, 0), std::nullopt);
}

TEST(HeaderQuery, ItemsReportWidthTextAndFormatButNotTheImage)
{
    Arena arena;
    FakeSource header = JobList();
    header.kind = ControlKind::Header;
    auto* item = arena.At<HDITEMW>(0);
    char16_t* text = arena.At<char16_t>(512);
    *item = HDITEMW{};
    item->mask = kHdiWidth | kHdiText | kHdiFormat | kHdiImage;
    item->pszText = text;
    item->cchTextMax = 32;
    item->iImage = -5;
    EXPECT_EQ(Ask(arena, header, kHdmGetItemW, 1, arena.Address(0)), 1);
    EXPECT_EQ(item->mask, kHdiWidth | kHdiText | kHdiFormat);
    EXPECT_EQ(item->cxy, 120);
    EXPECT_EQ(item->fmt, 1);
    EXPECT_EQ(item->iImage, -5);
    EXPECT_EQ(TextAt(text), u"File Name");
    EXPECT_EQ(Ask(arena, header, kHdmGetItemW, 3, arena.Address(0)), std::nullopt);
    item->mask = kHdiText;
    item->pszText = arena.At<char16_t>(2048);
    EXPECT_EQ(Ask(arena, header, kHdmGetItemW, 0, arena.Address(0)), std::nullopt);
}

// ---------------------------------------------------------------- boxes

class BoxTest : public ::testing::TestWithParam<ControlKind>
{
protected:
    unsigned Text() const { return GetParam() == ControlKind::ComboBox ? kCbGetLbText : kLbGetText; }
    unsigned TextLength() const
    {
        return GetParam() == ControlKind::ComboBox ? kCbGetLbTextLen : kLbGetTextLen;
    }
    unsigned Find() const
    {
        return GetParam() == ControlKind::ComboBox ? kCbFindStringExact : kLbFindStringExact;
    }
};

TEST_P(BoxTest, CopiesAnEntryOnlyIntoABufferWithRoomForItAndItsTerminator)
{
    Arena arena;
    const FakeSource box = Box(GetParam());
    // "PRN-01" needs 14 bytes: placed 14 bytes before the writable half ends, then 12.
    EXPECT_EQ(Ask(arena, box, Text(), 1, arena.Address(2048 - 14)), 6);
    EXPECT_EQ(TextAt(arena.At<char16_t>(2048 - 14)), u"PRN-01");
    EXPECT_EQ(Ask(arena, box, Text(), 1, arena.Address(2048 - 12)), -1);
    EXPECT_EQ(Ask(arena, box, Text(), 4, arena.Address(0)), -1);
    EXPECT_EQ(Ask(arena, box, Text(), 1, 0), -1);
    EXPECT_EQ(Ask(arena, box, TextLength(), 3, 0), 5);
    EXPECT_EQ(Ask(arena, box, TextLength(), 4, 0), -1);
    EXPECT_EQ(Ask(arena, box, TextLength(), std::uintptr_t(-1), 0), -1);
}

struct FindCase
{
    const char* name;
    std::uintptr_t after;
    const char16_t* text;
    std::intptr_t answer;
};

TEST_P(BoxTest, FindsAnEntryExactlyButForCaseFromAfterTheStartRoundToIt)
{
    const FindCase cases[] = {
        {"AfterStart", 0, u"prn-01", 1},
        {"OnlyMatchIsTheStart", 2, u"PRN-02", -1},
        {"RoundToTheFront", 2, u"all", 0},
        {"StartOutOfRangeSearchesAll", std::uintptr_t(-1), u"PRN-02", 2},
        {"StartPastTheEnd", 4, u"prn-01", 1},
        {"NonAsciiCase", 0, u"äRGER", 3},
        {"PrefixIsNoMatch", std::uintptr_t(-1), u"PRN", -1},
    };
    Arena arena;
    const FakeSource box = Box(GetParam());
    for (const FindCase& c : cases)
    {
        std::memcpy(arena.At<char16_t>(0), c.text, (std::u16string(c.text).size() + 1) * 2);
        EXPECT_EQ(Ask(arena, box, Find(), c.after, arena.Address(0)), c.answer) << c.name;
    }
}

TEST_P(BoxTest, SearchTextMustEndWithinItsRegionAndTheLengthLimit)
{
    Arena arena;
    const FakeSource box = Box(GetParam());
    // Unterminated up to the end of the writable half; the read-only half is another region.
    char16_t* text = arena.At<char16_t>(2048 - 6);
    std::memcpy(text, u"All", 6);
    EXPECT_EQ(Ask(arena, box, Find(), 1, arena.Address(2048 - 6)), -1);
    EXPECT_EQ(Ask(arena, box, Find(), 1, 0), -1);

    FakeSource withLong = box;
    withLong.rows.push_back({std::u16string(kMaxSearchText - 1, u'x')});
    std::vector<char16_t> longText(kMaxSearchText + 1, u'x');
    automation::RegionList memory({Region(longText.data(), longText.size() * 2)});
    const QueryContext context{kKind, memory};
    longText[kMaxSearchText] = 0;
    EXPECT_EQ(AnswerQuery(withLong, Find(), 1, std::intptr_t(longText.data()), context), -1) << "too long";
    longText[kMaxSearchText - 1] = 0;
    EXPECT_EQ(AnswerQuery(withLong, Find(), 1, std::intptr_t(longText.data()), context), 4) << "longest";
}

INSTANTIATE_TEST_SUITE_P(Kinds, BoxTest, ::testing::Values(ControlKind::ComboBox, ControlKind::ListBox),
                         [](const auto& info)
                         { return info.param == ControlKind::ComboBox ? "ComboBox" : "PopupList"; });

TEST(ComboQuery, CountSelectionDroppedStateAndInfo)
{
    Arena arena;
    FakeSource popup = Box(ControlKind::ListBox);
    popup.handle = 0x3000;
    FakeSource combo = Box(ControlKind::ComboBox);
    combo.handle = 0x2000;
    combo.popup = &popup;
    EXPECT_EQ(Ask(arena, combo, kCbGetCount, 0, 0), 4);
    EXPECT_EQ(Ask(arena, combo, kCbGetCurSel, 0, 0), 1);
    EXPECT_EQ(Ask(arena, combo, kCbGetDroppedState, 0, 0), 0);

    auto* info = arena.At<COMBOBOXINFO>(0);
    std::memset(info, 0x55, sizeof *info);
    EXPECT_EQ(Ask(arena, combo, kCbGetComboBoxInfo, 0, arena.Address(0)), 1);
    EXPECT_EQ(info->rcItem.right, 0);
    EXPECT_EQ(info->rcButton.right, 110);
    EXPECT_EQ(info->rcButton.bottom, 54);
    EXPECT_EQ(info->stateButton, 0u);
    EXPECT_EQ(info->hwndCombo, 0x2000u);
    EXPECT_EQ(info->hwndList, 0u);

    combo.dropped = true;
    EXPECT_EQ(Ask(arena, combo, kCbGetDroppedState, 0, 0), 1);
    EXPECT_EQ(Ask(arena, combo, kCbGetComboBoxInfo, 0, arena.Address(0)), 1);
    EXPECT_EQ(info->stateButton, kStateSystemPressed);
    EXPECT_EQ(info->hwndList, 0x3000u);
    EXPECT_EQ(Ask(arena, combo, kCbGetComboBoxInfo, 0, arena.NearEnd(sizeof *info)), -1);
    EXPECT_EQ(Ask(arena, combo, kCbGetComboBoxInfo, 0, arena.Address(2048)), -1);
    EXPECT_EQ(Ask(arena, combo, kLbGetCount, 0, 0), std::nullopt);
}

TEST(PopupQuery, ItemRectanglesOnlyForItemsInView)
{
    Arena arena;
    const FakeSource popup = Box(ControlKind::ListBox);
    auto* rect = arena.At<native::RECT>(0);
    EXPECT_EQ(Ask(arena, popup, kLbGetItemRect, 2, arena.Address(0)), 1);
    EXPECT_EQ(rect->left, 0);
    EXPECT_EQ(rect->top, 18);
    EXPECT_EQ(rect->right, 110);
    EXPECT_EQ(rect->bottom, 36);
    for (std::uintptr_t hidden : {std::uintptr_t(0), std::uintptr_t(3), std::uintptr_t(9)})
        EXPECT_EQ(Ask(arena, popup, kLbGetItemRect, hidden, arena.Address(0)), -1) << hidden;
    EXPECT_EQ(Ask(arena, popup, kLbGetItemRect, 1, arena.Address(2048)), -1);
    EXPECT_EQ(Ask(arena, popup, kLbGetTopIndex, 0, 0), 1);
    EXPECT_EQ(Ask(arena, popup, kLbGetCurSel, 0, 0), 1);
    EXPECT_EQ(Ask(arena, popup, kLbGetCount, 0, 0), 4);
    EXPECT_EQ(Ask(arena, popup, kCbGetCount, 0, 0), std::nullopt);
}

// ---------------------------------------------------------------- registered messages

TEST(WindowMessages, OneNumberPerNameWhateverItsCaseFromTheRegisteredRange)
{
    const unsigned first = RegisterWindowMessage(u"WYX_TEST_MESSAGE");
    EXPECT_GE(first, 0xC000u);
    EXPECT_LE(first, 0xFFFFu);
    EXPECT_EQ(RegisterWindowMessage(u"wyx_test_message"), first);
    EXPECT_NE(RegisterWindowMessage(u"WYX_OTHER_MESSAGE"), first);
    EXPECT_EQ(RegisterWindowMessage(u""), 0u);
    EXPECT_EQ(KindQueryMessage(), RegisterWindowMessage(u"autl_message"));
}

} // namespace
