#include "app/UiLanguage.h"

#include <wx/language.h>

// Until the language files are read, the system's language decides.
int ChooseUiLanguage(bool reload)
{
    return wxLANGUAGE_DEFAULT;
}
