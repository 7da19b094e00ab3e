#pragma once

#include <cstddef>
#include <cstdint>

namespace wyxos
{

// The shell events the program sends; the values are the Windows shell's.
enum ShellEvent : std::uint32_t
{
    ShellEventAssociationsChanged = 0x08000000
};

// Tells the desktop shell that file associations changed, so that it redraws
// every icon (the hot folders' error badges among them). Linux desktops have no
// such broadcast: the notification is only recorded, process-wide, so that the
// callers' behaviour can be checked.
void NotifyAssociationsChanged();

// How many notifications of the event were sent since start or the last reset.
std::size_t ShellNotificationCount(ShellEvent event = ShellEventAssociationsChanged);
void ResetShellNotifications();

} // namespace wyxos
