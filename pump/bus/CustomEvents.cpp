#include "pump/bus/CustomEvents.h"

// One translation unit, so the allocation order is the declaration order.
const wxEventType wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK = wxNewEventType();
const wxEventType wxEVT_MY_CUSTOM_COMMAND_COMBOCLICK_LOG = wxNewEventType();
const wxEventType wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG = wxNewEventType();
const wxEventType wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS = wxNewEventType();
