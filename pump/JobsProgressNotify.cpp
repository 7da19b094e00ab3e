#include "pump/JobsProgressNotify.h"

#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"

// Each model re-reads its journal only when it changed and publishes its own
// update; their results are not needed here.
void JobsProgressNotify::Notify()
{
    JobLogManager::GetInstance().Refresh();
    JobStatusManager::GetInstance().Refresh();
}

void JobsProgressNotify::SetRunning(bool running)
{
    JobLogManager::GetInstance().SetRunning(running);
    JobStatusManager::GetInstance().SetRunning(running);
}
