#pragma once

#include <chrono>
#include <functional>
#include <thread>

// Polls for what another thread or process brings about; false when it never held within the limit,
// which is generous: it only keeps a broken build from hanging the run.
inline bool WaitUntil(const std::function<bool()>& done, int limitMs = 30000)
{
    for (int waited = 0; waited < limitMs && !done(); ++waited)
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    return done();
}
