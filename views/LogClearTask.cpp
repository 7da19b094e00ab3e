#include "views/LogClearTask.h"

wxDEFINE_EVENT(wxEVT_LOG_CLEAR_DONE, wxThreadEvent);

LogClearTask::~LogClearTask()
{
    Finish();
}

bool LogClearTask::Start(std::function<int()> clear)
{
    if (IsRunning())
        return false;
    worker = std::thread(
        [this, clear = std::move(clear)]
        {
            auto* done = new wxThreadEvent(wxEVT_LOG_CLEAR_DONE);
            done->SetInt(clear());
            // The only thing this thread touches of the handler: its queue is
            // safe to fill from any thread.
            target.QueueEvent(done);
        });
    return true;
}

void LogClearTask::Finish()
{
    if (worker.joinable())
        worker.join();
}
