#pragma once

#include <wx/event.h>

// The program's four command event types. Each is a plain wxCommandEvent with
// id 0 and no payload. They are defined once, in this order, and exported from
// the executable under these names so that outside tools can find them.
extern const wxEventType wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK;
extern const wxEventType wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK_LOG;
extern const wxEventType wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG;
extern const wxEventType wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS;
