#include "pump/JobsProgressNotify.h"

// The models' Refresh and SetRunning calls join these bodies, log model first,
// once the models are part of the build.
void JobsProgressNotify::Notify() {}

void JobsProgressNotify::SetRunning(bool running) {}
