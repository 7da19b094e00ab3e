#pragma once

// Something the polling thread asks to do one pass of work per interval.
class INotify
{
public:
    // One pass of work, on the polling thread.
    virtual void Notify() = 0;
    // false makes a pass in progress give up at its next check; true allows work.
    virtual void SetRunning(bool running) = 0;

protected:
    // Listeners are deleted through their own type, never through this one.
    ~INotify() = default;
};
