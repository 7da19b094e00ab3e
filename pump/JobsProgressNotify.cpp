#include "pump/JobsProgressNotify.h"

#include "data/JobLogManager.h"
#include "data/JobStatusManager.h"
#include "platform/os/HeapTuning.h"

namespace
{
// A model whose pass throws (a journal too large to hold, say) skips that
// pass; the other journal is still read.
template <typename Model> void RefreshSkippingFailure(Model& model)
{
    try
    {
        model.Refresh();
    }
    catch (...)
    {
    }
}
} // namespace

// Each model re-reads its journal only when it changed and publishes its own
// update; their results are not needed here.
void JobsProgressNotify::Notify()
{
    RefreshSkippingFailure(JobLogManager::GetInstance());
    RefreshSkippingFailure(JobStatusManager::GetInstance());
    wyxos::ReturnLargeFreeHeap();
}

void JobsProgressNotify::SetRunning(bool running)
{
    JobLogManager::GetInstance().SetRunning(running);
    JobStatusManager::GetInstance().SetRunning(running);
}
