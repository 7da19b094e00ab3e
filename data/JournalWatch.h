#pragma once

#include <ctime>
#include <mutex>

// What the recent polls of one journal came to, so that a view can say so
// rather than show old rows as if they were live. A journal counts as busy
// once its lock was held at a few polls in a row after it changed; one that
// cannot be read (or whose lock path cannot be used) at once.
//
// The polling thread notes each outcome; the GUI thread reads the report.
class JournalWatch
{
public:
    enum class State
    {
        Readable,
        Busy,
        Unreadable
    };
    struct Report
    {
        State state = State::Readable;
        // When the journal became busy or unreadable; when it recovered.
        std::time_t since = 0;
        // Readable again after being busy or unreadable.
        bool recovered = false;
    };

    static constexpr int kBusyPolls = 3;

    // Each returns true when the report changed, so the views need telling.
    bool NoteRead(std::time_t now);
    bool NoteBusy(std::time_t now);
    bool NoteUnreadable(std::time_t now);

    Report Get() const;

private:
    bool Enter(State state, std::time_t now);

    mutable std::mutex lock;
    Report report;
    int busyPolls = 0;
    std::time_t busyFrom = 0;
};
