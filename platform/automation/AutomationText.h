#pragma once

#include <string>
#include <string_view>

namespace automation
{

// Tools' texts are UTF-16 on the native side and UTF-8 on the bus.
std::string ToUtf8(std::u16string_view text);
// From the GUI library's wide text (UTF-32 here, UTF-16 on Windows).
std::u16string ToUtf16(std::wstring_view text);

// Equal when they differ only in letter case, as the native exact-match
// searches compare: simple one-to-one case folding of the Latin, Greek and
// Cyrillic letters; other characters must match exactly.
bool EqualIgnoringCase(std::u16string_view a, std::u16string_view b);

} // namespace automation
