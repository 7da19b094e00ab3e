// The native query answers of the lists and boxes, over plain controls and a
// memory map that holds only the test's own buffers.
#include "FakeAutomationSource.h"

#include "platform/automation/NativeQueries.h"
#include "platform/automation/QueryAnswers.h"
#include "platform/automation/WindowMessages.h"

#include <gtest/gtest.h>

#include <array>
#include <cstring>

using namespace automation;
using namespace automation::native;
using automationtest::FakeSource;
using automationtest::Region;

namespace
{

constexpr unsigned kKind = 0xC123;
constexpr unsigned kSelFoc = kLvisSelected | kLvisFocused;
constexpr unsigned kAllColumn = kLvcfText | kLvcfWidth | kLvcfFmt;
constexpr std::uintptr_t kNone = std::uintptr_t(-1);
const std::optional<std::intptr_t> kNo = std::nullopt;

enum Control
{
    List,
    ListCurrentSelected,
    ListNoCurrent,
    ListMulti,
    Header,
    HeaderAlone,
    Combo,
    ComboDropped,
    Popup
};

// The controls the queries go to, and buffers they may touch: the first half
// of the arena writable, the second read-only.
struct Fixture
{
    alignas(16) unsigned char bytes[4096] = {};
    RegionList memory{{Region(bytes, 2048), Region(bytes + 2048, 2048, false)}};
    FakeSource header, popup, control;

    explicit Fixture(Control kind)
    {
        header.kind = ControlKind::Header;
        header.handle = 0x2000;
        popup = Box(ControlKind::ListBox);
        popup.handle = 0x3000;
        control = kind == Combo || kind == ComboDropped ? Box(ControlKind::ComboBox)
                  : kind == Popup                       ? Box(ControlKind::ListBox)
                                                        : JobList();
        control.header = &header;
        control.popup = &popup;
        control.dropped = kind == ComboDropped;
        control.current = kind == ListCurrentSelected ? 1 : kind == ListNoCurrent ? -1 : control.current;
        control.singleSelection = kind != ListMulti;
        if (kind == ListMulti)
            control.states = {itemstate::kSelected, itemstate::kSelected, 0};
        if (kind == Header || kind == HeaderAlone)
            control.kind = ControlKind::Header;
        if (kind == HeaderAlone)
            control.columns.clear();
    }
    static FakeSource JobList()
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
    static FakeSource Box(ControlKind kind)
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

    template <class T> T* At(size_t offset) { return reinterpret_cast<T*>(bytes + offset); }
    std::intptr_t Address(size_t offset) { return reinterpret_cast<std::intptr_t>(bytes + offset); }
    // An address whose structure would run past the end of the arena's last region.
    std::intptr_t NearEnd(size_t size) { return Address(sizeof bytes - size + 1); }
    std::optional<std::intptr_t> Ask(unsigned message, std::uintptr_t wParam, std::intptr_t lParam)
    {
        return AnswerQuery(control, message, wParam, lParam, QueryContext{kKind, memory});
    }
    std::u16string Text(size_t offset) { return At<char16_t>(offset); }
    std::array<int, 4> RectAt(size_t offset)
    {
        const auto* r = At<native::RECT>(offset);
        return {r->left, r->top, r->right, r->bottom};
    }
};

// ---------------------------------------------------------------- answers without a buffer

struct ScalarCase
{
    const char* name;
    Control control;
    unsigned message;
    std::uintptr_t wParam;
    std::intptr_t lParam;
    std::optional<std::intptr_t> answer;
};

using ScalarTest = ::testing::TestWithParam<ScalarCase>;

TEST_P(ScalarTest, Answers)
{
    const ScalarCase& c = GetParam();
    EXPECT_EQ(Fixture(c.control).Ask(c.message, c.wParam, c.lParam), c.answer);
}

INSTANTIATE_TEST_SUITE_P(
    Messages, ScalarTest,
    ::testing::Values(ScalarCase{"ItemCount", List, kLvmGetItemCount, 0, 0, 3},
                      ScalarCase{"Header", List, kLvmGetHeader, 0, 0, 0x2000},
                      ScalarCase{"TopIndex", List, kLvmGetTopIndex, 0, 0, 1},
                      ScalarCase{"SelectedAskedSelected", List, kLvmGetItemState, 1, kLvisSelected, 0x2},
                      ScalarCase{"SelectedAskedFocused", List, kLvmGetItemState, 1, kLvisFocused, 0},
                      ScalarCase{"FocusedAskedBoth", List, kLvmGetItemState, 2, kSelFoc, 0x1},
                      ScalarCase{"StateOutOfRange", List, kLvmGetItemState, 3, kSelFoc, kNo},
                      ScalarCase{"SingleSelectionCurrentNotSelected", List, kLvmGetSelectedCount, 0, 0, 0},
                      ScalarCase{"SingleSelectionCurrentSelected", ListCurrentSelected, kLvmGetSelectedCount,
                                 0, 0, 1},
                      ScalarCase{"SingleSelectionNoCurrent", ListNoCurrent, kLvmGetSelectedCount, 0, 0, 0},
                      ScalarCase{"MultipleSelection", ListMulti, kLvmGetSelectedCount, 0, 0, 2},
                      ScalarCase{"ColumnsOfAnItem", List, kLvmColumnCountQuery, 2, 0, 3},
                      ScalarCase{"ColumnsOfNoItem", List, kLvmColumnCountQuery, 3, 0, kNo},
                      ScalarCase{"ZeroForAnItem", List, kLvmZeroItemQuery, 0, 0, 0},
                      ScalarCase{"ZeroForNoItem", List, kLvmZeroItemQuery, 7, 0, kNo},
                      ScalarCase{"Zero", List, kLvmZeroQuery, 99, 0, 0},
                      ScalarCase{"ListHeaderItemCount", List, kHdmGetItemCount, 0, 0, 3},
                      ScalarCase{"ComboMessageToAList", List, kCbGetCount, 0, 0, kNo},
                      ScalarCase{"KindWithOtherWParam", List, kKind, 5, 0, 0},
                      ScalarCase{"Unknown", List, 0x1001, 0, 0, kNo},
                      ScalarCase{"HeaderItemCount", Header, kHdmGetItemCount, 0, 0, 3},
                      ScalarCase{"HeaderWithoutItsList", HeaderAlone, kHdmGetItemCount, 0, 0, 0},
                      ScalarCase{"ListMessageToAHeader", Header, kLvmGetItemCount, 0, 0, kNo},
                      ScalarCase{"ComboCount", Combo, kCbGetCount, 0, 0, 4},
                      ScalarCase{"ComboCurSel", Combo, kCbGetCurSel, 0, 0, 1},
                      ScalarCase{"ComboUp", Combo, kCbGetDroppedState, 0, 0, 0},
                      ScalarCase{"ComboDropped", ComboDropped, kCbGetDroppedState, 0, 0, 1},
                      ScalarCase{"ListBoxMessageToACombo", Combo, kLbGetCount, 0, 0, kNo},
                      ScalarCase{"ComboTextLen", Combo, kCbGetLbTextLen, 3, 0, 5},
                      ScalarCase{"ComboTextLenPastTheEnd", Combo, kCbGetLbTextLen, 4, 0, -1},
                      ScalarCase{"ComboTextLenNegative", Combo, kCbGetLbTextLen, kNone, 0, -1},
                      ScalarCase{"ComboTextToNull", Combo, kCbGetLbText, 1, 0, -1},
                      ScalarCase{"ComboFindInNull", Combo, kCbFindStringExact, 1, 0, -1},
                      ScalarCase{"PopupTopIndex", Popup, kLbGetTopIndex, 0, 0, 1},
                      ScalarCase{"PopupCurSel", Popup, kLbGetCurSel, 0, 0, 1},
                      ScalarCase{"PopupCount", Popup, kLbGetCount, 0, 0, 4},
                      ScalarCase{"ComboMessageToAPopup", Popup, kCbGetCount, 0, 0, kNo},
                      ScalarCase{"PopupTextLen", Popup, kLbGetTextLen, 3, 0, 5}),
    [](const auto& info) { return std::string(info.param.name); });

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

using KindQueryTest = ::testing::TestWithParam<KindCase>;

TEST_P(KindQueryTest, AnswersTheKindNameWhenTheBufferHoldsItWithItsTerminator)
{
    const KindCase& c = GetParam();
    Fixture f(List);
    f.control.kind = c.kind;
    std::memcpy(f.At<char>(c.offset), &c.capacity, sizeof c.capacity);
    EXPECT_EQ(f.Ask(kKind, c.wParam, f.Address(c.offset)), c.answer);
    std::uint16_t first = 0;
    std::memcpy(&first, f.At<char>(c.offset), sizeof first);
    if (c.written)
    {
        EXPECT_EQ(f.Text(c.offset), c.written);
    }
    else
    {
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
        KindCase{"HeaderHasNone", ControlKind::Header, kKindQuery, 64, 0, kNo, nullptr},
        KindCase{"ReadOnlyBuffer", ControlKind::ListCtrl, kKindQuery, 64, 2048, 0, nullptr},
        KindCase{"CapacityBeyondItsRegion", ControlKind::ListCtrl, kKindQuery, 1100, 0, 0, nullptr},
        KindCase{"ZeroCapacity", ControlKind::ComboBox, kKindQuery, 0, 0, 0, nullptr}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(KindQuery, BadPointersAnswerZero)
{
    Fixture f(List);
    for (std::intptr_t pointer : {std::intptr_t(0), std::intptr_t(8), f.NearEnd(2) + 1})
        EXPECT_EQ(f.Ask(kKind, kKindQuery, pointer), 0) << pointer;
}

// ---------------------------------------------------------------- translations

TEST(Translation, StateAndMaskBitsMapBothWaysAndTheUpperBitsPass)
{
    const unsigned states[][2] = {
        {kLvisFocused, itemstate::kFocused}, {kLvisSelected, itemstate::kSelected},
        {kLvisCut, itemstate::kCut},         {kLvisDropHilited, itemstate::kDropHighlighted},
        {0xABCD0000u, 0xABCD0000u},          {0x00F0u, 0}};
    for (const auto& pair : states)
    {
        EXPECT_EQ(NativeStateToGui(pair[0]), pair[1]) << std::hex << pair[0];
        if (pair[1] != 0)
            EXPECT_EQ(GuiStateToNative(pair[1]), pair[0]) << std::hex << pair[1];
    }
    const unsigned masks[][2] = {{kLvifState, guimask::kState},   {kLvifText, guimask::kText},
                                 {kLvifImage, guimask::kImage},   {kLvifParam, guimask::kData},
                                 {0x8000, guimask::kPassThrough}, {kLvifDiSetItem, guimask::kSetItem}};
    for (const auto& pair : masks)
    {
        EXPECT_EQ(NativeItemMaskToGui(pair[0]), pair[1]) << std::hex << pair[0];
        EXPECT_EQ(GuiItemMaskToNative(pair[1]), pair[0] == kLvifDiSetItem ? 0u : pair[0])
            << std::hex << pair[1];
    }
}

// ---------------------------------------------------------------- rectangles

struct RectCase
{
    const char* name;
    Control control;
    int headerHeight; // 0: no header shown
    unsigned message;
    std::uintptr_t wParam;
    std::array<int, 4> in; // what the caller puts in the structure
    size_t offset;
    std::optional<std::intptr_t> answer;
    std::array<int, 4> out;
};

using RectTest = ::testing::TestWithParam<RectCase>;

TEST_P(RectTest, FillsTheRectangleOnlyForAPlaceOnTheScreen)
{
    const RectCase& c = GetParam();
    Fixture f(c.control);
    if (c.headerHeight)
        f.control.headerHeight = c.headerHeight;
    if (c.control == Header)
    {
        f.control.scrolledLeft = -30;
        f.control.client = Rect{0, 0, 300, 25};
    }
    if (c.offset < 2048)
        *f.At<native::RECT>(c.offset) = native::RECT{c.in[0], c.in[1], c.in[2], c.in[3]};
    EXPECT_EQ(f.Ask(c.message, c.wParam, c.offset < 4096 ? f.Address(c.offset) : f.NearEnd(16)), c.answer);
    const std::array<int, 4> expected = c.answer == 1 ? c.out : c.in;
    EXPECT_EQ(c.offset < 2048 ? f.RectAt(c.offset) : expected, expected);
}

constexpr std::array<int, 4> kZero{};
constexpr size_t kReadOnly = 2048, kNearEnd = 8192;

INSTANTIATE_TEST_SUITE_P(
    Rects, RectTest,
    ::testing::Values(
        // Items stand below the shown header and its one-pixel line.
        RectCase{"ItemNoHeader", List, 0, kLvmGetItemRect, 2, kZero, 0, 1, {0, 20, 300, 40}},
        RectCase{"ItemBelowHeader", List, 25, kLvmGetItemRect, 2, kZero, 0, 1, {0, 46, 300, 66}},
        RectCase{
            "SubItemThirdColumn", List, 25, kLvmGetSubItemRect, 1, {0, 2, 0, 0}, 0, 1, {160, 26, 159, 46}},
        RectCase{"SubItemNoColumn", List, 25, kLvmGetSubItemRect, 1, {0, 3, 0, 0}, 0, kNo, {}},
        RectCase{"ItemOutOfRange", List, 0, kLvmGetItemRect, 3, kZero, 0, kNo, {}},
        RectCase{"ItemReadOnly", List, 0, kLvmGetItemRect, 0, kZero, kReadOnly, kNo, {}},
        RectCase{"ItemNearEnd", List, 0, kLvmGetItemRect, 0, kZero, kNearEnd, kNo, {}},
        // Header columns follow the scrolled widths and the client area.
        RectCase{"HeaderFirst", Header, 0, kHdmGetItemRect, 0, kZero, 0, 1, {-30, 0, 10, 25}},
        RectCase{"HeaderSecond", Header, 0, kHdmGetItemRect, 1, kZero, 0, 1, {10, 0, 130, 25}},
        RectCase{"HeaderUnsetWidth", Header, 0, kHdmGetItemRect, 2, kZero, 0, 1, {130, 0, 130, 25}},
        RectCase{"HeaderOutOfRange", Header, 0, kHdmGetItemRect, 3, kZero, 0, 0, {}},
        RectCase{"HeaderReadOnly", Header, 0, kHdmGetItemRect, 0, kZero, kReadOnly, 0, {}},
        // Popup entries only while in view.
        RectCase{"PopupInView", Popup, 0, kLbGetItemRect, 2, kZero, 0, 1, {0, 18, 110, 36}},
        RectCase{"PopupAboveView", Popup, 0, kLbGetItemRect, 0, kZero, 0, -1, {}},
        RectCase{"PopupBelowView", Popup, 0, kLbGetItemRect, 3, kZero, 0, -1, {}},
        RectCase{"PopupPastTheEnd", Popup, 0, kLbGetItemRect, 9, kZero, 0, -1, {}},
        RectCase{"PopupReadOnly", Popup, 0, kLbGetItemRect, 1, kZero, kReadOnly, -1, {}}),
    [](const auto& info) { return std::string(info.param.name); });

// ---------------------------------------------------------------- items and columns

struct ItemCase
{
    const char* name;
    unsigned message; // kLvmGetItemW, kLvmGetColumnW or kHdmGetItemW
    unsigned mask;
    int item;
    int subItem;
    int capacity;
    std::optional<std::intptr_t> answer;
    const char16_t* text; // expected in the buffer; nullptr: untouched
    unsigned maskBack;
    int width, format, image; // columns and header items: cx/cxy and fmt; the image
};

using ItemTest = ::testing::TestWithParam<ItemCase>;

TEST_P(ItemTest, FillsTheAskedFieldsAndReportsOnlyThose)
{
    const ItemCase& c = GetParam();
    Fixture f(c.message == kHdmGetItemW ? Header : List);
    std::memcpy(f.At<char16_t>(512), u"untouched", sizeof u"untouched");
    char16_t* text = c.capacity < 0 ? f.At<char16_t>(2048) : f.At<char16_t>(512);
    const int capacity = c.capacity < 0 ? 16 : c.capacity;
    std::optional<std::intptr_t> answer;
    unsigned maskBack = 0;
    int width = 0, format = 0, image = 0;
    if (c.message == kLvmGetItemW)
    {
        auto* item = f.At<LVITEMW>(0);
        *item = LVITEMW{c.mask, c.item, c.subItem, 0x00030000, kSelFoc, text, capacity, -9};
        answer = f.Ask(c.message, 0, f.Address(0));
        maskBack = item->mask;
        image = item->iImage;
        width = int(item->lParam);
        format = int(item->state);
    }
    else if (c.message == kLvmGetColumnW)
    {
        auto* column = f.At<LVCOLUMNW>(0);
        *column = LVCOLUMNW{c.mask, -7, -7, text, capacity};
        answer = f.Ask(c.message, std::uintptr_t(c.item), f.Address(0));
        std::tie(maskBack, width, format) = std::tuple(column->mask, column->cx, column->fmt);
    }
    else
    {
        auto* item = f.At<HDITEMW>(0);
        *item = HDITEMW{c.mask, 0, text, nullptr, capacity, 0, 0, -5};
        answer = f.Ask(c.message, std::uintptr_t(c.item), f.Address(0));
        std::tie(maskBack, width, format, image) = std::tuple(item->mask, item->cxy, item->fmt, item->iImage);
    }
    EXPECT_EQ(answer, c.answer);
    EXPECT_EQ(f.Text(512), c.text ? c.text : u"untouched");
    EXPECT_EQ(image, c.image);
    if (!c.answer)
        return;
    EXPECT_EQ(maskBack, c.maskBack);
    EXPECT_EQ(width, c.width);
    EXPECT_EQ(format, c.format);
}

// List items: "width" is lParam and "format" the state as they come back. Columns
// and header items share one routine, and all three the text cut: each bound
// is checked over one of them.
constexpr unsigned kAllItem = kLvifText | kLvifImage | kLvifParam | kLvifState, kSt = 0x00030000;
constexpr unsigned kHdAll = kHdiWidth | kHdiText | kHdiFormat;

INSTANTIATE_TEST_SUITE_P(
    Fields, ItemTest,
    ::testing::Values(
        ItemCase{"TextFits", kLvmGetItemW, kLvifText, 1, 2, 64, 1, u"PostScript", kLvifText, 0, kSt, -9},
        ItemCase{"TextCutWithTerminator", kLvmGetItemW, kLvifText, 1, 2, 5, 1, u"Post", kLvifText, 0, kSt,
                 -9},
        ItemCase{"NoRoomNoText", kLvmGetItemW, kLvifText, 1, 2, 0, 1, nullptr, kLvifText, 0, kSt, -9},
        ItemCase{"AllFields", kLvmGetItemW, kAllItem, 1, 1, 64, 1, u"b.ps", kAllItem, 1001, kSt | 2, 7},
        ItemCase{"ImageOfAnotherColumn", kLvmGetItemW, kLvifImage, 1, 2, 0, 1, nullptr, kLvifImage, 0, kSt,
                 -1},
        ItemCase{"PassThroughAndSetItemInboundOnly", kLvmGetItemW, 0x8000 | kLvifDiSetItem, 0, 0, 0, 1,
                 nullptr, 0x8000, 1000, kSt, -9},
        ItemCase{"StateOfAnUnselectedItem", kLvmGetItemW, kLvifState, 0, 0, 0, 1, nullptr, kLvifState, 0, kSt,
                 -9},
        ItemCase{"ItemOutOfRange", kLvmGetItemW, kLvifText, 3, 0, 64, kNo, nullptr, 0, 0, 0, -9},
        ItemCase{"NegativeItem", kLvmGetItemW, kLvifText, -1, 0, 64, kNo, nullptr, 0, 0, 0, -9},
        ItemCase{"ColumnOutOfRange", kLvmGetItemW, kLvifText, 0, 3, 64, kNo, nullptr, 0, 0, 0, -9},
        ItemCase{"TextOutsideWritableMemory", kLvmGetItemW, kLvifText | kLvifImage, 0, 0, -1, kNo, nullptr, 0,
                 0, 0, -9},
        ItemCase{"WholeColumn", kLvmGetColumnW, kAllColumn | 0x10, 1, 0, 64, 1, u"File Name", kAllColumn, 120,
                 1, 0},
        ItemCase{"UnsetWidthCentred", kLvmGetColumnW, kLvcfWidth | kLvcfFmt, 2, 0, 0, 1, nullptr,
                 kLvcfWidth | kLvcfFmt, -1, 2, 0},
        ItemCase{"LeftFormat", kLvmGetColumnW, kLvcfFmt, 0, 0, 0, 1, nullptr, kLvcfFmt, -7, 0, 0},
        ItemCase{"ColumnPastTheEnd", kLvmGetColumnW, kAllColumn, 3, 0, 64, kNo, nullptr, 0, 0, 0, 0},
        ItemCase{"HeaderItemWithoutImage", kHdmGetItemW, kHdAll | kHdiImage, 1, 0, 32, 1, u"File Name",
                 kHdAll, 120, 1, -5},
        ItemCase{"HeaderTextReadOnly", kHdmGetItemW, kHdiText, 0, 0, -1, kNo, nullptr, 0, 0, 0, -5}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(GetItem, AReadOnlyItemIsNotAnswered)
{
    Fixture f(List);
    EXPECT_EQ(f.Ask(kLvmGetItemW, 0, f.Address(2048)), kNo);
}

// ---------------------------------------------------------------- boxes

class BoxTest : public ::testing::TestWithParam<Control>
{
protected:
    bool combo = GetParam() == Combo;
    unsigned text = combo ? kCbGetLbText : kLbGetText;
    unsigned find = combo ? kCbFindStringExact : kLbFindStringExact;
    Fixture f{GetParam()};
};

TEST_P(BoxTest, CopiesAnEntryOnlyIntoABufferWithRoomForItAndItsTerminator)
{
    // "PRN-01" needs 14 bytes: placed 14 bytes before the writable half ends, then 12.
    EXPECT_EQ(f.Ask(text, 1, f.Address(2048 - 14)), 6);
    EXPECT_EQ(f.Text(2048 - 14), u"PRN-01");
    EXPECT_EQ(f.Ask(text, 1, f.Address(2048 - 12)), -1);
    EXPECT_EQ(f.Ask(text, 4, f.Address(0)), -1);
}

TEST_P(BoxTest, FindsAnEntryExactlyButForCaseFromAfterTheStartRoundToIt)
{
    const struct
    {
        std::uintptr_t after;
        const char16_t* text;
        std::intptr_t answer;
    } cases[] = {{0, u"prn-01", 1}, {2, u"PRN-02", -1}, {2, u"all", 0},     {kNone, u"PRN-02", 2},
                 {4, u"prn-01", 1}, {0, u"äRGER", 3},   {kNone, u"PRN", -1}};
    for (const auto& c : cases)
    {
        std::memcpy(f.At<char16_t>(0), c.text, (std::u16string(c.text).size() + 1) * 2);
        EXPECT_EQ(f.Ask(find, c.after, f.Address(0)), c.answer) << "case " << &c - cases;
    }
}

TEST_P(BoxTest, SearchTextMustEndWithinItsRegionAndTheLengthLimit)
{
    // Unterminated up to the end of the writable half; the read-only half is another region.
    std::memcpy(f.At<char16_t>(2048 - 6), u"All", 6);
    EXPECT_EQ(f.Ask(find, 1, f.Address(2048 - 6)), -1);

    f.control.rows.push_back({std::u16string(kMaxSearchText - 1, u'x')});
    std::vector<char16_t> longText(kMaxSearchText + 1, u'x');
    automation::RegionList memory({Region(longText.data(), longText.size() * 2)});
    const QueryContext context{kKind, memory};
    longText[kMaxSearchText] = 0;
    EXPECT_EQ(AnswerQuery(f.control, find, 1, std::intptr_t(longText.data()), context), -1) << "too long";
    longText[kMaxSearchText - 1] = 0;
    EXPECT_EQ(AnswerQuery(f.control, find, 1, std::intptr_t(longText.data()), context), 4) << "longest";
}

INSTANTIATE_TEST_SUITE_P(Kinds, BoxTest, ::testing::Values(Combo, Popup),
                         [](const auto& info) { return info.param == Combo ? "ComboBox" : "PopupList"; });

TEST(ComboQuery, InfoNamesTheButtonItsStateAndTheListWhileDropped)
{
    for (Control kind : {Combo, ComboDropped})
    {
        Fixture f(kind);
        f.control.handle = 0x2000;
        auto* info = f.At<COMBOBOXINFO>(0);
        std::memset(info, 0x55, sizeof *info);
        EXPECT_EQ(f.Ask(kCbGetComboBoxInfo, 0, f.Address(0)), 1);
        EXPECT_EQ(info->rcItem.right, 0);
        EXPECT_EQ(info->rcButton.right, 110);
        EXPECT_EQ(info->rcButton.bottom, 54);
        EXPECT_EQ(info->stateButton, kind == Combo ? 0u : kStateSystemPressed);
        EXPECT_EQ(info->hwndCombo, 0x2000u);
        EXPECT_EQ(info->hwndList, kind == Combo ? 0u : 0x3000u);
        EXPECT_EQ(f.Ask(kCbGetComboBoxInfo, 0, f.NearEnd(sizeof *info)), -1);
        EXPECT_EQ(f.Ask(kCbGetComboBoxInfo, 0, f.Address(2048)), -1);
    }
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
