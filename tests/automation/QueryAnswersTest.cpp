// The native query answers of the lists and boxes, over plain controls and a
// memory map that holds only the test's own buffers.
#include "FakeAutomationSource.h"

#include "platform/automation/NativeQueries.h"
#include "platform/automation/QueryAnswers.h"

#include <gtest/gtest.h>

#include <cstring>
#include <tuple>

using namespace automation;
using namespace automation::native;
using automationtest::FakeSource;

namespace
{

using Answer = std::optional<std::intptr_t>;
constexpr unsigned kKind = 0xC123, kSelFoc = kLvisSelected | kLvisFocused;
constexpr std::uintptr_t kReadOnly = 2048;
const Answer kNo = std::nullopt;

// A job list with its header, a combo box and its popup list, and the memory
// the queries may touch: the arena's first half writable, the second read-only.
struct Fixture
{
    alignas(16) unsigned char bytes[4096] = {};
    RegionList memory{
        {automationtest::Region(bytes, 2048), automationtest::Region(bytes + 2048, 2048, false)}};
    FakeSource list, header, combo, popup;

    Fixture()
    {
        list.rows = {{u"1", u"a.pdf", u"PDF"}, {u"2", u"b.ps", u"PostScript"}, {u"3", u"c.tif", u"TIFF"}};
        list.states = {0, itemstate::kSelected, itemstate::kFocused};
        list.columns = {{u"No.", 40}, {u"File Name", 120}, {u"Format", -1}};
        list.current = 2;
        list.top = 1;
        list.headerHeight = 25;
        list.header = &header;
        header = list;
        header.kind = ControlKind::Header;
        combo.kind = ControlKind::ComboBox;
        combo.rows = {{u"All"}, {u"PRN-01"}, {u"prn-02"}, {u"\u00c4rger"}};
        combo.current = combo.top = 1;
        combo.lastVisible = 2;
        popup = combo;
        popup.kind = ControlKind::ListBox;
    }
    template <class T> T* At(size_t offset) { return reinterpret_cast<T*>(bytes + offset); }
    std::intptr_t Address(size_t offset) { return reinterpret_cast<std::intptr_t>(bytes + offset); }
    std::u16string Text(size_t offset) { return At<char16_t>(offset); }
    Answer Ask(const FakeSource& to, unsigned message, std::uintptr_t wParam, std::intptr_t lParam)
    {
        return AnswerQuery(to, message, wParam, lParam, QueryContext{kKind, memory});
    }
};

TEST(QueryAnswers, EachControlAnswersItsOwnMessagesInRangeAndNoOthers)
{
    constexpr auto L = &Fixture::list, H = &Fixture::header, C = &Fixture::combo, P = &Fixture::popup;
    // clang-format off
    const struct { FakeSource Fixture::*to; unsigned message; std::uintptr_t wParam; std::intptr_t lParam;
                   Answer answer; } cases[] = {
        {L, kLvmGetItemCount, 0, 0, 3}, {L, kLvmGetItemState, 2, kSelFoc, 1},
        {L, kLvmGetItemState, 3, kSelFoc, kNo}, {L, kCbGetCount, 0, 0, kNo}, {L, kKind, kKindQuery, 8, 0},
        {L, kLvmGetItemW, 0, 8, kNo}, {H, kHdmGetItemCount, 0, 0, 3}, {H, kKind, kKindQuery, 0, kNo},
        {C, kCbGetCount, 0, 0, 4}, {C, kCbGetLbTextLen, 4, 0, -1}, {C, kCbGetLbText, 1, 0, -1},
        {P, kLbGetCount, 0, 0, 4}, {P, kCbGetCount, 0, 0, kNo}};
    // clang-format on
    Fixture f;
    for (const auto& c : cases)
        EXPECT_EQ(f.Ask(f.*c.to, c.message, c.wParam, c.lParam), c.answer) << "case " << &c - cases;
    EXPECT_EQ(f.Ask(f.list, kLvmGetHeader, 0, 0), std::intptr_t(&f.header));

    // No structure is filled in read-only memory or across the arena's end.
    const std::pair<FakeSource Fixture::*, unsigned> fills[] = {
        {L, kLvmGetItemRect}, {L, kLvmGetSubItemRect}, {L, kLvmGetItemW},       {L, kLvmGetColumnW},
        {H, kHdmGetItemRect}, {H, kHdmGetItemW},       {C, kCbGetComboBoxInfo}, {P, kLbGetItemRect}};
    for (const auto& [to, message] : fills)
        for (size_t at : {kReadOnly, sizeof f.bytes - 15})
        {
            std::memset(f.bytes + kReadOnly, 0, sizeof f.bytes - kReadOnly);
            EXPECT_NE(f.Ask(f.*to, message, 1, f.Address(at)), 1) << std::hex << message << " at " << at;
        }
    EXPECT_EQ(f.Ask(f.list, kLvmGetItemRect, 2, f.Address(0)), 1);
    EXPECT_EQ(f.At<native::RECT>(0)->top, 46) << "below the header and its one-pixel line";
    EXPECT_EQ(f.Ask(f.popup, kLbGetItemRect, 2, f.Address(0)), 1) << "an entry in view";
}

TEST(QueryAnswers, TextsGoOnlyIntoWritableBuffersWithRoomForThemAndTheirTerminatorsAndSearchesStayInBounds)
{
    Fixture f;
    // The kind's name, into a buffer whose first unit gives its room: all with its terminator, or nothing.
    const std::tuple<std::uint16_t, Answer, std::u16string> kinds[] = {
        {9, 1, u"ListCtrl"}, {8, 0, u"\u0008"}, {1100, 0, u"\u044c"}}; // 1100 units reach the read-only half
    for (const auto& [capacity, answer, text] : kinds)
    {
        std::memset(f.bytes, 0, sizeof f.bytes);
        std::memcpy(f.bytes, &capacity, sizeof capacity);
        EXPECT_EQ(f.Ask(f.list, kKind, kKindQuery, f.Address(0)), answer) << capacity;
        EXPECT_EQ(f.Text(0), text);
    }

    // A list item's text into a buffer at 512, cut to its room; none into read-only memory.
    const auto item = [&](int row, int capacity, size_t textAt)
    {
        std::memcpy(f.At<char16_t>(512), u"untouched", sizeof u"untouched");
        *f.At<LVITEMW>(0) = LVITEMW{kLvifText, row, 2, 0, 0, f.At<char16_t>(textAt), capacity};
        const Answer answer = f.Ask(f.list, kLvmGetItemW, 0, f.Address(0));
        return std::pair(answer, f.Text(512));
    };
    EXPECT_EQ(item(1, 5, 512), std::pair(Answer(1), std::u16string(u"Post")));
    EXPECT_EQ(item(3, 64, 512), std::pair(kNo, std::u16string(u"untouched")));
    EXPECT_EQ(item(0, 16, kReadOnly), std::pair(kNo, std::u16string(u"untouched")));

    // A box's entry: "PRN-01" needs 14 bytes: placed 14 bytes before the writable half ends, then 12.
    EXPECT_EQ(f.Ask(f.combo, kCbGetLbText, 1, f.Address(2048 - 14)), 6);
    EXPECT_EQ(f.Text(2048 - 14), u"PRN-01");
    EXPECT_EQ(f.Ask(f.combo, kCbGetLbText, 1, f.Address(2048 - 12)), -1);

    // The search text must end within its region (unterminated up to the end of the writable half)
    // and within the length limit.
    std::memcpy(f.At<char16_t>(2048 - 6), u"All", 6);
    EXPECT_EQ(f.Ask(f.popup, kLbFindStringExact, 1, f.Address(2048 - 6)), -1);
    f.popup.rows.push_back({std::u16string(kMaxSearchText - 1, u'x')});
    std::vector<char16_t> search(kMaxSearchText + 1, u'x');
    const RegionList memory({automationtest::Region(search.data(), search.size() * 2)});
    search[kMaxSearchText] = 0;
    EXPECT_EQ(AnswerQuery(f.popup, kLbFindStringExact, 1, std::intptr_t(search.data()), {kKind, memory}), -1);
    search[kMaxSearchText - 1] = 0;
    EXPECT_EQ(AnswerQuery(f.popup, kLbFindStringExact, 1, std::intptr_t(search.data()), {kKind, memory}), 4);
}

} // namespace
