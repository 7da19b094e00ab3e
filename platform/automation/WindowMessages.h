#pragma once

#include <string_view>

namespace automation
{

// Registered window messages: each distinct name (letter case aside) gets one
// number for the life of the process, the first from 0xC000 on; 0 once the
// 0xC000-0xFFFF range is used up or for an empty name. Safe from any thread.
unsigned RegisterWindowMessage(std::u16string_view name);

// The number of "AUTL_MESSAGE", through which tools ask a control its kind;
// registered at the first call.
unsigned KindQueryMessage();

} // namespace automation
