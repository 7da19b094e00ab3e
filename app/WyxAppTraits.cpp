#include "app/WyxAppTraits.h"

#include "app/NoLog.h"

wxLog* WyxAppTraits::CreateLogTarget()
{
    return new NoLog;
}
