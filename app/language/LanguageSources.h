#pragma once

#include <wx/string.h>

namespace uilanguage
{

// Where the language of the window can come from. Each source is asked only
// when the choice comes to it, so that a version that needs no file reads none.
class LanguageSources
{
public:
    virtual ~LanguageSources() = default;

    // The decoded text of the per-user language file; false when it is missing
    // or cannot be read.
    virtual bool ReadUserFile(wxString& text) const = 0;
    // The same for the print server's language file.
    virtual bool ReadServerFile(wxString& text) const = 0;
    // The Windows language id of the system's locale, 0 when it has none.
    virtual unsigned SystemLanguageId() const = 0;
    // The system's user-interface language as a wxLanguage value,
    // wxLANGUAGE_UNKNOWN when it cannot tell.
    virtual int SystemLanguage() const = 0;
};

// The sources of this machine and user: the files at their places under the
// user's configuration folder and the system root, and the locale the
// environment names.
class SystemLanguageSources : public LanguageSources
{
public:
    SystemLanguageSources();

    bool ReadUserFile(wxString& text) const override;
    bool ReadServerFile(wxString& text) const override;
    unsigned SystemLanguageId() const override;
    int SystemLanguage() const override;

    const wxString& UserFilePath() const { return m_userFile; }
    const wxString& ServerFilePath() const { return m_serverFile; }

private:
    wxString m_userFile;
    wxString m_serverFile;
};

} // namespace uilanguage
