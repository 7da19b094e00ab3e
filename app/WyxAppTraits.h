#pragma once

#include <wx/apptrait.h>

// Installs NoLog as the library's log target.
class WyxAppTraits : public wxGUIAppTraits
{
public:
    wxLog* CreateLogTarget() override;
};
