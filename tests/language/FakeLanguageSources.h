#pragma once

#include <optional>

#include <wx/intl.h>

#include "app/language/LanguageSources.h"

// Sources given by a test: a file that is std::nullopt is missing.
class FakeLanguageSources : public uilanguage::LanguageSources
{
public:
    std::optional<wxString> userFile;
    std::optional<wxString> serverFile;
    unsigned systemLanguageId = 0;
    int systemLanguage = wxLANGUAGE_UNKNOWN;

    bool ReadUserFile(wxString& text) const override { return Read(userFile, text); }
    bool ReadServerFile(wxString& text) const override { return Read(serverFile, text); }
    unsigned SystemLanguageId() const override { return systemLanguageId; }
    int SystemLanguage() const override { return systemLanguage; }

private:
    static bool Read(const std::optional<wxString>& file, wxString& text)
    {
        if (file)
            text = *file;
        return file.has_value();
    }
};
