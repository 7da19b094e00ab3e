#include "platform/os/ShellNotify.h"

#include <atomic>

namespace wyxos
{

namespace
{

std::atomic<std::size_t>& AssociationsChangedCount()
{
    static std::atomic<std::size_t> count{0};
    return count;
}

} // namespace

void NotifyAssociationsChanged()
{
    AssociationsChangedCount().fetch_add(1);
}

std::size_t ShellNotificationCount(ShellEvent event)
{
    return event == ShellEventAssociationsChanged ? AssociationsChangedCount().load() : 0;
}

void ResetShellNotifications()
{
    AssociationsChangedCount().store(0);
}

} // namespace wyxos
