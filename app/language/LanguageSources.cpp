#include "app/language/LanguageSources.h"

#include <string>

#include <wx/intl.h>

#include "app/language/LanguageFile.h"
#include "app/language/LanguageTable.h"
#include "platform/os/FileContents.h"
#include "platform/os/LanguageEnvironment.h"
#include "platform/os/SystemPaths.h"

namespace uilanguage
{

namespace
{

// A language file holds a code or a few settings; anything past this is not one.
constexpr std::size_t kMaxLanguageFileBytes = 64 * 1024;

bool ReadLanguageFile(const wxString& path, wxString& text)
{
    std::string bytes;
    if (path.empty() ||
        wyxos::ReadFileContents(path, bytes, kMaxLanguageFileBytes) != wyxos::ReadResult::Read)
        return false;
    text = DecodeLanguageFile(bytes);
    return true;
}

} // namespace

SystemLanguageSources::SystemLanguageSources()
    : m_serverFile(wyxos::UnderSystemRoot("/srv/kelvo/server/lcdstr/current.lang"))
{
    const wxString configFolder = wyxos::UserConfigFolder();
    if (!configFolder.empty())
        m_userFile = configFolder + "/Corvane Quillet/current.lang";
}

bool SystemLanguageSources::ReadUserFile(wxString& text) const
{
    return ReadLanguageFile(m_userFile, text);
}

bool SystemLanguageSources::ReadServerFile(wxString& text) const
{
    return ReadLanguageFile(m_serverFile, text);
}

unsigned SystemLanguageSources::SystemLanguageId() const
{
    return WindowsLanguageIdOfLocale(wyxos::UserMessagesLocaleName());
}

int SystemLanguageSources::SystemLanguage() const
{
    // The library reads the same variables as UserMessagesLocaleName.
    return wxLocale::GetSystemLanguage();
}

} // namespace uilanguage
