#pragma once

#include <wx/arrstr.h>
#include <wx/string.h>

// The hot-folder configuration service: which hot folders and print servers are
// configured, and the icon of each hot folder. Called on the GUI thread only.
class WyxDataSource
{
public:
    static WyxDataSource& GetInstance();

    // Fills names with the print servers, as written in the status journal.
    long GetServersList(wxArrayString& names);
    // Fills paths with the full path of every configured hot folder.
    long GetHotFoldersList(wxArrayString& paths);
    // Sets a hot folder's icon to match its error state.
    long ChangeHotfolderIcon(const wxString& hotFolderPath, const bool& errorState);

private:
    WyxDataSource() = default;
};
