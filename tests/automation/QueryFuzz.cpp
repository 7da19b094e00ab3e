// Random controls, messages, wParam/lParam values and caller buffers: every
// answer must read and write only inside the buffers the memory map holds.
#include "FakeAutomationSource.h"

#include "platform/automation/NativeQueries.h"
#include "platform/automation/QueryAnswers.h"

#include <fuzzer/FuzzedDataProvider.h>

#include <cstring>

using namespace automation;
using namespace automation::native;

namespace
{

constexpr unsigned kKind = 0xC000;
constexpr size_t kArena = 1024;

const unsigned kMessages[] = {
    kKind,
    kLvmGetItemCount,
    kLvmGetItemRect,
    kLvmGetHeader,
    kLvmGetTopIndex,
    kLvmGetItemState,
    kLvmGetSelectedCount,
    kLvmGetSubItemRect,
    kLvmGetItemW,
    kLvmColumnCountQuery,
    kLvmZeroItemQuery,
    kLvmZeroQuery,
    kLvmGetColumnW,
    kHdmGetItemCount,
    kHdmGetItemRect,
    kHdmGetItemW,
    kCbGetCount,
    kCbGetCurSel,
    kCbGetLbText,
    kCbGetLbTextLen,
    kCbGetDroppedState,
    kCbFindStringExact,
    kCbGetComboBoxInfo,
    kLbGetCurSel,
    kLbGetText,
    kLbGetTextLen,
    kLbGetCount,
    kLbGetTopIndex,
    kLbGetItemRect,
    kLbFindStringExact,
};

std::u16string Text(FuzzedDataProvider& data)
{
    const size_t length = data.ConsumeIntegralInRange<size_t>(0, 24);
    std::u16string text;
    for (size_t i = 0; i < length; ++i)
        text += static_cast<char16_t>(data.ConsumeIntegral<std::uint16_t>());
    return text;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, size_t size)
{
    FuzzedDataProvider data(bytes, size);
    automationtest::FakeSource popup;
    popup.kind = ControlKind::ListBox;
    automationtest::FakeSource source;
    source.kind = static_cast<ControlKind>(data.ConsumeIntegralInRange<int>(0, 3));
    source.popup = &popup;
    const int columns = data.ConsumeIntegralInRange<int>(0, 4);
    for (int c = 0; c < columns; ++c)
        source.columns.push_back(ColumnInfo{Text(data), data.ConsumeIntegralInRange<int>(-2, 300),
                                            static_cast<Alignment>(data.ConsumeIntegralInRange<int>(0, 2)),
                                            -1});
    const int rows = data.ConsumeIntegralInRange<int>(0, 6);
    for (int r = 0; r < rows; ++r)
    {
        source.rows.emplace_back();
        for (int c = 0; c < std::max(1, columns); ++c)
            source.rows.back().push_back(Text(data));
        source.states.push_back(data.ConsumeIntegral<unsigned>());
    }
    source.current = data.ConsumeIntegralInRange<long>(-2, 7);
    source.top = data.ConsumeIntegralInRange<long>(-1, 7);
    source.lastVisible = data.ConsumeIntegralInRange<long>(-1, 7);
    source.singleSelection = data.ConsumeBool();
    source.dropped = data.ConsumeBool();
    source.scrolledLeft = data.ConsumeIntegralInRange<int>(-500, 500);
    if (data.ConsumeBool())
        source.headerHeight = data.ConsumeIntegralInRange<int>(0, 40);

    // The caller's memory: a writable part and a read-only part, filled from the input.
    alignas(16) std::uint8_t arena[kArena] = {};
    const size_t writable = data.ConsumeIntegralInRange<size_t>(0, kArena);
    const RegionList memory({automationtest::Region(arena, writable),
                             automationtest::Region(arena + writable, kArena - writable, false)});
    const std::vector<std::uint8_t> fill = data.ConsumeBytes<std::uint8_t>(kArena);
    if (!fill.empty())
        std::memcpy(arena, fill.data(), fill.size());
    // Text pointers inside the structures, aimed into the arena now and then.
    const size_t textAt = data.ConsumeIntegralInRange<size_t>(0, kArena);
    char16_t* inArena = reinterpret_cast<char16_t*>(arena + textAt);
    if (data.ConsumeBool())
        std::memcpy(arena + offsetof(LVITEMW, pszText), &inArena, sizeof inArena);
    if (data.ConsumeBool())
        std::memcpy(arena + offsetof(LVCOLUMNW, pszText), &inArena, sizeof inArena);
    if (data.ConsumeBool())
        std::memcpy(arena + offsetof(HDITEMW, pszText), &inArena, sizeof inArena);

    const unsigned message =
        data.ConsumeBool() ? data.PickValueInArray(kMessages) : data.ConsumeIntegral<unsigned>();
    const auto wParam = data.ConsumeBool() ? data.ConsumeIntegralInRange<std::uintptr_t>(0, 8)
                                           : data.ConsumeIntegral<std::uintptr_t>();
    std::intptr_t lParam = 0;
    if (data.ConsumeBool())
        lParam = reinterpret_cast<std::intptr_t>(arena + data.ConsumeIntegralInRange<size_t>(0, kArena));
    else
        lParam = data.ConsumeIntegral<std::intptr_t>();
    AnswerQuery(source, message, wParam, lParam, QueryContext{kKind, memory});
    return 0;
}
