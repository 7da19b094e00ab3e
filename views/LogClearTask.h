#pragma once

#include <wx/event.h>

#include <functional>
#include <thread>

// The result of a clear, queued to the handler that started it: GetInt() is 0
// when the log was cleared.
wxDECLARE_EVENT(wxEVT_LOG_CLEAR_DONE, wxThreadEvent);

// Runs one clear of the log on a thread of its own, so that waiting for the
// producer to let go of the journal never freezes the window. Owned by the
// handler it reports to: its destructor waits for a clear under way, so a
// result is never queued to a handler that is gone.
class LogClearTask
{
public:
    explicit LogClearTask(wxEvtHandler& target) : target(target) {}
    ~LogClearTask();
    LogClearTask(const LogClearTask&) = delete;
    LogClearTask& operator=(const LogClearTask&) = delete;

    // False, and nothing happens, while a clear is under way.
    bool Start(std::function<int()> clear);
    bool IsRunning() const { return worker.joinable(); }
    // For the handler once the result came: the thread has ended or is ending.
    void Finish();

private:
    wxEvtHandler& target;
    std::thread worker;
};
