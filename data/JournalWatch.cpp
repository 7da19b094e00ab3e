#include "data/JournalWatch.h"

bool JournalWatch::NoteRead(std::time_t now)
{
    std::lock_guard<std::mutex> guard(lock);
    busyPolls = 0;
    if (report.state == State::Readable)
        return false;
    report = Report{State::Readable, now, true};
    return true;
}

bool JournalWatch::NoteBusy(std::time_t now)
{
    std::lock_guard<std::mutex> guard(lock);
    if (busyPolls++ == 0)
        busyFrom = now;
    // A producer holds the lock for a moment while it writes: that is no news.
    if (busyPolls < kBusyPolls || report.state == State::Busy)
        return false;
    return Enter(State::Busy, busyFrom);
}

bool JournalWatch::NoteUnreadable(std::time_t now)
{
    std::lock_guard<std::mutex> guard(lock);
    busyPolls = 0;
    if (report.state == State::Unreadable)
        return false;
    return Enter(State::Unreadable, now);
}

bool JournalWatch::Enter(State state, std::time_t since)
{
    report = Report{state, since, false};
    return true;
}

JournalWatch::Report JournalWatch::Get() const
{
    std::lock_guard<std::mutex> guard(lock);
    return report;
}
