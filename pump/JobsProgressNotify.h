#pragma once

#include "pump/INotify.h"

// The one listener of the program, registered as "OnNewData": each pass makes
// the job log model, then the job status model, re-read its journal.
class JobsProgressNotify final : public INotify
{
public:
    void Notify() override;
    void SetRunning(bool running) override;
};
