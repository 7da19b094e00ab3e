#include "app/UiLanguage.h"

#include "app/language/LanguageChoice.h"
#include "app/language/LanguageSources.h"
#include "data/DataLocations.h"

int ChooseUiLanguage(bool reload)
{
    return ChooseUiLanguageFor(GetApplicationVersion(reload), uilanguage::SystemLanguageSources());
}
