#pragma once

#include "platform/automation/AutomationSource.h"
#include "platform/automation/MemoryRegions.h"

#include <cstdint>
#include <optional>

namespace automation
{

// What a query needs beside the control: the number "AUTL_MESSAGE" was
// registered as, and the memory every pointer that comes with it is checked
// against before it is read or written.
struct QueryContext
{
    unsigned kindMessage = 0;
    const MemoryRegions& memory;
};

// The control's answer to a native query (message numbers and structures of
// NativeQueries.h), or nothing when the message is not one it answers and
// goes on to the default window procedure. Reads the control only; writes
// only into the caller's checked structures.
std::optional<std::intptr_t> AnswerQuery(const AutomationSource& source, unsigned message,
                                         std::uintptr_t wParam, std::intptr_t lParam,
                                         const QueryContext& context);

// Item state bits, native <-> GUI library; the upper 16 bits pass unchanged.
unsigned NativeStateToGui(unsigned state);
unsigned GuiStateToNative(unsigned state);

// Item field masks, native <-> GUI library. The native "set item" flag only
// goes in; 0x8000 passes both ways.
unsigned NativeItemMaskToGui(unsigned mask);
unsigned GuiItemMaskToNative(unsigned mask);

// The GUI library's item mask bits.
namespace guimask
{
constexpr unsigned kState = 0x1;
constexpr unsigned kText = 0x2;
constexpr unsigned kImage = 0x4;
constexpr unsigned kData = 0x8;
constexpr unsigned kSetItem = 0x10;
constexpr unsigned kPassThrough = 0x8000;
} // namespace guimask

// The longest text, in characters with its terminator, that an exact-match
// search reads from a caller.
constexpr std::size_t kMaxSearchText = 65535;

} // namespace automation
