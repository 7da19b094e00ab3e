#pragma once

#include <wx/font.h>

// Whether two fonts draw alike, for caches keyed by font. wxFont's operator==
// also compares pixel sizes, which it measures by shaping text on a new DC:
// once per paint that costs more than all the lookups it guards. The native
// description names face, size, weight and style exactly.
inline bool SameDrawingFont(const wxFont& a, const wxFont& b)
{
    if (a.IsSameAs(b))
        return true;
    if (!a.IsOk() || !b.IsOk())
        return a.IsOk() == b.IsOk();
    return a.GetUnderlined() == b.GetUnderlined() && a.GetStrikethrough() == b.GetStrikethrough() &&
           a.GetNativeFontInfoDesc() == b.GetNativeFontInfoDesc();
}
