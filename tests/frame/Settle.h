#pragma once

#include "GuiTest.h"

#include <functional>

// Lets the toolkit deliver events until the condition holds, for a bounded
// number of rounds; returns whether it came to hold. A window shown on a busy
// display gets its first size events late, and the tests must not read its
// layout before that.
inline bool PumpUntil(const std::function<bool()>& condition, int rounds = 200)
{
    for (int i = 0; i < rounds && !condition(); ++i)
        guitest::Pump(10);
    return condition();
}
